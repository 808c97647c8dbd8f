#pragma once

#include <string>

#include "console/screen/colours.h"
#include "console/widgets/text_area.h"

namespace Tarnel {

// One row of an ItemList. The focus lands only on rows that are selectable and enabled.
class Item {
 public:
  explicit Item(bool selectable) : _selectable(selectable) {}
  virtual ~Item() = default;
  Item(const Item&) = delete;
  Item& operator=(const Item&) = delete;

  virtual void Draw(TextArea* row) = 0;

  void SetFocused(bool focused);
  // A disabled item is drawn in grey and still counted.
  void SetEnabled(bool enabled);
  void SetSelectable(bool selectable) { _selectable = selectable; }
  bool IsEnabled() const { return _enabled; }
  bool IsSelectable() const { return _selectable; }
  int Background() const { return _background; }
  int Foreground() const { return _foreground; }

 protected:
  virtual void OnFocusChange() {}

  bool _selectable;
  bool _focused = false;
  bool _enabled = true;
  int _background = YELLOW;
  int _foreground = BLACK;
};

// A row of marked-up text.
class LabelItem : public Item {
 public:
  LabelItem(const std::string& text, bool selectable);

  void Draw(TextArea* row) override;
  // Shows at the next repaint of the list.
  void SetLabel(const std::string& text) { _text = text; }

 protected:
  std::string _text;
};

// A box that is checked or not, so many blanks from the left.
class CheckItem : public LabelItem {
 public:
  CheckItem(const std::string& label, bool checked, int indent);

  void SetChecked(bool checked);
  bool IsChecked() const { return _checked; }

 private:
  bool _checked = false;
  std::string _label;
  int _indent;
};

// A button that is on or off. The owner sees to it that one button of a set is on.
class RadioItem : public LabelItem {
 public:
  RadioItem(const std::string& label, bool checked);

  void SetChecked(bool checked);
  bool IsChecked() const { return _checked; }

 private:
  bool _checked = false;
  std::string _label;
};

}  // namespace Tarnel
