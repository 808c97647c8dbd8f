#include "console/login/login_disabled_dialog.h"

#include "console/screen/key_map.h"
#include "console/widgets/hints.h"

namespace Tarnel {

namespace {

constexpr int WIDTH = 60;
constexpr int HEIGHT = 9;
constexpr int HEADER_HEIGHT = 6;

constexpr int TEXT_TITLE = 147;
constexpr int TEXT_BODY = 148;

}  // namespace

LoginDisabledDialog::LoginDisabledDialog(Frame* parent)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT) {}

int LoginDisabledDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY) + TextArea::GetHostnameValue() + ".");
  SetFooter(HINT_OK);
  int key = 0;
  while (key != ENTER_KEY && key != ESC_KEY) {
    key = WaitKey(true);
  }
  Activate(false);
  return 0;
}

}  // namespace Tarnel
