#include "console/widgets/item_list.h"

#include <algorithm>

namespace Tarnel {

namespace {

constexpr char BAR[] = "\u2593";
constexpr char THUMB[] = "\u2588";

bool CanTakeFocus(const Item& item) { return item.IsSelectable() && item.IsEnabled(); }

}  // namespace

ItemList::ItemList(Window* parent, int x, int y, int width, int height)
    : Window(parent, x, y, width, height, PARENT_COLOUR, PARENT_COLOUR),
      _listPane(CreateChild(0, 0, width - 1, height, PARENT_COLOUR, PARENT_COLOUR)),
      _barPane(CreateChild(width - 1, 0, 1, height, PARENT_COLOUR, PARENT_COLOUR)) {
  const int rowWidth = width - 1;
  for (int row = 0; row < height; ++row) {
    Window* const window =
        _listPane->CreateChild(0, row, rowWidth, 1, PARENT_COLOUR, PARENT_COLOUR);
    _rowWindows.push_back(window);
    _rowTexts.push_back(window->Add<TextArea>(1, 0, rowWidth - 2, 1, PARENT_COLOUR));
  }
}

void ItemList::SetItems(const std::vector<Item*>& items) {
  // Rows below the last item are left alone: the screen may have put a hint there.
  for (size_t row = items.size(); row < std::min(_items.size(), _rowWindows.size()); ++row) {
    _rowWindows[row]->Erase();
  }
  if (items.size() <= _rowWindows.size()) {
    _barPane->Erase();
  }
  _items = items;
  _top = 0;
  _selectionIndex = 0;
  for (int index = 0; index < Count(); ++index) {
    if (CanTakeFocus(*At(index))) {
      _focusRow = index;
      return;
    }
    _selectionIndex += At(index)->IsSelectable() ? 1 : 0;
  }
}

void ItemList::SelectItem(int n) {
  int before = 0;
  for (int index = 0; index < Count(); ++index) {
    if (!At(index)->IsSelectable()) {
      continue;
    }
    if (before == n) {
      _focusRow = index;
      _selectionIndex = n;
      return;
    }
    ++before;
  }
}

void ItemList::MoveUp() {
  int selection = _selectionIndex;
  for (int index = FocusIndex() - 1; index >= 0; --index) {
    selection -= At(index)->IsSelectable() ? 1 : 0;
    if (CanTakeFocus(*At(index))) {
      _top = std::min(_top, index);
      _focusRow = index - _top;
      _selectionIndex = selection;
      break;
    }
  }
  Repaint();
}

void ItemList::MoveDown() {
  int selection = _selectionIndex;
  for (int index = FocusIndex() + 1; index < Count(); ++index) {
    selection += At(index)->IsSelectable() ? 1 : 0;
    if (CanTakeFocus(*At(index))) {
      _top = std::max(_top, index - Rows() + 1);
      _focusRow = index - _top;
      _selectionIndex = selection;
      break;
    }
  }
  Repaint();
}

// The focused item comes last: a field leaves the cursor where it is edited.
void ItemList::Repaint() {
  DrawRows();
  if (Count() > Rows()) {
    DrawScrollBar();
  }
  _listPane->Refresh();
  _barPane->Refresh();
  DrawFocusedItem();
}

void ItemList::DrawRows() {
  for (int row = 0; row < std::min(Rows(), Count() - _top); ++row) {
    Item* const item = At(_top + row);
    item->SetFocused(row == _focusRow);
    if (row == _focusRow) {
      TextOf(row)->SetColours(BLACK, WHITE);
    } else {
      TextOf(row)->SetColours(item->Background(), item->Foreground());
      item->Draw(TextOf(row));
    }
  }
}

// A list without room for a row has none that is drawn.
void ItemList::DrawFocusedItem() {
  if (_focusRow >= 0 && _focusRow < Rows() && FocusIndex() < Count()) {
    At(FocusIndex())->Draw(TextOf(_focusRow));
  }
}

void ItemList::DrawScrollBar() {
  const auto rows = static_cast<unsigned>(Rows());
  const unsigned hidden = static_cast<unsigned>(Count()) - rows;
  const unsigned percent = static_cast<unsigned>(_top) * 100 / hidden;
  _barPane->Erase();
  for (int row = 0; row < Rows(); ++row) {
    _barPane->PutText(0, row, BAR);
  }
  _barPane->PutText(0, static_cast<int>((rows - 1) * percent / 100), THUMB);
}

}  // namespace Tarnel
