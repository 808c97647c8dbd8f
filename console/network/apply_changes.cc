// How the pending configuration of the management network is written to the host. The order of the
// steps is fixed, and most of them are guarded by themselves so that one failure does not stop the
// rest. Nothing is rolled back.

#include <syslog.h>

#include <algorithm>
#include <cctype>

#include "console/hostops/command_runner.h"
#include "console/network/address_text.h"
#include "console/network/apply_changes_dialog.h"
#include "console/network/error_text.h"
#include "console/network/network_window.h"
#include "console/network/switch_operations.h"
#include "console/power/shutdown_dialogs.h"
#include "console/screen/screen.h"
#include "console/widgets/message_dialog.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

namespace {

using Coreplane::Network::CoreNicImpl;
using Coreplane::Network::NetworkInfoImpl;
using Coreplane::Network::PnicImpl;
using Nodeplane::Lib::NodeplaneException;
using Nodeplane::Network::CoreNic;
using Nodeplane::Network::IpAddress;
using Nodeplane::Network::IpConfig;
using Nodeplane::Network::Ipv4Address;
using Nodeplane::Network::Ipv6Address;

using Names = std::vector<std::string>;

constexpr int TEXT_ERROR_TITLE = 18;

void LogProgress(const std::string& text) { syslog(LOG_INFO, "%s", text.c_str()); }

bool Holds(const Names& names, const std::string& name) {
  return std::find(names.begin(), names.end(), name) != names.end();
}

bool IsSameAddressAndNetmask(const IpConfig& left, const IpConfig& right) {
  return left.GetIpv4Address() == right.GetIpv4Address() &&
         left.GetIpv4Netmask() == right.GetIpv4Netmask();
}

bool HasNoAddress(const IpConfig& config) { return IsSameAddressAndNetmask(config, IpConfig()); }

// The words between blanks and commas.
Names SplitSuffixes(const std::string& text) {
  Names words;
  std::string word;
  for (const char character : text + ",") {
    if (character != ',' && isspace(static_cast<unsigned char>(character)) == 0) {
      word += character;
    } else if (!word.empty()) {
      words.push_back(word);
      word.clear();
    }
  }
  return words;
}

}  // namespace

int NetworkWindow::ApplyChanges() {
  ApplyFlags flags;
  if (!IsManagementOnLattice()) {
    ApplyUplinks(flags);
    ApplyVlan(flags);
  }
  ApplyIpConfiguration(flags);
  WriteIpv4Gateway(flags);
  WriteIpv6Gateway();
  RenewLeases(flags);
  RestartForVlan(flags);
  Guard("Setting DNS failed: ", [this] {
    WriteHostnameAndNameServers();
    WriteSuffixes();
  });
  if (_ipv6Enabled != _ipv6EnabledAtEntry) {
    RebootConfirmDialog(this, true).Exec();
  }
  StewRefresh();
  return 1;
}

template <class Step>
bool NetworkWindow::Guard(const char* prefix, Step step) {
  try {
    step();
    return true;
  } catch (const NodeplaneException& error) {
    TellFailure(prefix + ExtractErrorText(error));
    return false;
  }
}

void NetworkWindow::TellFailure(const std::string& text) {
  syslog(LOG_ERR, "%s", text.c_str());
  MessageDialog(this, TEXT_ERROR_TITLE, text).Exec();
}

void NetworkWindow::ApplyUplinks(ApplyFlags& flags) {
  std::string line = "Setting adapters to";
  for (const std::string& adapter : _adapters) {
    line += " " + adapter;
  }
  LogProgress(line);
  Names present;
  if (GetActiveUplinks(*_mgmtNic, present)) {
    MoveUplinks(present, flags);
  }
  TakeMacAddress(present);
}

void NetworkWindow::MoveUplinks(const Names& present, ApplyFlags& flags) {
  bool moved = false;
  for (const std::string& adapter : present) {
    if (!Holds(_adapters, adapter) && RemoveManagementUplink(*_mgmtNic, adapter)) {
      moved = true;
    }
  }
  for (const std::string& adapter : _adapters) {
    if (!Holds(present, adapter) && AddManagementUplink(*_mgmtNic, adapter)) {
      moved = true;
    }
  }
  flags.renewDhcp4 = flags.renewDhcp6 = moved;
}

