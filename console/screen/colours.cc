#include "console/screen/colours.h"

#include <array>

namespace Tarnel {

bool bwColor = false;

namespace {

// Backgrounds are counted in eights on every terminal: the attribute word of curses holds eight
// bits of the pair number, which COLORS on a 256-colour terminal would overflow.
constexpr int COLOUR_SLOTS = 8;

constexpr std::array<Colour, 6> USED_COLOURS = {WHITE, BLACK, YELLOW, LIGHT_GREY, DARK_GREY, RED};

short PairNumber(int bg, int fg) { return static_cast<short>(fg + bg * COLOUR_SLOTS + 1); }

void RedefinePalette() {
  init_color(YELLOW, 999, 800, 0);
  init_color(DARK_GREY, 333, 333, 333);
  init_color(LIGHT_GREY, 666, 666, 666);
  init_color(WHITE, 999, 999, 999);
  init_color(RED, 999, 0, 0);
}

}  // namespace

void InitColours() {
  use_default_colors();
  if (!can_change_color()) {
    bwColor = true;
    return;
  }
  RedefinePalette();
  for (const Colour bg : USED_COLOURS) {
    for (const Colour fg : USED_COLOURS) {
      init_pair(PairNumber(bg, fg), static_cast<short>(fg), static_cast<short>(bg));
    }
  }
}

attr_t ColourAttr(int bg, int fg) {
  if (bwColor) {
    return bg == DARK_GREY || bg == BLACK ? A_STANDOUT : A_NORMAL;
  }
  return static_cast<attr_t>(COLOR_PAIR(PairNumber(bg, fg)));
}

}  // namespace Tarnel
