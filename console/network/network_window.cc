#include "console/network/network_window.h"

#include <syslog.h>

#include "console/hostops/command_runner.h"
#include "console/network/adapters_dialog.h"
#include "console/network/address_text.h"
#include "console/network/apply_changes_dialog.h"
#include "console/network/dns_dialogs.h"
#include "console/network/ip_configuration_dialog.h"
#include "console/network/ipv6_configuration_dialog.h"
#include "console/network/network_rows.h"
#include "console/network/switch_operations.h"
#include "console/network/vlan_dialog.h"
#include "console/screen/key_map.h"
#include "console/widgets/message_dialog.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

namespace {

using Nodeplane::Lib::NodeplaneException;
using Nodeplane::Network::IpAddress;
using Nodeplane::Network::IpConfig;
using Nodeplane::Network::Ipv4Address;
using Nodeplane::Network::Ipv6Address;

constexpr int TEXT_ERROR_TITLE = 18;
constexpr int TEXT_NO_INTERFACE = 20;
constexpr int TEXT_TITLE = 46;

std::string Join(const std::vector<std::string>& words) {
  std::string text;
  for (const std::string& word : words) {
    text += (&word == &words.front() ? "" : ", ") + word;
  }
  return text;
}

// The first few addresses of a list.
template <class Address>
void Append(std::vector<std::unique_ptr<IpAddress>>& servers, const std::vector<Address>& list,
            size_t most) {
  for (size_t i = 0; i < list.size() && i < most; ++i) {
    servers.push_back(std::make_unique<Address>(list[i]));
  }
}

bool IsSameIpv4(const IpConfig& left, const IpConfig& right) {
  return left.GetIpv4Address() == right.GetIpv4Address() &&
         left.GetIpv4Netmask() == right.GetIpv4Netmask() &&
         left.GetIpv4Gateway() == right.GetIpv4Gateway();
}

bool IsSameGateway(const Ipv6Address& left, const Ipv6Address& right) {
  return left.GetScopedStringAddress() == right.GetScopedStringAddress();
}

}  // namespace

NetworkWindow::NetworkWindow(Frame* parent) : RootWindow(parent) {
  for (const int id : NETWORK_ROW_TEXTS) {
    _menuItems.push_back(std::make_unique<LabelItem>(Text(id), true));
  }
  _adaptersItem = _menuItems[NETWORK_ROW_ADAPTERS].get();
  _vlanItem = _menuItems[NETWORK_ROW_VLAN].get();
  _menuItems.insert(_menuItems.begin() + NETWORK_ROW_IPV4, std::make_unique<LabelItem>("", false));
}

int NetworkWindow::Run() {
  ReadIpv6Switch();
  if (!FindInterface() || !ReadUplinksAndVlan()) {
    return 0;
  }
  ReadServices();
  ShowScreen();
  SetLeftTitle(Text(TEXT_TITLE));
  while (HandleKey(WaitKey(true))) {
  }
  return 1;
}

void NetworkWindow::RefreshPanes() {
  _list->SetItems(_menuItems);
  _list->Repaint();
  ShowRightPane();
}

void NetworkWindow::ReadIpv6Switch() {
  _changed = false;
  _ipv6GatewayChanged = false;
  _ipv6Enabled = Coreplane::Network::NetworkInfoImpl().IsCoreIpv6Enabled();
  _ipv6EnabledAtEntry = _ipv6Enabled;
}

// A host that fails here is back at the menu without a word.
bool NetworkWindow::FindInterface() {
  try {
    _mgmtNic = LookupManagementInterface();
    if (_mgmtNic == nullptr) {
      syslog(LOG_ERR, "Could not get a suitable management interface");
      MessageDialog(this, TEXT_ERROR_TITLE, TEXT_NO_INTERFACE).Exec();
      return false;
    }
    _modeConfig = _mgmtNic->GetIpConfig();
    _workingConfig = _mgmtNic->GetRunningIpConfig();
    return true;
  } catch (const NodeplaneException&) {
    return false;
  }
}

