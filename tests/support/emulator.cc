#include "tests/support/emulator.h"

#include <algorithm>
#include <array>
#include <string_view>

namespace Tarnel::Testing {

namespace {

// The shape of a line drawing character, or a NUL.
char LineShape(const std::string& character) {
  constexpr std::string_view LINES = "─│┌┐└┘├┤┴┬┼";
  constexpr size_t LENGTH = 3;
  const size_t place = character.size() == LENGTH ? LINES.find(character) : std::string_view::npos;
  return place == std::string_view::npos ? '\0' : "-|+++++++++"[place / LENGTH];
}

int ColourNumber(const VTermColor& colour) {
  if (VTERM_COLOR_IS_DEFAULT_FG(&colour) || VTERM_COLOR_IS_DEFAULT_BG(&colour)) {
    return -1;
  }
  constexpr int NO_PALETTE_COLOUR = 1000;
  return VTERM_COLOR_IS_INDEXED(&colour) ? colour.indexed.idx : NO_PALETTE_COLOUR;
}

// How many bytes at the end begin a character that is not complete yet.
size_t UnfinishedBytes(const std::string& text) {
  constexpr size_t LONGEST = 4;
  for (size_t tail = 1; tail < LONGEST && tail <= text.size(); ++tail) {
    const auto byte = static_cast<unsigned char>(text[text.size() - tail]);
    if (byte >= 0xc0) {
      const size_t length = byte >= 0xf0 ? 4 : byte >= 0xe0 ? 3 : 2;
      return tail < length ? tail : 0;
    }
    if (byte < 0x80) break;
  }
  return 0;
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
  size_t length = 0;
  size_t at = 0;
  for (; at < _pending.size(); at += std::max<size_t>(length, 1)) {
    const std::string start = _pending.substr(at, 3);
    const bool reset = start == "\x1b]R";
    length = start == "\x1b]P" ? SET_LENGTH : reset ? RESET_LENGTH : 0;
    if (at + length > _pending.size() || start == "\x1b" || start == "\x1b]") {
      break;  // the rest is still to come
    }
    _paletteWasReset = _paletteWasReset || reset;
    standard.append(length == 0 ? 1 : 0, start[0]);
  }
  _pending.erase(0, at);
  // The library mistakes a character that comes in two parts.
  const size_t unfinished = UnfinishedBytes(standard);
  _pending.insert(0, standard, standard.size() - unfinished, unfinished);
  standard.resize(standard.size() - unfinished);
  return standard;
}

void Emulator::Feed(const std::string& bytes) {
  _pending += bytes;
  const std::string standard = TakeStandardPart();
  vterm_input_write(_terminal.get(), standard.data(), standard.size());
}

void Emulator::SetSize(int columns, int rows) { vterm_set_size(_terminal.get(), rows, columns); }

int Emulator::Rows() const {
  int rows = 0;
  int columns = 0;
  vterm_get_size(_terminal.get(), &rows, &columns);
  return rows;
}

Cell Emulator::CellAt(VTermPos position) const {
  VTermScreenCell shown{};
  vterm_screen_get_cell(_screen, position, &shown);
  std::array<char, size_t{4} * VTERM_MAX_CHARS_PER_CELL> text{};
  const size_t length =
      vterm_screen_get_text(_screen, text.data(), text.size(),
                            {position.row, position.row + 1, position.col, position.col + 1});
  Cell cell;
  cell.text = std::string(text.data(), length);
  if (const char shape = LineShape(cell.text); shape != '\0') {
    cell.line = true;
    cell.text = shape;
  } else if (shown.chars[0] == 0) {
    cell.text = ' ';
  }
  cell.fg = ColourNumber(shown.fg);
  cell.bg = ColourNumber(shown.bg);
  // Terminals of type screen show what others know as italics in standout.
  cell.standout = shown.attrs.reverse != 0 || shown.attrs.italic != 0;
  return cell;
}

CellRow Emulator::Cells(int y) const {
  int rows = 0;
  int columns = 0;
  vterm_get_size(_terminal.get(), &rows, &columns);
  CellRow row;
  for (int x = 0; x < columns; ++x) {
    row.push_back(CellAt({y, x}));
  }
  return row;
}

VTermPos Emulator::Cursor() const {
  VTermPos position{};
  vterm_state_get_cursorpos(vterm_obtain_state(_terminal.get()), &position);
  return position;
}

}  // namespace Tarnel::Testing
