// The first process of a lab: keeps the host's syslogd, and either the console on the terminal or
// a given command to its end.
//
// It stands in a process group of its own, in the terminal's foreground, and the console stands in
// the same group: Ctrl-C reaches both. The console ends then, and the supervisor, which would start
// it again otherwise, ends the lab. A given command has the foreground for itself.

#include <fcntl.h>
#include <signal.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <sys/wait.h>
#include <termios.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <optional>
#include <thread>

namespace {

using Clock = std::chrono::steady_clock;
using std::chrono::milliseconds;

constexpr const char* SYSLOGD[] = {"/sbin/syslogd", "-n", "-O", "/var/log/syslog.log", nullptr};
constexpr const char* CONSOLE[] = {"/bin/tarnel", nullptr};
constexpr char LOG_SOCKET[] = "/dev/log";
constexpr milliseconds LOG_DEADLINE{5000};
// A console that lives shorter is started again only after a pause of the same length.
constexpr milliseconds SHORT_LIFE{1000};
// How long a process may take to end when it was asked to.
constexpr milliseconds END_DEADLINE{2000};
constexpr rlimit USUAL_DESCRIPTORS = {1024, 1024};
constexpr const char* START_AFRESH[] = {"/bin/lab", "restart", nullptr};
constexpr char PID_FILE[] = "/var/run/lab-supervisor.pid";
// What poweroff and reboot of the host send.
constexpr int POWER_OFF = SIGUSR1;
constexpr int REBOOT = SIGUSR2;
constexpr int SIGNAL_STATUS = 128;
constexpr int CANNOT_RUN = 127;

// Signals that end the lab, and the one that tells of an ended child. They are never delivered:
// the supervisor takes them where it waits.
sigset_t AwaitedSignals() {
  sigset_t set;
  sigemptyset(&set);
  for (const int signal : {SIGINT, SIGTERM, SIGHUP, SIGCHLD, POWER_OFF, REBOOT})
    sigaddset(&set, signal);
  return set;
}

// The terminal that the lab was entered from, if any; gives back its settings at the end.
class Terminal {
 public:
  Terminal() : _present(tcgetattr(STDIN_FILENO, &_settings) == 0) {
    if (!_present) return;
    setpgid(0, 0);
    GiveTo(getpgrp());
  }
  Terminal(const Terminal&) = delete;
  Terminal& operator=(const Terminal&) = delete;
  ~Terminal() { Restore(); }

  void GiveTo(pid_t group) const {
    if (_present) tcsetpgrp(STDIN_FILENO, group);
  }
  void Restore() const {
    if (_present) tcsetattr(STDIN_FILENO, TCSANOW, &_settings);
  }
  static bool IsThere() { return isatty(STDIN_FILENO) != 0; }

 private:
  termios _settings;
  bool _present;
};

void ResetSignals() {
  for (const int number : {SIGTTOU, SIGTSTP, SIGQUIT}) signal(number, SIG_DFL);
  sigset_t none;
  sigemptyset(&none);
  sigprocmask(SIG_SETMASK, &none, nullptr);
}

// Starts a program; prepare runs in the child before it.
template <typename Prepare>
pid_t Start(const char* const* argv, Prepare prepare) {
  const pid_t child = fork();
  if (child != 0) return child;
  prepare();
  ResetSignals();
  execvp(argv[0], const_cast<char* const*>(argv));
  fprintf(stderr, "lab: %s: %s\n", argv[0], strerror(errno));
  _exit(CANNOT_RUN);
}

int ExitStatus(int waitStatus) {
  return WIFSIGNALED(waitStatus) ? SIGNAL_STATUS + WTERMSIG(waitStatus) : WEXITSTATUS(waitStatus);
}

// Takes the next signal; 0 when none came in time. Without a time it waits for ever.
int NextSignal(std::optional<milliseconds> time = std::nullopt) {
  const sigset_t awaited = AwaitedSignals();
  timespec limit = {};
  if (time) {
    limit.tv_sec = time->count() / 1000;
    limit.tv_nsec = time->count() % 1000 * 1000000;
  }
  for (;;) {
    const int signal = sigtimedwait(&awaited, nullptr, time ? &limit : nullptr);
    if (signal > 0) return signal;
    if (errno == EAGAIN) return 0;
  }
}

// Reaps what has ended, orphans of the lab among it; the status of child when that has ended.
std::optional<int> Reap(pid_t child) {
  std::optional<int> result;
  int status = 0;
  for (pid_t ended = 0; (ended = waitpid(-1, &status, WNOHANG)) > 0;) {
    if (ended == child) result = ExitStatus(status);
  }
  return result;
}

// How a wait came to its end: by the child's, or by a signal that ends the lab.
struct Ending {
  int status = 0;
  int signal = 0;
};

Ending WaitFor(pid_t child) {
  for (;;) {
    const int signal = NextSignal();
    if (signal != SIGCHLD) return {SIGNAL_STATUS + signal, signal};
    if (const std::optional<int> status = Reap(child)) return {*status, 0};
  }
}

// Has a child end, by force when it takes too long.
void EndChild(pid_t child, int signal) {
  kill(child, signal);
  const auto deadline = Clock::now() + END_DEADLINE;
  while (!Reap(child)) {
    const auto left = std::chrono::duration_cast<milliseconds>(deadline - Clock::now());
    if (left.count() <= 0) {
      kill(child, SIGKILL);
      return;
    }
    NextSignal(left);
  }
}

bool IsLogOpen() {
  sockaddr_un address = {AF_UNIX, {}};
  strncpy(address.sun_path, LOG_SOCKET, sizeof(address.sun_path) - 1);
  const int fd = socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0);
  const bool open = connect(fd, reinterpret_cast<sockaddr*>(&address), sizeof(address)) == 0;
  close(fd);
  return open;
}

