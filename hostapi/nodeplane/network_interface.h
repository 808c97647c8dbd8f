#pragma once

#include <string>

#include "hostapi/nodeplane/ip_config.h"

namespace Nodeplane::Network {

// A network interface of the host's kernel, made by the host. Every operation throws
// NodeplaneException when the host fails.
class NetworkInterface {
 public:
  virtual ~NetworkInterface();

  virtual std::string GetName() const = 0;
  // The stored configuration: what the modes are read from.
  virtual IpConfig GetIpConfig() const = 0;
  // The configuration in effect: the addresses that the interface really has.
  virtual IpConfig GetRunningIpConfig() const = 0;
  // The console may change the interface.
  virtual bool IsConfigurable() const = 0;

 protected:
  NetworkInterface() = default;
};

// An interface that can hold a DHCP lease.
class CoreNic : public NetworkInterface {
 public:
  ~CoreNic() override;

  // The interface holds a valid DHCP lease for IPv4.
  virtual bool IsDhcpBound() const = 0;
  // The server that gave the lease for IPv4; 0.0.0.0 when there is none.
  virtual Ipv4Address GetDhcpServerAddress() const = 0;

 protected:
  CoreNic() = default;
};

}  // namespace Nodeplane::Network
