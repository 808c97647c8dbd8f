#include "console/widgets/text_area.h"

#include <gtest/gtest.h>

#include <vector>

#include "console/screen/screen.h"
#include "tests/support/curses_screen.h"
#include "tests/widgets/pane.h"

namespace Tarnel::Testing {
namespace {

constexpr int COLUMNS = 12;
constexpr int ROWS = 3;

// A text area over the whole of a small screen.
class TextAreaTest : public testing::Test {
 protected:
  CursesScreen _screen{COLUMNS, ROWS};
  Pane _pane{COLUMNS, ROWS};
  TextArea* _area = _pane.AddText(0, 0, COLUMNS, ROWS);
};

struct ColourRow {
  // Set one after the other; the last one is looked at.
  std::vector<const char*> texts;
  const char* row;
  const char* colours;
};

TEST(TextArea, PaintsTheTextAndItsColours) {
  const ColourRow rows[] = {
      {{"a{color:red}bc{/color}d"}, "abcd", "2/0*1 2/1*2 2/0*9"},
      {{"a{color:red}bcd"}, "abcd", "2/0*1 2/1*3 2/0*8"},
      {{"{color:white}a{color:dark-grey}b{color:yellow}c"}, "abc", "2/7*1 2/6*1 2/3*1 2/0*9"},
      {{"{bgcolor:white}a{bgcolor:black}b{bgcolor:light-grey}c"}, "abc", "7/0*1 0/0*1 2/0*10"},
      {{"{bgcolor:white}{color:black}ab{/color}{/bgcolor}c"}, "abc", "7/0*2 2/0*10"},
      {{"a{blink}b{ip:x}c{}d"}, "abcd", "2/0*12"},
      // An unknown name changes no colour, yet opens one.
      {{"{color:red}a{color:black>}b{/color}c"}, "abc", "2/1*2 2/0*10"},
      {{"{bgcolor:white}a{color:}b{/color}c"}, "abc", "7/0*2 2/0*10"},
      // A close without its opening does nothing.
      {{"{color:red}a{/bgcolor}b"}, "ab", "2/1*2 2/0*10"},
      {{"{bgcolor:white}a{/color}b"}, "ab", "7/0*2 2/0*10"},
      {{"{color:red}a{/color}{bgcolor:white}b{/color}c"}, "abc", "2/1*1 7/1*2 2/0*9"},
      {{"{bgcolor:white}a{/bgcolor}{color:red}b{/bgcolor}c"}, "abc", "7/0*1 7/1*2 2/0*9"},
      // A close returns to the window's pair; the closed colour still combines with a later one.
      {{"{bgcolor:white}{color:red}a{/color}b"}, "ab", "7/1*1 2/0*11"},
      {{"{bgcolor:white}{color:red}a{/bgcolor}b"}, "ab", "7/1*1 2/0*11"},
      {{"{color:red}a{/color}b{bgcolor:yellow}c"}, "abc", "2/1*1 2/0*1 3/1*1 2/0*9"},
      {{"{bgcolor:yellow}a{/bgcolor}b{color:red}c"}, "abc", "3/0*1 2/0*1 3/1*1 2/0*9"},
      {{"a{align:right}{color:red}b{/color}{/align}"}, "a          b", "2/0*11 2/1*1"},
      {{"{bgcolor:white}{align:right}b{/align}"}, "           b", "7/0*12"},
      // A byte is a column, also where the next piece begins.
      {{"\xC3\xA9{color:red}b"}, "\xC3\xA9 b", "2/0*2 2/1*1 2/0*9"},
      // An open colour stays for the next text, unless it stood below the last row.
      {{"{color:red}ab", "c{/color}d"}, "cd", "2/1*2 2/0*10"},
      {{"a\n{color:red}b", "c"}, "c", "2/0*12"},
      {{"{bgcolor:white}abcdef{/bgcolor}", "x"}, "x", "2/0*12"},
  };
  for (const ColourRow& row : rows) {
    const CursesScreen screen(COLUMNS, 1);
    Pane pane(COLUMNS, 1);
    TextArea* area = pane.AddText(0, 0, COLUMNS, 1);
    for (const char* text : row.texts) area->SetText(text);
    UpdateScreen();
    EXPECT_EQ(screen.Row(0), row.row) << row.texts.back();
    EXPECT_EQ(screen.Colours(0), row.colours) << row.texts.back();
  }
}

TEST(TextArea, StaysInItsPlace) {
  struct {
    const char* text;
    int x, y, width, height;
    const char* picture;
  } const rows[] = {
      {"ab\n\ncd", 1, 0, 3, 3, ".ab ..\n.   ..\n.cd ..\n"},
      {"{color:red}a{/color}b\nc{color:red}d\ne", 1, 0, 3, 3, ".ab ..\n.cd ..\n.e  ..\n"},
      {"ab\ncd", 1, 1, 3, 1, "......\n.ab ..\n......\n"},
      {"abcdefghijkl", 3, 1, 3, 2, "......\n...abc\n...def\n"},
      {"", 3, 1, 2, 1, "......\n...  .\n......\n"},
      {"abc", 4, 1, 0, 1, "......\n......\n......\n"},
      {"{align:right}abc{/align}", 4, 1, -3, -1, "......\n......\n......\n"},
      {"abc", 4, 1, 5, 1, "......\n......\n......\n"},
  };
  for (const auto& row : rows) {
    const CursesScreen screen(6, 3);
    Pane pane(6, 3);
    pane.AddText(0, 0, 6, 3)->SetText("......\n......\n......");
    TextArea* area = pane.AddText(row.x, row.y, row.width, row.height);
    area->SetText(row.text);
    area->Activate(false);
    area->AppendText("");
    area->Activate(true);
    UpdateScreen();
    EXPECT_EQ(screen.Picture(), row.picture) << row.text;
  }
}

TEST_F(TextAreaTest, HasItsOwnForeground) {
  _pane.AddText(0, 0, COLUMNS, 1, WHITE)->SetText("a{color:red}b{/color}c");
  UpdateScreen();
  EXPECT_EQ(_screen.Colours(0), "2/7*1 2/1*1 2/7*10");
}

TEST_F(TextAreaTest, DimsAllTextAndComesBack) {
  _area->SetText("a{bgcolor:white}{color:red}b{/color}{/bgcolor}c");
  _pane.Activate(false);
  UpdateScreen();
  EXPECT_EQ(_screen.Row(0), "abc");
  EXPECT_EQ(_screen.Colours(0), "0/6*12");
  _area->SetText("{color:red}d");
  UpdateScreen();
  EXPECT_EQ(_screen.Colours(0), "0/6*12");
  _pane.Activate(true);
  UpdateScreen();
  EXPECT_EQ(_screen.Colours(0), "2/1*1 2/0*11");
}

TEST(TextArea, MarksByTheBackgroundAloneWithoutColours) {
  const CursesScreen screen(COLUMNS, 1, "vt100");
  Pane pane(COLUMNS, 1);
  pane.AddText(0, 0, COLUMNS, 1)->SetText("a{color:red}b{/color}{bgcolor:black}c{/bgcolor}d");
  UpdateScreen();
  EXPECT_EQ(screen.Row(0), "abcd");
  EXPECT_EQ(screen.Colours(0), "plain*2 standout*1 plain*9");
}

TEST_F(TextAreaTest, AppendedTextIsSentAtOnce) {
  _area->SetText("Stopping.");
  EXPECT_EQ(_screen.Picture(), "");
  _area->AppendText("\nDone.");
  EXPECT_EQ(_screen.Picture(), "Stopping.\nDone.\n");
}

}  // namespace
}  // namespace Tarnel::Testing
