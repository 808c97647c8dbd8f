#include "tests/support/terminal.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <pty.h>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <unistd.h>
#include <utmp.h>

#include <array>
#include <csignal>
#include <cstring>
#include <fstream>
#include <stdexcept>
#include <thread>

#include "tests/support/lab.h"

namespace Tarnel::Testing {

namespace {

using std::chrono::milliseconds;
using std::chrono::steady_clock;

// What a program ends with when a sanitizer has found something.
constexpr int SANITIZER_STATUS = 99;

winsize WindowSize(int columns, int rows) {
  return {static_cast<unsigned short>(rows), static_cast<unsigned short>(columns), 0, 0};
}

std::vector<char*> Pointers(const std::vector<std::string>& texts) {
  std::vector<char*> pointers;
  pointers.reserve(texts.size() + 1);
  for (const std::string& text : texts) {
    pointers.push_back(const_cast<char*>(text.c_str()));
  }
  pointers.push_back(nullptr);
  return pointers;
}

[[noreturn]] void Become(const Launch& launch) {
  std::vector<std::string> arguments = launch.arguments;
  arguments.insert(arguments.begin(), launch.program);
  std::vector<std::string> environment = launch.environment;
  environment.emplace_back("PATH=/bin:/sbin:/usr/bin");
  if (!launch.term.empty()) {
    environment.push_back("TERM=" + launch.term);
  }
  execve(launch.program.c_str(), Pointers(arguments).data(), Pointers(environment).data());
  _exit(127);
}

std::string Readable(const std::string& keys) {
  std::string text;
  for (const char key : keys) {
    text += key == '\x1b' ? std::string("<Esc>") : std::string(1, key);
  }
  return text;
}

// The program's main thread waits for something to happen.
bool Sleeps(pid_t pid) {
  std::string line;
  std::getline(std::ifstream("/proc/" + std::to_string(pid) + "/stat"), line);
  const size_t name = line.rfind(')');
  return name != std::string::npos && line.compare(name, 3, ") S") == 0;
}

}  // namespace

std::vector<std::string> ClockTimes(int factor) {
  return {"LD_PRELOAD=/lib/libfaketime.so.1", "FAKETIME=+0 x" + std::to_string(factor),
          "ASAN_OPTIONS=verify_asan_link_order=0"};
}

Terminal::Terminal(const Launch& launch) : Emulator(launch.columns, launch.rows) {
  const winsize size = WindowSize(launch.columns, launch.rows);
  int master = -1;
  int slave = -1;
  if (openpty(&master, &slave, nullptr, nullptr, &size) != 0) {
    throw std::runtime_error("no pseudo-terminal");
  }
  _master.Reset(master);
  fcntl(master, F_SETFD, FD_CLOEXEC);
  tcgetattr(slave, &_modes);
  _pid = fork();
  if (_pid == 0) {
    login_tty(slave);
    Become(launch);
  }
  close(slave);
}

Terminal::~Terminal() {
  if (HasEnded()) {
    return;
  }
  Signal(SIGTERM);
  const int status = WaitForEnd();
  EXPECT_NE(status, SANITIZER_STATUS) << Describe();
  if (status < 0) {
    Signal(SIGKILL);
    waitpid(_pid, nullptr, 0);
  }
}

bool Terminal::TakeOutput(milliseconds time) {
  pollfd readable{_master.Get(), POLLIN, 0};
  if (poll(&readable, 1, static_cast<int>(time.count())) <= 0) {
    return false;
  }
  std::array<char, 65536> buffer;
  const ssize_t size = read(_master.Get(), buffer.data(), buffer.size());
  if (size <= 0) {  // nobody has the other side open any more
    std::this_thread::sleep_for(std::min(time, milliseconds(2)));
    return false;
  }
  const std::string bytes(buffer.data(), static_cast<size_t>(size));
  _output += bytes;
  Feed(bytes);
  return true;
}

void Terminal::TakeAllOutput() {
  while (TakeOutput(milliseconds(0))) {
  }
}

std::string Terminal::Describe() const {
  return "\nThe screen:\n" + Picture() + "\nThe last keys: " +
         Readable(_keys.substr(_keys.size() - std::min<size_t>(_keys.size(), 100))) +
         "\nThe program " + (_status ? "has ended with " + std::to_string(*_status) : "runs") +
         "\nThe last log lines:\n" + LastLogLines(15);
}

void Terminal::Type(const std::string& keys) {
  _keys += keys;
  if (write(_master.Get(), keys.data(), keys.size()) != static_cast<ssize_t>(keys.size())) {
    ADD_FAILURE() << "the terminal takes no keys" << Describe();
  }
}

void Terminal::Resize(int columns, int rows) {
  TakeAllOutput();
  const winsize size = WindowSize(columns, rows);
  if (columns > 0 && rows > 0) {
    SetSize(columns, rows);
  }
  ioctl(_master.Get(), TIOCSWINSZ, &size);
}

void Terminal::Signal(int signal) const { kill(_pid, signal); }

void Terminal::HangUp() {
  TakeAllOutput();
  _master.Reset();
}

bool Terminal::WaitUntil(const Condition& condition, const std::string& what) {
  const auto deadline = steady_clock::now() + _patience;
  TakeAllOutput();
  while (!condition()) {
    if (steady_clock::now() > deadline) {
      ADD_FAILURE() << "In vain waited for " << what << Describe();
      return false;
    }
    TakeOutput(milliseconds(5));
  }
  return true;
}

bool Terminal::WaitFor(const std::string& text) {
  return WaitUntil([&] { return Picture().find(text) != std::string::npos; }, "\"" + text + "\"");
}

bool Terminal::WaitForPicture(const std::string& picture) {
  return WaitUntil([&] { return Picture() == picture; }, "this picture:\n" + picture);
}

void Terminal::Settle() {
  constexpr milliseconds QUIET(40);
  auto lastOutput = steady_clock::now();
  WaitUntil(
      [&] {
        if (TakeOutput(milliseconds(5)) || !(HasEnded() || Sleeps(_pid))) {
          lastOutput = steady_clock::now();
        }
        return steady_clock::now() - lastOutput > QUIET;
      },
      "a quiet program");
}

int Terminal::WaitForEnd() {
  const bool ended = WaitUntil([this] { return HasEnded(); }, "the program's end");
  TakeAllOutput();
  return ended ? *_status : -1;
}

bool Terminal::HasEnded() {
  int waited = 0;
  if (!_status && waitpid(_pid, &waited, WNOHANG) == _pid) {
    _status = WIFEXITED(waited) ? WEXITSTATUS(waited) : 256 + WTERMSIG(waited);
  }
  return _status.has_value();
}

termios Terminal::Modes() const {
  termios modes{};
  tcgetattr(_master.Get(), &modes);
  return modes;
}

bool Terminal::ModesAreRestored() const {
  const termios now = Modes();
  const termios& before = _modes;
  return now.c_iflag == before.c_iflag && now.c_oflag == before.c_oflag &&
         now.c_cflag == before.c_cflag && now.c_lflag == before.c_lflag &&
         std::memcmp(now.c_cc, before.c_cc, sizeof now.c_cc) == 0;
}

}  // namespace Tarnel::Testing
