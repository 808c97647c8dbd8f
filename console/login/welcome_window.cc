#include "console/login/welcome_window.h"

#include <syslog.h>

#include <cstdlib>

#include "console/hostops/command_runner.h"
#include "console/login/login_dialog.h"
#include "console/login/login_disabled_dialog.h"
#include "console/menu/general_window.h"
#include "console/power/shutdown_dialogs.h"
#include "console/screen/colours.h"
#include "console/screen/key_map.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/kernel.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

namespace {

constexpr int TEXT_CUSTOMIZE = 0;
constexpr int TEXT_SHUT_DOWN = 1;
constexpr int TEXT_PRODUCT = 2;
constexpr int TEXT_DHCP_FAILED = 142;
constexpr int TEXT_AUDIT_MODE = 143;

// The alert of a host without adapters was raised; once for each process.
bool adapterAlertSent = false;

}  // namespace

WelcomeWindow::WelcomeWindow()
    : Frame(nullptr, 0, 0, COLS, LINES, BLACK, WHITE),
      _dnsConfig(Coreplane::Network::DEFAULT_STACK) {}

int WelcomeWindow::Run() {
  Draw();
  for (;;) {
    HandleKey(WaitKey(false));
    SetLoggedIn(false);
    if (_markForRestart) {
      exit(0);
    }
  }
}

void WelcomeWindow::HandleKey(int key) {
  if (key == F2_KEY || key == F12_KEY) {
    LogInFor(key);
    return;
  }
  if (key == F4_KEY && can_change_color()) {
    bwColor = !bwColor;
  } else {
    clearok(curscr, TRUE);
  }
  Draw();
}

// The idle limit of every frame behind the login ends here.
void WelcomeWindow::LogInFor(int key) {
  try {
    if (!LogIn()) {
      return;
    }
    if (key == F2_KEY) {
      Customize();
    } else {
      ShutdownDialog(this).Exec();
      Draw();
    }
  } catch (const TarnelTimeout&) {
    Activate(true);
    Draw();
  }
}

bool WelcomeWindow::LogIn() {
  if (LoginDialog::IsLoginEnabled()) {
    return LoginDialog(this).Exec() != 0;
  }
  return LoginDisabledDialog(this).Exec() != 0;
}

void WelcomeWindow::Customize() {
  const std::string user = _loginName;
  const bool hasPassword = LoginDialog::HasPassword(user);
  SetLoggedIn(true);
  GeneralWindow menu(this, hasPassword);
  menu.Exec();
  SetLoggedIn(false);
  syslog(LOG_INFO, "User %s logged out.", _loginName.c_str());
  Draw();
}

void WelcomeWindow::Redraw() { Draw(); }

void WelcomeWindow::Draw() {
  if (_systemInfo.GetWelcomeMessage().empty()) {
    if (_productText == nullptr) {
      BuildDefaultLayout();
    }
    FillDefaultLayout();
  } else {
    DrawCustomLayout();
  }
  Activate(_active);
  Refresh();
}

void WelcomeWindow::ForgetChildren() {
  DeleteChildren();
  _topHalf = _bottomHalf = nullptr;
  _productText = _hostText = _hardwareText = _networkText = nullptr;
  _warningText = _footerText = _customText = nullptr;
}

void WelcomeWindow::DrawCustomLayout() {
  if (_customText == nullptr) {
    ForgetChildren();
    Erase();
    DrawBox();
    _customText = Add<TextArea>(2, 2, COLS - 4, LINES - 4, WHITE);
  }
  _customText->SetText(_systemInfo.GetWelcomeMessage());
}

// The texts about the host come later, when the first facts are there.
void WelcomeWindow::BuildDefaultLayout() {
  ForgetChildren();
  Erase();
  const int topHeight = LINES / 2;
  const int bottomHeight = LINES - topHeight;
  _topHalf = CreateChild(0, 0, COLS, topHeight, DARK_GREY, WHITE);
  _bottomHalf = CreateChild(0, topHeight, COLS, bottomHeight, YELLOW, WHITE);
  DrawBox();
  _warningText = _bottomHalf->Add<TextArea>(16, 9, COLS - 32, 6, DARK_GREY);
  _footerText = _bottomHalf->Add<TextArea>(2, bottomHeight - 2, COLS - 4, 1, BLACK);
  _footerText->SetText("<F2> {color:dark-grey}" + Text(TEXT_CUSTOMIZE) +
                       "{/color}{align:right}<F12> {color:dark-grey}" + Text(TEXT_SHUT_DOWN) +
                       "{/color}{/align}");
}

