#pragma once

#include <string>
#include <vector>

namespace Tarnel::Testing {

// One cell of the screen as the terminal shows it.
struct Cell {
  std::string text;  // the character, UTF-8
  int fg = -1;       // curses colour number; -1 is the terminal's own
  int bg = -1;
  bool standout = false;
  bool line = false;  // a line drawing character; the text is '-', '|' or '+' then

  bool operator==(const Cell&) const = default;
};

using CellRow = std::vector<Cell>;

// A cell that shows this character.
Cell CharacterCell(char32_t character);

// The texts without the blanks at the end of the row.
std::string RowText(const CellRow& row);
// Runs of equal colours: "6/7*80" is background 6 and foreground 7 in 80 cells; "plain" and
// "standout" are cells in the terminal's own colours.
std::string RowColours(const CellRow& row);
// All rows, with a line end behind each; empty rows at the end are left out.
std::string PictureText(const std::vector<CellRow>& rows);

}  // namespace Tarnel::Testing
