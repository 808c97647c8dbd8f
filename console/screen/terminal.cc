#include "console/screen/terminal.h"

#include <curses.h>
#include <fcntl.h>
#include <linux/vt.h>
#include <sys/ioctl.h>
#include <syslog.h>
#include <term.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <clocale>
#include <csignal>
#include <cstdlib>
#include <string_view>

#include "console/screen/colours.h"
#include "console/screen/key_map.h"

namespace Tarnel {

bool runningOverSerial = true;
termios orig_termios;

namespace {

std::string_view TerminalType() {
  const char* const type = getenv("TERM");
  return type != nullptr ? type : "";
}

// The locale decides which bytes are characters and whether block and line characters show; any
// UTF-8 locale will do. Nothing else of a locale is used, and each category costs a file.
void SetLocale() {
  for (const char* locale : {"en_US.UTF-8", "C.UTF-8", ""}) {
    if (setlocale(LC_CTYPE, locale) != nullptr) {
      return;
    }
  }
}

// Curses would print its complaint to standard error, which nobody sees, and end the process.
void RequireUsableTerminal() {
  int result = 0;
  if (setupterm(nullptr, STDOUT_FILENO, &result) != OK) {
    syslog(LOG_ERR, "Terminal type \"%s\" cannot be used", TerminalType().data());
    exit(1);
  }
  del_curterm(cur_term);
}

// A person at a serial line types a function key as Esc and a digit, one after the other.
bool KeysAreTypedByHand() {
  constexpr std::array<std::string_view, 4> DEVICES = {"/dev/ttyS", "/dev/ttyAMA", "/dev/hvc",
                                                       "/dev/ttyUSB"};
  constexpr std::array<std::string_view, 2> TYPES = {"vt1", "vt2"};
  const char* const name = ttyname(STDIN_FILENO);
  const std::string_view device = name != nullptr ? name : "";
  return std::any_of(DEVICES.begin(), DEVICES.end(),
                     [&](std::string_view prefix) { return device.starts_with(prefix); }) ||
         std::any_of(TYPES.begin(), TYPES.end(),
                     [](std::string_view prefix) { return TerminalType().starts_with(prefix); });
}

void SetEscapeDelay() {
  constexpr int MILLISECONDS = 50;
  if (getenv("ESCDELAY") == nullptr && !KeysAreTypedByHand()) {
    set_escdelay(MILLISECONDS);
  }
}

void EndScreen() { endwin(); }

}  // namespace

void ReadTerminal() {
  tcgetattr(STDOUT_FILENO, &orig_termios);
  setenv("TERMINFO", "/usr/share/terminfo", 0);
  runningOverSerial = TerminalType() != "linux" && TerminalType() != "xterm";
}

void ActivateVirtualTerminal(int vt) {
  const int console = open("/dev/console", O_RDWR | O_NOCTTY | O_CLOEXEC);
  if (console < 0) {
    return;
  }
  if (ioctl(console, VT_ACTIVATE, vt) != 0) {
    ioctl(console, VT_WAITACTIVE, vt);
  }
  close(console);
}

void DisableSuspend() {
  orig_termios.c_cc[VSUSP] = 0;
  tcsetattr(STDOUT_FILENO, TCSANOW, &orig_termios);
}

void OpenScreen() {
  SetLocale();
  RequireUsableTerminal();
  // Otherwise curses installs a handler, which would stop the console.
  signal(SIGTSTP, SIG_IGN);
  initscr();
  start_color();
  atexit(EndScreen);
  SetEscapeDelay();
  curs_set(0);
  cbreak();
  noecho();
  keypad(stdscr, TRUE);
  InitColours();
  InitKeyMap();
  refresh();
}

void CloseScreen() {
  constexpr std::string_view RESET_PALETTE = "\033]R";
  erase();
  refresh();
  endwin();
  // Nothing is left to do about a terminal that does not take it.
  [[maybe_unused]] const ssize_t written =
      write(STDOUT_FILENO, RESET_PALETTE.data(), RESET_PALETTE.size());
}

}  // namespace Tarnel
