#pragma once

#include <memory>
#include <string>
#include <vector>

#include "hostapi/nodeplane/ip_address.h"

namespace Coreplane::Network {

// The TCP/IP stack of the management network.
inline constexpr char DEFAULT_STACK[] = "defaultTcpipStack";

// The name service settings of one TCP/IP stack. Changes act at once
// and are lost at the next start of the host unless they are saved. Every operation throws
// NodeplaneException when the host fails.
class DnsConfigImpl {
 public:
  explicit DnsConfigImpl(const std::string& stack);
  ~DnsConfigImpl();
  DnsConfigImpl(DnsConfigImpl&&) noexcept;
  DnsConfigImpl& operator=(DnsConfigImpl&&) noexcept;

  // The host's name without its domain.
  std::string GetHostname() const;
  // Empty when the host is in no domain.
  std::string GetDomain() const;
  std::vector<std::string> GetSearchDomains() const;
  std::vector<Nodeplane::Network::Ipv4Address> GetNameServers() const;
  // With onlyFromDhcp, those alone that a DHCPv6 server gave.
  std::vector<Nodeplane::Network::Ipv6Address> GetIpv6NameServers(bool onlyFromDhcp) const;

  // Changes the name and keeps the domain. With fromDhcp, the name counts as given by a server.
  void SetHostname(const std::string& hostname, bool fromDhcp);
  // Changes name and domain. An empty domain means the part of the name behind its first dot.
  void SetFqdn(const std::string& fqdn, bool fromDhcp, const std::string& domain);
  // Removes all name servers of both families.
  void RemoveNameServers();
  // Appends a name server to those of its family.
  void AddNameServer(const Nodeplane::Network::IpAddress& address);
  // Replaces the search domains by the words of this text.
  void SetSearchDomainsString(const std::string& domains);
  void AddSearchDomain(const std::string& domain);
  // Keeps the settings as they are now for later starts of the host.
  void SaveConfig();

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

// The default routes of one TCP/IP stack. Every operation throws NodeplaneException when the host
// fails.
class RoutingInfoImpl {
 public:
  explicit RoutingInfoImpl(const std::string& stack);
  ~RoutingInfoImpl();
  RoutingInfoImpl(RoutingInfoImpl&&) noexcept;
  RoutingInfoImpl& operator=(RoutingInfoImpl&&) noexcept;

  // 0.0.0.0 when there is none.
  Nodeplane::Network::Ipv4Address GetCorelinDefaultGateway() const;
  // "::" when there is none.
  Nodeplane::Network::Ipv6Address GetIpv6CorelinDefaultGateway() const;
  // With fromDhcp, the gateway counts as given by a server and is not stored.
  void SetCorelinDefaultGateway(const Nodeplane::Network::Ipv4Address& gateway, bool fromDhcp);
  void SetIpv6CorelinDefaultGateway(const Nodeplane::Network::Ipv6Address& gateway);

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

// The names in /etc/hosts. Every operation throws NodeplaneException when the file cannot be read
// or written.
class HostsFile {
 public:
  // Removes the name, with its entry when it was the only one there. An absent name is no error.
  void RemoveEntryByHostName(const std::string& hostname);
};

}  // namespace Coreplane::Network
