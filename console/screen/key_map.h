#pragma once

namespace Tarnel {

// Key codes as WaitKey() gives them; all others are characters or curses' own KEY_ values.
enum Key : int {
  TAB_KEY = 9,
  ENTER_KEY = 10,
  ESC_KEY = 27,
  SPACE_KEY = 32,
  F2_KEY = 266,
  F3_KEY = 267,
  F4_KEY = 268,
  F11_KEY = 275,
  F12_KEY = 276,
};

// Tells curses which byte sequences stand for which key, whatever the terminal type.
void InitKeyMap();

}  // namespace Tarnel
