// Measures the console behind a login, in a lab: what a key costs in the menu and in forms, the
// bytes of a focus move beside those that curses needs for it, and the memory over many keys.

#include <curses.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cwchar>
#include <fstream>
#include <random>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "console/screen/colours.h"
#include "tests/support/curses_screen.h"
#include "tests/support/lab.h"
#include "tests/support/terminal.h"

namespace {

using namespace Tarnel::Testing;
using namespace Tarnel::Testing::Keys;
using std::chrono::steady_clock;

constexpr int COLUMNS = 80;
constexpr int ROWS = 25;

std::string StatusLine(pid_t pid, const std::string& name) {
  std::ifstream status("/proc/" + std::to_string(pid) + "/status");
  for (std::string line; std::getline(status, line);) {
    if (line.starts_with(name + ":")) return line.substr(name.size() + 1);
  }
  throw std::runtime_error("the console has ended");
}

long Number(pid_t pid, const std::string& name) { return std::stol(StatusLine(pid, name)); }

// In milliseconds. On a busy machine only what the console needs of the processor is steady.
struct KeyTime {
  double passed;
  double processor;
};

// What a settled screen shows.
struct Shown {
  std::vector<CellRow> rows;
  int cursorX;
  int cursorY;
};

// The console with an operator logged in.
class Session : public Terminal {
 public:
  Session() {
    Expect("<F2> Customize");
    Type(F2);
    Expect("<Esc> Cancel");
    Settle();
    Type("root\tlaboratory\r");
    Expect("System Customization");
    Settle();
  }

  void Expect(const std::string& text) {
    if (!WaitFor(text)) throw std::runtime_error("the console does not show " + text);
  }

  // How long it is from the key to the last byte that it brought.
  KeyTime TimeOf(const std::string& key) {
    constexpr std::chrono::milliseconds QUIET(15);
    const size_t before = Output().size();
    size_t seen = before;
    const double processor = ProcessorTime();
    const auto start = steady_clock::now();
    auto last = start;
    Type(key);
    WaitUntil(
        [&] {
          const auto now = steady_clock::now();
          last = Output().size() != seen ? now : last;
          seen = Output().size();
          return seen != before && now - last > QUIET;
        },
        "what a key brings");
    return {std::chrono::duration<double, std::milli>(last - start).count(),
            ProcessorTime() - processor};
  }

  size_t BytesOf(const std::string& key) {
    const size_t before = Output().size();
    Type(key);
    Settle();
    return Output().size() - before;
  }

  // Types a key and waits until the console sleeps again.
  void TypeAndWait(const std::string& key) {
    const long before = Wakes();
    Type(key);
    WaitUntil([&] { return Wakes() != before && Sleeps(); }, "the end of a key");
  }

  bool IsInMenu() const {
    return At(3, 1).bg == Tarnel::YELLOW && Row(1).find("System Customization") == 3;
  }

  void OpenRow(size_t row) {
    for (size_t move = 0; move < row; ++move) TimeOf(DOWN);
    Type(ENTER);
    Expect("<Esc> Cancel");
    Settle();
  }

  void CloseForm() {
    Type(ESC);
    if (!WaitUntil([this] { return IsInMenu(); }, "the menu")) {
      throw std::runtime_error("a form does not close");
    }
    Settle();
  }

  Shown Look() const {
    Shown shown{{}, CursorX(), CursorY()};
    for (int y = 0; y < ROWS; ++y) shown.rows.push_back(Cells(y));
    return shown;
  }