// The interface has the MAC address of its first uplink, so a new first place changes it even when
// no uplink was moved.
void NetworkWindow::TakeMacAddress(const Names& present) {
  if (_adapters.empty() || (!present.empty() && present.front() == _adapters.front())) {
    return;
  }
  Guard("Setting mac address of upnic failed: ", [this] {
    PnicImpl pnic(_adapters.front());
    if (auto* const nic = dynamic_cast<CoreNicImpl*>(_mgmtNic.get())) {
      nic->SetMacFromPnic(pnic);
    } else {
      _mgmtNic->SetMacAddress(pnic.GetMacAddress());
    }
  });
}

void NetworkWindow::ApplyVlan(ApplyFlags& flags) {
  uint16_t present = 0;
  if (GetVlanId(*_mgmtNic, present) && present != _vlanId) {
    flags.vlanChanged = SetVlanId(*_mgmtNic, _vlanId);
  }
}

void NetworkWindow::ApplyIpConfiguration(ApplyFlags& flags) {
  if (!Guard("Setting ip configuration failed: ", [&] { ChooseIpv4(flags); })) {
    flags.ipv4Rewritten = false;
  }
  Guard("Setting ipv6 configuration failed: ", [&] { SwitchIpv6(flags); });
  ChooseDnsMode();
  Guard("Setting ip/ipv6 configuration failed: ", [&] { WriteIpConfiguration(flags); });
}

// A lease that is in use already is left alone.
void NetworkWindow::ChooseIpv4(ApplyFlags& flags) {
  const IpConfig stored = _mgmtNic->GetIpConfig();
  const IpConfig running = _mgmtNic->GetRunningIpConfig();
  if (_modeConfig.GetUseDhcp()) {
    if (!stored.GetUseDhcp()) {
      flags.renewDhcp4 = false;
      LogProgress("Switching to DHCP on " + _mgmtNic->GetName());
    }
    _workingConfig.SetUseDhcp(true);
    return;
  }
  const bool hasNone = !stored.GetUseDhcp() && HasNoAddress(running);
  const bool none = _workingConfig.GetIpv4UseNone() && !hasNone;
  if (!none && !stored.GetUseDhcp() && IsSameAddressAndNetmask(_workingConfig, running)) {
    flags.renewDhcp4 = false;
    return;
  }
  RewriteIpv4(none, flags);
}

void NetworkWindow::RewriteIpv4(bool none, ApplyFlags& flags) {
  const std::string value = none ? "to none"
                                 : "to " + _workingConfig.GetIpv4Address().GetStringAddress() +
                                       " " + _workingConfig.GetIpv4Netmask().GetStringAddress();
  LogProgress("Setting ipv4 configuration " + value + " on " + _mgmtNic->GetName());
  _workingConfig.SetUseDhcp(false, none);
  flags.ipv4Rewritten = true;
  flags.renewDhcp4 = false;
}

void NetworkWindow::SwitchIpv6(ApplyFlags& flags) {
  NetworkInfoImpl().SetCoreIpv6Enabled(_ipv6Enabled);
  if (!_ipv6Enabled) {
    flags.renewDhcp6 = false;
    return;
  }
  LogProgress("Setting ipv6 configuration");
  _workingConfig.SetUseIpv6Dhcp(_modeConfig.GetUseIpv6Dhcp());
  _workingConfig.SetUseIpv6RouterAdvertised(_modeConfig.GetUseIpv6RouterAdvertised());
  const bool staysInUse =
      _modeConfig.IsUsingIpv6Dhcp() && _mgmtNic->GetIpConfig().IsUsingIpv6Dhcp();
  flags.renewDhcp6 = flags.renewDhcp6 && staysInUse;
}

// Without any DHCP there is nobody who could tell the name servers.
void NetworkWindow::ChooseDnsMode() {
  const bool usesDhcp = _workingConfig.GetUseDhcp() || _workingConfig.IsUsingIpv6Dhcp();
  _workingConfig.SetDhcpDns(_modeConfig.GetDhcpDns() && usesDhcp);
  _modeConfig.SetDhcpDns(_workingConfig.GetDhcpDns());
}

