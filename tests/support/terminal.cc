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
#include <optional>
#include <stdexcept>
#include <thread>

#include "tests/support/descriptor.h"
#include "tests/support/emulator.h"
#include "tests/support/lab.h"

namespace Tarnel::Testing {

namespace {

using std::chrono::milliseconds;
using std::chrono::steady_clock;

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

struct Terminal::Data {
  Data(int columns, int rows) : emulator(columns, rows) {}

  void Start(const Launch& launch);
  // Takes output in for at most so long, or until some has come; false when none came.
  bool TakeOutput(milliseconds time);
  void TakeAllOutput();
  bool Reap();
  std::string Picture() const;
  std::string Describe() const;

  Emulator emulator;
  Descriptor master;
  termios modes{};  // as they were before the start
  pid_t pid = -1;
  std::optional<int> status;
  std::string output;
  std::string keys;
  milliseconds patience = PATIENCE;
};

void Terminal::Data::Start(const Launch& launch) {
  const winsize size = WindowSize(launch.columns, launch.rows);
  int fd = -1;
  int terminal = -1;
  if (openpty(&fd, &terminal, nullptr, nullptr, &size) != 0) {
    throw std::runtime_error("no pseudo-terminal");
  }
  const Descriptor slave(terminal);
  master.Reset(fd);
  fcntl(fd, F_SETFD, FD_CLOEXEC);
  tcgetattr(terminal, &modes);
  pid = fork();
  if (pid == 0) {
    login_tty(terminal);
    Become(launch);
  }
}

bool Terminal::Data::TakeOutput(milliseconds time) {
  pollfd readable{master.Get(), POLLIN, 0};
  if (poll(&readable, 1, static_cast<int>(time.count())) <= 0) {
    return false;
  }
  std::array<char, 65536> buffer;
  const ssize_t size = master.Get() < 0 ? 0 : read(master.Get(), buffer.data(), buffer.size());
  if (size <= 0) {  // nobody has the other side open any more
    std::this_thread::sleep_for(std::min(time, milliseconds(2)));
    return false;
  }
  const std::string bytes(buffer.data(), static_cast<size_t>(size));
  output += bytes;
  emulator.Feed(bytes);
  return true;
}

void Terminal::Data::TakeAllOutput() {
  while (TakeOutput(milliseconds(0))) {
  }
}

bool Terminal::Data::Reap() {
  int waited = 0;
  if (!status && waitpid(pid, &waited, WNOHANG) == pid) {
    status = WIFEXITED(waited) ? WEXITSTATUS(waited) : 256 + WTERMSIG(waited);
  }
  return status.has_value();
}

std::string Terminal::Data::Picture() const {
  std::vector<CellRow> rows;
  rows.reserve(static_cast<size_t>(emulator.Rows()));
  for (int y = 0; y < emulator.Rows(); ++y) {
    rows.push_back(emulator.Row(y));
  }
  return PictureText(rows);
}

std::string Terminal::Data::Describe() const {
  return "\nThe screen:\n" + Picture() + "\nThe last keys: " +
         Readable(keys.substr(keys.size() - std::min<size_t>(keys.size(), 100))) +
         "\nThe program " + (status ? "has ended with " + std::to_string(*status) : "runs") +
         "\nThe last log lines:\n" + LastLogLines(15);
}

Terminal::Terminal(const Launch& launch)
    : _data(std::make_unique<Data>(launch.columns, launch.rows)) {
  _data->Start(launch);
}

Terminal::~Terminal() {
  if (!HasEnded()) {
    Signal(SIGTERM);
    if (WaitForEnd() < 0) {
      Signal(SIGKILL);
      waitpid(_data->pid, nullptr, 0);
    }
  }
}

void Terminal::SetPatience(milliseconds patience) { _data->patience = patience; }

void Terminal::Type(const std::string& keys) {
  _data->keys += keys;
  if (write(_data->master.Get(), keys.data(), keys.size()) != static_cast<ssize_t>(keys.size())) {
    ADD_FAILURE() << "the terminal takes no keys" << _data->Describe();
  }
}

void Terminal::Resize(int columns, int rows) {
  _data->TakeAllOutput();
  const winsize size = WindowSize(columns, rows);
  if (columns > 0 && rows > 0) {
    _data->emulator.Resize(columns, rows);
  }
  ioctl(_data->master.Get(), TIOCSWINSZ, &size);
}

void Terminal::Signal(int signal) const { kill(_data->pid, signal); }

void Terminal::HangUp() {
  _data->TakeAllOutput();
  _data->master.Reset();
}

bool Terminal::WaitUntil(const Condition& condition, const std::string& what) {
  const auto deadline = steady_clock::now() + _data->patience;
  _data->TakeAllOutput();
  while (!condition()) {
    if (steady_clock::now() > deadline) {
      ADD_FAILURE() << "In vain waited for " << what << _data->Describe();
      return false;
    }
    _data->TakeOutput(milliseconds(5));
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
        if (_data->TakeOutput(milliseconds(5)) || !(HasEnded() || Sleeps(_data->pid))) {
          lastOutput = steady_clock::now();
        }
        return steady_clock::now() - lastOutput > QUIET;
      },
      "a quiet program");
}

int Terminal::WaitForEnd() {
  const bool ended = WaitUntil([this] { return HasEnded(); }, "the program's end");
  _data->TakeAllOutput();
  return ended ? *_data->status : -1;
}

bool Terminal::HasEnded() { return _data->Reap(); }

Cell Terminal::At(int x, int y) {
  _data->TakeAllOutput();
  return _data->emulator.Row(y).at(static_cast<size_t>(x));
}

std::string Terminal::Row(int y) {
  _data->TakeAllOutput();
  return RowText(_data->emulator.Row(y));
}

std::string Terminal::Picture() {
  _data->TakeAllOutput();
  return _data->Picture();
}

std::string Terminal::Colours(int y) {
  _data->TakeAllOutput();
  return RowColours(_data->emulator.Row(y));
}

bool Terminal::CursorVisible() {
  _data->TakeAllOutput();
  return _data->emulator.CursorVisible();
}

int Terminal::CursorX() {
  _data->TakeAllOutput();
  return _data->emulator.CursorX();
}

int Terminal::CursorY() {
  _data->TakeAllOutput();
  return _data->emulator.CursorY();
}

bool Terminal::OnAlternateScreen() {
  _data->TakeAllOutput();
  return _data->emulator.OnAlternateScreen();
}

const std::string& Terminal::Output() {
  _data->TakeAllOutput();
  return _data->output;
}

bool Terminal::PaletteWasReset() {
  _data->TakeAllOutput();
  return _data->emulator.PaletteWasReset();
}

termios Terminal::Modes() const {
  termios modes{};
  tcgetattr(_data->master.Get(), &modes);
  return modes;
}

bool Terminal::ModesAreRestored() const {
  const termios now = Modes();
  const termios& before = _data->modes;
  return now.c_iflag == before.c_iflag && now.c_oflag == before.c_oflag &&
         now.c_cflag == before.c_cflag && now.c_lflag == before.c_lflag &&
         std::memcmp(now.c_cc, before.c_cc, sizeof now.c_cc) == 0;
}

pid_t Terminal::Pid() const { return _data->pid; }

bool WaitUntil(const std::function<bool()>& condition, milliseconds time) {
  const auto deadline = steady_clock::now() + time;
  while (!condition()) {
    if (steady_clock::now() > deadline) {
      return false;
    }
    std::this_thread::sleep_for(milliseconds(2));
  }
  return true;
}

}  // namespace Tarnel::Testing
