#include "tests/support/curses_screen.h"

#include <curses.h>
#include <fcntl.h>
#include <poll.h>
#include <pty.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <clocale>
#include <cstdio>
#include <cwchar>
#include <mutex>
#include <stdexcept>
#include <string_view>
#include <thread>
#include <utility>
#include <vector>

#include "shell/colours.h"
#include "shell/key_map.h"
#include "tests/support/descriptor.h"

namespace Tarnel::Testing {

namespace {

using std::chrono::milliseconds;
using std::chrono::steady_clock;

// Written behind the console's output to see when all of it has come through the pseudo-terminal.
constexpr char MARK[] = "\x01mark\x02";

void SetLocale() {
  if (setlocale(LC_ALL, "en_US.UTF-8") == nullptr) {
    setlocale(LC_ALL, "C.UTF-8");
  }
}

// Takes what comes out of the pseudo-terminal, so that writing to it never blocks.
class Drain {
 public:
  explicit Drain(int master)
      : _master(master), _thread([this](const std::stop_token& stop) {
          while (!stop.stop_requested()) {
            pollfd readable{_master, POLLIN, 0};
            poll(&readable, 1, 20);
            if (readable.revents != 0) {
              Read();
            }
          }
        }) {}

  // Everything up to the mark, which the caller has just written.
  std::string TakeUpToMark() {
    const auto deadline = steady_clock::now() + milliseconds(5000);
    while (steady_clock::now() < deadline) {
      Read();
      const std::scoped_lock lock(_mutex);
      if (const size_t end = _received.find(MARK); end != std::string::npos) {
        std::string taken = _received.substr(0, end);
        _received.erase(0, end + sizeof MARK - 1);
        return taken;
      }
      std::this_thread::yield();
    }
    throw std::runtime_error("the pseudo-terminal does not deliver");
  }

 private:
  void Read() {
    const std::scoped_lock lock(_mutex);
    std::array<char, 4096> buffer;
    for (ssize_t size = 0; (size = read(_master, buffer.data(), buffer.size())) > 0;) {
      _received.append(buffer.data(), static_cast<size_t>(size));
    }
  }

  int _master;
  std::mutex _mutex;
  std::string _received;
  std::jthread _thread;
};

// Curses keeps a line character as a letter with an attribute.
char32_t ShownAs(wchar_t character, bool alternate) {
  constexpr std::wstring_view LETTERS = L"qxlkmjtuvwn";
  const size_t place = alternate ? LETTERS.find(character) : std::wstring_view::npos;
  return place == std::wstring_view::npos ? static_cast<char32_t>(character)
                                          : U"─│┌┐└┘├┤┴┬┼"[place];
}

cchar_t ComplexAt(int x, int y) {
  cchar_t complex{};
  // Reading moves the window's cursor, which is where the terminal's cursor is taken from.
  const int savedX = getcurx(curscr);
  const int savedY = getcury(curscr);
  mvwin_wch(curscr, y, x, &complex);
  wmove(curscr, savedY, savedX);
  return complex;
}

Cell CellAt(int x, int y) {
  const cchar_t complex = ComplexAt(x, y);
  std::array<wchar_t, CCHARW_MAX + 1> text{};
  attr_t attributes = 0;
  short oldPair = 0;
  int pair = 0;
  getcchar(&complex, text.data(), &attributes, &oldPair, &pair);
  Cell cell = CharacterCell(ShownAs(text[0], (attributes & A_ALTCHARSET) != 0));
  extended_pair_content(pair, &cell.fg, &cell.bg);
  cell.standout = (attributes & (A_STANDOUT | A_REVERSE)) != 0;
  return cell;
}

bool IsWide(int x, int y) {
  const cchar_t complex = ComplexAt(x, y);
  return wcwidth(complex.chars[0]) == 2;
}

CellRow RowAt(int y) {
  CellRow row;
  for (int x = 0; x < getmaxx(curscr); ++x) {
    row.push_back(CellAt(x, y));
    if (x > 0 && IsWide(x - 1, y) && !row[row.size() - 2].text.empty()) {
      row.back().text.clear();  // the second half of a wide character
    }
  }
  return row;
}

}  // namespace

struct CursesScreen::Data {
  Descriptor master;
  Descriptor input;   // what the process had as descriptor 0
  Descriptor output;  // and as 1
  FILE* processOutput = nullptr;
  FILE* terminal = nullptr;
  SCREEN* screen = nullptr;
  std::unique_ptr<Drain> drain;
  std::string untaken;
  bool cursorVisible = true;