// The host forgets about a lease when it gets a configuration; one that was bound stays bound.
void NetworkWindow::WriteIpConfiguration(const ApplyFlags& flags) {
  auto* const coreNic = dynamic_cast<CoreNic*>(_mgmtNic.get());
  const bool wasBound = coreNic != nullptr && coreNic->IsDhcpBound();
  _mgmtNic->SetIpConfig(_workingConfig);
  if (flags.ipv4Rewritten) {
    ShowRightPane();
    RedrawLines();
    UpdateScreen();
  }
  if (wasBound && _workingConfig.GetUseDhcp()) {
    coreNic->SetDhcpBound(true);
  }
}

// The operator sees the whole text of this failure.
void NetworkWindow::WriteIpv4Gateway(const ApplyFlags& flags) {
  if (_workingConfig.GetUseDhcp()) {
    return;
  }
  try {
    const Ipv4Address& gateway = _workingConfig.GetIpv4Gateway();
    const bool isInEffect = _routingInfo.GetCorelinDefaultGateway() == gateway;
    if (!isInEffect || flags.ipv4Rewritten) {
      LogProgress("Setting default gateway to " + gateway.GetStringAddress());
      _routingInfo.SetCorelinDefaultGateway(gateway, false);
    }
  } catch (const NodeplaneException& error) {
    TellFailure(std::string("Setting default gateway failed: ") + error.what());
  }
}

void NetworkWindow::WriteIpv6Gateway() {
  if (!_ipv6Enabled || !_ipv6GatewayChanged) {
    return;
  }
  Guard("Setting default ipv6 gateway failed: ", [this] {
    const Ipv6Address& gateway = _workingConfig.GetIpv6Gateway();
    LogProgress("Setting default ipv6 gateway to " + gateway.GetStringAddress());
    _routingInfo.SetIpv6CorelinDefaultGateway(gateway);
  });
}

void NetworkWindow::RenewLeases(const ApplyFlags& flags) {
  if (!flags.renewDhcp4 && !flags.renewDhcp6) {
    return;
  }
  LogProgress("Renew DHCP lease on " + _mgmtNic->GetName());
  auto* const coreNic = dynamic_cast<CoreNic*>(_mgmtNic.get());
  if (coreNic == nullptr) {
    return;
  }
  if (flags.renewDhcp4) {
    coreNic->RenewDhcpLease();
  }
  if (flags.renewDhcp6) {
    coreNic->RenewDhcp6Lease();
  }
}

void NetworkWindow::RestartForVlan(const ApplyFlags& flags) {
  if (flags.vlanChanged) {
    LogProgress("Changed vlan, restarting management interface");
    _mgmtNic->Disable();
    _mgmtNic->Refresh();
    _mgmtNic->Enable();
  }
}

void NetworkWindow::WriteHostnameAndNameServers() {
  if (_modeConfig.GetDhcpDns()) {
    return;
  }
  LogProgress("Setting hostname to " + _hostname);
  if (_hostname.find('.') != std::string::npos) {
    _dnsConfig.SetFqdn(_hostname, false, "");
  } else {
    _dnsConfig.SetHostname(_hostname, false);
  }
  LogProgress("Setting nameservers to " + AddressText(_primaryDns.get()) + " " +
              AddressText(_alternateDns.get()));
  _dnsConfig.RemoveNameServers();
  for (const IpAddress* const server : {_primaryDns.get(), _alternateDns.get()}) {
    if (IsSetAddress(AddressText(server))) {
      _dnsConfig.AddNameServer(*server);
    }
  }
}

// The search list restarts with the host's own domain.
void NetworkWindow::WriteSuffixes() {
  LogProgress("Setting suffixes to " + _suffixes);
  _dnsConfig.SetSearchDomainsString(_dnsConfig.GetDomain());
  for (const std::string& suffix : SplitSuffixes(_suffixes)) {
    _dnsConfig.AddSearchDomain(suffix);
  }
  _dnsConfig.SaveConfig();
}

}  // namespace Tarnel
