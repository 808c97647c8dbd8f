#include "tests/shell/fake_time.h"

#include <dlfcn.h>
#include <poll.h>
#include <sys/select.h>
#include <sys/time.h>

#include <cmath>
#include <cstdint>
#include <optional>
#include <utility>

namespace Tarnel::Testing {

namespace {

constexpr int64_t SECOND = 1000000;
constexpr time_t START = 1700000000;

struct State {
  int64_t elapsed = 0;  // microseconds, never set back
  int64_t setBack = 0;
  int waits = 0;
  std::multimap<int64_t, std::function<void()>> plans;
};

std::optional<State> state;

template <class Function>
Function Real(const char* name) {
  return reinterpret_cast<Function>(dlsym(RTLD_NEXT, name));
}

using SelectFunction = int (*)(int, fd_set*, fd_set*, fd_set*, timeval*);
using ClockFunction = int (*)(timeval*, void*);

int RealSelect(int count, fd_set* reading, timeval time) {
  static const auto SELECT = Real<SelectFunction>("select");
  return SELECT(count, reading, nullptr, nullptr, &time);
}

int RunNextPlan(int count, fd_set* reading) {
  const auto next = state->plans.begin();
  state->elapsed = std::max(state->elapsed, next->first);
  const auto action = std::move(next->second);
  state->plans.erase(next);
  action();
  constexpr time_t PATIENCE = 5;
  return RealSelect(count, reading, {PATIENCE, 0});
}

int Wait(int count, fd_set* reading, const timeval* limit) {
  ++state->waits;
  fd_set ready = *reading;
  if (const int result = RealSelect(count, &ready, {0, 0}); result != 0) {
    *reading = ready;
    return result;
  }
  const int64_t span = limit == nullptr ? INT64_MAX : limit->tv_sec * SECOND + limit->tv_usec;
  const auto next = state->plans.begin();
  if (next != state->plans.end() && next->first - state->elapsed <= span) {
    return RunNextPlan(count, reading);
  }
  if (limit == nullptr) {
    throw SleepsForEver();
  }
  // Even an empty wait takes some time.
  state->elapsed += std::max<int64_t>(span, 1);
  FD_ZERO(reading);
  return 0;
}

}  // namespace

FakeTime::FakeTime() { state.emplace(); }

FakeTime::~FakeTime() { state.reset(); }

double FakeTime::Now() { return static_cast<double>(state->elapsed) / SECOND; }

void FakeTime::Plan(double seconds, std::function<void()> action) {
  state->plans.emplace(std::llround(seconds * SECOND), std::move(action));
}

void FakeTime::SetBack(double seconds) { state->setBack += std::llround(seconds * SECOND); }

int FakeTime::Waits() { return state->waits; }

}  // namespace Tarnel::Testing

// These stand before the C library's functions of the same names.
extern "C" {

int select(int count, fd_set* reading, fd_set* writing, fd_set* exceptional, timeval* limit) {
  using namespace Tarnel::Testing;
  if (state) {
    return Wait(count, reading, limit);
  }
  static const auto SELECT = Real<SelectFunction>("select");
  return SELECT(count, reading, writing, exceptional, limit);
}

int gettimeofday(timeval* now, void* zone) noexcept {
  using namespace Tarnel::Testing;
  if (state) {
    const int64_t time = state->elapsed - state->setBack;
    now->tv_sec = START + static_cast<time_t>(std::floor(static_cast<double>(time) / SECOND));
    now->tv_usec = ((time % SECOND) + SECOND) % SECOND;
    return 0;
  }
  static const auto CLOCK = Real<ClockFunction>("gettimeofday");
  return CLOCK(now, zone);
}

}  // extern "C"
