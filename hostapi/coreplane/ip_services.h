#pragma once

#include <memory>
#include <string>

namespace Coreplane::Network {

// The name service settings of one TCP/IP stack, such as "defaultTcpipStack". Every operation
// throws NodeplaneException when the host fails.
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

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

// The routes of one TCP/IP stack. Every operation throws NodeplaneException when the host fails.
class RoutingInfoImpl {
 public:
  explicit RoutingInfoImpl(const std::string& stack);
  ~RoutingInfoImpl();
  RoutingInfoImpl(RoutingInfoImpl&&) noexcept;
  RoutingInfoImpl& operator=(RoutingInfoImpl&&) noexcept;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

}  // namespace Coreplane::Network
