// The signal thread and the one wait. These cases also run under ThreadSanitizer, in a program of
// their own.

#include <gtest/gtest.h>
#include <unistd.h>

#include <csignal>
#include <thread>

#include "shell/frame.h"
#include "tests/shell/signal_thread.h"
#include "tests/support/curses_screen.h"

namespace Tarnel {

namespace {

using Testing::CursesScreen;

class Signals : public testing::Test {
 protected:
  static int NextEvent(time_t seconds = 5) {
    timeval limit{seconds, 0};
    return Frame::WaitEvent(&limit);
  }

  Testing::SignalThread _signalThread;
  CursesScreen _screen{10, 2};
};

TEST_F(Signals, BecomeEvents) {
  struct SignalCase {
    int signal;
    int event;
  };
  for (const auto& [signal, event] : {SignalCase{10, -3}, SignalCase{12, -4}, SignalCase{28, -5},
                                      SignalCase{2, -6}, SignalCase{3, -6}, SignalCase{15, -6}}) {
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

TEST_F(Signals, WaitUntilTheKeyboardWasRead) {
  kill(getpid(), SIGUSR1);
  ASSERT_EQ(NextEvent(), EVENT_REDRAW);  // the thread has had its time
  kill(getpid(), SIGUSR1);
  _screen.Type("ab");
  EXPECT_EQ(NextEvent(), 'a');
  EXPECT_EQ(NextEvent(), 'b');
  EXPECT_EQ(NextEvent(), EVENT_REDRAW);
}

TEST_F(Signals, AreNotMixedUpWithKeysOfTheSameNumbers) {
  _screen.Type("\x01\x04");
  EXPECT_EQ(NextEvent(), 1);
  EXPECT_EQ(NextEvent(), 4);
}

TEST_F(Signals, LeaveTheRestOfABrokenSequenceToTheNextWait) {
  _screen.Type("\x1bx");
  EXPECT_EQ(NextEvent(), 27);
  EXPECT_EQ(NextEvent(0), 'x');
  EXPECT_EQ(NextEvent(0), EVENT_TIME_IS_UP);
}

}  // namespace

}  // namespace Tarnel
