#include "console/screen/idle_clock.h"

#include <algorithm>

namespace Tarnel {

namespace {

timeval SecondsLater(timeval time, uint32_t seconds) {
  time.tv_sec += seconds;
  return time;
}

timeval Difference(timeval later, timeval earlier) {
  timeval span{};
  timersub(&later, &earlier, &span);
  return span;
}

void MoveBack(timeval& time, timeval span) {
  const timeval end = time;
  timersub(&end, &span, &time);
}

}  // namespace

IdleClock::IdleClock(timeval now, uint32_t limitSeconds)
    : _now(now),
      _dimEnd(SecondsLater(now, DIM_SECONDS)),
      _idleEnd(SecondsLater(now, std::max(limitSeconds, DIM_SECONDS))) {}

void IdleClock::Set(timeval now) {
  if (timercmp(&now, &_now, <)) {
    const timeval setBack = Difference(_now, now);
    MoveBack(_dimEnd, setBack);
    MoveBack(_idleEnd, setBack);
  }
  _now = now;
}

bool IdleClock::DimIsDue() const { return timercmp(&_now, &_dimEnd, >); }
bool IdleClock::LimitIsOver() const { return timercmp(&_now, &_idleEnd, >); }
timeval IdleClock::UntilDim() const { return Difference(_dimEnd, _now); }
timeval IdleClock::UntilLimit() const { return Difference(_idleEnd, _now); }

}  // namespace Tarnel
