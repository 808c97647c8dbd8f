// What the right pane of the menu tells about each row.

#include "console/hostops/command_runner.h"
#include "console/login/login_dialog.h"
#include "console/menu/general_window.h"
#include "console/menu/log_viewer.h"
#include "console/menu/menu_rows.h"
#include "console/menu/support_pages.h"
#include "console/widgets/hints.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/coreplane/system.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

namespace {

using Nodeplane::Lib::NodeplaneException;

constexpr int TEXT_TITLE = 4;
constexpr int TEXT_ABOUT_PASSWORD = 22;
constexpr int TEXT_ABOUT_LOCKDOWN = 23;
constexpr int TEXT_ABOUT_DRIVER_VM = 24;
constexpr int TEXT_ABOUT_NETWORK = 25;
constexpr int TEXT_ABOUT_RESTART = 26;
constexpr int TEXT_ABOUT_TEST = 27;
constexpr int TEXT_ABOUT_RESTORE = 28;
constexpr int TEXT_ABOUT_LOGS = 29;
constexpr int TEXT_ABOUT_TROUBLESHOOTING = 30;
constexpr int TEXT_ABOUT_RESET = 31;
constexpr int TEXT_FROM_DHCP = 33;
constexpr int TEXT_ABOUT_KEYBOARD = 34;
constexpr int TEXT_NO_PASSWORD = 35;
constexpr int TEXT_UNKNOWN = 36;
constexpr int TEXT_IPV4_ADDRESS = 37;
constexpr int TEXT_IPV6_ADDRESSES = 38;
constexpr int TEXT_HOSTNAME = 42;
constexpr int TEXT_SET = 119;
constexpr int TEXT_NOT_SET = 120;
constexpr int TEXT_ENABLED = 121;
constexpr int TEXT_DISABLED = 122;

constexpr char HINT_SELECT_MENU_ROW[] =
    "{color:black}<Up/Down>{/color}{color:dark-grey} Select{/color}";
constexpr char HINT_CHANGE[] =
    "{color:white}<Enter>{/color}{color:light-grey} Change{/color}"
    "{align:right}{color:white}<Esc>{/color}{color:light-grey} Log Out{/color}{/align}";
constexpr char HINT_CHANGE2[] =
    "{color:white}<Enter>{color:light-grey} Change{/color}"
    "{align:right}{color:white}<Esc>{/color}{color:light-grey} Log Out{/color}{/align}";
constexpr char HINT_MORE[] =
    "{color:white}<Enter>{/color}{color:light-grey} More{/color}"
    "{align:right}{color:white}<Esc>{/color}{color:light-grey} Log Out{/color}{/align}";
constexpr char HINT_RUN_TEST[] =
    "{color:white}<Enter>{/color}{color:light-grey} Run Test{/color}"
    "{align:right}{color:white}<Esc>{/color}{color:light-grey} Log Out{/color}{/align}";
constexpr char HINT_RESET[] =
    "{color:white}<Enter>{/color}{color:light-grey} Reset{/color}"
    "{align:right}{color:white}<Esc>{/color}{color:light-grey} Log Out{/color}{/align}";
constexpr char HINT_LOG_OUT[] =
    "{align:right}{color:white}<Esc>{/color}{color:light-grey} Log Out{/color}{/align}";

struct RowHint {
  int row;
  const char* hint;
};

constexpr RowHint ROW_HINTS[] = {
    {ROW_PASSWORD, HINT_CHANGE},
    {ROW_LOCKDOWN, HINT_CHANGE2},
    {ROW_DRIVER_VM, ""},
    {ROW_NETWORK, HINT_MORE},
    {ROW_RESTART_NETWORK, HINT_RESTART_OR_LOG_OUT},
    {ROW_TEST_NETWORK, HINT_RUN_TEST},
    {ROW_RESTORE_NETWORK, HINT_RESTART_OR_LOG_OUT},
    {ROW_SUPPORT, HINT_LOG_OUT},
    {ROW_LOGS, HINT_LOG_OUT},
    {ROW_TROUBLESHOOTING, HINT_MORE},
    {ROW_RESET, HINT_RESET},
    {ROW_KEYBOARD, HINT_MORE},
};

const char* HintOf(int row) {
  for (const RowHint& entry : ROW_HINTS) {
    if (entry.row == row) {
      return entry.hint;
    }
  }
  return "";
}

std::string White(const std::string& text) { return "{color:white}" + text + "{/color}"; }

}  // namespace

void GeneralWindow::RefreshPanes() {
  SetLeftTitle(Text(TEXT_TITLE));
  SetLeftHint(HINT_SELECT_MENU_ROW);
  _list->Repaint();
  ShowRightPane();
}

