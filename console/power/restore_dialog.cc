#include "console/power/restore_dialog.h"

#include <syslog.h>
#include <unistd.h>

#include "console/hostops/command_runner.h"
#include "console/hostops/event_reporting.h"
#include "console/screen/colours.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"

namespace Tarnel {

RestoreDialog::RestoreDialog(Frame* parent)
    : Dialog(parent, 60, 12, 7),
      _questionText(_content->Add<TextArea>(0, 0, _content->Width() - 6, _content->Height(),
                                            PARENT_COLOUR)) {}

int RestoreDialog::Run() {
  if (!IsConfirmed() || !Restore()) {
    return 0;
  }
  WaitForEnter();
  if (RunShell("reboot -f") == -1) {
    return 0;
  }
  for (;;) {
    pause();
  }
}

bool RestoreDialog::IsConfirmed() {
  SetTitle("Reset System Configuration: Confirm");
  SetBody(
      "Warning! All system parameters will be reverted to their software defaults, and host "
      "configuration will be lost.");
  _questionText->SetText("Reset System Configuration now?");
  SetFooter(HINT_F11_OK);
  return IsAccepted(F11_KEY);
}

// False when the script could not be started; what became of it otherwise is not asked.
bool RestoreDialog::Restore() {
  syslog(LOG_INFO, "%s", "Restoring factory defaults");
  PostEvent(NOTARY_RESTORE_DEFAULTS);
  SetTitle("Reset System Configuration");
  SetBody("Please wait while the default settings are restored.");
  if (RunShell("/sbin/firmwareConfig.sh --reset-only > /dev/null 2>&1") == -1) {
    return false;
  }
  _questionText->SetText("");
  SetFooter(HINT_RESTART_HOST);
  SetBody("Default settings are restored. Press <Enter> to restart your host.");
  return true;
}

}  // namespace Tarnel
