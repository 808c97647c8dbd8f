#include "console/screen/frame.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <syslog.h>
#include <unistd.h>

#include <cerrno>
#include <cmath>
#include <csignal>
#include <functional>

#include "console/screen/colours.h"
#include "console/screen/screen.h"
#include "tests/support/curses_screen.h"
#include "tests/support/fake_time.h"
#include "tests/support/lab.h"
#include "tests/support/signal_thread.h"

namespace Tarnel {

namespace {

using Testing::FakeTime;

// A frame whose loop is a function of the test, and which keeps a diary with the seconds.
class TestFrame : public Frame {
 public:
  using Loop = std::function<int(TestFrame&)>;

  explicit TestFrame(Loop loop)
      : Frame(nullptr, 0, 0, 12, 3, DARK_GREY, WHITE), _loop(std::move(loop)) {
    PutText(0, 0, "under");
  }
  TestFrame(TestFrame* parent, Loop loop)
      : Frame(parent, 4, 1, 6, 1, DARK_GREY, WHITE), _loop(std::move(loop)) {
    PutText(0, 0, "over");
  }

  int Run() override { return _loop(*this); }
  void Redraw() override { Note("redraw"); }
  void Activate(bool active) override {
    Note(active ? "active" : "dim");
    Frame::Activate(active);
  }

  using Frame::_idleTimeout;
  using Frame::_markForRestart;
  using Frame::fgFrame;
  using Frame::WaitKey;

  std::string diary;

 private:
  void Note(const std::string& what) {
    diary += std::to_string(std::lround(FakeTime::Now())) + ":" + what + " ";
  }

  Loop _loop;
};

class FrameTest : public testing::Test {
 protected:
  void PlanKey(double seconds, const std::string& key) {
    FakeTime::Plan(seconds, [this, key] { _screen.Type(key); });
  }
  static void PlanSignal(double seconds, int signal) {
    FakeTime::Plan(seconds, [signal] { kill(getpid(), signal); });
  }

