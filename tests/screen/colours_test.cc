#include "console/screen/colours.h"

#include <gtest/gtest.h>

#include <tuple>

#include "tests/support/curses_screen.h"

namespace Tarnel {

namespace {

using Testing::CursesScreen;

class ColourTerminal : public testing::TestWithParam<const char*> {};

TEST_P(ColourTerminal, HasThePaletteAndAPairForEveryTwoColours) {
  using Mix = std::tuple<short, short, short>;
  const std::pair<Colour, Mix> palette[] = {
      {BLACK, {0, 0, 0}},      {RED, {999, 0, 0}},           {LIGHT_GREY, {666, 666, 666}},
      {YELLOW, {999, 800, 0}}, {DARK_GREY, {333, 333, 333}}, {WHITE, {999, 999, 999}}};
  const CursesScreen screen(10, 2, GetParam());
  ASSERT_FALSE(bwColor);
  for (const auto& [bg, mix] : palette) {
    auto [red, green, blue] = Mix();
    color_content(bg, &red, &green, &blue);
    EXPECT_EQ(Mix(red, green, blue), mix) << "of colour " << bg;
    for (const auto& [fg, _] : palette) {
      const attr_t attributes = ColourAttr(bg, fg);
      EXPECT_EQ(attributes, static_cast<attr_t>(COLOR_PAIR(fg + bg * 8 + 1)));
      short pairFg = -2;
      short pairBg = -2;
      pair_content(static_cast<short>(PAIR_NUMBER(static_cast<int>(attributes))), &pairFg, &pairBg);
      // Curses may refuse the last pair of eight colours.
      EXPECT_TRUE((pairFg == fg && pairBg == bg) || (fg == WHITE && bg == WHITE)) << bg << fg;
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Types, ColourTerminal, testing::Values("linux", "xterm-256color"));

TEST(MonochromeTerminal, ShowsDarkBackgroundsInStandout) {
  for (const char* const term : {"vt100", "vt220", "xterm", "screen-256color", "dumb"}) {
    const CursesScreen screen(10, 2, term);
    EXPECT_TRUE(bwColor) << term;
    for (const Colour bg : {BLACK, RED, LIGHT_GREY, YELLOW, DARK_GREY, WHITE}) {
      EXPECT_EQ(ColourAttr(bg, WHITE), bg == DARK_GREY || bg == BLACK ? A_STANDOUT : A_NORMAL);
    }
  }
}

}  // namespace

}  // namespace Tarnel
