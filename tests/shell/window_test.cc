#include "shell/window.h"

#include <gtest/gtest.h>

#include "shell/colours.h"
#include "shell/screen.h"
#include "tests/support/curses_screen.h"

namespace Tarnel {

namespace {

using Testing::CursesScreen;

// A window that lets its fields be seen and tells of its end.
class Probe : public Window {
 public:
  Probe(int x, int y, int width, int height, int bg = BLACK, int fg = WHITE)
      : Window(x, y, width, height, bg, fg) {}
  Probe(Window* parent, int x, int y, int width, int height, int bg = PARENT_COLOUR,
        int fg = PARENT_COLOUR)
      : Window(parent, x, y, width, height, bg, fg) {}
  ~Probe() override { ends += name + " "; }

  using Window::_children;
  using Window::DrawBox;
  using Window::Erase;

  std::string ColourFields() const {
    return std::to_string(_bgColor) + "/" + std::to_string(_fgColor);
  }
  Probe* Named(const std::string& newName) {
    name = newName;
    return this;
  }
  std::string ChildNames() const {
    std::string names;
    for (Window* child : _children) {
      names += static_cast<Probe*>(child)->name + " ";
    }
    return names;
  }

  std::string name = "?";
  static std::string ends;
};

std::string Probe::ends;

TEST(WindowTree, IsDestroyedFromTheFirstChildOn) {
  const CursesScreen screen(20, 5);
  Probe::ends.clear();
  auto root = std::make_unique<Probe>(0, 0, 10, 4);
  root->Named("root");
  Probe* const first = root->Add<Probe>(0, 0, 5, 4)->Named("first");
  first->Add<Probe>(0, 0, 5, 2)->Named("upper");
  first->Add<Probe>(0, 2, 5, 2)->Named("lower");
  root->Add<Probe>(5, 0, 5, 4)->Named("second");
  root.reset();
  EXPECT_EQ(Probe::ends, "root first upper lower second ");
}

TEST(WindowTree, KeepsSiblingsInOrderAndItselfWithoutChildren) {
  const CursesScreen screen(20, 5);
  Probe root(0, 0, 10, 4);
  Probe* const first = root.Add<Probe>(0, 0, 1, 1)->Named("first");
  Probe* const second = root.Add<Probe>(1, 0, 1, 1)->Named("second");
  root.Add<Probe>(2, 0, 1, 1)->Named("third");
  first->RemoveChild(second);  // none of its own
  delete second;
  EXPECT_EQ(root.ChildNames(), "first third ");
  root.DeleteChildren();
  EXPECT_EQ(root.ChildNames(), "");
  root.Add<Probe>(0, 0, 4, 1)->PutText(0, 0, "new");
  root.Activate(true);
  UpdateScreen();
  EXPECT_EQ(screen.Picture(), "new\n");
}

TEST(WindowColours, OfTheParentAreTakenAtEachLevel) {
  const CursesScreen screen(12, 1);
  Probe root(0, 0, 12, 1, DARK_GREY, WHITE);
  Probe* const child = root.Add<Probe>(0, 0, 8, 1, YELLOW, BLACK);
  Probe* const grandchild = child->Add<Probe>(0, 0, 4, 1, RED, LIGHT_GREY);
  root.Activate(true);
  UpdateScreen();
  EXPECT_EQ(screen.Colours(0), "1/2*4 3/0*4 6/7*4");
  child->SetColours(PARENT_COLOUR, RED);
  EXPECT_EQ(child->ColourFields(), "6/1");
  EXPECT_EQ(grandchild->ColourFields(), "6/1");
  root.Refresh();
  UpdateScreen();
  EXPECT_EQ(screen.Colours(0), "6/1*8 6/7*4");
  EXPECT_EQ(child->Add<Probe>(0, 0, 1, 1)->ColourFields(), "6/1");
}

TEST(WindowColours, OfADimmedWindowShowWhenItIsActiveAgain) {
  const CursesScreen screen(4, 1);
  Probe root(0, 0, 4, 1, DARK_GREY, WHITE);
  Probe* const child = root.Add<Probe>(0, 0, 2, 1);
  root.Activate(false);
  root.SetColours(YELLOW, BLACK);
  root.Refresh();
  UpdateScreen();
  EXPECT_EQ(screen.Colours(0), "0/6*4");
  EXPECT_EQ(child->ColourFields(), "6/7");
  root.Activate(true);
  UpdateScreen();
  EXPECT_EQ(screen.Colours(0), "6/7*2 3/0*2");
}

// Bands without text, a box around them, and text in one of them.
struct Look {
  bool active;
  const char* band;
  const char* emptyRow;
};

TEST(WindowLook, KeepsItsCharactersThroughActiveDimmedActive) {
  const CursesScreen screen(12, 5);
  Probe root(0, 0, 10, 4, BLACK, WHITE);
  Probe* const top = root.Add<Probe>(0, 0, 10, 2, DARK_GREY, WHITE);
  root.Add<Probe>(0, 2, 10, 2, YELLOW, WHITE);
  root.DrawBox();
  top->Add<Probe>(2, 1, 4, 1, PARENT_COLOUR, RED)->PutText(0, 0, "text");
  for (const Look& look : {Look{true, "6/7*2 6/1*4 6/7*4 plain*2", "3/7*10 plain*2"},
                           Look{false, "0/6*10 plain*2", "0/6*10 plain*2"},
                           Look{true, "6/7*2 6/1*4 6/7*4 plain*2", "3/7*10 plain*2"}}) {
    root.Activate(look.active);
    UpdateScreen();
    EXPECT_EQ(screen.Picture(),
              "+--------+\n"
              "| text   |\n"
              "|        |\n"
              "+--------+\n");
    EXPECT_TRUE(screen.At(0, 1).line);
    EXPECT_FALSE(screen.At(2, 1).line);
    EXPECT_EQ(screen.Colours(1), look.band);
    EXPECT_EQ(screen.Colours(2), look.emptyRow);
  }
}

TEST(WindowLook, InMonochromeIsStandoutOrPlain) {
  const CursesScreen screen(8, 3, "vt220");
  Probe root(0, 0, 8, 3, LIGHT_GREY, WHITE);
  root.Add<Probe>(0, 0, 8, 1, DARK_GREY, WHITE);
  root.Add<Probe>(0, 1, 8, 1, YELLOW, WHITE);
  root.Activate(true);
  UpdateScreen();
  EXPECT_EQ(screen.Colours(0), "standout*8");
  EXPECT_EQ(screen.Colours(1), "plain*8");
  root.Activate(false);
  UpdateScreen();
  EXPECT_EQ(screen.Colours(2), "standout*8");
}

struct Place {
  int x, y, width, height;
};

void PrintTo(const Place& place, std::ostream* out) {
  *out << place.width << "x" << place.height << " at " << place.x << "," << place.y;
}

class WindowThatDoesNotFit : public testing::TestWithParam<Place> {};

TEST_P(WindowThatDoesNotFit, SurvivesEverythingAndShowsNothing) {
  const CursesScreen screen(12, 3);
  Probe root(0, 0, 10, 3, DARK_GREY, WHITE);
  const auto [x, y, width, height] = GetParam();
  Probe* const child = root.Add<Probe>(x, y, width, height, YELLOW, BLACK);
  Probe* const nested = child->Add<Probe>(0, 0, 2, 1, RED, WHITE);
  for (const bool active : {true, false, true}) {
    root.Activate(active);
    for (Probe* probe : {child, nested}) {
      probe->PutText(0, 0, "text");
      probe->DrawBox();
      probe->Erase();
      probe->SetColours(LIGHT_GREY, PARENT_COLOUR);
      probe->TouchAll();
      probe->Refresh();
      probe->RedrawLines();
    }
    UpdateScreen();
    EXPECT_EQ(screen.Picture(), "");
    EXPECT_EQ(screen.Colours(0), active ? "6/7*10 plain*2" : "0/6*10 plain*2");
  }
}

INSTANTIATE_TEST_SUITE_P(Places, WindowThatDoesNotFit,
                         testing::Values(Place{0, 0, 11, 1}, Place{0, 0, 1, 4}, Place{9, 2, 2, 1},
                                         Place{0, 3, 4, 1}, Place{-1, 0, 4, 1}, Place{0, 0, 0, 2},
                                         Place{0, 0, 4, 0}, Place{0, 0, -3, 2},
                                         Place{0, 0, 4, -1}));

TEST(TopLevelWindow, WithoutCellsSurvivesToo) {
  const CursesScreen screen(4, 2);
  for (const Place& place : {Place{0, 0, 0, 0}, Place{0, 0, 5, 5}, Place{4, 2, 1, 1}}) {
    Probe window(place.x, place.y, place.width, place.height);
    window.Add<Probe>(0, 0, 2, 1)->PutText(0, 0, "x");
    window.Activate(false);
    window.Activate(true);
    window.RedrawLines();
    UpdateScreen();
  }
}

TEST(WindowCursor, ComesBackToItsCell) {
  const CursesScreen screen(20, 6);
  Probe window(1, 1, 10, 4);
  window.Activate(true);
  UpdateScreen();
  EXPECT_FALSE(screen.CursorVisible());
  window.Add<Probe>(2, 1, 5, 2)->MoveCursor(3, 1);
  Window::SetCursorVisible(true);
  UpdateScreen();
  EXPECT_TRUE(screen.CursorVisible());
  EXPECT_EQ(screen.CursorX(), 6);
  EXPECT_EQ(screen.CursorY(), 3);

  // Again and again, whatever a dialog does with the cursor in between.
  for (int round = 0; round < 2; ++round) {
    window.Activate(false);
    Probe dialog(5, 0, 4, 2);
    dialog.Activate(true);
    UpdateScreen();
    EXPECT_FALSE(screen.CursorVisible());
    Window::SetCursorVisible(true);
    dialog.MoveCursor(0, 0);
    dialog.Activate(false);
    window.Activate(true);
    UpdateScreen();
    EXPECT_TRUE(screen.CursorVisible());
    EXPECT_EQ(screen.CursorX(), 6);
    EXPECT_EQ(screen.CursorY(), 3);
  }
}

TEST(WindowOutput, IsSentOnceByTheUpdateAndAgainWhenTheTerminalIsNotTrusted) {
  CursesScreen screen(20, 4);
  Probe window(0, 0, 10, 2);
  window.Add<Probe>(0, 0, 5, 1)->PutText(0, 0, "words");
  window.Activate(true);
  screen.TakeOutput();
  window.Refresh();
  EXPECT_EQ(screen.TakeOutput(), "");
  EXPECT_EQ(screen.Picture(), "");
  UpdateScreen();
  EXPECT_NE(screen.TakeOutput().find("words"), std::string::npos);
  window.Refresh();
  UpdateScreen();
  EXPECT_EQ(screen.TakeOutput().find("words"), std::string::npos);
  window.RedrawLines();
  window.Refresh();
  UpdateScreen();
  EXPECT_NE(screen.TakeOutput().find("words"), std::string::npos);
}

TEST(WindowOutput, OfALowerWindowCoversTheUpperOne) {
  const CursesScreen screen(6, 1);
  Probe lower(0, 0, 6, 1);
  Probe upper(1, 0, 3, 1);
  lower.PutText(0, 0, "......");
  upper.PutText(0, 0, "up!");
  lower.Refresh();
  upper.Refresh();
  UpdateScreen();
  EXPECT_EQ(screen.Row(0), ".up!..");
  lower.Refresh();
  UpdateScreen();
  EXPECT_EQ(screen.Row(0), "......");
}

TEST(ActivatedWindow, DropsKeysThatWereTypedBefore) {
  CursesScreen screen(6, 1);
  Probe window(0, 0, 6, 1);
  for (const bool active : {true, false}) {
    screen.Type("abc");
    window.Activate(active);
    wtimeout(stdscr, 0);
    EXPECT_EQ(wgetch(stdscr), ERR);
  }
}

}  // namespace

}  // namespace Tarnel
