// What the right pane of the network screen tells about each row: its pending value and what it is
// good for.

#include "console/hostops/command_runner.h"
#include "console/network/address_text.h"
#include "console/network/network_rows.h"
#include "console/network/network_window.h"
#include "console/widgets/hints.h"
#include "hostapi/coreplane/network_info.h"

namespace Tarnel {

namespace {

constexpr int TEXT_IPV4_ADDRESS = 37;
constexpr int TEXT_IPV6_ADDRESSES = 38;
constexpr int TEXT_GATEWAY = 40;
constexpr int TEXT_NETMASK = 41;
constexpr int TEXT_HOSTNAME = 42;
constexpr int TEXT_PRIMARY_DNS = 43;
constexpr int TEXT_ALTERNATE_DNS = 44;
constexpr int TEXT_IPV6_DNS = 45;
constexpr int TEXT_IPV6_ENABLED = 52;
constexpr int TEXT_IPV6_DISABLED = 53;
constexpr int TEXT_ABOUT_ADAPTERS = 56;
constexpr int TEXT_ABOUT_VLAN = 58;
constexpr int TEXT_ABOUT_IPV4 = 59;
constexpr int TEXT_ABOUT_IPV6 = 60;
constexpr int TEXT_IPV6_IS_OFF = 61;
constexpr int TEXT_IPV6_AFTER_REBOOT = 62;
constexpr int TEXT_ABOUT_DNS = 63;
constexpr int TEXT_ABOUT_SUFFIXES = 64;
constexpr int TEXT_AUTOMATIC = 116;
constexpr int TEXT_NONE = 117;
constexpr int TEXT_MANUAL = 118;
constexpr int TEXT_NOT_SET = 120;

// Between the values of a pane and what it says about them.
constexpr char EXPLANATION[] = "{/color}{color:light-grey}";

// What the adapter is called by its hardware, else its MAC address.
std::string HardwareLabel(const std::string& adapter) {
  const Coreplane::Network::PnicImpl pnic(adapter);
  const auto device = pnic.GetPciDevice();
  const std::string label = device != nullptr ? CollapseWhitespace(device->GetName()) : "";
  return label.empty() ? pnic.GetMacAddress().GetStringAddress() : label;
}

}  // namespace

void NetworkWindow::ShowRightPane() {
  const int row = _list->SelectionIndex();
  SetRightTitle(Text(NETWORK_ROW_TEXTS[row]));
  _rightText->SetText("{color:white}" + RightText(row));
  SetLeftHint(HINT_SELECT_ROW);
  SetRightHint(HINT_CHANGE_OR_EXIT);
}

std::string NetworkWindow::RightText(int row) const {
  switch (row) {
    case NETWORK_ROW_ADAPTERS:
      return AdaptersText() + "\n" + EXPLANATION + Text(TEXT_ABOUT_ADAPTERS);
    case NETWORK_ROW_VLAN:
      return OrNotSet(_vlanId != 0 ? std::to_string(_vlanId) : "") + "\n\n" + EXPLANATION +
             Text(TEXT_ABOUT_VLAN);
    case NETWORK_ROW_IPV4:
      return Ipv4Text() + "\n" + EXPLANATION + Text(TEXT_ABOUT_IPV4);
    case NETWORK_ROW_IPV6:
      return Ipv6Text();
    case NETWORK_ROW_DNS:
      return DnsText() + "\n\n" + EXPLANATION + Text(TEXT_ABOUT_DNS);
    case NETWORK_ROW_SUFFIXES:
      return OrNotSet(_suffixes) + "\n\n" + EXPLANATION + Text(TEXT_ABOUT_SUFFIXES);
    default:
      return "";
  }
}

std::string NetworkWindow::OrNotSet(const std::string& text) const {
  return text.empty() ? Text(TEXT_NOT_SET) : text;
}

std::string NetworkWindow::AdaptersText() const {
  std::string text;
  for (const std::string& adapter : _adapters) {
    text += adapter + " (" + HardwareLabel(adapter) + ")\n";
  }
  return text;
}

std::string NetworkWindow::Ipv4Text() const {
  const auto line = [this](int label, const Nodeplane::Network::Ipv4Address& address) {
    const std::string text = AddressText(&address);
    return Text(label) + ": " + (IsSetAddress(text) ? text : Text(TEXT_NOT_SET)) + "\n";
  };
  int mode = TEXT_MANUAL;
  if (_modeConfig.GetUseDhcp()) {
    mode = TEXT_AUTOMATIC;
  } else if (_workingConfig.GetIpv4UseNone()) {
    mode = TEXT_NONE;
  }
  return Text(mode) + "\n\n" + line(TEXT_IPV4_ADDRESS, _workingConfig.GetIpv4Address()) +
         line(TEXT_NETMASK, _workingConfig.GetIpv4Netmask()) +
         line(TEXT_GATEWAY, _workingConfig.GetIpv4Gateway());
}

std::string NetworkWindow::Ipv6Text() const {
  const std::string state = Text(_ipv6Enabled ? TEXT_IPV6_ENABLED : TEXT_IPV6_DISABLED) + "\n\n";
  if (_ipv6Enabled && !_ipv6EnabledAtEntry) {
    return state + EXPLANATION + Text(TEXT_IPV6_AFTER_REBOOT);
  }
  if (!Coreplane::Network::NetworkInfoImpl().IsCoreIpv6Enabled()) {
    return state + EXPLANATION + Text(TEXT_IPV6_IS_OFF);
  }
  const bool automatic = _modeConfig.GetUseIpv6Dhcp() || _modeConfig.GetUseIpv6RouterAdvertised();
  const std::string addresses = Ipv6Lines(_workingConfig.GetIpv6Network());
  const std::string gateway = AddressText(&_workingConfig.GetIpv6Gateway());
  return state + Text(automatic ? TEXT_AUTOMATIC : TEXT_MANUAL) + "\n\n" +
         Text(TEXT_IPV6_ADDRESSES) + ":\n" +
         (addresses.empty() ? Text(TEXT_NOT_SET) + "\n" : addresses) + "\n" + Text(TEXT_GATEWAY) +
         ":\n" + (IsSetAddress(gateway) ? gateway : Text(TEXT_NOT_SET)) + "\n\n" + EXPLANATION +
         Text(TEXT_ABOUT_IPV6);
}

std::string NetworkWindow::DnsText() const {
  const bool mixed = IsMixedPair(_primaryDns.get(), _alternateDns.get());
  return Text(_modeConfig.GetDhcpDns() ? TEXT_AUTOMATIC : TEXT_MANUAL) + "\n\n" +
         Text(TEXT_PRIMARY_DNS) + ":\n" + OrNotSet(AddressText(_primaryDns.get())) + "\n" +
         Text(mixed ? TEXT_IPV6_DNS : TEXT_ALTERNATE_DNS) + ":\n" +
         OrNotSet(AddressText(_alternateDns.get())) + "\n\n" + Text(TEXT_HOSTNAME) + "\n" +
         _hostname;
}

}  // namespace Tarnel