bool NetworkWindow::ReadUplinksAndVlan() {
  const bool onLattice = IsManagementOnLattice();
  if (!onLattice &&
      !(GetActiveUplinks(*_mgmtNic, _adapters) &&
        GetMaxActiveUplinks(*_mgmtNic, _maxActiveUplinks) && GetVlanId(*_mgmtNic, _vlanId))) {
    return false;
  }
  _adaptersItem->SetEnabled(!onLattice);
  _vlanItem->SetEnabled(!onLattice);
  return true;
}

void NetworkWindow::ReadServices() {
  _workingConfig.SetIpv4Gateway(_routingInfo.GetCorelinDefaultGateway());
  _hostname = _dnsConfig.GetHostname();
  _workingConfig.SetIpv6Gateway(_routingInfo.GetIpv6CorelinDefaultGateway());
  _searchDomains = _dnsConfig.GetSearchDomains();
  ReadNameServers();
  _suffixes = Join(_searchDomains);
}

// IPv4 servers come first, and a host with both families shows one of each.
void NetworkWindow::ReadNameServers() {
  const auto ipv4 = _dnsConfig.GetNameServers();
  const auto ipv6 = _dnsConfig.GetIpv6NameServers(false);
  const size_t ofEach = ipv4.empty() || ipv6.empty() ? 2 : 1;
  std::vector<std::unique_ptr<IpAddress>> servers;
  Append(servers, ipv4, ofEach);
  Append(servers, ipv6, ofEach);
  servers.resize(2);
  _primaryDns = std::move(servers[0]);
  _alternateDns = std::move(servers[1]);
}

bool NetworkWindow::HandleKey(int key) {
  switch (key) {
    case KEY_DOWN:
      _list->MoveDown();
      break;
    case KEY_UP:
      _list->MoveUp();
      break;
    case ENTER_KEY:
      OpenRow();
      break;
    case ESC_KEY:
      return !Leave();
    default:
      return true;
  }
  ShowRightPane();
  return true;
}

// True unless the operator wants to stay.
bool NetworkWindow::Leave() {
  if (!HasPendingChanges()) {
    return true;
  }
  ApplyChangesDialog dialog(this, _ipv6Enabled != _ipv6EnabledAtEntry);
  if (dialog.Exec() == 0) {
    return false;
  }
  if (dialog.IsYes()) {
    ApplyChanges();
    syslog(LOG_INFO, "Network settings changed.");
  }
  return true;
}

bool NetworkWindow::HasPendingChanges() const {
  return _changed || _ipv6Enabled != _ipv6EnabledAtEntry;
}

void NetworkWindow::OpenRow() {
  switch (_list->SelectionIndex()) {
    case NETWORK_ROW_ADAPTERS:
      EditAdapters();
      break;
    case NETWORK_ROW_VLAN:
      EditVlan();
      break;
    case NETWORK_ROW_IPV4:
      EditIpv4();
      break;
    case NETWORK_ROW_IPV6:
      EditIpv6();
      break;
    case NETWORK_ROW_DNS:
      EditDns();
      break;
    case NETWORK_ROW_SUFFIXES:
      EditSuffixes();
      break;
    default:
      break;
  }
}

// The order of the adapters counts: it is the teaming order.
void NetworkWindow::EditAdapters() {
  std::string switchName;
  if (!GetSwitchName(*_mgmtNic, switchName)) {
    return;
  }
  AdaptersDialog dialog(this, _adapters, _maxActiveUplinks, switchName);
  if (dialog.Exec() == 0) {
    return;
  }
  if (dialog.Selected() != _adapters || dialog.MaxActiveUplinks() != _maxActiveUplinks) {
    _changed = true;
    _adapters = dialog.Selected();
    _maxActiveUplinks = dialog.MaxActiveUplinks();
  }
}

void NetworkWindow::EditVlan() {
  VlanDialog dialog(this, _vlanId);
  if (dialog.Exec() != 0 && dialog.GetVlanId() != _vlanId) {
    _changed = true;
    _vlanId = dialog.GetVlanId();
  }
}

