#include <gtest/gtest.h>

#include "shell/colours.h"
#include "shell/screen.h"
#include "shell/window.h"
#include "tests/support/curses_screen.h"

namespace Tarnel {

namespace {

using Testing::CursesScreen;

struct TextCase {
  std::string text;
  int x;
  std::string row;
};

void PrintTo(const TextCase& row, std::ostream* out) {
  *out << testing::PrintToString(row.text) << " at " << row.x;
}

class PutText : public testing::TestWithParam<TextCase> {};

// A window of 10 by 2 with rows of dots, in the middle of others.
TEST_P(PutText, StaysInItsRow) {
  const CursesScreen screen(14, 4);
  Window around(0, 0, 14, 4, BLACK, WHITE);
  for (int y = 0; y < 4; ++y) {
    around.PutText(0, y, "..............");
  }
  Window* const window = around.CreateChild(2, 1, 10, 2, BLACK, WHITE);
  window->PutText(GetParam().x, 0, GetParam().text);
  around.Refresh();
  UpdateScreen();
  EXPECT_EQ(screen.Picture(), "..............\n" + std::string("..") + GetParam().row +
                                  "..\n..............\n..............\n");
}

const char ZERO_BYTE[] = "a\0b";

INSTANTIATE_TEST_SUITE_P(
    Texts, PutText,
    testing::Values(TextCase{"", 0, ".........."}, TextCase{"text", 0, "text......"},
                    // Up to the edge and over it.
                    TextCase{"0123456789", 0, "0123456789"},
                    TextCase{"0123456789abc", 0, "0123456789"}, TextCase{"xyz", 9, ".........x"},
                    TextCase{"xyz", 10, ".........."}, TextCase{"xyz", -1, ".........."},
                    // Each of these takes one cell and moves nothing.
                    TextCase{"a\tb", 0, "a b......."}, TextCase{"a\nb", 0, "a b......."},
                    TextCase{"a\rb", 0, "a b......."}, TextCase{"a\x1b[2Jb", 0, "a?[2Jb...."},
                    TextCase{"a\x07\x08\x7f"
                             "b",
                             0, "a???b....."},
                    TextCase{std::string(ZERO_BYTE, 3), 0, "a?b......."},
                    TextCase{"a\u0085\u009b\u200bb", 0, "a???b....."},
                    // Characters of several bytes, whole and broken.
                    TextCase{"größe█", 0, "größe█...."}, TextCase{"a\xff\xc3+b", 0, "a??+b....."},
                    TextCase{"a\xed\xa0\x80"
                             "b",
                             0, "a???b....."},
                    TextCase{"ab\xe2\x96", 0, "ab??......"},
                    TextCase{"\xc0\xaf\xf5", 0, "???......."},
                    // Characters of two columns, the last of them half over the edge.
                    TextCase{"a語b", 0, "a語b......"}, TextCase{"語語語", 5, ".....語語."}));

TEST(PutTextInTheLastCell, DoesNotScroll) {
  const CursesScreen screen(4, 2);
  Window window(0, 0, 4, 2, BLACK, WHITE);
  window.PutText(0, 0, "abcd");
  window.PutText(2, 1, "yz");
  window.PutText(3, 2, "no");
  window.Refresh();
  UpdateScreen();
  EXPECT_EQ(screen.Picture(), "abcd\n  yz\n");
}

}  // namespace

}  // namespace Tarnel
