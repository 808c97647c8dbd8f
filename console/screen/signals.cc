// How signals become data: a thread of its own takes them and writes a byte for each into a pipe,
// and the one wait of the program reads the keyboard and that pipe.

#include <fcntl.h>
#include <poll.h>
#include <pthread.h>
#include <sys/ioctl.h>
#include <sys/select.h>
#include <syslog.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdlib>
#include <cstring>

#include "console/screen/frame.h"
#include "console/screen/screen.h"

namespace Tarnel {

sigset_t Frame::_signalSet;
int Frame::_signalPipe[2] = {-1, -1};

namespace {

struct SignalByte {
  int signal;
  char byte;
};

constexpr SignalByte SIGNAL_BYTES[] = {
    {SIGUSR1, 1}, {SIGUSR2, 2}, {SIGWINCH, 3}, {SIGINT, 4}, {SIGQUIT, 4}, {SIGTERM, 4},
};

// By the byte minus 1.
constexpr std::array<Event, 4> BYTE_EVENTS = {EVENT_REDRAW, EVENT_RESTART, EVENT_RESIZE, EVENT_END};

// A key that has come already, or EVENT_NONE.
int ReadKey() {
  wtimeout(stdscr, 0);
  const int key = wgetch(stdscr);
  wtimeout(stdscr, -1);
  return key;
}

// The terminal has hung up, or its input is at the end of file: nothing will come any more.
bool TerminalIsGone() {
  pollfd input{STDIN_FILENO, POLLIN, 0};
  if (poll(&input, 1, 0) <= 0) {
    return false;
  }
  int waiting = 0;
  return (input.revents & (POLLHUP | POLLERR | POLLNVAL)) != 0 ||
         ioctl(STDIN_FILENO, FIONREAD, &waiting) != 0 || waiting == 0;
}

// Nothing usable came from the terminal. A terminal that is gone ends the process, which would
// otherwise find it readable for ever.
int NothingRead() {
  if (TerminalIsGone()) {
    exit(0);
  }
  return EVENT_NONE;
}

int ReadSignalEvent(int pipe) {
  char byte = 0;
  ssize_t count = 0;
  do {
    count = read(pipe, &byte, 1);
  } while (count < 0 && errno == EINTR);
  if (count != 1 || byte < 1 || byte > static_cast<char>(BYTE_EVENTS.size())) {
    return EVENT_NONE;
  }
  return BYTE_EVENTS[static_cast<size_t>(byte - 1)];
}

}  // namespace

void Frame::StartSignalThread() {
  if (pipe2(_signalPipe, O_CLOEXEC) != 0) {
    LogErrno("pipe() failed");
    exit(1);
  }
  sigemptyset(&_signalSet);
  for (const SignalByte& entry : SIGNAL_BYTES) {
    sigaddset(&_signalSet, entry.signal);
  }
  sigset_t blocked = _signalSet;
  sigaddset(&blocked, SIGCHLD);
  errno = pthread_sigmask(SIG_BLOCK, &blocked, nullptr);
  if (errno != 0) {
    LogErrno("pthread_sigmask() failed");
  }
  pthread_t thread{};
  errno = pthread_create(&thread, nullptr, &Frame::SignalHandler, nullptr);
  if (errno != 0) {
    LogErrno("pthread_create() failed");
    exit(1);
  }
}

void* Frame::SignalHandler(void*) {
  for (;;) {
    int signal = 0;
    errno = sigwait(&_signalSet, &signal);
    if (errno != 0) {
      LogErrno("sigwait() failed");
      continue;
    }
    const auto* const entry =
        std::find_if(std::begin(SIGNAL_BYTES), std::end(SIGNAL_BYTES),
                     [&](const SignalByte& candidate) { return candidate.signal == signal; });
    if (entry == std::end(SIGNAL_BYTES)) {
      continue;
    }
    while (write(_signalPipe[1], &entry->byte, 1) < 0 && errno == EINTR) {
    }
  }
}

int Frame::WaitEvent(timeval* timeout, const sigset_t* mask) {
  UpdateScreen();
  // After a broken escape sequence curses holds keys that select does not see.
  if (const int key = ReadKey(); key != ERR) {
    return key;
  }
  fd_set ready;
  FD_ZERO(&ready);
  FD_SET(STDIN_FILENO, &ready);
  FD_SET(_signalPipe[0], &ready);
  const int last = std::max(STDIN_FILENO, _signalPipe[0]);
  const int count = mask == nullptr ? select(last + 1, &ready, nullptr, nullptr, timeout)
                                    : pselect(last + 1, &ready, nullptr, nullptr, nullptr, mask);
  if (count < 0) {
    if (mask != nullptr && errno == EINTR) {
      return EVENT_NONE;
    }
    LogErrno("select() failed");
    return NothingRead();
  }
  if (count == 0) {
    return EVENT_TIME_IS_UP;
  }
  if (FD_ISSET(STDIN_FILENO, &ready)) {
    const int key = ReadKey();
    return key != ERR ? key : NothingRead();
  }
  return ReadSignalEvent(_signalPipe[0]);
}

void LogErrno(const char* message) {
  const int error = errno;
  char buffer[128] = "";
  const char* const text = strerror_r(error, buffer, sizeof buffer);
  syslog(LOG_ERR, "%s with errno(%d): %s", message, error, text);
}

}  // namespace Tarnel
