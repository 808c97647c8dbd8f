#include "console/network/apply_changes_dialog.h"

#include "console/screen/colours.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"

namespace Tarnel {

namespace {

constexpr int WIDTH = 70;
constexpr int HEIGHT = 15;
constexpr int HEADER_HEIGHT = 9;

constexpr int TEXT_TITLE = 211;
constexpr int TEXT_BODY = 212;
constexpr int TEXT_QUESTION = 213;
constexpr int TEXT_REBOOT_QUESTION = 214;

}  // namespace

ApplyChangesDialog::ApplyChangesDialog(Frame* parent, bool rebootNeeded)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT), _rebootNeeded(rebootNeeded) {
  _question =
      _content->Add<TextArea>(2, 0, _content->Width() - 6, _content->Height(), PARENT_COLOUR);
}

int ApplyChangesDialog::Run() {
  _question->SetText(Text(_rebootNeeded ? TEXT_REBOOT_QUESTION : TEXT_QUESTION));
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  SetFooter(HINT_YES_NO);
  for (;;) {
    switch (WaitKey(true)) {
      case 'y':
      case 'Y':
        _yes = true;
        return 1;
      case 'n':
      case 'N':
        _yes = false;
        return 1;
      case ESC_KEY:
        return 0;
      default:
        break;
    }
  }
}

}  // namespace Tarnel
