#pragma once

#include <string>

#include "console/widgets/item.h"

namespace Tarnel {

// One line of text that the operator can edit. It shows a part of its value of at most so many
// columns and scrolls; the value itself may grow beyond that. Until the first edit the value is
// shown inverted, and a printable key replaces all of it.
class InputItem : public Item {
 public:
  // Half the row less one column.
  static constexpr int AUTOMATIC_WIDTH = -1;

  InputItem(const std::string& label, const std::string& value, int fieldWidth);
  ~InputItem() override;

  void Draw(TextArea* row) override;
  // One key that the owner lets pass: an editing key or a character.
  void HandleKey(int key);

  void SetLabel(const std::string& label) { _label = label; }
  void SetValue(const std::string& value);
  const std::string& Value() const { return _value; }
  // Shows "*" in place of each character.
  void SetMasked(bool masked) { _masked = masked; }

 protected:
  void OnFocusChange() override;

 private:
  // The part of the value that a field of so many columns shows; scrolls to the cursor.
  std::string ShownPart(int columns);
  void Insert(char character);
  void Delete();
  void DeleteBackward();
  void MoveLeft();
  void Clear();
  void Wipe();

  std::string _label;
  std::string _value;
  int _fieldWidth;
  bool _masked = false;
  size_t _cursor = 0;
  size_t _offset = 0;
  bool _pristine = true;
};

// An editing key, which every field takes: Delete, Backspace, Left, Right, Home, End.
bool IsEditingKey(int key);
// A character that can be typed into a field.
bool IsPrintableKey(int key);

}  // namespace Tarnel
