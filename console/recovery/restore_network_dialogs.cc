#include "console/recovery/restore_network_dialogs.h"

#include <syslog.h>

#include <string>

#include "console/hostops/command_runner.h"
#include "console/hostops/event_reporting.h"
#include "console/power/shutdown_dialogs.h"
#include "console/screen/colours.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/coreplane/system.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

namespace {

constexpr int WIDTH = 60;
constexpr int HEIGHT = 12;
constexpr int HEADER_HEIGHT = 6;

constexpr int TEXT_DONE = 123;
constexpr int TEXT_ASK_TITLE = 189;
constexpr int TEXT_ASK_BODY = 190;
constexpr int TEXT_ASK = 191;
constexpr int TEXT_RESTORE_TITLE = 207;
constexpr int TEXT_RESTORE_BODY = 208;
constexpr int TEXT_POWERING_OFF = 209;
constexpr int TEXT_CONFIGURING = 210;
constexpr int TEXT_FAILED = 223;

}  // namespace

RestoreNetworkDialog::RestoreNetworkDialog(Frame* parent)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT),
      _questionText(_content->Add<TextArea>(3, 0, _content->Width() - 6, _content->Height(),
                                            PARENT_COLOUR)) {}

// The log and the fleet hear of it even when the operator backed out at the warning.
int RestoreNetworkDialog::Run() {
  if (!IsConfirmed()) {
    return 0;
  }
  DoRestoreNetworkDialog dialog(this);
  dialog.Exec();
  syslog(LOG_INFO, "%s", "Restoring factory network settings");
  PostEvent(NOTARY_NETWORK_RESTORED);
  return 1;
}

bool RestoreNetworkDialog::IsConfirmed() {
  SetTitle(Text(TEXT_ASK_TITLE));
  SetBody(Text(TEXT_ASK_BODY));
  SetFooter(HINT_F11_RESET);
  _questionText->SetText(Text(TEXT_ASK));
  return IsAccepted(F11_KEY);
}

DoRestoreNetworkDialog::DoRestoreNetworkDialog(Frame* parent)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT),
      _progressText(
          _content->Add<TextArea>(0, 0, _content->Width(), _content->Height(), PARENT_COLOUR)) {}

int DoRestoreNetworkDialog::Run() {
  SetTitle(Text(TEXT_RESTORE_TITLE));
  SetBody(Text(TEXT_RESTORE_BODY));
  bool machinesAreOff = true;
  if (Coreplane::Resource::ResourceInfoImpl().HasRunningVirtualMachines()) {
    if (RunningVMsWarningDialog(this).Exec() == 0) {
      return 0;
    }
    machinesAreOff = PowerOffVms();
  }
  RestoreNetwork(machinesAreOff);
  SetFooter(HINT_OK2);
  WaitForEnter();
  return 1;
}

bool DoRestoreNetworkDialog::PowerOffVms() {
  _progressText->AppendText(Text(TEXT_POWERING_OFF) + " ");
  const char* argv[] = {"powerOffVms", nullptr};
  const bool done =
      RunCommand("/sbin/powerOffVms", argv, nullptr, nullptr, nullptr, nullptr, nullptr, 0, 0) == 0;
  if (done) {
    _progressText->AppendText(Text(TEXT_DONE) + "\n");
  }
  return done;
}

// The dump service goes off in any case; the network stays as it is while machines may run.
void DoRestoreNetworkDialog::RestoreNetwork(bool machinesAreOff) {
  const std::string failed = Text(TEXT_FAILED) + "\n";
  try {
    Coreplane::Network::NetworkInfoImpl network;
    network.DisableNetDumper();
    if (!machinesAreOff) {
      _progressText->AppendText(failed);
      syslog(LOG_ERR, "Error powering off VMs");
      return;
    }
    _progressText->AppendText(Text(TEXT_CONFIGURING) + " ");
    syslog(LOG_INFO, "Clearing Network Config");
    network.ClearNetworkConfig();
    syslog(LOG_INFO, "Auto-Configuring Network");
    network.AutoConfigNetwork();
    _progressText->AppendText(Text(TEXT_DONE) + "\n");
  } catch (const Nodeplane::Lib::NodeplaneException&) {
    _progressText->AppendText(failed);
    syslog(LOG_ERR, "Error auto-configuring network");
  }
}

}  // namespace Tarnel
