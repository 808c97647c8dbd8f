#include "tests/support/fake_time.h"

#include <dlfcn.h>
#include <sys/select.h>
#include <sys/time.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <map>
#include <optional>
#include <utility>

namespace Tarnel::Testing {

namespace {

// Times are in microseconds.
constexpr int64_t SECOND = 1000000;
constexpr int64_t START = 1700000000 * SECOND + SECOND / 2;

struct State {
  int64_t elapsed = 0;
  int waits = 0;
  std::multimap<int64_t, std::function<void()>> plans;
};

std::optional<State> state;

int RealSelect(int count, fd_set* reading, fd_set* writing, fd_set* exceptional, timeval* limit) {
  static const auto SELECT = reinterpret_cast<decltype(&select)>(dlsym(RTLD_NEXT, "select"));
  return SELECT(count, reading, writing, exceptional, limit);
}

int Wait(int count, fd_set* reading, const timeval* limit) {
  ++state->waits;
  fd_set ready = *reading;
  timeval noTime{};
  if (const int result = RealSelect(count, &ready, nullptr, nullptr, &noTime); result != 0) {
    *reading = ready;
    return result;
  }
  const int64_t span = limit == nullptr ? INT64_MAX : limit->tv_sec * SECOND + limit->tv_usec;
  const auto next = state->plans.begin();
  if (next != state->plans.end() && next->first - state->elapsed <= span) {
    state->elapsed = std::max(state->elapsed, next->first);
    state->plans.extract(next).mapped()();
    timeval patience{5, 0};
    return RealSelect(count, reading, nullptr, nullptr, &patience);
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
  state->plans.emplace(state->elapsed + std::llround(seconds * SECOND), std::move(action));
}

int FakeTime::Waits() { return state->waits; }

}  // namespace Tarnel::Testing

// These stand before the C library's functions of the same names.
extern "C" {

int select(int count, fd_set* reading, fd_set* writing, fd_set* exceptional, timeval* limit) {
  using namespace Tarnel::Testing;
  return state ? Wait(count, reading, limit)
               : RealSelect(count, reading, writing, exceptional, limit);
}

int gettimeofday(timeval* now, void* zone) noexcept {
  using namespace Tarnel::Testing;
  if (!state) {
    static const auto CLOCK =
        reinterpret_cast<decltype(&gettimeofday)>(dlsym(RTLD_NEXT, "gettimeofday"));
    return CLOCK(now, zone);
  }
  const int64_t time = START + state->elapsed;
  *now = {time / SECOND, time % SECOND};
  return 0;
}

}  // extern "C"
