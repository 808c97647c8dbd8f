#include "console/screen/screen.h"

#include <curses.h>

namespace Tarnel {

void UpdateScreen() {
  if (stdscr == nullptr) {
    return;  // before the screen was opened
  }
  // stdscr has no content of its own; staged last, it only brings its cursor.
  wnoutrefresh(stdscr);
  doupdate();
}

}  // namespace Tarnel
