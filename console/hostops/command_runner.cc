#include "console/hostops/command_runner.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/signalfd.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <syslog.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <climits>
#include <csignal>

#include "console/hostops/pipe.h"
#include "console/screen/screen.h"
#include "hostapi/kernel.h"

namespace Tarnel {
namespace {

using std::chrono::milliseconds;
using std::chrono::steady_clock;

// How often a child is looked at where the kernel does not tell of its end.
constexpr int FALLBACK_POLL_MS = 5;
// How long a killed child may take to go; one that hangs in the kernel is left behind.
constexpr int REAP_LIMIT_MS = 1000;

bool IsTransient(int error) { return error == EINTR || error == EAGAIN; }

// One output stream of a child: the first bytes reach the caller, the rest is read and dropped.
class Capture {
 public:
  Capture(Pipe& pipe, char* buffer, int32_t* length) : _pipe(pipe), _buffer(buffer) {
    if (buffer == nullptr) {
      return;
    }
    _capacity = std::max(*length, 0);
    _length = length;
    *_length = 0;
  }

  int Descriptor() const { return _pipe.ReadEnd(); }

  // Takes what a readable pipe gives in one read; closes it at the end of file.
  void ReadSome() {
    char dropped[16384];
    const int32_t room = Room();
    const ssize_t count = room > 0 ? read(Descriptor(), End(), static_cast<size_t>(room))
                                   : read(Descriptor(), dropped, sizeof dropped);
    if (count > 0 && room > 0) {
      *_length += static_cast<int32_t>(count);
    } else if (count == 0 || (count < 0 && !IsTransient(errno))) {
      _pipe.CloseRead();
    }
  }

  // Takes what lies in the pipe at this moment. It never waits for an end of file, which a
  // descendant of the child may put off for ever.
  void ReadPending() {
    int pending = 0;
    if (Room() == 0 || Descriptor() == -1 || ioctl(Descriptor(), FIONREAD, &pending) != 0) {
      return;
    }
    *_length += ReadFully(Descriptor(), End(), std::min(pending, Room()));
  }

 private:
  int32_t Room() const { return _length == nullptr ? 0 : _capacity - *_length; }
  char* End() const { return _buffer + *_length; }

  Pipe& _pipe;
  char* _buffer;
  int32_t* _length = nullptr;
  int32_t _capacity = 0;
};

// write() that reports a reader's absence by EPIPE alone, whatever the disposition of SIGPIPE is.
ssize_t WriteQuietly(int fd, const char* data, size_t size) {
  sigset_t pipeSignal;
  sigset_t pending;
  sigset_t previous;
  sigemptyset(&pipeSignal);
  sigaddset(&pipeSignal, SIGPIPE);
  sigpending(&pending);
  pthread_sigmask(SIG_BLOCK, &pipeSignal, &previous);
  const ssize_t count = write(fd, data, size);
  const int error = errno;
  if (count < 0 && error == EPIPE && sigismember(&pending, SIGPIPE) == 0) {
    const timespec atOnce{};
    sigtimedwait(&pipeSignal, nullptr, &atOnce);
  }
  pthread_sigmask(SIG_SETMASK, &previous, nullptr);
  errno = error;
  return count;
}

// What a child gets to read: the given bytes, then the end of file.
class Feed {
 public:
  Feed(Pipe& pipe, const char* data, uint32_t size)
      : _pipe(pipe), _data(data), _left(data == nullptr ? 0 : size) {
    if (_left == 0) {
      _pipe.CloseWrite();
    } else {
      fcntl(Descriptor(), F_SETFL, O_NONBLOCK);
    }
  }

  int Descriptor() const { return _pipe.WriteEnd(); }

  // Hands over what a writable pipe takes in one write.
  void WriteSome() {
    const ssize_t count = WriteQuietly(Descriptor(), _data, _left);
    if (count > 0) {
      _data += count;
      _left -= static_cast<size_t>(count);
    }
    if (_left == 0 || count == 0 || (count < 0 && !IsTransient(errno))) {
      _pipe.CloseWrite();
    }
  }

 private:
  Pipe& _pipe;
  const char* _data;
  size_t _left;
};

// Readable when a child has ended or stopped, while SIGCHLD is blocked.
int WatchChildren() {
  sigset_t childSignal;
  sigemptyset(&childSignal);
  sigaddset(&childSignal, SIGCHLD);
  return signalfd(-1, &childSignal, SFD_NONBLOCK | SFD_CLOEXEC);
}

// A child from its start until its wait status has been taken.
class Child {
 public:
  explicit Child(pid_t pid)
      : _pid(pid),
        _endDescriptor(static_cast<int>(syscall(SYS_pidfd_open, pid, 0))),
        _changeDescriptor(WatchChildren()) {}
  ~Child() {
    for (const int fd : {_endDescriptor, _changeDescriptor}) {
      if (fd != -1) {
        close(fd);
      }
    }
  }
  Child(const Child&) = delete;
  Child& operator=(const Child&) = delete;

