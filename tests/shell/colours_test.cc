#include "shell/colours.h"

#include <gtest/gtest.h>

#include <tuple>

#include "tests/support/curses_screen.h"

namespace Tarnel {

namespace {

using Testing::CursesScreen;

constexpr Colour USED[] = {BLACK, RED, LIGHT_GREY, YELLOW, DARK_GREY, WHITE};

class ColourTerminal : public testing::TestWithParam<const char*> {};

TEST_P(ColourTerminal, HasAPairForEveryTwoUsedColours) {
  const CursesScreen screen(10, 2, GetParam());
  ASSERT_FALSE(bwColor);
  for (const Colour bg : USED) {
    for (const Colour fg : USED) {
      if (bg == WHITE && fg == WHITE) {
        continue;  // curses may refuse the last pair of eight colours
      }
      short pairFg = -2;
      short pairBg = -2;
      pair_content(static_cast<short>(PAIR_NUMBER(static_cast<int>(ColourAttr(bg, fg)))), &pairFg,
                   &pairBg);
      EXPECT_EQ(std::pair(pairBg, pairFg),
                std::pair(static_cast<short>(bg), static_cast<short>(fg)));
    }
  }
  EXPECT_EQ(ColourAttr(BLACK, BLACK), static_cast<attr_t>(COLOR_PAIR(1)));
  EXPECT_EQ(ColourAttr(DARK_GREY, WHITE), static_cast<attr_t>(COLOR_PAIR(56)));
}

TEST_P(ColourTerminal, HasThePalette) {
  const CursesScreen screen(10, 2, GetParam());
  using Mix = std::tuple<short, short, short>;
  const std::pair<Colour, Mix> palette[] = {{RED, {999, 0, 0}},       {LIGHT_GREY, {666, 666, 666}},
                                            {YELLOW, {999, 800, 0}},  {DARK_GREY, {333, 333, 333}},
                                            {WHITE, {999, 999, 999}}, {BLACK, {0, 0, 0}}};
  for (const auto& [colour, mix] : palette) {
    auto [red, green, blue] = Mix();
    color_content(colour, &red, &green, &blue);
    EXPECT_EQ(Mix(red, green, blue), mix) << "of colour " << colour;
  }
}

INSTANTIATE_TEST_SUITE_P(Types, ColourTerminal, testing::Values("linux", "xterm-256color"));

class MonochromeTerminal : public testing::TestWithParam<const char*> {};

TEST_P(MonochromeTerminal, ShowsDarkBackgroundsInStandout) {
  const CursesScreen screen(10, 2, GetParam());
  ASSERT_TRUE(bwColor);
  for (const Colour bg : USED) {
    const attr_t expected = bg == DARK_GREY || bg == BLACK ? A_STANDOUT : A_NORMAL;
    EXPECT_EQ(ColourAttr(bg, WHITE), expected) << "of background " << bg;
    EXPECT_EQ(ColourAttr(bg, BLACK), expected) << "of background " << bg;
  }
}

INSTANTIATE_TEST_SUITE_P(Types, MonochromeTerminal,
                         testing::Values("vt100", "vt220", "xterm", "screen-256color", "dumb"));

}  // namespace

}  // namespace Tarnel
