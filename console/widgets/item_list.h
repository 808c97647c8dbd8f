#pragma once

#include <memory>
#include <string>
#include <vector>

#include "console/screen/window.h"
#include "console/widgets/item.h"

namespace Tarnel {

// A vertical list of rows with one focused row, and a scroll bar when it has more items than rows.
// It knows no keys: the frame's Run() tells it what to do. The items belong to that frame and may
// be changed in place; they show at the next Repaint().
class ItemList : public Window {
 public:
  ItemList(Window* parent, int x, int y, int width, int height);

  // Takes a copy of the pointers and puts the focus on the first usable item. Does not draw.
  void SetItems(const std::vector<Item*>& items);
  // The same for items that their owner keeps in a vector.
  template <class OwnedItem>
  void SetItems(const std::vector<std::unique_ptr<OwnedItem>>& items) {
    std::vector<Item*> pointers;
    pointers.reserve(items.size());
    for (const auto& item : items) {
      pointers.push_back(item.get());
    }
    SetItems(pointers);
  }
  // Puts the focus on the n-th selectable item, enabled or not. Serves lists whose top is 0. Does
  // not draw.
  void SelectItem(int n);
  // How many selectable items, enabled or not, come before the focused one: the same number for
  // the same field, whatever is enabled.
  int SelectionIndex() const { return _selectionIndex; }
  // The focused item's place among all items.
  int FocusIndex() const { return _top + _focusRow; }

  // Each moves the focus to the next usable item, if there is one, and repaints.
  void MoveUp();
  void MoveDown();
  void Repaint();

 private:
  int Rows() const { return static_cast<int>(_rowTexts.size()); }
  int Count() const { return static_cast<int>(_items.size()); }
  Item* At(int index) const { return _items[static_cast<size_t>(index)]; }
  TextArea* TextOf(int row) const { return _rowTexts[static_cast<size_t>(row)]; }
  void DrawRows();
  void DrawFocusedItem();
  void DrawScrollBar();

  Window* _listPane;
  Window* _barPane;
  std::vector<Item*> _items;
  std::vector<TextArea*> _rowTexts;
  std::vector<Window*> _rowWindows;
  int _focusRow = 0;
  int _top = 0;
  int _selectionIndex = 0;
};

}  // namespace Tarnel