void WelcomeWindow::FillDefaultLayout() {
  const bool ipv6Enabled = Coreplane::Network::NetworkInfoImpl().IsCoreIpv6Enabled();
  try {
    ShowHost(ipv6Enabled);
  } catch (const Nodeplane::Lib::NodeplaneException&) {
    if (_networkText != nullptr) {
      _networkText->SetText("");
    }
  }
}

void WelcomeWindow::ShowHost(bool ipv6Enabled) {
  const ManagementAddresses addresses = ReadAddresses();
  WarnInAuditMode();
  const std::string text = AddressText(addresses, _dnsConfig.GetHostname(), ipv6Enabled, *_strings);
  if (_networkText == nullptr) {
    BuildHostTexts();
  }
  ShowAddresses(text);
  ShowMachine();
}

// Reads the management interface and shows or takes away the warning that belongs to it. Without
// an interface the warning stays as it is.
ManagementAddresses WelcomeWindow::ReadAddresses() {
  ManagementAddresses addresses;
  const auto nic = LookupManagementInterface();
  if (nic == nullptr) {
    return addresses;
  }
  const Nodeplane::Network::IpConfig stored = nic->GetIpConfig();
  addresses.useDhcp = stored.GetUseDhcp();
  addresses.ipv4None = stored.GetIpv4UseNone();
  const auto* const coreNic = dynamic_cast<const Nodeplane::Network::CoreNic*>(nic.get());
  addresses.dhcpLease = coreNic != nullptr && coreNic->IsDhcpBound();
  const Nodeplane::Network::IpConfig running = nic->GetRunningIpConfig();
  addresses.ipv6 = running.GetIpv6Network();
  addresses.ipv4 = running.GetIpv4Address();
  _warningText->SetText(addresses.DhcpFailed() ? Text(TEXT_DHCP_FAILED) : "");
  return addresses;
}

void WelcomeWindow::WarnInAuditMode() {
  SystemBootOptionRecord bootOption{};
  if (Sysnode_Get(SYSNODE_NODE_system_bootOption, &bootOption, sizeof bootOption) == 0 &&
      bootOption.auditMode == 1) {
    _warningText->SetText(Text(TEXT_AUDIT_MODE));
  }
}

void WelcomeWindow::BuildHostTexts() {
  constexpr int X = 8;
  const int width = COLS - 2 * X;
  _networkText = _bottomHalf->Add<TextArea>(X, 1, width, 7, BLACK);
  _hardwareText = _topHalf->Add<TextArea>(X, 9, width, 2, PARENT_COLOUR);
  _productText = _topHalf->Add<TextArea>(X, 5, width, 1, PARENT_COLOUR);
  _hostText = _topHalf->Add<TextArea>(X, 7, width, 1, PARENT_COLOUR);
}

void WelcomeWindow::ShowAddresses(const std::string& addresses) {
  if (!Coreplane::Network::NetworkInfoImpl().GetPnics().empty()) {
    _networkText->SetText(addresses);
    return;
  }
  _networkText->SetText(
      "No compatible network adapter found. Please consult the product's Hardware Compatibility "
      "Guide (HCG) for a list of supported adapters.");
  if (!adapterAlertSent) {
    _systemInfo.SetSystemAlert("No compatible network adapter found.");
    adapterAlertSent = true;
  }
}

void WelcomeWindow::ShowMachine() {
  _productText->SetText(Text(TEXT_PRODUCT));
  const Coreplane::Hardware::HardwareInfoImpl hardware;
  const std::string vendor = hardware.GetVendorName();
  _hostText->SetText(MachineName(vendor, hardware.GetProductName()));
  const Coreplane::Hardware::CpuInfoImpl cpu;
  const auto packages = cpu.GetNumCpuPackages();
  const std::string cpuLine = CpuLine(packages, cpu.GetModelName());
  const Coreplane::Hardware::MemoryInfoImpl memory;
  const auto pages = memory.GetTotalPages();
  _hardwareText->SetText(cpuLine + "\n" + MemoryLine(pages * memory.GetPageSize()));
}

}  // namespace Tarnel
