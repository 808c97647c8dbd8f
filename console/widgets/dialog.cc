#include "console/widgets/dialog.h"

#include "console/screen/colours.h"
#include "console/screen/key_map.h"

namespace Tarnel {

// The bands share the cells of the dialog, so the box that is drawn after them stays on top.
Dialog::Dialog(Frame* parent, int width, int height, int headerHeight)
    : Frame(parent, (COLS - width) / 2, (LINES - height) / 2, width, height, BLACK, WHITE) {
  constexpr int PADDING = 4;
  const int footerHeight = height - headerHeight;
  Erase();
  _header = CreateChild(0, 0, width, headerHeight, DARK_GREY, WHITE);
  _footer = CreateChild(0, headerHeight, width, footerHeight, YELLOW, WHITE);
  DrawBox();
  _titleText = _header->Add<TextArea>(3, 1, width - 6, 1, WHITE);
  _bodyText = _header->Add<TextArea>(3, 3, width - 6, headerHeight - PADDING, LIGHT_GREY);
  _hintText = _footer->Add<TextArea>(2, footerHeight - 2, width - PADDING, 1, BLACK);
  if (footerHeight > PADDING) {
    _content =
        _footer->CreateChild(2, 1, width - PADDING, footerHeight - PADDING, YELLOW, DARK_GREY);
  }
}

void Dialog::SetTitle(const std::string& title) { _titleText->SetText(title); }

void Dialog::SetBody(const std::string& body) { _bodyText->SetText(body); }

void Dialog::SetFooter(const std::string& hint) { _hintText->SetText(hint); }

bool Dialog::IsAccepted(int acceptKey) {
  for (;;) {
    const int key = WaitKey(true);
    if (key == acceptKey || key == ESC_KEY) {
      return key == acceptKey;
    }
  }
}

void Dialog::WaitForEnter() {
  while (WaitKey(true) != ENTER_KEY) {
  }
}

// What another dialog has covered of the dimmed parent comes back below this one.
void Dialog::Activate(bool active) {
  if (active) {
    _parentFrame->Refresh();
  }
  Window::Activate(active);
}

}  // namespace Tarnel
