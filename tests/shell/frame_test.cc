#include "shell/frame.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <syslog.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <functional>

#include "shell/colours.h"
#include "shell/screen.h"
#include "tests/shell/fake_time.h"
#include "tests/shell/signal_thread.h"
#include "tests/support/curses_screen.h"
#include "tests/support/lab.h"

namespace Tarnel {

namespace {

using Testing::CursesScreen;
using Testing::FakeTime;
using Testing::SleepsForEver;

// A frame whose loop is a function of the test, and which keeps a diary.
class TestFrame : public Frame {
 public:
  using Loop = std::function<int(TestFrame&)>;

  TestFrame(TestFrame* parent, int x, int y, int width, int height, Loop loop)
      : Frame(parent, x, y, width, height, DARK_GREY, WHITE), _loop(std::move(loop)) {
    PutText(0, 0, parent == nullptr ? "under" : "over");
  }

  int Run() override { return _loop(*this); }
  void Redraw() override { diary += "redraw "; }
  void Activate(bool active) override {
    diary += active ? "activate " : "dim ";
    lastChange = _clock ? FakeTime::Now() : 0;
    Frame::Activate(active);
  }

  static void UseFakeTime(bool use) { _clock = use; }
  static void SetIdleTimeout(uint32_t seconds) { _idleTimeout = seconds; }
  static bool MarkedForRestart() { return _markForRestart; }
  static void ClearRestart() { _markForRestart = false; }
  static Frame* Foreground() { return fgFrame; }

  using Frame::WaitKey;

  std::string diary;
  double lastChange = 0;

 private:
  Loop _loop;
  static bool _clock;
};

bool TestFrame::_clock = false;

class FrameTest : public testing::Test {
 protected:
  Testing::SignalThread _signalThread;
  CursesScreen _screen{12, 3};
};

TEST_F(FrameTest, DimsItsParentAndGivesItsResultBack) {
  TestFrame under(nullptr, 0, 0, 12, 3, [&](TestFrame& self) {
    EXPECT_EQ(TestFrame::Foreground(), &self);
    TestFrame over(&self, 4, 1, 6, 1, [&](TestFrame& upper) {
      EXPECT_EQ(TestFrame::Foreground(), &upper);
      EXPECT_EQ(_screen.Picture(), "under\n    over\n");
      EXPECT_EQ(_screen.Colours(0), "0/6*12");
      EXPECT_EQ(_screen.Colours(1), "0/6*4 6/7*6 0/6*2");
      return 7;
    });
    EXPECT_EQ(over.Exec(), 7);
    EXPECT_EQ(over.Exec(), 7);
    EXPECT_EQ(TestFrame::Foreground(), &self);
    EXPECT_EQ(_screen.Picture(), "under\n");
    EXPECT_EQ(_screen.Colours(1), "6/7*12");
    return 3;
  });
  EXPECT_EQ(under.Exec(), 3);
  EXPECT_EQ(TestFrame::Foreground(), nullptr);
  EXPECT_EQ(under.diary, "activate dim activate dim activate ");
}

TEST_F(FrameTest, LosesKeysThatWereTypedBeforeItBegan) {
  TestFrame frame(nullptr, 0, 0, 12, 3, [&](TestFrame& self) {
    _screen.Type("b");
    return self.WaitKey(false);
  });
  _screen.Type("a");
  EXPECT_EQ(frame.Exec(), 'b');
}

TEST_F(FrameTest, TakesTheKeypadsEnterForEnter) {
  TestFrame frame(nullptr, 0, 0, 12, 3, [&](TestFrame& self) {
    ungetch(KEY_ENTER);
    return self.WaitKey(false);
  });
  EXPECT_EQ(frame.Exec(), 10);
}

// What a wait of ten minutes looks like.
struct WaitCase {
  uint32_t limit;
  bool useLimit;
  double dimmedAt;  // 0: never
  double thrownAt;  // 0: it sleeps for ever
};

void PrintTo(const WaitCase& row, std::ostream* out) {
  *out << "limit " << row.limit << (row.useLimit ? "" : " not used");
}

class FrameInTime : public testing::TestWithParam<WaitCase> {
 protected:
  FrameInTime() {
    TestFrame::UseFakeTime(true);
    TestFrame::SetIdleTimeout(GetParam().limit);
  }
  ~FrameInTime() override {
    TestFrame::UseFakeTime(false);
    TestFrame::SetIdleTimeout(600);
  }