void NetworkWindow::EditIpv4() {
  IPConfigurationDialog dialog(this, _workingConfig.GetIpv4UseNone(), _modeConfig.GetUseDhcp(),
                               _workingConfig);
  if (dialog.Exec() == 0) {
    return;
  }
  const IpConfig& edited = dialog.Config();
  const bool isStatic = !edited.GetUseDhcp() && !edited.GetIpv4UseNone();
  if (edited.GetUseDhcp() == _modeConfig.GetUseDhcp() &&
      edited.GetIpv4UseNone() == _workingConfig.GetIpv4UseNone() &&
      (!isStatic || IsSameIpv4(edited, _workingConfig))) {
    return;
  }
  _changed = true;
  _modeConfig.SetUseDhcp(edited.GetUseDhcp());
  if (edited.GetIpv4UseNone()) {
    _workingConfig.SetIpv4UseNone();
  } else {
    _workingConfig.SetIpv4Address(edited.GetIpv4Address());
    _workingConfig.SetIpv4Netmask(edited.GetIpv4Netmask());
  }
  _workingConfig.SetIpv4Gateway(edited.GetIpv4Gateway());
}

// The dialog works on a copy of the working configuration, so what it gives back holds the same
// IPv4 settings and can be taken over as a whole.
void NetworkWindow::EditIpv6() {
  IPv6ConfigurationDialog dialog(this, _ipv6Enabled, _modeConfig, _workingConfig);
  if (dialog.Exec() == 0) {
    return;
  }
  const IpConfig& edited = dialog.Config();
  const bool isOtherGateway =
      !IsSameGateway(edited.GetIpv6Gateway(), _workingConfig.GetIpv6Gateway());
  if (dialog.IsEnabled() != _ipv6Enabled ||
      edited.GetUseIpv6Dhcp() != _modeConfig.GetUseIpv6Dhcp() ||
      edited.GetUseIpv6RouterAdvertised() != _modeConfig.GetUseIpv6RouterAdvertised() ||
      isOtherGateway || dialog.IsAddressEdited()) {
    _changed = true;
  }
  _ipv6Enabled = dialog.IsEnabled();
  if (!_ipv6Enabled) {
    return;
  }
  _ipv6GatewayChanged = _ipv6GatewayChanged || isOtherGateway;
  _modeConfig.SetUseIpv6Dhcp(edited.GetUseIpv6Dhcp());
  _modeConfig.SetUseIpv6RouterAdvertised(edited.GetUseIpv6RouterAdvertised());
  _workingConfig = edited;
}

// What the host gets from a DHCP server is not looked at.
void NetworkWindow::EditDns() {
  DNSConfigurationDialog dialog(this, _modeConfig.GetDhcpDns(), _modeConfig.IsUsingDhcp(),
                                _primaryDns.get(), _alternateDns.get(), _hostname);
  if (dialog.Exec() == 0) {
    return;
  }
  const bool isManual = !dialog.IsDhcpDns();
  if (dialog.IsDhcpDns() == _modeConfig.GetDhcpDns() &&
      !(isManual && (AddressText(dialog.PrimaryDns()) != AddressText(_primaryDns.get()) ||
                     AddressText(dialog.AlternateDns()) != AddressText(_alternateDns.get()) ||
                     dialog.Hostname() != _hostname))) {
    return;
  }
  _changed = true;
  _modeConfig.SetDhcpDns(dialog.IsDhcpDns());
  if (isManual) {
    _primaryDns = dialog.TakePrimaryDns();
    _alternateDns = dialog.TakeAlternateDns();
    _hostname = dialog.Hostname();
  }
}

void NetworkWindow::EditSuffixes() {
  SuffixesDialog dialog(this, _suffixes);
  if (dialog.Exec() != 0 && dialog.Suffixes() != _suffixes) {
    _changed = true;
    _suffixes = dialog.Suffixes();
  }
}

}  // namespace Tarnel