  Testing::SignalThread _signalThread;
  Testing::CursesScreen _screen{12, 3};
  FakeTime _time;
};

TEST_F(FrameTest, DimsItsParentAndGivesItsResultBack) {
  TestFrame under([&](TestFrame& self) {
    EXPECT_EQ(TestFrame::fgFrame, &self);
    TestFrame over(&self, [&](TestFrame& upper) {
      EXPECT_EQ(TestFrame::fgFrame, &upper);
      EXPECT_EQ(_screen.Picture(), "under\n    over\n");
      EXPECT_EQ(_screen.Colours(0), "0/6*12");
      EXPECT_EQ(_screen.Colours(1), "0/6*4 6/7*6 0/6*2");
      return 7;
    });
    EXPECT_EQ(over.Exec(), 7);
    EXPECT_EQ(over.Exec(), 7);
    EXPECT_EQ(TestFrame::fgFrame, &self);
    EXPECT_EQ(_screen.Picture(), "under\n");
    EXPECT_EQ(_screen.Colours(1), "6/7*12");
    return 3;
  });
  EXPECT_EQ(under.Exec(), 3);
  EXPECT_EQ(TestFrame::fgFrame, nullptr);
  EXPECT_EQ(under.diary, "0:active 0:dim 0:active 0:dim 0:active ");
}

TEST_F(FrameTest, LosesEarlierKeysAndTakesTheKeypadsEnterForEnter) {
  TestFrame frame([&](TestFrame& self) {
    _screen.Type("b");
    EXPECT_EQ(self.WaitKey(false), 'b');
    ungetch(KEY_ENTER);
    return self.WaitKey(false);
  });
  _screen.Type("a");
  EXPECT_EQ(frame.Exec(), 10);
}

// A wait in which nothing happens.
struct WaitCase {
  uint32_t limit;
  bool useLimit;
  const char* diary;
  double thrownAt;  // 0: it sleeps for ever
};

class FrameLimit : public FrameTest, public testing::WithParamInterface<WaitCase> {
 protected:
  FrameLimit() { TestFrame::_idleTimeout = GetParam().limit; }
  ~FrameLimit() override { TestFrame::_idleTimeout = 600; }
};

TEST_P(FrameLimit, DimsAndGivesUp) {
  const auto& [limit, useLimit, diary, thrownAt] = GetParam();
  TestFrame frame([use = useLimit](TestFrame& self) { return self.WaitKey(use); });
  if (thrownAt > 0) {
    EXPECT_THROW(frame.Exec(), TarnelTimeout);
    EXPECT_NEAR(FakeTime::Now(), thrownAt, 0.001);
    EXPECT_EQ(TestFrame::fgFrame, nullptr);
  } else {
    EXPECT_THROW(frame.Exec(), Testing::SleepsForEver);
  }
  EXPECT_EQ(frame.diary, diary) << limit;
  EXPECT_LE(FakeTime::Waits(), 5);  // no waking up in between
}

INSTANTIATE_TEST_SUITE_P(Limits, FrameLimit,
                         testing::Values(WaitCase{600, true, "0:active 60:dim ", 600},
                                         WaitCase{61, true, "0:active 60:dim ", 61},
                                         WaitCase{30, true, "0:active ", 60},
                                         WaitCase{0, true, "0:active 60:dim ", 0},
                                         WaitCase{30, false, "0:active 60:dim ", 0}));

TEST_F(FrameTest, GetsTheKeyAlsoWhenItIsDimmed) {
  for (const bool dimmed : {false, true}) {
    TestFrame frame([&](TestFrame& self) {
      _screen.TakeOutput();
      return self.WaitKey(true);
    });
    PlanKey(dimmed ? 60.5 : 60, "k");
    EXPECT_EQ(frame.Exec(), 'k');
    EXPECT_EQ(frame.diary.find("dim") != std::string::npos, dimmed);
    UpdateScreen();
    // The whole screen is sent anew, or nothing.
    const std::string output = _screen.TakeOutput();
    EXPECT_TRUE(dimmed ? output.find("\033[2J") != std::string::npos : output.empty());
    EXPECT_EQ(_screen.Picture(), "under\n");
    EXPECT_EQ(_screen.Colours(0), "6/7*12");
  }
}

TEST_F(FrameTest, WaitsLongerAfterAKeyButNotAfterASignal) {
  TestFrame frame([&](TestFrame& self) {
    EXPECT_EQ(self.WaitKey(true), 'k');
    return self.WaitKey(true);
  });
  PlanKey(20, "k");
  PlanSignal(50.7, SIGUSR1);
  EXPECT_THROW(frame.Exec(), TarnelTimeout);
  EXPECT_EQ(frame.diary, "0:active 51:redraw 80:dim ");
  EXPECT_NEAR(FakeTime::Now(), 620, 0.001);
}

TEST_F(FrameTest, IsNotRedrawnInTheBackground) {
  TestFrame frame([](TestFrame&) { return 0; });
  PlanSignal(1, SIGUSR1);
  PlanKey(2, "k");
  EXPECT_EQ(frame.WaitKey(false), 'k');
  EXPECT_EQ(frame.diary, "");
}

TEST_F(FrameTest, GetsTheKeyBeforeASignalOfTheSameMoment) {
  TestFrame frame([&](TestFrame& self) {
    EXPECT_EQ(self.WaitKey(false), 'k');
    EXPECT_EQ(self.diary, "0:active ");
    return self.WaitKey(false);
  });
  FakeTime::Plan(1, [this] {
    kill(getpid(), SIGUSR1);
    _screen.Type("k");
    usleep(20000);  // so that the signal is there, too
  });
  PlanKey(2, "l");
  EXPECT_EQ(frame.Exec(), 'l');
  EXPECT_EQ(frame.diary, "0:active 1:redraw ");
}

TEST_F(FrameTest, RemembersARestartWhileAnOperatorIsLoggedIn) {
  Frame::SetLoggedIn(true);
  TestFrame frame([](TestFrame& self) { return self.WaitKey(true); });
  PlanSignal(1, SIGUSR2);
  PlanKey(2, "k");
  EXPECT_EQ(frame.Exec(), 'k');
  EXPECT_TRUE(TestFrame::_markForRestart);
  TestFrame::_markForRestart = false;
  Frame::SetLoggedIn(false);
}

TEST_F(FrameTest, EndsTheProcessAtTheEndOfTheInput) {
  // The child is started anew, since a forked one would miss the threads.
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  EXPECT_EXIT(
      {
        close(STDIN_FILENO);
        open("/dev/null", O_RDONLY);
        Frame::WaitEvent(nullptr);
      },
      testing::ExitedWithCode(0), "");
}

TEST(LoggedErrno, HasNumberAndText) {
  openlog("TARNEL", 0, LOG_USER);
  const Testing::Log log;
  errno = EINVAL;
  LogErrno("100%s");
  log.WaitFor({"user.err", "TARNEL: 100%s with errno(22): Invalid argument"});
}

}  // namespace

}  // namespace Tarnel