  Testing::SignalThread _signalThread;
  CursesScreen _screen{12, 3};
  FakeTime _time;
};

TEST_P(FrameInTime, DimsAndGivesUp) {
  const WaitCase& row = GetParam();
  TestFrame frame(nullptr, 0, 0, 12, 3,
                  [&](TestFrame& self) { return self.WaitKey(row.useLimit); });
  frame.Activate(true);
  if (row.thrownAt > 0) {
    EXPECT_THROW(frame.Exec(), TarnelTimeout);
    EXPECT_NEAR(FakeTime::Now(), row.thrownAt, 0.001);
    EXPECT_EQ(TestFrame::Foreground(), nullptr);
  } else {
    EXPECT_THROW(frame.Exec(), SleepsForEver);
  }
  EXPECT_EQ(frame.diary, row.dimmedAt > 0 ? "activate activate dim " : "activate activate ");
  EXPECT_NEAR(frame.lastChange, row.dimmedAt, 0.001);
  EXPECT_EQ(_screen.Colours(0), row.dimmedAt > 0 ? "0/6*12" : "6/7*12");
  EXPECT_LE(FakeTime::Waits(), 5);  // no waking up in between
}

INSTANTIATE_TEST_SUITE_P(Limits, FrameInTime,
                         testing::Values(WaitCase{600, true, 60, 600}, WaitCase{0, true, 60, 0},
                                         WaitCase{30, true, 0, 60}, WaitCase{60, true, 0, 60},
                                         WaitCase{61, true, 60, 61}, WaitCase{600, false, 60, 0},
                                         WaitCase{30, false, 60, 0}));

class FrameInAWait : public FrameTest {
 protected:
  FrameInAWait() { TestFrame::UseFakeTime(true); }
  ~FrameInAWait() override { TestFrame::UseFakeTime(false); }

