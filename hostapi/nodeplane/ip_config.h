#pragma once

#include <vector>

#include "hostapi/nodeplane/ip_address.h"

namespace Nodeplane::Network {

// The IP configuration of one kernel interface: modes, addresses and default gateways.
// A host gives out two views of it, the stored one and the one in effect.
class IpConfig {
 public:
  // Static, 0.0.0.0, no IPv6 networks, no gateways.
  IpConfig();

  // IPv4 by DHCP.
  bool GetUseDhcp() const;
  // SetUseDhcp(true) also ends "no IPv4"; SetUseDhcp(false) leaves it as it is.
  void SetUseDhcp(bool useDhcp);
  // Says at once whether IPv4 is off. With useDhcp true, useNone has no effect.
  void SetUseDhcp(bool useDhcp, bool useNone);

  // No IPv4 at all. Setting it leaves the DHCP flag as it is; with both set, DHCP is in use.
  bool GetIpv4UseNone() const;
  void SetIpv4UseNone();

  const Ipv4Address& GetIpv4Address() const;
  // Ends "no IPv4".
  void SetIpv4Address(const Ipv4Address& address);
  const Ipv4Address& GetIpv4Netmask() const;
  void SetIpv4Netmask(const Ipv4Address& netmask);
  const Ipv4Address& GetIpv4Gateway() const;
  void SetIpv4Gateway(const Ipv4Address& gateway);

  // IPv6 by DHCPv6.
  bool GetUseIpv6Dhcp() const;
  void SetUseIpv6Dhcp(bool useDhcp);
  // IPv6 by router advertisement.
  bool GetUseIpv6RouterAdvertised() const;
  void SetUseIpv6RouterAdvertised(bool useRouterAdvertised);

  // In the order in which they were added.
  const std::vector<Ipv6Network>& GetIpv6Network() const;
  void AddIpv6Network(const Ipv6Network& network);
  // Removes each entry with that address and prefix; an absent one is no error.
  void RemoveIpv6Network(const Ipv6Network& network);
  const Ipv6Address& GetIpv6Gateway() const;
  void SetIpv6Gateway(const Ipv6Address& gateway);

  // Name servers and host name come from DHCP.
  bool GetDhcpDns() const;
  void SetDhcpDns(bool dhcpDns);

  // IPv4 by DHCP or IPv6 by DHCPv6.
  bool IsUsingDhcp() const;
  // IPv6 by DHCPv6.
  bool IsUsingIpv6Dhcp() const;

 private:
  bool _useDhcp = false;
  bool _ipv4UseNone = false;
  bool _useIpv6Dhcp = false;
  bool _useIpv6RouterAdvertised = false;
  bool _dhcpDns = false;
  Ipv4Address _ipv4Address;
  Ipv4Address _ipv4Netmask;
  Ipv4Address _ipv4Gateway;
  Ipv6Address _ipv6Gateway;
  std::vector<Ipv6Network> _ipv6Networks;
};

}  // namespace Nodeplane::Network
