#include "hostapi/nodeplane/ip_config.h"

namespace Nodeplane::Network {

IpConfig::IpConfig() = default;

bool IpConfig::GetUseDhcp() const { return _useDhcp; }

void IpConfig::SetUseDhcp(bool useDhcp) { SetUseDhcp(useDhcp, _ipv4UseNone); }

void IpConfig::SetUseDhcp(bool useDhcp, bool useNone) {
  _useDhcp = useDhcp;
  _ipv4UseNone = useNone && !useDhcp;
}

bool IpConfig::GetIpv4UseNone() const { return _ipv4UseNone; }
void IpConfig::SetIpv4UseNone() { _ipv4UseNone = true; }

const Ipv4Address& IpConfig::GetIpv4Address() const { return _ipv4Address; }

void IpConfig::SetIpv4Address(const Ipv4Address& address) {
  _ipv4Address = address;
  _ipv4UseNone = false;
}

const Ipv4Address& IpConfig::GetIpv4Netmask() const { return _ipv4Netmask; }
void IpConfig::SetIpv4Netmask(const Ipv4Address& netmask) { _ipv4Netmask = netmask; }
const Ipv4Address& IpConfig::GetIpv4Gateway() const { return _ipv4Gateway; }
void IpConfig::SetIpv4Gateway(const Ipv4Address& gateway) { _ipv4Gateway = gateway; }

bool IpConfig::GetUseIpv6Dhcp() const { return _useIpv6Dhcp; }
void IpConfig::SetUseIpv6Dhcp(bool useDhcp) { _useIpv6Dhcp = useDhcp; }
bool IpConfig::GetUseIpv6RouterAdvertised() const { return _useIpv6RouterAdvertised; }
void IpConfig::SetUseIpv6RouterAdvertised(bool useRouterAdvertised) {
  _useIpv6RouterAdvertised = useRouterAdvertised;
}

const std::vector<Ipv6Network>& IpConfig::GetIpv6Network() const { return _ipv6Networks; }
void IpConfig::AddIpv6Network(const Ipv6Network& network) { _ipv6Networks.push_back(network); }

void IpConfig::RemoveIpv6Network(const Ipv6Network& network) {
  // By value: the argument may be one of the entries.
  std::erase_if(_ipv6Networks, [network](const Ipv6Network& entry) { return entry == network; });
}

const Ipv6Address& IpConfig::GetIpv6Gateway() const { return _ipv6Gateway; }
void IpConfig::SetIpv6Gateway(const Ipv6Address& gateway) { _ipv6Gateway = gateway; }

bool IpConfig::GetDhcpDns() const { return _dhcpDns; }
void IpConfig::SetDhcpDns(bool dhcpDns) { _dhcpDns = dhcpDns; }

bool IpConfig::IsUsingDhcp() const { return _useDhcp || _useIpv6Dhcp; }
bool IpConfig::IsUsingIpv6Dhcp() const { return _useIpv6Dhcp; }

}  // namespace Nodeplane::Network