  // Serves the streams until the child has ended, and gives its wait status; -1 when it was killed
  // at the limit or cannot be waited for. A child that stops, as by the terminal's suspend
  // character, is killed too: nobody would let it go on.
  int Wait(int32_t timeoutSeconds, Feed& in, Capture& out, Capture& err) {
    const auto limit = milliseconds(timeoutSeconds * INT64_C(1000));
    const auto start = steady_clock::now();
    int64_t left = timeoutSeconds > 0 ? limit.count() : -1;
    while (left != 0) {
      int status = -1;
      if (Serve(left, in, out, err) && waitpid(_pid, &status, WNOHANG | WUNTRACED) != 0) {
        if (WIFSTOPPED(status)) {
          Kill();
        }
        return status;
      }
      if (timeoutSeconds > 0) {
        const auto spent = std::chrono::floor<milliseconds>(steady_clock::now() - start);
        left = std::max(limit - spent, milliseconds(0)).count();
      }
    }
    syslog(LOG_WARNING, "Killing process because %d seconds timeout expired", timeoutSeconds);
    Kill();
    return -1;
  }

 private:
  // Waits for the next event, but not longer than the given time (-1: for ever). True when the
  // child may have ended or stopped.
  bool Serve(int64_t limit, Feed& in, Capture& out, Capture& err) {
    pollfd watched[] = {{_endDescriptor, POLLIN, 0},
                        {in.Descriptor(), POLLOUT, 0},
                        {out.Descriptor(), POLLIN, 0},
                        {err.Descriptor(), POLLIN, 0},
                        {_changeDescriptor, POLLIN, 0}};
    int wait = static_cast<int>(std::min<int64_t>(limit, INT_MAX));
    if (_endDescriptor == -1) {
      wait = wait < 0 ? FALLBACK_POLL_MS : std::min(wait, FALLBACK_POLL_MS);
    }
    if (poll(watched, std::size(watched), wait) > 0) {
      if (watched[1].revents != 0) {
        in.WriteSome();
      }
      if (watched[2].revents != 0) {
        out.ReadSome();
      }
      if (watched[3].revents != 0) {
        err.ReadSome();
      }
      if (watched[4].revents != 0) {
        // Which child it was is asked of the child.
        signalfd_siginfo change;
        [[maybe_unused]] const ssize_t taken = read(_changeDescriptor, &change, sizeof change);
      }
    }
    return _endDescriptor == -1 || watched[0].revents != 0 || watched[4].revents != 0;
  }

  void Kill() const {
    kill(_pid, SIGKILL);
    for (int waited = 0; waited < REAP_LIMIT_MS; waited += FALLBACK_POLL_MS) {
      pollfd end{_endDescriptor, POLLIN, 0};
      poll(&end, 1, FALLBACK_POLL_MS);
      if (waitpid(_pid, nullptr, WNOHANG) != 0) {
        return;
      }
    }
  }

  pid_t _pid;
  // Readable once the child has ended; -1 where the kernel has no such descriptors.
  int _endDescriptor;
  int _changeDescriptor;
};

// Gives the child's process id, or -1 with errno set.
pid_t StartChild(const char* path, const char** argv, const Pipe& in, const Pipe& out,
                 const Pipe& err) {
  static const char* const ENVIRONMENT[] = {"PYTHONHOME=/", nullptr};
  const int32_t descriptors[] = {in.ReadEnd(), out.WriteEnd(), err.WriteEnd()};
  const SpawnResult result =
      Kernel_Spawn({path, argv, ENVIRONMENT, descriptors, std::size(descriptors)});
  if (result.errorWord != 0) {
    errno = -result.errorWord;
  }
  return result.status == 0 ? result.pid : -1;
}

}  // namespace

int RunShell(const char* command) {
  UpdateScreen();
  const char* const argv[] = {"sh", "-c", command, nullptr};
  const int32_t descriptors[] = {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO};
  const SpawnResult shell =
      Kernel_Spawn({"/bin/sh", argv, environ, descriptors, std::size(descriptors)});
  int status = -1;
  if (shell.status != 0) {
    return -1;
  }
  for (;;) {
    const pid_t changed = waitpid(shell.pid, &status, WUNTRACED);
    if (changed > 0 && WIFSTOPPED(status)) {
      // By the terminal's suspend character, with all that the shell had started.
      kill(0, SIGCONT);
    } else if (changed > 0 || errno != EINTR) {
      return status;
    }
  }
}

int32_t ReadFully(int fd, char* buffer, int32_t size) {
  int32_t done = 0;
  while (done < size) {
    const ssize_t count = read(fd, buffer + done, static_cast<size_t>(size - done));
    if (count > 0) {
      done += static_cast<int32_t>(count);
    } else if (count < 0 && IsTransient(errno)) {
      pollfd readable{fd, POLLIN, 0};
      poll(&readable, 1, -1);
    } else {
      break;
    }
  }
  return done;
}

int32_t RunCommand(const char* path, const char** argv, char* outBuf, int32_t* outLen, char* errBuf,
                   int32_t* errLen, const char* inBuf, uint32_t inLen, int32_t timeoutSeconds) {
  UpdateScreen();
  Pipe in;
  Pipe out;
  Pipe err;
  Capture outCapture(out, outBuf, outLen);
  Capture errCapture(err, errBuf, errLen);
  if (!in.IsOpened() || !out.IsOpened() || !err.IsOpened()) {
    return -1;
  }
  const pid_t pid = StartChild(path, argv, in, out, err);
  if (pid == -1) {
    return -1;
  }
  in.CloseRead();
  out.CloseWrite();
  err.CloseWrite();

  Feed feed(in, inBuf, inLen);
  const int status = Child(pid).Wait(timeoutSeconds, feed, outCapture, errCapture);
  outCapture.ReadPending();
  errCapture.ReadPending();
  if (WIFEXITED(status)) {
    return WEXITSTATUS(status);
  }
  syslog(LOG_ERR, "Run Command did not terminate normally");
  return -1;
}

}  // namespace Tarnel