  FakeTime _time;
};

struct KeyCase {
  double typedAt;
  bool dimmed;
};

TEST_F(FrameInAWait, GetsTheKeyAlsoWhenItIsDimmed) {
  for (const KeyCase& row :
       {KeyCase{1, false}, KeyCase{60, false}, KeyCase{60.5, true}, KeyCase{599, true}}) {
    TestFrame frame(nullptr, 0, 0, 12, 3, [&](TestFrame& self) {
      _screen.TakeOutput();
      return self.WaitKey(true);
    });
    _time.Plan(FakeTime::Now() + row.typedAt, [this] { _screen.Type("k"); });
    EXPECT_EQ(frame.Exec(), 'k');
    EXPECT_EQ(frame.diary, row.dimmed ? "activate dim activate " : "activate ") << row.typedAt;
    UpdateScreen();
    const std::string output = _screen.TakeOutput();
    EXPECT_EQ(output.empty(), !row.dimmed) << row.typedAt;
    // The whole screen is sent anew.
    EXPECT_EQ(output.find("\x1b[2J") != std::string::npos, row.dimmed) << row.typedAt;
    EXPECT_EQ(_screen.Picture(), "under\n");
    EXPECT_EQ(_screen.Colours(0), "6/7*12");
  }
}

TEST_F(FrameInAWait, IsNotLengthenedByASignalButByAKey) {
  TestFrame frame(nullptr, 0, 0, 12, 3, [&](TestFrame& self) {
    EXPECT_EQ(self.WaitKey(true), 'k');
    return self.WaitKey(true);
  });
  _time.Plan(20, [this] { _screen.Type("k"); });
  _time.Plan(50, [] { kill(getpid(), SIGUSR1); });
  EXPECT_THROW(frame.Exec(), TarnelTimeout);
  EXPECT_EQ(frame.diary, "activate redraw dim ");
  EXPECT_NEAR(frame.lastChange, 80, 0.001);
  EXPECT_NEAR(FakeTime::Now(), 620, 0.001);
}

TEST_F(FrameInAWait, IsRedrawnOnlyInTheForeground) {
  TestFrame frame(nullptr, 0, 0, 12, 3, [](TestFrame& self) { return self.WaitKey(false); });
  for (const std::string expected : {"", "activate redraw "}) {
    _time.Plan(FakeTime::Now() + 1, [] { kill(getpid(), SIGUSR1); });
    _time.Plan(FakeTime::Now() + 2, [this] { _screen.Type("k"); });
    EXPECT_EQ(expected.empty() ? frame.WaitKey(false) : frame.Exec(), 'k');
    EXPECT_EQ(frame.diary, expected);
  }
}

TEST_F(FrameInAWait, GetsTheKeyBeforeASignalOfTheSameMoment) {
  TestFrame frame(nullptr, 0, 0, 12, 3, [&](TestFrame& self) {
    EXPECT_EQ(self.WaitKey(false), 'k');
    EXPECT_EQ(self.diary, "activate ");
    return self.WaitKey(false);
  });
  _time.Plan(1, [this] {
    kill(getpid(), SIGUSR1);
    _screen.Type("k");
    usleep(20000);  // so that the signal is there, too
  });
  _time.Plan(2, [this] { _screen.Type("l"); });
  EXPECT_EQ(frame.Exec(), 'l');
  EXPECT_EQ(frame.diary, "activate redraw ");
}

TEST_F(FrameInAWait, DimsAMinuteAfterTheClockWasSetBackAtTheLatest) {
  TestFrame frame(nullptr, 0, 0, 12, 3, [&](TestFrame& self) { return self.WaitKey(false); });
  _time.Plan(30, [] {
    FakeTime::SetBack(3600);
    kill(getpid(), SIGUSR1);
  });
  EXPECT_THROW(frame.Exec(), SleepsForEver);
  EXPECT_GE(frame.lastChange, 60);
  EXPECT_LE(frame.lastChange, 90.001);
}

TEST_F(FrameInAWait, RemembersARestartOnlyWhileAnOperatorIsLoggedIn) {
  Frame::SetLoggedIn(true);
  TestFrame frame(nullptr, 0, 0, 12, 3, [&](TestFrame& self) {
    _screen.TakeOutput();
    return self.WaitKey(true);
  });
  _time.Plan(1, [] { kill(getpid(), SIGUSR2); });
  _time.Plan(2, [this] { _screen.Type("k"); });
  EXPECT_EQ(frame.Exec(), 'k');
  EXPECT_TRUE(TestFrame::MarkedForRestart());
  EXPECT_EQ(_screen.TakeOutput(), "");
  TestFrame::ClearRestart();
  Frame::SetLoggedIn(false);
}

class FrameEnd : public FrameTest {
 protected:
  // The child is started anew, since a forked one would miss the threads.
  FrameEnd() { GTEST_FLAG_SET(death_test_style, "threadsafe"); }
};

TEST_F(FrameEnd, ComesWhenTheTerminalIsGone) {
  _screen.HangUp();
  EXPECT_EXIT(Frame::WaitEvent(nullptr), testing::ExitedWithCode(0), "");
}

TEST_F(FrameEnd, ComesAtTheEndOfTheInput) {
  EXPECT_EXIT(
      {
        close(STDIN_FILENO);
        open("/dev/null", O_RDONLY);
        Frame::WaitEvent(nullptr);
      },
      testing::ExitedWithCode(0), "");
}

TEST_F(FrameEnd, ComesWithAResizeKey) {
  TestFrame frame(nullptr, 0, 0, 12, 3, [](TestFrame& self) {
    ungetch(KEY_RESIZE);
    return self.WaitKey(false);
  });
  EXPECT_EXIT(frame.Exec(), testing::ExitedWithCode(0), "");
}

struct SizeCase {
  int columns;
  int rows;
  bool taken;
};

TEST_F(FrameTest, TakesANewSizeUnlessItIsNone) {
  openlog("TARNEL", 0, LOG_USER);
  for (const SizeCase& row : {SizeCase{0, 0, false}, SizeCase{80, 0, false}, SizeCase{0, 24, false},
                              SizeCase{100, 30, true}}) {
    const Testing::Log log;
    _screen.Resize(row.columns, row.rows);
    Frame::HandleResize();
    if (row.taken) {
      log.WaitFor({"user.info", "TARNEL: Resized window to 100x30"});
      EXPECT_EQ(LINES, 30);
      EXPECT_EQ(COLS, 100);
    } else {
      EXPECT_EQ(LINES, 3);
      EXPECT_EQ(COLS, 12);
      EXPECT_EQ(log.Lines().size(), 0U);
    }
  }
}

TEST(LoggedErrno, HasNumberAndText) {
  openlog("TARNEL", 0, LOG_USER);
  const Testing::Log log;
  errno = ENOENT;
  LogErrno("pipe() failed");
  errno = EINVAL;
  LogErrno("100%s");
  log.WaitFor({"user.err", "TARNEL: pipe() failed with errno(2): No such file or directory"});
  log.WaitFor({"user.err", "TARNEL: 100%s with errno(22): Invalid argument"});
}

}  // namespace

}  // namespace Tarnel
