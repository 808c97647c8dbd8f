#include "console/widgets/input_item.h"

#include <algorithm>
#include <cctype>
#include <cstring>

namespace Tarnel {

namespace {

constexpr int CONTROL_H = 8;
// Values of a usual length never move in memory.
constexpr size_t USUAL_CAPACITY = 256;

std::string LeftJustified(std::string text, int columns) {
  if (columns > 0 && text.size() < static_cast<size_t>(columns)) {
    text.resize(static_cast<size_t>(columns), ' ');
  }
  return text;
}

}  // namespace

bool IsEditingKey(int key) {
  switch (key) {
    case KEY_HOME:
    case KEY_END:
    case KEY_LEFT:
    case KEY_RIGHT:
    case KEY_DC:
    case KEY_BACKSPACE:
    case CONTROL_H:
      return true;
    default:
      return false;
  }
}

bool IsPrintableKey(int key) { return key >= 0 && key <= 255 && isprint(key) != 0; }

InputItem::InputItem(const std::string& label, const std::string& value, int fieldWidth)
    : Item(true), _label(label), _fieldWidth(fieldWidth) {
  _value.reserve(USUAL_CAPACITY);
  SetValue(value);
}

InputItem::~InputItem() { Wipe(); }

// The value may be a password, of which nothing may stay in memory that was given back.
void InputItem::Wipe() {
  _value.resize(_value.capacity());
  explicit_bzero(_value.data(), _value.size());
  _value.clear();
}

void InputItem::SetValue(const std::string& value) {
  Clear();
  for (const char character : value) {
    Insert(character);
  }
  _pristine = true;
}

void InputItem::Insert(char character) {
  if (_value.size() == _value.capacity()) {
    std::string larger;
    larger.reserve(_value.size() * 2);
    larger += _value;
    Wipe();
    _value.swap(larger);
  }
  _value.insert(_cursor, 1, character);
  ++_cursor;
}

void InputItem::Clear() {
  Wipe();
  _cursor = 0;
  _offset = 0;
  _pristine = false;
}

void InputItem::OnFocusChange() { _pristine = true; }

std::string InputItem::ShownPart(int columns) {
  const auto length = static_cast<int>(_value.size());
  const auto cursor = static_cast<int>(_cursor);
  if (length < _fieldWidth) {
    _offset = 0;
  }
  if (cursor - static_cast<int>(_offset) > columns) {
    _offset = static_cast<size_t>(cursor - columns);
  }
  const size_t count = std::min(_value.size() - _offset, static_cast<size_t>(columns));
  // No part of a password is copied.
  return _masked ? std::string(count, '*') : _value.substr(_offset, count);
}

void InputItem::Draw(TextArea* row) {
  const int width = row->Width();
  const int columns = _fieldWidth == AUTOMATIC_WIDTH ? width / 2 - 1 : _fieldWidth;
  const std::string shown = ShownPart(columns);
  std::string text = LeftJustified(_label, width - 5 - columns) + " [ ";
  if (_focused) {
    const std::string blanks(static_cast<size_t>(columns) - shown.size(), ' ');
    text += (_pristine ? "{bgcolor:white}{color:black}" : "{bgcolor:black}{color:white}") + shown +
            "{/color}{/bgcolor}" + blanks;
  } else {
    text += LeftJustified(shown, columns);
  }
  row->SetText(text + " ]");
  row->MoveCursor(static_cast<int>(_cursor) - 2 - static_cast<int>(_offset) + width - columns, 0);
}

void InputItem::HandleKey(int key) {
  switch (key) {
    case KEY_HOME:
      _pristine = false;
      _offset = 0;
      _cursor = 0;
      break;
    case KEY_END:
      _pristine = false;
      _cursor = _value.size();
      break;
    case KEY_LEFT:
      MoveLeft();
      break;
    case KEY_RIGHT:
      _pristine = false;
      _cursor += _cursor < _value.size() ? 1 : 0;
      break;
    case KEY_DC:
      Delete();
      break;
    case KEY_BACKSPACE:
    case CONTROL_H:
      DeleteBackward();
      break;
    default:
      if (_pristine) {
        Clear();
      }
      if (IsPrintableKey(key)) {
        Insert(static_cast<char>(key));
      }
  }
}

void InputItem::MoveLeft() {
  _pristine = false;
  if (_cursor == 0) {
    return;
  }
  if (_cursor == _offset) {
    --_offset;
  }
  --_cursor;
}

void InputItem::Delete() {
  if (_pristine) {
    Clear();
  } else if (_cursor < _value.size()) {
    _value.erase(_cursor, 1);
  }
}

void InputItem::DeleteBackward() {
  if (_pristine) {
    Clear();
    return;
  }
  if (_cursor == 0) {
    return;
  }
  _value.erase(--_cursor, 1);
  if (_cursor < _offset) {
    _offset = 0;
    _cursor = _value.size();
  }
}

}  // namespace Tarnel
