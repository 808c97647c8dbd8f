#pragma once

#include <sys/time.h>

#include <cstdint>

namespace Tarnel {

// Tells a waiting frame when it is to dim and when its idle limit is over. What time it is comes
// from outside.
class IdleClock {
 public:
  // Seconds until an unused frame dims. A shorter idle limit counts as this long.
  static constexpr uint32_t DIM_SECONDS = 60;

  // The wait begins now. limitSeconds is the idle limit.
  IdleClock(timeval now, uint32_t limitSeconds);

  // It is now so late. A clock that was set back moves both ends with it, so that the wait does not
  // become longer by the time that was taken back.
  void Set(timeval now);

  bool DimIsDue() const;
  bool LimitIsOver() const;
  timeval UntilDim() const;
  timeval UntilLimit() const;

 private:
  timeval _now;
  timeval _dimEnd;
  timeval _idleEnd;
};

}  // namespace Tarnel
