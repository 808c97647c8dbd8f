// The signal thread and the one wait. These cases also run under ThreadSanitizer, in a program of
// their own.

#include <gtest/gtest.h>
#include <unistd.h>

#include <csignal>
#include <thread>

#include "console/screen/frame.h"
#include "tests/support/curses_screen.h"
#include "tests/support/signal_thread.h"

namespace Tarnel {

namespace {

class Signals : public testing::Test {
 protected:
  static int NextEvent(time_t seconds = 5) {
    timeval limit{seconds, 0};
    return Frame::WaitEvent(&limit);
  }

  Testing::SignalThread _signalThread;
  Testing::CursesScreen _screen{10, 2};
};

TEST_F(Signals, BecomeEvents) {
  using SignalEvent = std::pair<int, Event>;
  for (const auto& [signal, event] :
       {SignalEvent{SIGUSR1, EVENT_REDRAW}, SignalEvent{SIGUSR2, EVENT_RESTART},
        SignalEvent{SIGWINCH, EVENT_RESIZE}, SignalEvent{SIGINT, EVENT_END},
        SignalEvent{SIGQUIT, EVENT_END}, SignalEvent{SIGTERM, EVENT_END}}) {
    kill(getpid(), signal);
    EXPECT_EQ(NextEvent(), event) << "after signal " << signal;
  }
  EXPECT_EQ(NextEvent(0), EVENT_TIME_IS_UP);
}

TEST_F(Signals, AreBlockedInLaterThreadsAndNotLost) {
  std::jthread([] {
    for (int i = 0; i < 50; ++i) {
      pthread_kill(pthread_self(), SIGUSR1);  // for a thread that takes none: it lives on
      kill(getpid(), SIGUSR2);
      std::this_thread::yield();
    }
  }).join();
  // Signals of one kind that come together may be one. The highest number is taken last.
  kill(getpid(), SIGWINCH);
  int restarts = 0;
  int event = EVENT_NONE;
  while ((event = NextEvent()) == EVENT_RESTART) {
    ++restarts;
  }
  EXPECT_EQ(event, EVENT_RESIZE);
  EXPECT_GE(restarts, 1);
  EXPECT_LE(restarts, 50);
}

// Also keys with the numbers of the bytes that signals become, and those that curses holds back
// after a broken sequence.
TEST_F(Signals, LeaveKeysAlone) {
  for (const std::string keys : {"\x01\x04", "\033x"}) {
    _screen.Type(keys);
    EXPECT_EQ(NextEvent(), keys[0]);
    EXPECT_EQ(NextEvent(0), keys[1]);
    EXPECT_EQ(NextEvent(0), EVENT_TIME_IS_UP);
  }
}

}  // namespace

}  // namespace Tarnel
