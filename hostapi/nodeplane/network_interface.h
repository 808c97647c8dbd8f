#pragma once

#include <memory>
#include <string>

#include "hostapi/nodeplane/ip_config.h"
#include "hostapi/nodeplane/virtual_switch.h"

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
  // Stores the configuration and brings it into effect. What was bound by DHCP before is given up.
  virtual void SetIpConfig(const IpConfig& config) = 0;
  // The console may change the interface.
  virtual bool IsConfigurable() const = 0;

  // Where the interface is attached; never null.
  virtual std::unique_ptr<ConnectionPoint> GetConnectionPoint() const = 0;
  // Attaches the interface elsewhere. With force, also where the present point objects.
  virtual void SetConnectionPoint(ConnectionPoint* point, bool force) = 0;
  virtual void SetMacAddress(const MacAddress& address) = 0;

  // Takes the interface down.
  virtual void Disable() = 0;
  // Brings the interface up.
  virtual void Enable() = 0;
  // Brings what the object knows of the interface up to date.
  virtual void Refresh() = 0;

 protected:
  NetworkInterface() = default;
};

// An interface that can hold a DHCP lease.
class CoreNic : public NetworkInterface {
 public:
  ~CoreNic() override;

  // The interface holds a valid DHCP lease for IPv4.
  virtual bool IsDhcpBound() const = 0;
  virtual void SetDhcpBound(bool bound) = 0;
  // The server that gave the lease for IPv4; 0.0.0.0 when there is none.
  virtual Ipv4Address GetDhcpServerAddress() const = 0;
  // Asks the server for the IPv4 lease again.
  virtual void RenewDhcpLease() = 0;
  // Asks the server for the IPv6 lease again.
  virtual void RenewDhcp6Lease() = 0;

 protected:
  CoreNic() = default;
};

}  // namespace Nodeplane::Network
