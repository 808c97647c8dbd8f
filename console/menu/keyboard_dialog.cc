#include "console/menu/keyboard_dialog.h"

#include <syslog.h>

#include "console/screen/key_map.h"
#include "console/widgets/hints.h"

namespace Tarnel {

namespace {

constexpr int WIDTH = 76;
constexpr int HEIGHT = 18;
constexpr int HEADER_HEIGHT = 6;

constexpr int TEXT_TITLE = 16;
constexpr int TEXT_BODY = 255;

}  // namespace

KeyboardDialog::KeyboardDialog(Frame* parent) : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT) {
  const std::string configured = _systemInfo.GetKeyboardLayout();
  _layouts = _systemInfo.GetKeyboardLayouts();
  for (const std::string& layout : _layouts) {
    if (layout == configured) {
      _selected = static_cast<int>(_items.size());
    }
    _items.push_back(std::make_unique<RadioItem>(layout, layout == configured));
  }
  _list = _content->Add<ItemList>(0, 0, _content->Width(), _content->Height());
}

int KeyboardDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  _list->SetItems(_items);
  _list->Repaint();
  SetFooter(HINT_SELECT_TOGGLE);
  for (;;) {
    switch (WaitKey(true)) {
      case SPACE_KEY:
        SelectFocused();
        break;
      case KEY_DOWN:
        _list->MoveDown();
        break;
      case KEY_UP:
        _list->MoveUp();
        break;
      case ENTER_KEY:
        Apply();
        return 1;
      case ESC_KEY:
        return 0;
      default:
        break;
    }
  }
}

void KeyboardDialog::SelectFocused() {
  if (_items.empty()) {
    return;
  }
  _items[static_cast<size_t>(_selected)]->SetChecked(false);
  _selected = _list->SelectionIndex();
  _items[static_cast<size_t>(_selected)]->SetChecked(true);
  _list->Repaint();
}

// It is the button that counts, not the focus.
void KeyboardDialog::Apply() {
  if (_layouts.empty()) {
    return;
  }
  const std::string& layout = _layouts[static_cast<size_t>(_selected)];
  _systemInfo.SetKeyboardLayout(layout);
  _systemInfo.LoadKeyboardMappings(layout);
  syslog(LOG_INFO, "Keyboard Layout changed to %s", layout.c_str());
}

}  // namespace Tarnel
