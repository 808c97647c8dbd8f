#pragma once

#include <vterm.h>

#include <memory>
#include <string>

#include "tests/support/cell.h"

namespace Tarnel::Testing {

// An emulated terminal: takes the bytes that a program writes and shows cells.
class Emulator : public CellScreen {
 public:
  Emulator(int columns, int rows);
  Emulator(const Emulator&) = delete;
  Emulator& operator=(const Emulator&) = delete;

  int CursorX() const { return Cursor().col; }
  int CursorY() const { return Cursor().row; }
  bool CursorVisible() const { return _cursorVisible; }
  // The screen that programs take over and give back, where the terminal type has one.
  bool OnAlternateScreen() const { return _alternateScreen; }
  // The Linux console's request to reset its palette came.
  bool PaletteWasReset() const { return _paletteWasReset; }

 protected:
  void Feed(const std::string& bytes);
  void SetSize(int columns, int rows);
  int Rows() const override;
  CellRow Cells(int y) const override;

 private:
  struct Free {
    void operator()(VTerm* terminal) const { vterm_free(terminal); }
  };

  static int Notice(VTermProp property, VTermValue* value, void* self);
  VTermPos Cursor() const;
  Cell CellAt(VTermPos position) const;
  std::string TakeStandardPart();

  std::unique_ptr<VTerm, Free> _terminal;
  VTermScreen* _screen;
  std::string _pending;  // a sequence of the Linux console that has come in part
  bool _cursorVisible = true;
  bool _alternateScreen = false;
  bool _paletteWasReset = false;
};

}  // namespace Tarnel::Testing
