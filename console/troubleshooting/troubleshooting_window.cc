#include "console/troubleshooting/troubleshooting_window.h"

#include <syslog.h>

#include "console/hostops/command_runner.h"
#include "console/screen/key_map.h"
#include "console/troubleshooting/restart_agents_dialog.h"
#include "console/troubleshooting/service_script.h"
#include "console/troubleshooting/timeout_dialogs.h"
#include "console/widgets/hints.h"
#include "hostapi/coreplane/system.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

namespace {

enum Row : int {
  ROW_SHELL,
  ROW_SSH,
  ROW_SHELL_TIMEOUTS,
  ROW_TARNEL_TIMEOUT,
  ROW_AGENTS,
};

constexpr int TEXT_TITLE = 225;
constexpr int TEXT_ENABLE_SHELL = 226;
constexpr int TEXT_DISABLE_SHELL = 227;
constexpr int TEXT_ENABLE_SSH = 228;
constexpr int TEXT_DISABLE_SSH = 229;
constexpr int TEXT_SHELL_TIMEOUTS = 232;
constexpr int TEXT_TARNEL_TIMEOUT = 233;
constexpr int TEXT_AGENTS = 234;
constexpr int TEXT_SHELL_IS_ENABLED = 237;
constexpr int TEXT_SHELL_IS_DISABLED = 238;
constexpr int TEXT_SSH_IS_ENABLED = 239;
constexpr int TEXT_SSH_IS_DISABLED = 240;

// By row: the right pane's title and its explanation.
constexpr int TEXT_ROW_TITLES[] = {230, 231, TEXT_SHELL_TIMEOUTS, TEXT_TARNEL_TIMEOUT, TEXT_AGENTS};
constexpr int TEXT_ABOUT_ROWS[] = {235, 236, 242, 243, 241};

constexpr char HINT_CHANGE[] =
    "{color:white}<Enter>{/color}{color:light-grey} Change{/color}"
    "{align:right}{color:white}<Esc>{/color}{color:light-grey} Exit{/color}{/align}";
constexpr char HINT_RESTART[] =
    "{color:white}<Enter>{/color}{color:light-grey} Restart{/color}"
    "{align:right}{color:white}<Esc>{/color}{color:light-grey} Exit{/color}{/align}";

}  // namespace

struct TroubleShootingWindow::Service {
  int row;
  int enableText;
  int disableText;
  const char* script;
  const char* startCommand;
  const char* stopCommand;
  const char* enableCommand;
  const char* disableCommand;
  // Its name in the log, where a failed command is told of with another one.
  const char* name;
  const char* nameInFailures;
};

const TroubleShootingWindow::Service TroubleShootingWindow::SHELL = {
    ROW_SHELL,
    TEXT_ENABLE_SHELL,
    TEXT_DISABLE_SHELL,
    SHELL_SCRIPT,
    "hostsvc/start_ostrel_shell",
    "hostsvc/stop_ostrel_shell",
    "hostsvc/enable_ostrel_shell",
    "hostsvc/disable_ostrel_shell",
    "Ostrel Shell",
    "Ostrel Shell",
};

const TroubleShootingWindow::Service TroubleShootingWindow::SSH = {
    ROW_SSH,
    TEXT_ENABLE_SSH,
    TEXT_DISABLE_SSH,
    SSH_SCRIPT,
    "hostsvc/start_ssh",
    "hostsvc/stop_ssh",
    "hostsvc/enable_ssh",
    "hostsvc/disable_ssh",
    "SSH",
    "ssh",
};

TroubleShootingWindow::TroubleShootingWindow(Frame* parent)
    : RootWindow(parent),
      _shellEnabled(IsServiceRunning(SHELL_SCRIPT)),
      _sshEnabled(IsServiceRunning(SSH_SCRIPT)) {
  AddRows();
}

void TroubleShootingWindow::AddRows() {
  const int texts[] = {_shellEnabled ? TEXT_DISABLE_SHELL : TEXT_ENABLE_SHELL,
                       _sshEnabled ? TEXT_DISABLE_SSH : TEXT_ENABLE_SSH, TEXT_SHELL_TIMEOUTS,
                       TEXT_TARNEL_TIMEOUT, TEXT_AGENTS};
  for (const int text : texts) {
    _items.push_back(std::make_unique<LabelItem>(Text(text), true));
  }
  OfferTimeouts(!_shellEnabled && !_sshEnabled);
  _list->SetItems(_items);
}

int TroubleShootingWindow::Run() {
  ShowScreen();
  SetLeftTitle(Text(TEXT_TITLE));
  for (;;) {
    switch (WaitKey(true)) {
      case KEY_UP:
        _list->MoveUp();
        ShowRightPane();
        break;
      case KEY_DOWN:
        _list->MoveDown();
        ShowRightPane();
        break;
      case ENTER_KEY:
        OpenRow();
        break;
      case ESC_KEY:
        return 1;
      default:
        break;
    }
  }
}

