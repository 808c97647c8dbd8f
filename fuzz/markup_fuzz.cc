// Lays out and paints marked-up texts that are put together at random from pieces of the language,
// and checks what has to hold for every text.

#include <curses.h>

#include <algorithm>
#include <cctype>
#include <ctime>

#include "console/screen/colours.h"
#include "console/widgets/markup_layout.h"
#include "console/widgets/text_area.h"
#include "fuzz/random.h"

namespace {

constexpr int TEXTS = 20000;
constexpr int PAINTED_TEXTS = 1000;
constexpr size_t MAX_PIECES = 40;
constexpr int MAX_WIDTH = 24;
constexpr size_t LARGE = 1 << 16;

const Tarnel::ValueTags FACTS = {
    {"fact", [] { return std::string("10.0.0.1"); }},
    {"long-fact", [] { return std::string(70, 'f'); }},
    {"empty-fact", [] { return std::string(); }},
};

using Texts = std::vector<std::string>;

// What stands more than once comes more often.
const Texts WORDS({"a", "bc", "words", "averylongwordwithoutanend", " ", "  ", "\n", "\n\n", "\t",
                   "\r", "\x1b", "\xC3\xA9", "\xff", "}"});
const Texts TAGS({"{align:right}", "{align:center}", "{align:left}", "{align}", "{/align}",
                  "{/align}", "{/align}", "{}", "{color:red}", "{/color}", "{color:x}", "{nothing}",
                  "{bgcolor:white}", "{/bgcolor}", "{a{b}", "{:}"});
const Texts COLUMNS({"{align:padding:0}", "{align:padding:5}",
                     "{align:padding:99999999999999999999}",
                     "{align:padding:-99999999999999999999}", "{align:padding:x}", "{fact}",
                     "{long-fact}", "{empty-fact}", "{"});

// With columns, the text also holds columns, facts and tags without an end.
std::string MakeText(Random& random, bool columns) {
  std::string text;
  for (size_t count = random.Below(MAX_PIECES); count > 0; --count) {
    const size_t kind = random.Below(columns ? 5 : 4);
    text += random.From(kind < 2 ? WORDS : kind == 4 ? COLUMNS : TAGS);
  }
  if (columns && !text.empty() && random.Below(4) == 0) {
    text[random.Below(text.size())] = static_cast<char>(random.Below(256));
  }
  return text;
}

std::string WithoutTags(const std::string& text) {
  std::string rest;
  bool inTag = false;
  for (const char c : text) {
    if (!inTag && c != '{') rest += c;
    inTag = inTag ? c != '}' : c == '{';
  }
  return rest;
}

std::string WithoutSpace(std::string text) {
  std::erase_if(text, [](unsigned char c) { return isspace(c) != 0; });
  return text;
}

bool FitsInto(const std::string& text, int width) {
  int length = 0;
  return std::all_of(text.begin(), text.end(), [&](char c) {
    length = c == '\n' ? 0 : length + 1;
    return length <= width;
  });
}

void CheckText(const std::string& text, int width, bool columns) {
  const std::string display = Tarnel::LayoutMarkup(text, width, FACTS);
  // Each byte of the text leads to at most one line end and one line's blanks.
  const size_t most = (text.size() + 1) * (static_cast<size_t>(width) + 80);
  Require(display.size() <= most, "the result is of bounded size", text);
  if (columns) return;
  const std::string shown = WithoutTags(display);
  Require(FitsInto(shown, width), "lines fit", text);
  Require(WithoutSpace(shown) == WithoutSpace(WithoutTags(text)), "letters stay", text);
}

// The processor's time for a text of the start and as many of the pieces as give the size.
double LayoutSeconds(const std::string& start, const std::string& piece, size_t size) {
  std::string text = start;
  while (text.size() < size) text += piece;
  double best = 1e9;
  for (int round = 0; round < 2; ++round) {
    const clock_t begin = clock();
    static_cast<void>(Tarnel::LayoutMarkup(text + "{/align}", 80, FACTS));
    best = std::min(best, static_cast<double>(clock() - begin) / CLOCKS_PER_SEC);
  }
  return best;
}

// Four times the text takes about four times the time; with a quadratic cost it would be sixteen.
void CheckLinearCosts() {
  for (const std::string start :
       {"", "{align:right}", "{align:padding:999999999}", "{align:padding:0}"}) {
    for (const std::string piece :
         {"a", "a ", "\n", "{x}a ", "{", "{}", "{align:right}", "{align:right} a\n{/align}b",
          "{align:center}{/align}", "{align:padding:9}a{/align}", "{align:padding:1}a\n{/align}",
          "{long-fact} "}) {
      const double once = LayoutSeconds(start, piece, LARGE);
      const double fourTimes = LayoutSeconds(start, piece, 4 * LARGE);
      Require(fourTimes < 9 * once + 0.01, "the cost is linear", start + piece);
    }
  }
}

struct Picture : Tarnel::Window {
  using Window::Curses;
  using Window::Window;
};

// Whether the window still has its outermost dots.
bool HasFrame(WINDOW* window, int columns, int rows) {
  for (int cell = 0; cell < columns * rows; ++cell) {
    const int x = cell % columns;
    const int y = cell / columns;
    const bool outside = x == 0 || y == 0 || x == columns - 1 || y == rows - 1;
    if (outside && (mvwinch(window, y, x) & A_CHARTEXT) != '.') return false;
  }
  return true;
}

void CheckPainting(Random& random) {
  FILE* const terminal = fopen("/dev/null", "r+");
  Require(terminal != nullptr && newterm("xterm-256color", terminal, terminal) != nullptr,
          "there is a terminal to paint on", "");
  start_color();
  Tarnel::InitColours();
  Picture window(0, 0, 12, 5, Tarnel::LIGHT_GREY, Tarnel::BLACK);
  window.Activate(true);
  for (int y = 0; y < 5; ++y) window.PutText(0, y, "............");
  auto* const area = window.Add<Tarnel::TextArea>(1, 1, 10, 3, Tarnel::PARENT_COLOUR);
  area->Activate(true);
  for (int i = 0; i < PAINTED_TEXTS; ++i) {
    const std::string text = MakeText(random, i % 2 == 0);
    area->SetText(text);
    Require(HasFrame(window.Curses(), 12, 5), "only the area is painted", text);
  }
}

}  // namespace

int main() {
  Random random;
  for (int i = 0; i < TEXTS; ++i) {
    const bool columns = i % 2 == 0;
    CheckText(MakeText(random, columns), 1 + static_cast<int>(random.Below(MAX_WIDTH)), columns);
  }
  CheckLinearCosts();
  CheckPainting(random);
  return EXIT_SUCCESS;
}