void GeneralWindow::ShowRightPane() {
  const int row = FocusedRow();
  if (row != ROW_DRIVER_VM) {
    SetRightTitle(Text(row));
  }
  // Empty while the password is checked.
  _rightText->SetText("");
  _rightText->SetText(RightText(row));
  SetRightHint(HintOf(row));
  if (!_hasPassword) {
    SetLeftHint(Text(TEXT_NO_PASSWORD));
  }
}

std::string GeneralWindow::RightText(int row) {
  switch (row) {
    case ROW_PASSWORD:
      return PasswordText();
    case ROW_LOCKDOWN:
      return LockdownText();
    case ROW_DRIVER_VM:
      return "{color:light-grey}" + Text(TEXT_ABOUT_DRIVER_VM);
    case ROW_NETWORK:
      return NetworkText();
    case ROW_RESTART_NETWORK:
      return Text(TEXT_ABOUT_RESTART);
    case ROW_TEST_NETWORK:
      return Text(TEXT_ABOUT_TEST);
    case ROW_RESTORE_NETWORK:
      return Text(TEXT_ABOUT_RESTORE);
    case ROW_SUPPORT:
      return SupportPageText(_supportPages, _supportPage);
    case ROW_LOGS:
      return LogListText() + Text(TEXT_ABOUT_LOGS);
    case ROW_TROUBLESHOOTING:
      return Text(TEXT_ABOUT_TROUBLESHOOTING);
    case ROW_RESET:
      return Text(TEXT_ABOUT_RESET);
    case ROW_KEYBOARD:
      return KeyboardText();
    default:
      return "";
  }
}

std::string GeneralWindow::PasswordText() {
  if (_recheckPassword) {
    _hasPassword = LoginDialog::HasPassword(_loginName);
    _recheckPassword = false;
  }
  return White(Text(_hasPassword ? TEXT_SET : TEXT_NOT_SET)) + "\n\n" + Text(TEXT_ABOUT_PASSWORD);
}

std::string GeneralWindow::LockdownText() {
  return White(Text(_lockdownEnabled ? TEXT_ENABLED : TEXT_DISABLED)) + "\n\n" +
         Text(TEXT_ABOUT_LOCKDOWN);
}

std::string GeneralWindow::KeyboardText() const {
  return White(Coreplane::System::SystemInfoImpl().GetKeyboardLayout()) + "\n\n{color:light-grey}" +
         Text(TEXT_ABOUT_KEYBOARD) + "{/color}";
}

std::string GeneralWindow::NetworkText() const {
  return "{color:white}" + ConfiguredAddressText() + Ipv6Text() + "{color:light-grey}" +
         Text(TEXT_ABOUT_NETWORK);
}

std::string GeneralWindow::ConfiguredAddressText() const {
  std::string hostname;
  std::string address = "0.0.0.0";
  bool useDhcp = false;
  Nodeplane::Network::Ipv4Address server;
  try {
    hostname = _dnsConfig.GetHostname();
    if (const auto nic = LookupManagementInterface(); nic != nullptr) {
      useDhcp = nic->GetIpConfig().GetUseDhcp();
      address = nic->GetIpConfig().GetIpv4UseNone()
                    ? Text(TEXT_NOT_SET)
                    : nic->GetRunningIpConfig().GetIpv4Address().GetStringAddress();
      if (const auto* coreNic = dynamic_cast<const Nodeplane::Network::CoreNic*>(nic.get())) {
        server = coreNic->GetDhcpServerAddress();
      }
    }
  } catch (const NodeplaneException&) {
    hostname = address = Text(TEXT_UNKNOWN);
  }
  std::string text = Text(TEXT_HOSTNAME) + ":\n" + hostname + "\n\n" + Text(TEXT_IPV4_ADDRESS) +
                     ":\n" + address + "\n\n";
  if (useDhcp && server.GetBinaryAddress() != 0) {
    text += Text(TEXT_FROM_DHCP) + " " + server.GetStringAddress() + "\n\n";
  }
  return text;
}

std::string GeneralWindow::Ipv6Text() const {
  std::string text = Text(TEXT_IPV6_ADDRESSES) + ":\n";
  try {
    if (!Coreplane::Network::NetworkInfoImpl().IsCoreIpv6Enabled()) {
      return "";
    }
    if (const auto nic = LookupManagementInterface(); nic != nullptr) {
      text += Ipv6Lines(nic->GetRunningIpConfig().GetIpv6Network());
    }
  } catch (const NodeplaneException&) {
    text += Text(TEXT_UNKNOWN) + "\n";
  }
  return text + "\n";
}

}  // namespace Tarnel
