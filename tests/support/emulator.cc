#include "tests/support/emulator.h"

namespace Tarnel::Testing {

namespace {

// Stands in the second cell of a wide character.
constexpr uint32_t SECOND_HALF = 0xffffffff;

int ColourNumber(const VTermColor& colour) {
  if (VTERM_COLOR_IS_DEFAULT_FG(&colour) || VTERM_COLOR_IS_DEFAULT_BG(&colour)) {
    return -1;
  }
  constexpr int NO_PALETTE_COLOUR = 1000;
  return VTERM_COLOR_IS_INDEXED(&colour) ? colour.indexed.idx : NO_PALETTE_COLOUR;
}

}  // namespace

Emulator::Emulator(int columns, int rows)
    : _terminal(vterm_new(rows, columns)), _screen(vterm_obtain_screen(_terminal.get())) {
  static const VTermScreenCallbacks CALLBACKS = [] {
    VTermScreenCallbacks callbacks{};
    callbacks.settermprop = &Emulator::Notice;
    return callbacks;
  }();
  vterm_set_utf8(_terminal.get(), 1);
  vterm_screen_set_callbacks(_screen, &CALLBACKS, this);
  vterm_screen_enable_altscreen(_screen, 1);
  vterm_screen_reset(_screen, 1);
}

int Emulator::Notice(VTermProp property, VTermValue* value, void* self) {
  auto* const emulator = static_cast<Emulator*>(self);
  if (property == VTERM_PROP_CURSORVISIBLE) {
    emulator->_cursorVisible = value->boolean != 0;
  } else if (property == VTERM_PROP_ALTSCREEN) {
    emulator->_alternateScreen = value->boolean != 0;
  }
  return 1;
}

// The Linux console sets its palette by ESC ] P and seven digits and resets it by ESC ] R, both
// without the end that such a sequence has elsewhere.
std::string Emulator::TakeStandardPart() {
  constexpr size_t SET_LENGTH = 10;
  constexpr size_t RESET_LENGTH = 3;
  std::string standard;
  for (;;) {
    const size_t start = _pending.find('\x1b');
    standard += _pending.substr(0, start);
    _pending.erase(0, start);
    if (_pending.size() < 3 && std::string("\x1b]").starts_with(_pending)) {
      return standard;  // the rest is still to come
    }
    const bool set = _pending.starts_with("\x1b]P");
    const bool reset = _pending.starts_with("\x1b]R");
    if (set && _pending.size() < SET_LENGTH) {
      return standard;
    }
    if (!set && !reset) {
      standard += '\x1b';
      _pending.erase(0, 1);
      continue;
    }
    _paletteWasReset = _paletteWasReset || reset;
    _pending.erase(0, set ? SET_LENGTH : RESET_LENGTH);
  }
}

void Emulator::Feed(const std::string& bytes) {
  _pending += bytes;
  const std::string standard = TakeStandardPart();
  vterm_input_write(_terminal.get(), standard.data(), standard.size());
}

void Emulator::Resize(int columns, int rows) { vterm_set_size(_terminal.get(), rows, columns); }

int Emulator::Rows() const {
  int rows = 0;
  int columns = 0;
  vterm_get_size(_terminal.get(), &rows, &columns);
  return rows;
}

CellRow Emulator::Row(int y) const {
  int rows = 0;
  int columns = 0;
  vterm_get_size(_terminal.get(), &rows, &columns);
  CellRow row;
  for (int x = 0; x < columns; ++x) {
    VTermScreenCell shown{};
    vterm_screen_get_cell(_screen, VTermPos{y, x}, &shown);
    Cell cell = CharacterCell(shown.chars[0] == 0 ? U' ' : shown.chars[0]);
    if (shown.chars[0] == SECOND_HALF) {
      cell.text.clear();
    }
    cell.fg = ColourNumber(shown.fg);
    cell.bg = ColourNumber(shown.bg);
    // Terminals of type screen show what others know as italics in standout.
    cell.standout = shown.attrs.reverse != 0 || shown.attrs.italic != 0;
    row.push_back(cell);
  }
  return row;
}

VTermPos Emulator::Cursor() const {
  VTermPos position{};
  vterm_state_get_cursorpos(vterm_obtain_state(_terminal.get()), &position);
  return position;
}

}  // namespace Tarnel::Testing
