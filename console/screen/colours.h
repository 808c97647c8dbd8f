#pragma once

#include <curses.h>

namespace Tarnel {

// Colour numbers: curses colour slots, some of which InitColours() gives another look.
enum Colour : int {
  PARENT_COLOUR = -1,  // in arguments only: the parent window's colour
  BLACK = 0,
  RED = 1,
  LIGHT_GREY = 2,
  YELLOW = 3,
  DARK_GREY = 6,
  WHITE = 7,
};

// Colours are reduced to standout and plain text.
extern bool bwColor;

// Redefines the palette and sets up a pair for every two used colours, or sets bwColor on a
// terminal whose colours cannot be changed.
void InitColours();

// The curses attributes of text or a window background with these two colours.
attr_t ColourAttr(int bg, int fg);

}  // namespace Tarnel