// The host's syslogd, from its first line on; ended with the object.
class LogDaemon {
 public:
  LogDaemon() { Begin(); }
  LogDaemon(const LogDaemon&) = delete;
  LogDaemon& operator=(const LogDaemon&) = delete;
  ~LogDaemon() { kill(_pid, SIGTERM); }

  void Begin() {
    _pid = Start(SYSLOGD, Detach);
    const auto deadline = Clock::now() + LOG_DEADLINE;
    while (!(_ready = IsLogOpen()) && Clock::now() < deadline) {
      std::this_thread::sleep_for(milliseconds(1));
    }
  }
  void End() { EndChild(_pid, SIGTERM); }
  bool IsReady() const { return _ready; }

 private:
  // Out of reach of the terminal's signals.
  static void Detach() {
    setsid();
    const int null = open("/dev/null", O_RDWR);
    for (const int fd : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) dup2(null, fd);
  }

  pid_t _pid = -1;
  bool _ready = false;
};

bool IsPowerSignal(int signal) { return signal == POWER_OFF || signal == REBOOT; }

void WritePidFile() {
  FILE* const file = fopen(PID_FILE, "w");
  if (file == nullptr) return;
  fprintf(file, "%d\n", getpid());
  fclose(file);
}

int RunCommand(const char* const* command, const Terminal& terminal) {
  const pid_t child = Start(command, [&terminal] {
    setpgid(0, 0);
    terminal.GiveTo(getpid());
  });
  const Ending ending = WaitFor(child);
  if (ending.signal != 0) EndChild(child, ending.signal);
  if (IsPowerSignal(ending.signal)) puts("lab: the host has gone down");
  return ending.status;
}

// Waits out what is left of a short life; gives a signal that ends the lab meanwhile, else 0.
int Pause(Clock::time_point start) {
  if (Clock::now() - start >= SHORT_LIFE) return 0;
  const auto end = Clock::now() + SHORT_LIFE;
  for (;;) {
    const auto left = std::chrono::duration_cast<milliseconds>(end - Clock::now());
    if (left.count() <= 0) return 0;
    const int signal = NextSignal(left);
    if (signal != 0 && signal != SIGCHLD) return signal;
    Reap(0);
  }
}

// What a restart of the host does besides a new console; gives a signal that ends the lab
// meanwhile, else 0.
int StartHostAfresh(LogDaemon& log) {
  log.End();
  const int signal = WaitFor(Start(START_AFRESH, [] {})).signal;
  log.Begin();
  return IsPowerSignal(signal) ? 0 : signal;
}

// Starts the console again and again until Ctrl-C, the end of the terminal, or a signal.
int KeepConsole(const Terminal& terminal, LogDaemon& log) {
  int signal = 0;
  while (signal == 0 && Terminal::IsThere()) {
    const auto start = Clock::now();
    const pid_t console = Start(CONSOLE, [] {});
    signal = WaitFor(console).signal;
    if (signal != 0) EndChild(console, IsPowerSignal(signal) ? SIGTERM : signal);
    terminal.Restore();
    if (signal == POWER_OFF) {
      puts("lab: the host has been shut down");
      return 0;
    }
    if (signal == REBOOT) {
      signal = StartHostAfresh(log);
      continue;
    }
    if (signal == 0 && Terminal::IsThere()) signal = Pause(start);
  }
  return signal == 0 || signal == SIGINT ? 0 : SIGNAL_STATUS + signal;
}

}  // namespace

// A lab may lose its root and its terminal together, and the leak check, which starts a helper
// process, would then wait for that one for ever.
extern "C" int __lsan_is_turned_off() { return 1; }  // NOLINT(bugprone-reserved-identifier)

int main(int, char** argv) {
  const sigset_t awaited = AwaitedSignals();
  sigprocmask(SIG_BLOCK, &awaited, nullptr);
  for (const int number : {SIGTTOU, SIGTSTP, SIGQUIT}) signal(number, SIG_IGN);
  prctl(PR_SET_CHILD_SUBREAPER, 1);
  // PAM closes descriptors one by one before it runs a helper.
  setrlimit(RLIMIT_NOFILE, &USUAL_DESCRIPTORS);
  // What the caller left open is no business of the lab.
  close_range(STDERR_FILENO + 1, ~0U, 0);
  LogDaemon log;
  if (!log.IsReady()) {
    fprintf(stderr, "lab: syslogd does not start\n");
    return 1;
  }
  WritePidFile();
  const Terminal terminal;
  return argv[1] == nullptr ? KeepConsole(terminal, log) : RunCommand(argv + 1, terminal);
}
