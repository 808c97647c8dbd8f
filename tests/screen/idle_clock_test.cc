#include "console/screen/idle_clock.h"

#include <gtest/gtest.h>

namespace Tarnel {

namespace {

constexpr int64_t SECOND = 1000000;

// Microseconds since the start of the wait; the wait itself began half a second into a second.
timeval After(int64_t microseconds) {
  const int64_t time = 1700000000 * SECOND + SECOND / 2 + microseconds;
  return {time / SECOND, time % SECOND};
}

struct IdleCase {
  int64_t elapsed;
  uint32_t limit;
  bool dim;
  bool over;
};

TEST(IdleClock, TellsWhatIsDue) {
  const IdleCase rows[] = {
      {60 * SECOND, 600, false, false},
      {60 * SECOND + 1, 600, true, false},
      {600 * SECOND, 600, true, false},
      {600 * SECOND + 1, 600, true, true},
      // A shorter limit counts as a minute.
      {60 * SECOND, 30, false, false},
      {60 * SECOND + 1, 30, true, true},
      // A limit that no clock of 32 bits reaches.
      {3600 * SECOND, 0xffffffff, true, false},
  };
  for (const IdleCase& row : rows) {
    IdleClock clock(After(0), row.limit);
    clock.Set(After(row.elapsed));
    EXPECT_EQ(clock.DimIsDue(), row.dim) << row.limit << " after " << row.elapsed;
    EXPECT_EQ(clock.LimitIsOver(), row.over) << row.limit << " after " << row.elapsed;
  }
}

TEST(IdleClockThatIsSetBack, DoesNotLengthenTheWait) {
  IdleClock clock(After(0), 600);
  clock.Set(After(40 * SECOND));
  clock.Set(After(-3600 * SECOND));
  EXPECT_FALSE(clock.DimIsDue());
  EXPECT_EQ(clock.UntilDim().tv_sec, 20);
  EXPECT_EQ(clock.UntilLimit().tv_sec, 560);
  clock.Set(After((-3600 + 20) * SECOND + 1));
  EXPECT_TRUE(clock.DimIsDue());
  EXPECT_FALSE(clock.LimitIsOver());
}

}  // namespace

}  // namespace Tarnel
