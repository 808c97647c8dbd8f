#pragma once

#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <thread>
#include <type_traits>
#include <vector>

#include "hostapi/nodeplane/exception.h"
#include "hosts/lab/state/faults.h"
#include "hosts/lab/state/host_state.h"
#include "hosts/lab/state/trace.h"

// The way of every operation of the lab's libraries: trace, faults, the state, and
// NodeplaneException for whatever goes wrong.
namespace Lab {

// An object of another class than the caller hopes for, for the returned value "otherClass".
// A class of handles for which there is one specialises this.
template <class T>
std::unique_ptr<T> MakeOtherClass() {
  throw StateError("returns: no other class");
}

// A fault's returned value as the operation's result: numbers, flags and texts as they stand, an
// empty list for lists, null or "otherClass" for handles.
template <class Result>
struct Told {
  static Result Value(const Json& returns) {
    if constexpr (std::is_arithmetic_v<Result>) {
      return returns.get<Result>();
    } else {
      throw StateError("returns: not possible here");
    }
  }
};

template <>
struct Told<void> {
  static void Value(const Json&) {}
};

template <>
struct Told<std::string> {
  static std::string Value(const Json& returns) { return Text(returns, ""); }
};

template <class T>
struct Told<std::vector<T>> {
  static std::vector<T> Value(const Json& returns) {
    if (returns == Json::array()) return {};
    throw StateError("returns: not an empty list");
  }
};

template <class T>
struct Told<std::unique_ptr<T>> {
  static std::unique_ptr<T> Value(const Json& returns) {
    if (returns.is_null()) return nullptr;
    if (returns == "otherClass") return MakeOtherClass<T>();
    throw StateError("returns: neither null nor \"otherClass\"");
  }
};

// Runs the effect of a call and applies what the state's faults say of it.
template <class Result, class Effect>
Result PerformWithFaults(const Json& state, const Call& call, Effect effect) {
  const std::optional<Fault> fault = TakeFault(state, call);
  if (!fault) return effect();
  std::this_thread::sleep_for(std::chrono::milliseconds(fault->delayMs));
  const bool lies = fault->message || fault->returns;
  if (!lies) return effect();
  if (fault->afterEffect) static_cast<void>(effect());
  if (fault->message) throw Nodeplane::Lib::NodeplaneException(*fault->message);
  return Told<Result>::Value(*fault->returns);
}

// Turns what can go wrong with the state into the host's exception.
template <class Body>
auto WithHostExceptions(const Call& call, Body body) {
  using Nodeplane::Lib::NodeplaneException;
  try {
    return body();
  } catch (const StateError& error) {
    throw NodeplaneException(call.operation + ": " + error.what());
  } catch (const Json::exception& error) {
    throw NodeplaneException(call.operation + ": " + error.what());
  }
}

// Performs a call that only reads; the effect gets the state.
template <class Result, class Effect>
Result PerformRead(const Call& call, Effect effect) {
  return WithHostExceptions(call, [&]() -> Result {
    const std::shared_ptr<const Json> state = ReadState();
    TraceRead(*state, call);
    return PerformWithFaults<Result>(*state, call, [&]() -> Result { return effect(*state); });
  });
}

// Performs a call that changes the host; the effect gets the state to change. What it gives back, a
// handle on what it made, is the call's result.
template <class Result = void, class Effect>
Result PerformChange(const Call& call, Effect effect) {
  return WithHostExceptions(call, [&]() -> Result {
    TraceChange(call);
    return PerformWithFaults<Result>(*ReadState(), call, [&]() -> Result {
      if constexpr (std::is_void_v<Result>) {
        ChangeState(effect);
      } else {
        Result result;
        ChangeState([&](Json& state) { result = effect(state); });
        return result;
      }
    });
  });
}

// Performs a call that changes nothing of the state: a file of the host, or only what an object
// knows.
template <class Effect>
void PerformBesideState(const Call& call, Effect effect) {
  WithHostExceptions(call, [&] {
    TraceChange(call);
    PerformWithFaults<void>(*ReadState(), call, effect);
  });
}

}  // namespace Lab
