#include "shell/idle_clock.h"

#include <gtest/gtest.h>

namespace Tarnel {

namespace {

constexpr time_t START = 1700000000;

// Microseconds since the start of the wait; the wait itself began half a second into a second.
timeval After(int64_t microseconds) {
  const int64_t time = START * 1000000 + 500000 + microseconds;
  return {time / 1000000, time % 1000000};
}

constexpr int64_t SECOND = 1000000;

struct IdleCase {
  uint32_t limit;
  int64_t elapsed;
  bool dim;
  bool over;
};

class IdleClockAt : public testing::TestWithParam<IdleCase> {};

TEST_P(IdleClockAt, TellsWhatIsDue) {
  const IdleCase& row = GetParam();
  IdleClock clock(After(0), row.limit);
  clock.Set(After(row.elapsed));
  EXPECT_EQ(clock.DimIsDue(), row.dim) << row.limit << " after " << row.elapsed;
  EXPECT_EQ(clock.LimitIsOver(), row.over) << row.limit << " after " << row.elapsed;
}

INSTANTIATE_TEST_SUITE_P(
    Times, IdleClockAt,
    testing::Values(
        IdleCase{600, 0, false, false}, IdleCase{600, 60 * SECOND - 1, false, false},
        IdleCase{600, 60 * SECOND, false, false}, IdleCase{600, 60 * SECOND + 1, true, false},
        IdleCase{600, 600 * SECOND, true, false}, IdleCase{600, 600 * SECOND + 1, true, true},
        IdleCase{61, 60 * SECOND + 1, true, false}, IdleCase{61, 61 * SECOND + 1, true, true},
        // A shorter limit counts as a minute.
        IdleCase{30, 60 * SECOND, false, false}, IdleCase{30, 60 * SECOND + 1, true, true},
        IdleCase{60, 60 * SECOND, false, false}, IdleCase{0, 60 * SECOND + 1, true, true},
        // A limit that no clock of 32 bits reaches.
        IdleCase{0xffffffff, 3600 * SECOND, true, false}));

struct SpanCase {
  int64_t elapsed;
  timeval untilDim;
};

TEST(IdleClockSpan, BorrowsASecondForTheMicroseconds) {
  for (const SpanCase& row :
       {SpanCase{0, {60, 0}}, SpanCase{SECOND / 4, {59, 750000}}, SpanCase{SECOND - 1, {59, 1}},
        SpanCase{60 * SECOND - 1, {0, 1}}, SpanCase{60 * SECOND, {0, 0}}}) {
    IdleClock clock(After(0), 600);
    clock.Set(After(row.elapsed));
    const timeval span = clock.UntilDim();
    EXPECT_EQ(span.tv_sec, row.untilDim.tv_sec) << row.elapsed;
    EXPECT_EQ(span.tv_usec, row.untilDim.tv_usec) << row.elapsed;
    EXPECT_EQ(clock.UntilLimit().tv_sec, row.untilDim.tv_sec + 540) << row.elapsed;
    EXPECT_EQ(clock.UntilLimit().tv_usec, row.untilDim.tv_usec) << row.elapsed;
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
