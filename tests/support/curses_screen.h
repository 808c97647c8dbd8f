#pragma once

#include <memory>
#include <string>

#include "tests/support/cell.h"

namespace Tarnel::Testing {

// A curses screen of a given size on a pseudo-terminal that stands in for descriptors 0 and 1, set
// up as the console sets it up. One at a time; what the process had as 0 and 1 comes back at the
// end. It shows what was there after the last update: cells that are staged but not sent are not
// seen.
class CursesScreen : public CellScreen {
 public:
  CursesScreen(int columns, int rows, const std::string& term = "xterm-256color");
  ~CursesScreen() override;

  // Types bytes, as an operator would.
  void Type(const std::string& bytes);

  static bool CursorVisible();
  static int CursorX();
  static int CursorY();
  // Bytes sent to the terminal since the last call.
  std::string TakeOutput();

 protected:
  int Rows() const override;
  CellRow Cells(int y) const override;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

}  // namespace Tarnel::Testing
