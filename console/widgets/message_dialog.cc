#include "console/widgets/message_dialog.h"

#include "console/screen/key_map.h"
#include "console/widgets/hints.h"

namespace Tarnel {

namespace {

constexpr int WIDTH = 70;
constexpr int HEIGHT = 10;
constexpr int HEADER_HEIGHT = 7;

}  // namespace

MessageDialog::MessageDialog(Frame* parent, int titleId, int bodyId)
    : MessageDialog(parent, titleId, StringFactory::ForLocale("en_US")->GetString(bodyId)) {}

MessageDialog::MessageDialog(Frame* parent, int titleId, const std::string& body)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT), _titleId(titleId), _body(body) {}

int MessageDialog::Run() {
  SetTitle(Text(_titleId));
  SetBody(_body);
  SetFooter(HINT_OK);
  WaitForEnter();
  return 1;
}

}  // namespace Tarnel
