#pragma once

#include <string>
#include <vector>

namespace Tarnel::Testing {

// One cell of the screen as the terminal shows it.
struct Cell {
  std::string text;  // the character, UTF-8; empty in the second half of a wide one
  int fg = -1;       // curses colour number; -1 is the terminal's own
  int bg = -1;
  bool standout = false;
  bool line = false;  // a line drawing character; the text is '-', '|' or '+' then
};

using CellRow = std::vector<Cell>;

// A screen that can be looked at, whatever shows it.
class CellScreen {
 public:
  virtual ~CellScreen() = default;

  Cell At(int x, int y) const { return Cells(y).at(static_cast<size_t>(x)); }
  // A row without the blanks at its end.
  std::string Row(int y) const;
  // Runs of equal colours: "6/7*80" is background 6 and foreground 7 in 80 cells; "plain" and
  // "standout" are cells in the terminal's own colours.
  std::string Colours(int y) const;
  // All rows, with a line end behind each; empty rows at the end are left out.
  std::string Picture() const;

 protected:
  virtual int Rows() const = 0;
  virtual CellRow Cells(int y) const = 0;
};

}  // namespace Tarnel::Testing
