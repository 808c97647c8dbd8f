#include "tests/support/curses_screen.h"

#include <curses.h>
#include <fcntl.h>
#include <poll.h>
#include <pty.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <array>
#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <cwchar>
#include <mutex>
#include <stdexcept>
#include <string_view>
#include <thread>

#include "console/screen/colours.h"
#include "console/screen/key_map.h"
#include "tests/support/descriptor.h"
#include "tests/support/wait.h"

namespace Tarnel::Testing {

namespace {

// Written behind the console's output to see when all of it has come through the pseudo-terminal.
constexpr char MARK[] = "\x01mark\x02";

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
    std::string taken;
    const bool delivered = WaitUntil([&] {
      Read();
      const std::scoped_lock lock(_mutex);
      const size_t end = _received.find(MARK);
      if (end == std::string::npos) {
        return false;
      }
      taken = _received.substr(0, end);
      _received.erase(0, end + sizeof MARK - 1);
      return true;
    });
    return delivered ? taken : throw std::runtime_error("the pseudo-terminal does not deliver");
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

std::string ToUtf8(wchar_t character) {
  std::string bytes(MB_CUR_MAX, '\0');
  mbstate_t state{};
  bytes.resize(wcrtomb(bytes.data(), character, &state));
  return bytes;
}

Cell ShownCell(const cchar_t& complex) {
  // Curses keeps a line character as a letter with an attribute.
  constexpr std::wstring_view LINES = L"qxlkmjtuvwn";
  const size_t place = LINES.find(complex.chars[0]);
  Cell cell;
  cell.line = (complex.attr & A_ALTCHARSET) != 0 && place != std::wstring_view::npos;
  cell.text = cell.line ? std::string(1, "-|+++++++++"[place]) : ToUtf8(complex.chars[0]);
  extended_pair_content(complex.ext_color, &cell.fg, &cell.bg);
  cell.standout = (complex.attr & (A_STANDOUT | A_REVERSE)) != 0;
  return cell;
}

}  // namespace

struct CursesScreen::Data {
  Data(int columns, int rows);
  ~Data();

  Descriptor master;
  Descriptor input;   // what the process had as descriptor 0
  Descriptor output;  // and as 1
  FILE* processOutput = stdout;
  FILE* terminal = nullptr;
  SCREEN* screen = nullptr;
  std::unique_ptr<Drain> drain;
};

CursesScreen::Data::Data(int columns, int rows) {
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
  stdout = fdopen(fcntl(output.Get(), F_DUPFD_CLOEXEC, 10), "w");
  dup2(terminalSide, STDIN_FILENO);
  dup2(terminalSide, STDOUT_FILENO);
  close(terminalSide);
  terminal = fdopen(fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 10), "w");
  drain = std::make_unique<Drain>(masterSide);
}

CursesScreen::Data::~Data() {
  drain.reset();
  fclose(terminal);
  fclose(stdout);
  stdout = processOutput;
  dup2(input.Get(), STDIN_FILENO);
  dup2(output.Get(), STDOUT_FILENO);
}

CursesScreen::CursesScreen(int columns, int rows, const std::string& term)
    : _data(std::make_unique<Data>(columns, rows)) {
  setlocale(LC_ALL, "C.UTF-8");
  _data->screen = newterm(term.c_str(), _data->terminal, stdin);
  if (_data->screen == nullptr) {
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

CursesScreen::~CursesScreen() {
  endwin();
  delscreen(_data->screen);
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
  WaitUntil([&] { return waiting() >= expected; }, std::chrono::milliseconds(500));
}

int CursesScreen::Rows() const { return getmaxy(curscr); }

CellRow CursesScreen::Cells(int y) const {
  // Reading moves the window's cursor, which is where the terminal's cursor is taken from.
  const int cursorX = CursorX();
  const int cursorY = CursorY();
  CellRow row;
  for (int x = 0; x < getmaxx(curscr); ++x) {
    cchar_t complex{};
    mvwin_wch(curscr, y, x, &complex);
    row.push_back(ShownCell(complex));
    if (wcwidth(complex.chars[0]) == 2) {
      row.push_back(row.back());
      row.back().text.clear();
      ++x;
    }
  }
  wmove(curscr, cursorY, cursorX);
  return row;
}

bool CursesScreen::CursorVisible() {
  const int before = curs_set(0);  // there is no other way to ask
  curs_set(before);
  return before == 1;
}

int CursesScreen::CursorX() { return getcurx(curscr); }

int CursesScreen::CursorY() { return getcury(curscr); }

std::string CursesScreen::TakeOutput() {
  // Behind the mark nothing is lost: the terminal only delivers bytes in their order.
  if (write(STDOUT_FILENO, MARK, sizeof MARK - 1) != sizeof MARK - 1) {
    throw std::runtime_error("the pseudo-terminal takes nothing");
  }
  return _data->drain->TakeUpToMark();
}

}  // namespace Tarnel::Testing
