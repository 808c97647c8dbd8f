#include "console/power/shutdown_dialogs.h"

#include <syslog.h>

#include "console/hostops/command_runner.h"
#include "console/hostops/event_reporting.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"

namespace Tarnel {

namespace {

constexpr int CONFIRM_WIDTH = 70;
constexpr int CONFIRM_HEIGHT = 10;
constexpr int CONFIRM_HEADER_HEIGHT = 7;

constexpr char BODY[] =
    "Remote management software is recommended to safely shut down or restart this host.\n\nBy "
    "default, running virtual machines will be powered off, suspended, or shut down according to "
    "the current system shutdown policy.\nIf this host is part of an HA cluster, then HA will not "
    "restart these VMs unless they are forcefully terminated.";

// False when the command could not be started.
bool GoDown(bool graceful, const char* command) {
  AutostopAndPowerOffVms(graceful);
  return RunShell(command) != -1;
}

}  // namespace

ShutdownDialog::ShutdownDialog(Frame* parent)
    : Dialog(parent, 60, 19, 13), _forceItem("Forcefully terminate running VMs", false, 0) {
  _list = _content->Add<ItemList>(0, 0, _content->Width(), _content->Height());
  _list->SetItems({&_forceItem});
}

int ShutdownDialog::Run() {
  SetTitle("Shut Down/Restart");
  SetBody(BODY);
  _list->Repaint();
  SetFooter(HINT_SHUT_DOWN);
  for (;;) {
    switch (WaitKey(true)) {
      case SPACE_KEY:
        _forceItem.SetChecked(!_forceItem.IsChecked());
        _list->Repaint();
        break;
      case F2_KEY:
        ShutDown();
        break;
      case F11_KEY:
        Restart();
        break;
      case ESC_KEY:
        return 0;
      default:
        break;
    }
  }
}

void ShutdownDialog::ShutDown() {
  syslog(LOG_INFO, "%s", "Shutting down host");
  PostEvent(NOTARY_SHUT_DOWN);
  ShutdownConfirmDialog(this, !_forceItem.IsChecked()).Exec();
}

void ShutdownDialog::Restart() {
  syslog(LOG_INFO, "%s", "Rebooting host");
  PostEvent(NOTARY_REBOOT);
  RebootConfirmDialog(this, !_forceItem.IsChecked()).Exec();
}

ShutdownConfirmDialog::ShutdownConfirmDialog(Frame* parent, bool graceful)
    : Dialog(parent, CONFIRM_WIDTH, CONFIRM_HEIGHT, CONFIRM_HEADER_HEIGHT), _graceful(graceful) {}

// Waits, once the command has run, until the host takes the process down.
int ShutdownConfirmDialog::Run() {
  SetTitle("Shut Down Host");
  SetBody("Shutdown in progress...");
  if (!GoDown(_graceful, "poweroff")) {
    return 0;
  }
  for (;;) {
    WaitKey(true);
  }
}

RebootConfirmDialog::RebootConfirmDialog(Frame* parent, bool graceful)
    : Dialog(parent, CONFIRM_WIDTH, CONFIRM_HEIGHT, CONFIRM_HEADER_HEIGHT), _graceful(graceful) {}

int RebootConfirmDialog::Run() {
  SetTitle("Restart Host");
  SetBody("Restart in progress...");
  if (!GoDown(_graceful, "reboot")) {
    return 0;
  }
  for (;;) {
    WaitKey(true);
  }
}

RunningVMsWarningDialog::RunningVMsWarningDialog(Frame* parent) : Dialog(parent, 60, 10, 7) {}

int RunningVMsWarningDialog::Run() {
  SetTitle("Warning: VMs running on the host");
  SetBody(
      "Host has VMs running. Are you sure you want to shutdown/restart the host or restore the "
      "network.");
  SetFooter(HINT_CONFIRM);
  return IsAccepted(ENTER_KEY) ? 1 : 0;
}

}  // namespace Tarnel
