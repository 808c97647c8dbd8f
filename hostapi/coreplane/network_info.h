#pragma once

#include <memory>
#include <string>
#include <vector>

#include "hostapi/nodeplane/ip_address.h"
#include "hostapi/nodeplane/network_interface.h"

namespace Coreplane::Network {

// A physical network adapter, found by its name. An adapter that has vanished throws
// NodeplaneException at the first read, not at construction.
class PnicImpl {
 public:
  explicit PnicImpl(const std::string& name);
  ~PnicImpl();
  PnicImpl(PnicImpl&&) noexcept;
  PnicImpl& operator=(PnicImpl&&) noexcept;

  std::string GetName() const;
  Nodeplane::Network::MacAddress GetMacAddress() const;
  bool IsLinkUp() const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

// The host's network as a whole. Every operation throws NodeplaneException when the host fails.
class NetworkInfoImpl {
 public:
  NetworkInfoImpl();
  ~NetworkInfoImpl();
  NetworkInfoImpl(NetworkInfoImpl&&) noexcept;
  NetworkInfoImpl& operator=(NetworkInfoImpl&&) noexcept;

  // IPv6 is on in the kernel as it runs now.
  bool IsCoreIpv6Enabled() const;
  // Finds anew which interface is the management interface.
  void UpdateManagementInterface();
  // Null when there is none. Works without an update too.
  std::unique_ptr<Nodeplane::Network::NetworkInterface> GetManagementInterface() const;
  // All physical adapters.
  std::vector<std::unique_ptr<PnicImpl>> GetPnics() const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

}  // namespace Coreplane::Network