 private:
  double ProcessorTime() const {
    constexpr double NANOSECONDS = 1e6;
    double time = 0;
    std::ifstream("/proc/" + std::to_string(Pid()) + "/schedstat") >> time;
    return time / NANOSECONDS;
  }
  long Wakes() const { return Number(Pid(), "voluntary_ctxt_switches"); }
  bool Sleeps() const { return StatusLine(Pid(), "State").find('S') != std::string::npos; }
};

void PrintTimes(const char* what, const std::vector<KeyTime>& times) {
  const auto print = [&](const char* name, double KeyTime::*part) {
    std::vector<double> values;
    values.reserve(times.size());
    for (const KeyTime& time : times) values.push_back(time.*part);
    std::sort(values.begin(), values.end());
    const auto at = [&](double rank) { return values[size_t(rank * double(values.size() - 1))]; };
    printf("  %-28s %-10s %7.3f ms median %7.3f ms p99 (n=%zu)\n", what, name, at(0.5), at(0.99),
           values.size());
  };
  print("passed", &KeyTime::passed);
  print("processor", &KeyTime::processor);
}

// Types the keys over and over.
std::vector<KeyTime> TimesOf(Session& session, const std::vector<std::string>& keys, size_t count) {
  std::vector<KeyTime> times;
  while (times.size() < count) times.push_back(session.TimeOf(keys[times.size() % keys.size()]));
  return times;
}

std::vector<std::string> ThereAndBack(const std::string& there, const std::string& back,
                                      size_t steps) {
  std::vector<std::string> keys(steps, there);
  keys.insert(keys.end(), steps, back);
  return keys;
}

constexpr size_t MENU_MOVES = 10;

constexpr size_t NETWORK_ROW = 2;
constexpr size_t KEYBOARD_ROW = 6;

void MeasureKeys() {
  constexpr size_t COUNT = 600;
  printf("a key to the painted screen\n");
  Session session;
  PrintTimes("menu, Down and Up", TimesOf(session, ThereAndBack(DOWN, UP, MENU_MOVES), COUNT));
  session.OpenRow(0);
  PrintTimes("password form, typing", TimesOf(session, ThereAndBack("x", BACKSPACE, 8), COUNT));
  session.CloseForm();
  session.OpenRow(KEYBOARD_ROW);
  PrintTimes("keyboard form, Down and Up", TimesOf(session, ThereAndBack(DOWN, UP, 9), COUNT));
}

// The screen of the management network: opening it, typing into its forms, writing a change.
void MeasureNetwork() {
  constexpr size_t COUNT = 300;
  constexpr size_t VISITS = 40;
  printf("the management network\n");
  Session session;
  for (size_t row = 0; row < NETWORK_ROW; ++row) session.TimeOf(DOWN);
  std::vector<KeyTime> openings;
  std::vector<KeyTime> applications;
  for (size_t visit = 0; visit < VISITS; ++visit) {
    openings.push_back(session.TimeOf(ENTER));
    const std::string digit = visit % 2 == 0 ? "7" : "8";
    for (const std::string& key : {DOWN, ENTER, digit, ENTER, ESC}) {
      session.TimeOf(key);
    }
    session.Expect("<Y> Yes");
    applications.push_back(session.TimeOf("y"));
    session.Settle();
  }
  PrintTimes("opening", openings);
  PrintTimes("a VLAN, with all its steps", applications);
  for (const std::string& key : {ENTER, DOWN, ENTER}) session.TimeOf(key);
  PrintTimes("VLAN form, typing", TimesOf(session, ThereAndBack("1", BACKSPACE, 4), COUNT));
  for (const std::string& key : {ESC, DOWN, DOWN, ENTER}) session.TimeOf(key);
  PrintTimes("IPv6 form, Down and Up", TimesOf(session, {DOWN, UP}, COUNT));
}

// From the end that coreping logs to the screen.
void MeasureTestSteps() {
  constexpr size_t VISITS = 20;
  Session session;
  for (size_t row = 0; row <= NETWORK_ROW + 1; ++row) session.TimeOf(DOWN);
  std::vector<double> delays;
  for (size_t visit = 0; visit < VISITS; ++visit) {
    const Log log;
    session.TimeOf(ENTER);
    for (const std::string& key : {DOWN, BACKSPACE, DOWN, DOWN, BACKSPACE}) session.TimeOf(key);
    session.Type(ENTER);
    session.WaitFor("OK.");
    const double shown = double(std::chrono::duration_cast<std::chrono::microseconds>(
                                    std::chrono::system_clock::now().time_since_epoch())
                                    .count()) /
                         1e3;
    session.Expect("<Enter> OK");
    for (const LogLine& line : log.Lines()) {
      const size_t at = line.text.rfind(" at ");
      if (line.text.find("coreping") != std::string::npos && at != std::string::npos) {
        delays.push_back(shown - std::stod(line.text.substr(at + 4)) * 1e3);
      }
    }
    session.Type(ENTER);
    session.Settle();
  }
  std::sort(delays.begin(), delays.end());
  if (delays.empty()) throw std::runtime_error("coreping logs no end");
  printf("  the result of a test step    passed     %7.3f ms median %7.3f ms at most (n=%zu)\n",
         delays[delays.size() / 2], delays.back(), delays.size());
}

chtype LineCharacter(const std::string& shape) {
  return shape == "-" ? ACS_HLINE : shape == "|" ? ACS_VLINE : ACS_PLUS;
}

void Draw(const Shown& shown) {
  for (size_t y = 0; y < shown.rows.size(); ++y) {
    for (size_t x = 0; x < shown.rows[y].size(); ++x) {
      const Cell& cell = shown.rows[y][x];
      const attr_t attributes = cell.bg < 0 ? A_NORMAL : Tarnel::ColourAttr(cell.bg, cell.fg);
      attrset(static_cast<int>(attributes));
      if (cell.line) {
        mvaddch(int(y), int(x), LineCharacter(cell.text) | attributes);
      } else {
        mvaddstr(int(y), int(x), cell.text.c_str());
      }
    }
  }
  move(shown.cursorY, shown.cursorX);
  refresh();
}

// Bytes that curses needs to turn each screen into the one behind it.
std::vector<size_t> BytesOfCurses(const std::vector<Shown>& screens) {
  CursesScreen reference(COLUMNS, ROWS, "linux");
  std::vector<size_t> bytes;
  for (const Shown& screen : screens) {
    Draw(screen);
    bytes.push_back(reference.TakeOutput().size());
  }
  bytes.erase(bytes.begin());
  return bytes;
}

void CompareBytes(const char* what, Session& session, const std::vector<std::string>& keys) {
  std::vector<Shown> screens = {session.Look()};
  std::vector<size_t> sent;
  for (const std::string& key : keys) {
    sent.push_back(session.BytesOf(key));
    screens.push_back(session.Look());
  }
  const std::vector<size_t> needed = BytesOfCurses(screens);
  double worst = 0;
  size_t sentSum = 0;
  size_t neededSum = 0;
  for (size_t i = 0; i < sent.size(); ++i) {
    worst = std::max(worst, double(sent[i]) / double(needed[i]));
    sentSum += sent[i];
    neededSum += needed[i];
  }
  printf("  %-34s %6zu sent, %6zu needed: %.3f times, at worst %.3f\n", what, sentSum, neededSum,
         double(sentSum) / double(neededSum), worst);
}

void MeasureBytes() {
  printf("bytes of focus moves\n");
  Session session;
  CompareBytes("menu", session, ThereAndBack(DOWN, UP, MENU_MOVES));
  session.OpenRow(1);
  CompareBytes("lockdown form", session, ThereAndBack(" ", " ", 2));
  session.CloseForm();
  session.OpenRow(KEYBOARD_ROW - 1);
  CompareBytes("keyboard form", session, ThereAndBack(DOWN, UP, 9));
}

// Opens the focused row, works in what it opens and comes back.
void VisitRow(Session& session, std::mt19937& random) {
  const std::string keys[] = {UP, " ", "x", "\x1b[D"};
  session.Type(ENTER);
  session.Settle();
  if (session.IsInMenu()) return;
  for (int key = 0; key < 5; ++key) session.TypeAndWait(keys[random() % std::size(keys)]);
  session.CloseForm();
}

void MeasureMemory(int count) {
  constexpr unsigned VISIT_EVERY = 250;
  const std::string keys[] = {DOWN,     UP,  DOWN, UP,        "\x1b[6~", "\x1b[5~",
                              "\x1b[C", "x", "\t", "\x1b[1~", "\x1b[4~"};
  Session session;
  std::mt19937 random(1);
  long early = 0;
  for (int key = 0; key < count; ++key) {
    if (key == count / 10) early = Number(session.Pid(), "VmRSS");
    if (random() % VISIT_EVERY == 0) {
      VisitRow(session, random);
    } else {
      session.TypeAndWait(keys[random() % std::size(keys)]);
    }
  }
  const long late = Number(session.Pid(), "VmRSS");
  printf("memory (RSS) over %d random keys\n  %ld KiB after a tenth, %+ld KiB at the end\n", count,
         early, late - early);
}

}  // namespace

int main(int argc, char** argv) {
  try {
    LoadScenario("static");
    MeasureKeys();
    MeasureNetwork();
    MeasureTestSteps();
    MeasureBytes();
    MeasureMemory(argc > 1 ? atoi(argv[1]) : 100000);
  } catch (const std::exception& error) {
    fprintf(stderr, "%s\n", error.what());
    return 2;
  }
  return 0;
}
