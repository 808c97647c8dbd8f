#include "console/screen/window.h"

#include <gtest/gtest.h>

#include "console/screen/colours.h"
#include "console/screen/screen.h"
#include "tests/support/curses_screen.h"

namespace Tarnel {

namespace {

using Testing::CursesScreen;

// A window that lets its painting be tried and tells of its end.
class Probe : public Window {
 public:
  using Window::DrawBox;
  using Window::Erase;
  using Window::Window;
  ~Probe() override { ends += name + " "; }

  std::string name;
  static std::string ends;
};

std::string Probe::ends;

TEST(WindowTree, IsDestroyedFromTheFirstChildOn) {
  const CursesScreen screen(20, 5);
  const auto add = [](Window& parent, const char* name) {
    auto* const child = parent.Add<Probe>(0, 0, 5, 4, RED, WHITE);
    child->name = name;
    return child;
  };
  {
    Window root(0, 0, 10, 4, BLACK, WHITE);
    Probe* const first = add(root, "first");
    add(*first, "upper");
    add(*first, "lower");
    Probe* const second = add(root, "second");
    add(root, "third");
    Probe::ends.clear();
    first->RemoveChild(second);  // none of its own
    delete second;
  }
  EXPECT_EQ(Probe::ends, "second first upper lower third ");
}

TEST(WindowColours, AreGivenDownAndKeptWhileDimmed) {
  const CursesScreen screen(12, 1);
  Window root(0, 0, 12, 1, DARK_GREY, WHITE);
  Window* const child = root.CreateChild(0, 0, 8, 1, YELLOW, BLACK);
  child->CreateChild(0, 0, 4, 1, RED, PARENT_COLOUR);
  const auto shown = [&] {
    root.Refresh();
    UpdateScreen();
    return screen.Colours(0);
  };
  root.Activate(true);
  EXPECT_EQ(shown(), "1/0*4 3/0*4 6/7*4");
  child->SetColours(PARENT_COLOUR, RED);
  EXPECT_EQ(shown(), "6/1*8 6/7*4");
  root.Activate(false);
  root.SetColours(YELLOW, BLACK);
  EXPECT_EQ(shown(), "0/6*12");
  root.Activate(true);
  EXPECT_EQ(shown(), "6/1*8 3/0*4");
}

// Bands without text, a box around them, and text in one of them.
TEST(WindowLook, KeepsItsCharactersThroughActiveDimmedActive) {
  const CursesScreen screen(12, 5);
  Probe root(0, 0, 10, 4, BLACK, WHITE);
  Window* const top = root.CreateChild(0, 0, 10, 2, DARK_GREY, WHITE);
  root.CreateChild(0, 2, 10, 2, YELLOW, WHITE);
  root.DrawBox();
  top->CreateChild(2, 1, 4, 1, PARENT_COLOUR, RED)->PutText(0, 0, "text");
  for (const bool active : {true, false, true}) {
    root.Activate(active);
    UpdateScreen();
    EXPECT_EQ(screen.Picture(),
              "+--------+\n"
              "| text   |\n"
              "|        |\n"
              "+--------+\n");
    EXPECT_TRUE(screen.At(0, 1).line);
    EXPECT_FALSE(screen.At(2, 1).line);
    EXPECT_EQ(screen.Colours(1), active ? "6/7*2 6/1*4 6/7*4 plain*2" : "0/6*10 plain*2");
    EXPECT_EQ(screen.Colours(2), active ? "3/7*10 plain*2" : "0/6*10 plain*2");
  }
}

struct Place {
  int x, y, width, height;
};

TEST(WindowThatDoesNotFit, SurvivesEverythingAndShowsNothing) {
  const CursesScreen screen(12, 3);
  for (const auto& [x, y, width, height] :
       {Place{0, 0, 11, 1}, Place{0, 0, 1, 4}, Place{9, 2, 2, 1}, Place{0, 3, 4, 1},
        Place{-1, 0, 4, 1}, Place{0, 0, 0, 2}, Place{0, 0, 4, 0}, Place{0, 0, 4, -1}}) {
    Window root(0, 0, 10, 3, DARK_GREY, WHITE);
    Probe* const child = root.Add<Probe>(x, y, width, height, YELLOW, BLACK);
    Probe* const nested = child->Add<Probe>(0, 0, 2, 1, RED, WHITE);
    for (const bool active : {true, false, true}) {
      root.Activate(active);
      for (Probe* const window : {child, nested}) {
        window->PutText(0, 0, "text");
        window->DrawBox();
        window->Erase();
        window->SetColours(LIGHT_GREY, PARENT_COLOUR);
        window->RedrawLines();
        window->Refresh();
      }
      UpdateScreen();
      EXPECT_EQ(screen.Picture(), "") << width << "x" << height << " at " << x << "," << y;
      EXPECT_EQ(screen.Colours(0), active ? "6/7*10 plain*2" : "0/6*10 plain*2");
    }
  }
}

TEST(WindowCursor, ComesBackToItsCell) {
  const CursesScreen screen(20, 6);
  const auto cursor = [&] {
    UpdateScreen();
    return CursesScreen::CursorVisible() ? std::pair(screen.CursorX(), screen.CursorY())
                                         : std::pair(-1, -1);
  };
  const std::pair hidden(-1, -1);
  Window window(1, 1, 10, 4, BLACK, WHITE);
  window.Activate(true);
  EXPECT_EQ(cursor(), hidden);
  window.CreateChild(2, 1, 5, 2, RED, WHITE)->MoveCursor(3, 1);
  Window::SetCursorVisible(true);
  EXPECT_EQ(cursor(), std::pair(6, 3));
  // Again and again, whatever a dialog does with the cursor in between.
  for (int round = 0; round < 2; ++round) {
    window.Activate(false);
    Window dialog(5, 0, 4, 2, BLACK, WHITE);
    dialog.Activate(true);
    EXPECT_EQ(cursor(), hidden);
    Window::SetCursorVisible(true);
    dialog.MoveCursor(0, 0);
    dialog.Activate(false);
    window.Activate(true);
    EXPECT_EQ(cursor(), std::pair(6, 3));
  }
}

TEST(WindowOutput, IsSentOnceByTheUpdateAndAgainWhenTheTerminalIsNotTrusted) {
  CursesScreen screen(20, 4);
  Window window(0, 0, 10, 2, BLACK, WHITE);
  window.CreateChild(0, 0, 5, 1, RED, WHITE)->PutText(0, 0, "words");
  const auto sent = [&] { return screen.TakeOutput().find("words") != std::string::npos; };
  window.Activate(true);
  EXPECT_FALSE(sent());
  UpdateScreen();
  EXPECT_TRUE(sent());
  window.Refresh();
  UpdateScreen();
  EXPECT_FALSE(sent());
  window.RedrawLines();
  window.Refresh();
  UpdateScreen();
  EXPECT_TRUE(sent());
}

TEST(WindowOutput, OfALowerWindowCoversTheUpperOne) {
  const CursesScreen screen(6, 1);
  Window lower(0, 0, 6, 1, BLACK, WHITE);
  Window upper(1, 0, 3, 1, BLACK, WHITE);
  lower.PutText(0, 0, "......");
  upper.PutText(0, 0, "up!");
  for (Window* const window : {&lower, &upper, &lower}) {
    window->Refresh();
    UpdateScreen();
    EXPECT_EQ(screen.Row(0), window == &upper ? ".up!.." : "......");
  }
}

struct TextCase {
  std::string text;
  int x;
  std::string row;
};

// Texts in a window of 10 by 2, in the middle of dots.
TEST(WindowText, StaysInItsRow) {
  const TextCase rows[] = {
      // Up to the edge and over it.
      {"0123456789abc", 0, "0123456789"},
      {"xyz", 9, ".........x"},
      {"xyz", 10, ".........."},
      {"xyz", -1, ".........."},
      // Each of these takes one cell and moves nothing.
      {"a\tb\nc\rd", 0, "a b c d..."},
      {"a\033[2Jb", 0, "a?[2Jb...."},
      {"a\a\b\177b", 0, "a???b....."},
      {{'a', '\0', 'b'}, 0, "a?b......."},
      {"a\u0085\u009b\u200bb", 0, "a???b....."},
      // Characters of several bytes, whole and broken.
      {"größe█", 0, "größe█...."},
      {"a\xff\xc3+b", 0, "a??+b....."},
      {"a\355\240\200b", 0, "a???b....."},
      {"ab\xe2\x96", 0, "ab??......"},
      // Characters of two columns, the last of them half over the edge.
      {"a語b", 0, "a語b......"},
      {"語語語", 5, ".....語語."},
  };
  const CursesScreen screen(12, 3);
  for (const auto& [text, x, row] : rows) {
    Window around(0, 0, 12, 3, BLACK, WHITE);
    for (int y = 0; y < 3; ++y) {
      around.PutText(0, y, "............");
    }
    around.CreateChild(1, 1, 10, 2, BLACK, WHITE)->PutText(x, 0, text);
    around.Refresh();
    UpdateScreen();
    EXPECT_EQ(screen.Picture(), "............\n." + row + ".\n............\n")
        << testing::PrintToString(text);
  }
}

}  // namespace

}  // namespace Tarnel
