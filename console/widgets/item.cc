#include "console/widgets/item.h"

namespace Tarnel {

void Item::SetFocused(bool focused) {
  if (focused != _focused) {
    _focused = focused;
    OnFocusChange();
  }
}

void Item::SetEnabled(bool enabled) {
  _enabled = enabled;
  _foreground = enabled ? BLACK : DARK_GREY;
}

LabelItem::LabelItem(const std::string& text, bool selectable) : Item(selectable), _text(text) {}

void LabelItem::Draw(TextArea* row) { row->SetText(_text); }

CheckItem::CheckItem(const std::string& label, bool checked, int indent)
    : LabelItem("", true), _label(label), _indent(indent) {
  SetChecked(checked);
}

void CheckItem::SetChecked(bool checked) {
  _checked = checked;
  SetLabel(std::string(static_cast<size_t>(_indent), ' ') + (checked ? "[X] " : "[ ] ") + _label);
}

RadioItem::RadioItem(const std::string& label, bool checked) : LabelItem("", true), _label(label) {
  SetChecked(checked);
}

void RadioItem::SetChecked(bool checked) {
  _checked = checked;
  SetLabel((checked ? "(o) " : "( ) ") + _label);
}

}  // namespace Tarnel
