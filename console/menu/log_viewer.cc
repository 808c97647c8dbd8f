#include "console/menu/log_viewer.h"

#include <curses.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <term.h>
#include <termios.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <iterator>

#include "console/screen/screen.h"
#include "console/screen/terminal.h"
#include "hostapi/kernel.h"

namespace Tarnel {

namespace {

struct Log {
  const char* label;
  const char* path;
  bool exists;
};

Log logs[] = {
    {"Syslog", "/var/log/syslog.log", false},
    {"Corelin", "/var/log/corelin.log", false},
    {"Config", "/var/log/sysboot.log", false},
    {"Management Agent (stewardd)", "/var/log/stewardd.log", false},
    {"Fleetkeep Agent (fkagent)", "/var/log/fkagent.log", false},
    {"High Availibility Agent (hakeeper)", "/var/log/hakeeper.log", false},
    {"Halvren Ostrel Observation log (notaryd)", "/var/log/notaryd.log", false},
};

// The pager's secure mode, in which it starts no programs, for as long as the object lives.
class SecurePager {
 public:
  SecurePager() {
    const char* const value = getenv(NAME);
    _value = value != nullptr ? value : "";
    setenv(NAME, "1", 1);
  }
  ~SecurePager() { setenv(NAME, _value.c_str(), 1); }
  SecurePager(const SecurePager&) = delete;
  SecurePager& operator=(const SecurePager&) = delete;

 private:
  static constexpr char NAME[] = "LESSSECURE";
  std::string _value;
};

// The terminal as it was before curses, for as long as the object lives.
class LentTerminal {
 public:
  LentTerminal() {
    tcgetattr(STDOUT_FILENO, &_modes);
    tcsetattr(STDOUT_FILENO, TCSANOW, &orig_termios);
  }
  ~LentTerminal() { TakeBack(); }
  LentTerminal(const LentTerminal&) = delete;
  LentTerminal& operator=(const LentTerminal&) = delete;

 private:
  // From the background, where the pager has put the console, each of these calls would stop it.
  void TakeBack() const {
    sigset_t stop;
    sigset_t before;
    sigemptyset(&stop);
    sigaddset(&stop, SIGTTOU);
    pthread_sigmask(SIG_BLOCK, &stop, &before);
    tcsetattr(STDOUT_FILENO, TCSANOW, &_modes);
    tcsetpgrp(STDOUT_FILENO, getpgid(0));
    pthread_sigmask(SIG_SETMASK, &before, nullptr);
  }

  termios _modes{};
};

void RunToItsEnd(const char* path) {
  const char* const argv[] = {"less", "-cfP", "<Q> Quit </> RegExp Search <H> Help", path, nullptr};
  const int32_t descriptors[] = {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO};
  const int32_t terminal = tcgetpgrp(STDOUT_FILENO) >= 0 ? STDOUT_FILENO : -1;
  const SpawnResult pager = Kernel_Spawn({"/bin/less", argv, environ, descriptors,
                                          static_cast<int32_t>(std::size(descriptors)), terminal});
  if (pager.status != 0) {
    return;
  }
  while (waitpid(pager.pid, nullptr, 0) < 0 && errno == EINTR) {
  }
}

// The pager has left the alternate screen; without it the console would go on among the lines that
// stood on the terminal before.
void EnterAlternateScreen() {
  if (enter_ca_mode != nullptr) {
    putp(enter_ca_mode);
    fflush(stdout);
  }
}

}  // namespace

std::string LogListText() {
  std::string text;
  int number = 1;
  for (Log& log : logs) {
    struct stat status {};
    log.exists = stat(log.path, &status) == 0;
    if (log.exists) {
      text += "{color:white}<" + std::to_string(number) + "> {color:light-grey}" + log.label +
              "{/color}\n";
      ++number;
    }
  }
  return text + "\n";
}

const char* FindLog(int number) {
  for (const Log& log : logs) {
    if (log.exists && --number == 0) {
      return log.path;
    }
  }
  return nullptr;
}

void RunPager(const char* path) {
  {
    const LentTerminal lent;
    clear();
    UpdateScreen();
    const SecurePager secure;
    RunToItsEnd(path);
  }
  EnterAlternateScreen();
}

}  // namespace Tarnel