  void Connect(int columns, int rows);
  void Disconnect();
  void StartCurses(const std::string& term);
  void Collect();
};

void CursesScreen::Data::Connect(int columns, int rows) {
  const winsize size{static_cast<unsigned short>(rows), static_cast<unsigned short>(columns), 0, 0};
  int masterSide = -1;
  int terminalSide = -1;
  if (openpty(&masterSide, &terminalSide, nullptr, nullptr, &size) != 0) {
    throw std::runtime_error("no pseudo-terminal");
  }
  master.Reset(masterSide);
  fcntl(masterSide, F_SETFL, O_NONBLOCK);
  fcntl(masterSide, F_SETFD, FD_CLOEXEC);
  // The test runner's reports go where they went before.
  fflush(stdout);
  input.Reset(fcntl(STDIN_FILENO, F_DUPFD_CLOEXEC, 10));
  output.Reset(fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 10));
  processOutput = stdout;
  stdout = fdopen(fcntl(output.Get(), F_DUPFD_CLOEXEC, 10), "w");
  dup2(terminalSide, STDIN_FILENO);
  dup2(terminalSide, STDOUT_FILENO);
  close(terminalSide);
  terminal = fdopen(fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 10), "w");
  drain = std::make_unique<Drain>(masterSide);
}

void CursesScreen::Data::Disconnect() {
  drain.reset();
  fclose(terminal);
  fclose(stdout);
  stdout = processOutput;
  if (input.Get() >= 0) {
    dup2(input.Get(), STDIN_FILENO);
  } else {
    close(STDIN_FILENO);
  }
  dup2(output.Get(), STDOUT_FILENO);
}

void CursesScreen::Data::StartCurses(const std::string& term) {
  SetLocale();
  screen = newterm(term.c_str(), terminal, stdin);
  if (screen == nullptr) {
    Disconnect();
    throw std::runtime_error("no terminal of type " + term);
  }
  set_escdelay(25);
  start_color();
  curs_set(0);
  cbreak();
  noecho();
  keypad(stdscr, TRUE);
  bwColor = false;
  InitColours();
  InitKeyMap();
  refresh();
}

void CursesScreen::Data::Collect() {
  if (master.Get() < 0) {
    return;
  }
  // Behind the mark nothing is lost: the terminal only delivers bytes in their order.
  const ssize_t written = write(STDOUT_FILENO, MARK, sizeof MARK - 1);
  if (written != sizeof MARK - 1) {
    throw std::runtime_error("the pseudo-terminal takes nothing");
  }
  const std::string taken = drain->TakeUpToMark();
  const size_t shown = taken.rfind("\x1b[?25h");
  const size_t hidden = taken.rfind("\x1b[?25l");
  if (shown != std::string::npos || hidden != std::string::npos) {
    cursorVisible = hidden == std::string::npos || (shown != std::string::npos && shown > hidden);
  }
  untaken += taken;
}

CursesScreen::CursesScreen(int columns, int rows, const std::string& term)
    : _data(std::make_unique<Data>()) {
  _data->Connect(columns, rows);
  _data->StartCurses(term);
}

CursesScreen::~CursesScreen() {
  endwin();
  delscreen(_data->screen);
  _data->Disconnect();
  bwColor = false;
}

void CursesScreen::Type(const std::string& bytes) {
  const auto waiting = [] {
    int count = 0;
    ioctl(STDIN_FILENO, FIONREAD, &count);
    return count;
  };
  const int expected = waiting() + static_cast<int>(bytes.size());
  if (write(_data->master.Get(), bytes.data(), bytes.size()) !=
      static_cast<ssize_t>(bytes.size())) {
    throw std::runtime_error("the pseudo-terminal takes no keys");
  }
  // The bytes come through on their own time; what follows may rely on their being there.
  const auto deadline = steady_clock::now() + milliseconds(500);
  while (waiting() < expected && steady_clock::now() < deadline) {
    std::this_thread::yield();
  }
}

void CursesScreen::HangUp() {
  _data->Collect();
  _data->drain.reset();
  _data->master.Reset();
}

void CursesScreen::Resize(int columns, int rows) {
  const winsize size{static_cast<unsigned short>(rows), static_cast<unsigned short>(columns), 0, 0};
  ioctl(_data->master.Get(), TIOCSWINSZ, &size);
}

Cell CursesScreen::At(int x, int y) const { return CellAt(x, y); }

std::string CursesScreen::Row(int y) const { return RowText(RowAt(y)); }

std::string CursesScreen::Picture() const {
  std::vector<CellRow> rows;
  rows.reserve(static_cast<size_t>(getmaxy(curscr)));
  for (int y = 0; y < getmaxy(curscr); ++y) {
    rows.push_back(RowAt(y));
  }
  return PictureText(rows);
}

std::string CursesScreen::Colours(int y) const { return RowColours(RowAt(y)); }

bool CursesScreen::CursorVisible() const {
  _data->Collect();
  return _data->cursorVisible;
}

int CursesScreen::CursorX() const { return getcurx(curscr); }

int CursesScreen::CursorY() const { return getcury(curscr); }

std::string CursesScreen::TakeOutput() {
  _data->Collect();
  return std::exchange(_data->untaken, "");
}

}  // namespace Tarnel::Testing
