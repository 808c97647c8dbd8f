#include "console/menu/lockdown_dialog.h"

#include <syslog.h>

#include "console/hostops/command_runner.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"

namespace Tarnel {

namespace {

constexpr int WIDTH = 70;
constexpr int HEIGHT = 11;
constexpr int HEADER_HEIGHT = 6;

constexpr int TEXT_TITLE = 252;
constexpr int TEXT_BODY = 253;
constexpr int TEXT_ENABLE = 254;

// Runs one command of the agent's client; what it complained of is in complaint.
bool RunAgentCommand(const char* command, std::string& complaint) {
  char output[256] = {};
  char errors[256] = {};
  int32_t outputLength = sizeof output - 1;
  int32_t errorLength = sizeof errors - 1;
  const char* argv[] = {"stew-cmd", "-U", TARNEL_USER.c_str(), command, nullptr};
  const int32_t result =
      RunCommand("/bin/stew-cmd", argv, output, &outputLength, errors, &errorLength, nullptr, 0, 0);
  complaint.assign(errors, static_cast<size_t>(errorLength));
  return result == 0;
}

}  // namespace

LockdownDialog::LockdownDialog(Frame* parent)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT),
      _wasEnabled(QueryStewBool("stewsvc/auth/lockdown_is_enabled")),
      _enableItem(Text(TEXT_ENABLE), _wasEnabled, 0) {
  _list = _content->Add<ItemList>(0, 0, _content->Width(), _content->Height());
  _list->SetItems({&_enableItem});
}

int LockdownDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  _list->Repaint();
  SetFooter(HINT_TOGGLE);
  for (;;) {
    switch (WaitKey(true)) {
      case SPACE_KEY:
        _enableItem.SetChecked(!_enableItem.IsChecked());
        _list->Repaint();
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

// A refusal is told to the log alone; the menu shows the state that the agent reports afterwards.
void LockdownDialog::Apply() {
  const bool enable = _enableItem.IsChecked();
  if (enable == _wasEnabled) {
    return;
  }
  std::string complaint;
  if (RunAgentCommand(
          enable ? "stewsvc/auth/lockdown_mode_enter" : "stewsvc/auth/lockdown_mode_exit",
          complaint)) {
    syslog(LOG_INFO, "%s", enable ? "Lockdown mode enabled" : "Lockdown mode disabled");
    _wasEnabled = enable;
  } else {
    syslog(LOG_ERR,
           enable ? "Enabling lockdown mode failed with error: %s"
                  : "Disabling lockdown mode failed with error: %s",
           complaint.c_str());
  }
}

}  // namespace Tarnel