void TroubleShootingWindow::OpenRow() {
  switch (_list->FocusIndex()) {
    case ROW_SHELL:
      Toggle(SHELL, _shellEnabled);
      break;
    case ROW_SSH:
      Toggle(SSH, _sshEnabled);
      break;
    case ROW_SHELL_TIMEOUTS:
      Open<ShellTimeoutDialog>();
      break;
    case ROW_TARNEL_TIMEOUT:
      Open<TarnelTimeoutDialog>();
      break;
    case ROW_AGENTS:
      Open<RestartAgentsDialog>();
      break;
    default:
      break;
  }
}

template <class DialogClass>
void TroubleShootingWindow::Open() {
  DialogClass dialog(this);
  dialog.Exec();
  ShowScreen();
}

// The screen shows the new state whatever became of the commands; the next visit shows the truth.
void TroubleShootingWindow::Toggle(const Service& service, bool& enabled) {
  StartOrStop(service, enabled);
  KeepForNextStart(service, enabled);
  enabled = !enabled;
  const std::string message =
      "User " + _loginName + (enabled ? " enabled " : " disabled ") + service.name;
  syslog(LOG_INFO, "%s", message.c_str());
  _items[static_cast<size_t>(service.row)]->SetLabel(
      Text(enabled ? service.disableText : service.enableText));
  OfferTimeouts(!_shellEnabled && !_sshEnabled);
  RefreshPanes();
  ShowScreen();
}

// Where the agent fails, the service's own script serves, which knows nothing of the firewall.
void TroubleShootingWindow::StartOrStop(const Service& service, bool enabled) {
  if (RunStewCmdAsOperator(enabled ? service.stopCommand : service.startCommand) == 0) {
    return;
  }
  syslog(LOG_WARNING, "Unable to run stew-cmd to start/stop %s", service.nameInFailures);
  RunServiceScript(service.script, enabled ? "stop" : "start");
  if (service.row == ROW_SSH) {
    SwitchFirewall(enabled);
  }
}

void TroubleShootingWindow::SwitchFirewall(bool enabled) {
  try {
    const Coreplane::System::SystemInfoImpl systemInfo;
    const auto ruleset = systemInfo.GetFirewallRulesetById("sshServer");
    if (ruleset == nullptr || !ruleset->FollowsService()) {
      return;
    }
    if (enabled) {
      ruleset->Disable();
    } else {
      ruleset->Enable();
    }
  } catch (const Nodeplane::Lib::NodeplaneException& error) {
    syslog(LOG_WARNING, "Failed to update firewall sshServer ruleset status: %s", error.what());
  }
}

void TroubleShootingWindow::KeepForNextStart(const Service& service, bool enabled) {
  if (RunStewCmdAsOperator(enabled ? service.disableCommand : service.enableCommand) != 0) {
    syslog(LOG_WARNING, "Unable to run stew-cmd to enable/disable %s", service.nameInFailures);
  }
}

void TroubleShootingWindow::OfferTimeouts(bool offered) {
  const std::string text = Text(TEXT_SHELL_TIMEOUTS);
  LabelItem& row = *_items[ROW_SHELL_TIMEOUTS];
  row.SetSelectable(offered);
  row.SetLabel(offered ? text : "{color:dark-grey}" + text + "{/color}");
}

// The hint that is set last stands until the focus moves.
void TroubleShootingWindow::RefreshPanes() {
  _list->Repaint();
  ShowRightPane();
  SetLeftHint(HINT_SELECT_ROW);
  SetRightHint(HINT_CHANGE_OR_EXIT);
}

void TroubleShootingWindow::ShowRightPane() {
  const int row = _list->FocusIndex();
  _rightText->SetText("");
  SetRightTitle(Text(TEXT_ROW_TITLES[row]));
  _rightText->SetText(RightText(row));
  SetRightHint(row == ROW_AGENTS ? HINT_RESTART : HINT_CHANGE);
}

std::string TroubleShootingWindow::RightText(int row) const {
  std::string state;
  if (row == ROW_SHELL) {
    state = Text(_shellEnabled ? TEXT_SHELL_IS_ENABLED : TEXT_SHELL_IS_DISABLED);
  } else if (row == ROW_SSH) {
    state = Text(_sshEnabled ? TEXT_SSH_IS_ENABLED : TEXT_SSH_IS_DISABLED);
  }
  if (!state.empty()) {
    state = "{/color}{color:white}" + state + "\n\n";
  }
  return state + "{/color}{color:light-grey}" + Text(TEXT_ABOUT_ROWS[row]);
}

}  // namespace Tarnel
