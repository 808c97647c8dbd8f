#pragma once

#include <memory>
#include <string>

#include "tests/support/cell.h"

namespace Tarnel::Testing {

// A curses screen of a given size on a pseudo-terminal that stands in for descriptors 0 and 1, set
// up as the console sets it up. One at a time; what the process had as 0 and 1 comes back at the
// end.
class CursesScreen {
 public:
  CursesScreen(int columns, int rows, const std::string& term = "xterm-256color");
  ~CursesScreen();

  // Types bytes, as an operator would.
  void Type(const std::string& bytes);
  // The operator's terminal goes away.
  void HangUp();
  // Gives the pseudo-terminal another size; curses learns of it only through a signal.
  void Resize(int columns, int rows);

  // What the terminal shows since the last update: cells that are staged but not sent are not seen.
  Cell At(int x, int y) const;
  // A row without the blanks at its end.
  std::string Row(int y) const;
  std::string Picture() const;
  // The colours of a row, as RowColours() writes them.
  std::string Colours(int y) const;
  bool CursorVisible() const;
  int CursorX() const;
  int CursorY() const;
  // Bytes sent to the terminal since the last call.
  std::string TakeOutput();

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

}  // namespace Tarnel::Testing
