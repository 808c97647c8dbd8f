#include "widgets/text_area.h"

#include <gtest/gtest.h>

#include <ostream>

#include "shell/colours.h"
#include "shell/screen.h"
#include "tests/support/curses_screen.h"

namespace Tarnel::Testing {
namespace {

constexpr int COLUMNS = 12;
constexpr int ROWS = 4;

// A light grey window over the whole screen.
class Pane : public Window {
 public:
  explicit Pane(int bg = LIGHT_GREY, int fg = BLACK) : Window(0, 0, COLUMNS, ROWS, bg, fg) {
    Activate(true);
  }

  TextArea* AddText(int x, int y, int width, int height, int fg = PARENT_COLOUR) {
    auto* area = Add<TextArea>(x, y, width, height, fg);
    area->Activate(true);
    return area;
  }
};

struct ColourCase {
  const char* name;
  const char* text;
  const char* row;
  const char* colours;
};

std::ostream& operator<<(std::ostream& out, const ColourCase& row) { return out << row.text; }

class ColourTable : public testing::TestWithParam<ColourCase> {};

TEST_P(ColourTable, PaintsTheTextAndItsColours) {
  const CursesScreen screen(COLUMNS, ROWS);
  Pane pane;
  pane.AddText(0, 0, COLUMNS, 1)->SetText(GetParam().text);
  UpdateScreen();
  EXPECT_EQ(screen.Row(0), GetParam().row);
  EXPECT_EQ(screen.Colours(0), GetParam().colours);
}

INSTANTIATE_TEST_SUITE_P(
    , ColourTable,
    testing::Values(
        ColourCase{"Plain", "abcd", "abcd", "2/0*12"},
        ColourCase{"Foreground", "a{color:red}bc{/color}d", "abcd", "2/0*1 2/1*2 2/0*9"},
        ColourCase{"EachName", "{color:white}a{color:dark-grey}b{color:yellow}c{color:red}d",
                   "abcd", "2/7*1 2/6*1 2/3*1 2/1*1 2/0*8"},
        ColourCase{"EachBackground", "{bgcolor:white}a{bgcolor:black}b{bgcolor:light-grey}c", "abc",
                   "7/0*1 0/0*1 2/0*10"},
        ColourCase{"Unclosed", "a{color:red}bcd", "abcd", "2/0*1 2/1*3 2/0*8"},
        ColourCase{"UnknownName", "a{color:green}b{/color}c", "abc", "2/0*12"},
        ColourCase{"UnknownKeepsTheOpenColour", "{color:red}a{color:black>}b{/color}c", "abc",
                   "2/1*2 2/0*10"},
        ColourCase{"UnknownBackground", "a{bgcolor:}b{/bgcolor}c", "abc", "2/0*12"},
        ColourCase{"CloseWithoutOpen", "a{/color}b{/bgcolor}c", "abc", "2/0*12"},
        ColourCase{"SecondCloseDoesNothing", "{color:red}a{/color}{bgcolor:white}b{/color}c", "abc",
                   "2/1*1 7/1*2 2/0*9"},
        ColourCase{"CloseOfTheOtherKindDoesNothing", "{color:red}a{/bgcolor}b", "ab",
                   "2/1*2 2/0*10"},
        ColourCase{"SecondCloseOfTheBackgroundDoesNothing",
                   "{bgcolor:white}a{/bgcolor}{color:red}b{/bgcolor}c", "abc", "7/0*1 7/1*2 2/0*9"},
        ColourCase{"InputField", "{bgcolor:white}{color:black}ab{/color}{/bgcolor}c", "abc",
                   "7/0*2 2/0*10"},
        ColourCase{"CloseReturnsToTheWindowsPair", "{bgcolor:white}{color:red}a{/color}b", "ab",
                   "7/1*1 2/0*11"},
        ColourCase{"CloseOfTheBackgroundToo", "{bgcolor:white}{color:red}a{/bgcolor}b", "ab",
                   "7/1*1 2/0*11"},
        ColourCase{"ClosedForegroundCombines", "{color:red}a{/color}b{bgcolor:yellow}c", "abc",
                   "2/1*1 2/0*1 3/1*1 2/0*9"},
        ColourCase{"ClosedBackgroundCombines", "{bgcolor:yellow}a{/bgcolor}b{color:red}c", "abc",
                   "3/0*1 2/0*1 3/1*1 2/0*9"},
        ColourCase{"AlignmentBlanksBeforeTheColour", "a{align:right}{color:red}b{/color}{/align}",
                   "a          b", "2/0*11 2/1*1"},
        ColourCase{"AlignmentBlanksInsideTheColour", "{bgcolor:white}{align:right}b{/align}",
                   "           b", "7/0*12"},
        ColourCase{"OtherTagsVanish", "a{blink}b{ip:x}c{}d", "abcd", "2/0*12"},
        ColourCase{"ControlBytesTakeOneCell", "a\tb\x1b[1m\rc", "a b?[1m c", "2/0*12"},
        ColourCase{"InvalidBytesTakeOneCell", "a\xff\xc3 b", "a?? b", "2/0*12"},
        ColourCase{"Utf8", "\xC3\xA9\xE2\x82\xAC!", "\xC3\xA9\xE2\x82\xAC!", "2/0*12"},
        // A byte is a column, also where the next piece begins.
        ColourCase{"Utf8BeforeAColour", "\xC3\xA9{color:red}b", "\xC3\xA9 b", "2/0*2 2/1*1 2/0*9"}),
    [](const auto& row) { return row.param.name; });

struct PictureCase {
  const char* name;
  const char* text;
  int x, y, width, height;
  const char* picture;
};

std::ostream& operator<<(std::ostream& out, const PictureCase& row) { return out << row.text; }

class PictureTable : public testing::TestWithParam<PictureCase> {};

TEST_P(PictureTable, StaysInItsPlace) {
  const PictureCase& row = GetParam();
  const CursesScreen screen(COLUMNS, ROWS);
  Pane pane;
  pane.AddText(0, 0, COLUMNS, ROWS)
      ->SetText("............\n............\n............\n............");
  TextArea* area = pane.AddText(row.x, row.y, row.width, row.height);
  area->SetText(row.text);
  area->Activate(false);
  area->AppendText("");
  area->Activate(true);
  UpdateScreen();
  EXPECT_EQ(screen.Picture(), row.picture);
}

INSTANTIATE_TEST_SUITE_P(
    , PictureTable,
    testing::Values(PictureCase{"Lines", "ab\n\ncd", 1, 0, 3, 3,
                                ".ab ........\n.   ........\n.cd ........\n............\n"},
                    PictureCase{"ColouredLines", "{color:red}a{/color}b\nc{color:red}d\ne", 1, 0, 3,
                                3, ".ab ........\n.cd ........\n.e  ........\n............\n"},
                    PictureCase{"OneRow", "ab\ncd", 1, 1, 3, 1,
                                "............\n.ab ........\n............\n............\n"},
                    PictureCase{"FullToTheLastCell", "abcdefghijkl", 9, 2, 3, 2,
                                "............\n............\n.........abc\n.........def\n"},
                    PictureCase{"TooManyLines", "a\nb\nc\nd\ne\nf", 0, 2, 2, 2,
                                "............\n............\na ..........\nb ..........\n"},
                    PictureCase{"OneCell", "abc", 4, 1, 1, 1,
                                "............\n....a.......\n............\n............\n"},
                    PictureCase{"Empty", "", 4, 1, 2, 1,
                                "............\n....  ......\n............\n............\n"},
                    PictureCase{"NoWidth", "abc", 4, 1, 0, 1,
                                "............\n............\n............\n............\n"},
                    PictureCase{"NoHeight", "abc", 4, 1, 3, 0,
                                "............\n............\n............\n............\n"},
                    PictureCase{"NegativeSize", "{align:right}abc{/align}", 4, 1, -3, -1,
                                "............\n............\n............\n............\n"},
                    PictureCase{"OverTheEdge", "abc", 10, 1, 5, 1,
                                "............\n............\n............\n............\n"}),
    [](const auto& row) { return row.param.name; });

TEST(TextArea, HasItsOwnForeground) {
  const CursesScreen screen(COLUMNS, ROWS);
  Pane pane;
  pane.AddText(0, 0, COLUMNS, 1, WHITE)->SetText("a{color:red}b{/color}c");
  UpdateScreen();
  EXPECT_EQ(screen.Colours(0), "2/7*1 2/1*1 2/7*10");
}

TEST(TextArea, AnOpenColourStaysForTheNextText) {
  const CursesScreen screen(COLUMNS, ROWS);
  Pane pane;
  TextArea* area = pane.AddText(0, 0, COLUMNS, 1);
  area->SetText("{color:red}ab");
  area->SetText("c{/color}d");
  UpdateScreen();
  EXPECT_EQ(screen.Row(0), "cd");
  EXPECT_EQ(screen.Colours(0), "2/1*2 2/0*10");
}

TEST(TextArea, DoesNotReadBelowItsLastRow) {
  const CursesScreen screen(COLUMNS, ROWS);
  Pane pane;
  TextArea* area = pane.AddText(0, 0, COLUMNS, 1);
  area->SetText("a\n{color:red}b");
  area->SetText("c");
  UpdateScreen();
  EXPECT_EQ(screen.Colours(0), "2/0*12");
}

TEST(TextArea, DimsAllTextAndComesBack) {
  const CursesScreen screen(COLUMNS, ROWS);
  Pane pane;
  TextArea* area = pane.AddText(0, 0, COLUMNS, 1);
  area->SetText("a{bgcolor:white}{color:red}b{/color}{/bgcolor}c");
  pane.Activate(false);
  UpdateScreen();
  EXPECT_EQ(screen.Row(0), "abc");
  EXPECT_EQ(screen.Colours(0), "0/6*12");
  area->SetText("{color:red}d");
  UpdateScreen();
  EXPECT_EQ(screen.Row(0), "d");
  EXPECT_EQ(screen.Colours(0), "0/6*12");
  pane.Activate(true);
  UpdateScreen();
  EXPECT_EQ(screen.Colours(0), "2/1*1 2/0*11");
}

TEST(TextArea, MarksByTheBackgroundAloneWithoutColours) {
  const CursesScreen screen(COLUMNS, ROWS, "vt100");
  Pane pane;
  pane.AddText(0, 0, COLUMNS, 1)->SetText("a{color:red}b{/color}{bgcolor:black}c{/bgcolor}d");
  UpdateScreen();
  EXPECT_EQ(screen.Row(0), "abcd");
  EXPECT_EQ(screen.Colours(0), "plain*2 standout*1 plain*9");
}

TEST(TextArea, AppendedTextIsSentAtOnce) {
  const CursesScreen screen(COLUMNS, ROWS);
  Pane pane;
  TextArea* area = pane.AddText(0, 0, COLUMNS, ROWS);
  area->SetText("Stopping.");
  EXPECT_EQ(screen.Picture(), "");
  area->AppendText("\nDone");
  EXPECT_EQ(screen.Picture(), "Stopping.\nDone\n");
  area->AppendText(".");
  EXPECT_EQ(screen.Picture(), "Stopping.\nDone.\n");
}

TEST(TextArea, ANewTextLeavesNothingOfTheOldOne) {
  const CursesScreen screen(COLUMNS, ROWS);
  Pane pane;
  TextArea* area = pane.AddText(0, 0, COLUMNS, ROWS);
  area->SetText("{bgcolor:white}abcdef{/bgcolor}\nghi");
  area->SetText("x");
  UpdateScreen();
  EXPECT_EQ(screen.Picture(), "x\n");
  EXPECT_EQ(screen.Colours(0), "2/0*12");
}

}  // namespace
}  // namespace Tarnel::Testing
