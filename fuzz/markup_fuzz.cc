// Lays out and paints marked-up texts that are put together at random from pieces of the language,
// the same ones in every run, and checks what has to hold for every text.

#include <curses.h>

#include <algorithm>
#include <array>
#include <cctype>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <random>
#include <string>

#include "shell/colours.h"
#include "widgets/markup_layout.h"
#include "widgets/text_area.h"

namespace {

using Tarnel::ValueTags;

constexpr int TEXTS = 60000;
constexpr int PAINTED_TEXTS = 3000;
constexpr size_t MAX_PIECES = 40;
constexpr int MAX_WIDTH = 24;
constexpr size_t LARGE = 1 << 17;

const ValueTags FACTS = {
    {"fact", [] { return std::string("10.0.0.1"); }},
    {"long-fact", [] { return std::string(70, 'f'); }},
    {"empty-fact", [] { return std::string(); }},
};

constexpr std::array TEXT_PIECES = {"a",    "bc", "words", "averylongwordwithoutanend",
                                    " ",    "  ", "\n",    "\n\n",
                                    "\t",   "\r", "\x1b",  "\xC3\xA9",
                                    "\xff", "}",  "."};
constexpr std::array TAG_PIECES = {"{align:right}",   "{align:center}", "{align:left}", "{align}",
                                   "{/align}",        "{/align}",       "{/align}",     "{}",
                                   "{color:red}",     "{/color}",       "{color:x}",    "{nothing}",
                                   "{bgcolor:white}", "{/bgcolor}",     "{a{b}",        "{:}"};
constexpr std::array COLUMN_PIECES = {"{align:padding:0}",
                                      "{align:padding:5}",
                                      "{align:padding:99999999999999999999}",
                                      "{align:padding:-99999999999999999999}",
                                      "{fact}",
                                      "{long-fact}",
                                      "{empty-fact}",
                                      "{align:padding:x}",
                                      "{"};

class Random {
 public:
  size_t Below(size_t limit) { return _engine() % limit; }

  template <size_t COUNT>
  const char* Piece(const std::array<const char*, COUNT>& pieces) {
    return pieces[Below(COUNT)];
  }

 private:
  std::mt19937 _engine{20};
};

// With columns, the text also holds columns, facts and tags without an end.
std::string MakeText(Random& random, bool columns) {
  std::string text;
  for (size_t count = random.Below(MAX_PIECES); count > 0; --count) {
    const size_t kind = random.Below(columns ? 5 : 4);
    text += kind < 2    ? random.Piece(TEXT_PIECES)
            : kind == 4 ? random.Piece(COLUMN_PIECES)
                        : random.Piece(TAG_PIECES);
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
  std::erase_if(text, [](char c) { return isspace(static_cast<unsigned char>(c)) != 0; });
  return text;
}

size_t LongestLine(const std::string& text) {
  size_t longest = 0;
  size_t length = 0;
  for (const char c : text) {
    length = c == '\n' ? 0 : length + 1;
    longest = std::max(longest, length);
  }
  return longest;
}

void Require(bool holds, const char* what, const std::string& text, int width) {
  if (holds) return;
  fprintf(stderr, "%s, at width %d:\n", what, width);
  for (const char c : text) {
    const auto byte = static_cast<unsigned char>(c);
    if (isprint(byte) != 0) {
      fputc(c, stderr);
    } else {
      fprintf(stderr, "\\x%02x", byte);
    }
  }
  fputc('\n', stderr);
  exit(EXIT_FAILURE);
}

// Each byte of the text leads to at most one line end and one line's blanks.
size_t LargestSize(const std::string& text, int width) {
  return (text.size() + 1) * (static_cast<size_t>(width) + 80);
}

void CheckText(const std::string& text, int width, bool columns) {
  const std::string display = Tarnel::LayoutMarkup(text, width, FACTS);
  Require(display == Tarnel::LayoutMarkup(text, width, FACTS), "two results", text, width);
  Require(display.size() <= LargestSize(text, width), "the result is too large", text, width);
  if (columns) return;
  const std::string shown = WithoutTags(display);
  Require(LongestLine(shown) <= static_cast<size_t>(width), "a line is too long", text, width);
  Require(WithoutSpace(shown) == WithoutSpace(WithoutTags(text)), "letters have changed", text,
          width);
}

double LayoutSeconds(const std::string& text) {
  double best = 1e9;
  for (int round = 0; round < 3; ++round) {
    const clock_t start = clock();
    static_cast<void>(Tarnel::LayoutMarkup(text, 80, FACTS));
    best = std::min(best, static_cast<double>(clock() - start) / CLOCKS_PER_SEC);
  }
  return best;
}

std::string Repeat(const std::string& piece, size_t size) {
  std::string text;
  while (text.size() < size) text += piece;
  return text;
}

// Four times the text takes about four times the time; with a quadratic cost it would be sixteen.
void CheckLinearCost(const std::string& start, const std::string& piece) {
  const double once = LayoutSeconds(start + Repeat(piece, LARGE) + "{/align}");
  const double fourTimes = LayoutSeconds(start + Repeat(piece, 4 * LARGE) + "{/align}");
  Require(fourTimes < 9 * once + 0.01, "the cost is not linear", start + piece + "...", 80);
}

void CheckLinearCosts() {
  for (const char* const start :
       {"", "{align:right}", "{align:center}", "{align:padding:999999999}", "{align:padding:-1}",
        "{align:padding:0}"}) {
    for (const char* const piece :
         {"a", "a ", "word after word ", "\n", "{x}", "{x}a ", "{", "{}", "}", "{align:right}",
          "{align:right}a{/align}", "{align:right} a\n{/align}b", "{align:center}{/align}",
          "{align:padding:99}a{/align}", "{align:padding:1}a\n{/align}", "{fact}",
          "{long-fact} "}) {
      CheckLinearCost(start, piece);
    }
  }
}

// A window full of dots with a text area in its middle.
class Picture : public Tarnel::Window {
 public:
  static constexpr int COLUMNS = 12;
  static constexpr int ROWS = 5;

  Picture() : Window(0, 0, COLUMNS, ROWS, Tarnel::LIGHT_GREY, Tarnel::BLACK) {
    Activate(true);
    for (int y = 0; y < ROWS; ++y) PutText(0, y, std::string(COLUMNS, '.'));
    _text = Add<Tarnel::TextArea>(1, 1, COLUMNS - 2, ROWS - 2, Tarnel::PARENT_COLOUR);
    _text->Activate(true);
  }

  // Whether the dots around the area are still there.
  bool Show(const std::string& text) {
    _text->SetText(text);
    for (int y = 0; y < ROWS; ++y) {
      for (int x = 0; x < COLUMNS; ++x) {
        const bool outside = x == 0 || y == 0 || x == COLUMNS - 1 || y == ROWS - 1;
        if (outside && (mvwinch(Curses(), y, x) & A_CHARTEXT) != '.') return false;
      }
    }
    return true;
  }

 private:
  Tarnel::TextArea* _text;
};

void CheckPainting(Random& random) {
  FILE* const terminal = fopen("/dev/null", "r+");
  if (terminal == nullptr || newterm("xterm-256color", terminal, terminal) == nullptr) {
    fputs("no terminal to paint on\n", stderr);
    exit(EXIT_FAILURE);
  }
  start_color();
  Tarnel::InitColours();
  {
    Picture picture;
    for (int i = 0; i < PAINTED_TEXTS; ++i) {
      const std::string text = MakeText(random, i % 2 == 0);
      Require(picture.Show(text), "painted outside", text, Picture::COLUMNS - 2);
    }
  }
  endwin();
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
