#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "hostapi/nodeplane/nic_teaming_policy.h"

// The standard switches of a host, which the console may change, and what interfaces are attached
// to. All objects are made by the host; every operation throws NodeplaneException when it fails.
namespace Nodeplane::Network {

// The switch side of a connection.
class Portset {
 public:
  // Ports of a new switch.
  static constexpr unsigned int DEF_NUM_PORTS = 128;

  virtual ~Portset();
  // Names of the adapters that it is connected to the outside by.
  virtual std::vector<std::string> GetUplinks() const = 0;

 protected:
  Portset() = default;
};

// Where an interface is attached.
class ConnectionPoint {
 public:
  enum ConnecteeType : int {
    CONNECTEE_NONE = 0,
    CONNECTEE_PORT_GROUP = 1,
    CONNECTEE_LATTICE_PORT = 2,
    CONNECTEE_OPAQUE_NETWORK = 3,
  };

  virtual ~ConnectionPoint();
  // A ConnecteeType; a host may give other values too.
  virtual int GetConnecteeType() const = 0;
  // Never null; it outlives the connection point.
  virtual std::unique_ptr<Portset> GetPortset() const = 0;

 protected:
  ConnectionPoint() = default;
};

class PortGroup;

// A standard switch.
class VirtualSwitch : public Portset {
 public:
  ~VirtualSwitch() override;

  virtual std::string GetName() const = 0;
  // Throws when the adapter is in use elsewhere.
  virtual void AddUplink(const std::string& adapter) = 0;
  // Throws when the adapter is not on this switch. With force, also where the host objects.
  virtual void RemoveUplink(const std::string& adapter, bool force) = 0;
  virtual std::unique_ptr<PortGroup> AddPortGroup(const std::string& name) = 0;
  // The switch's own policy, which its port groups inherit.
  virtual NicTeamingPolicy GetTeamingPolicy() const = 0;
  virtual void SetTeamingPolicy(const NicTeamingPolicy& policy) = 0;

 protected:
  VirtualSwitch() = default;
};

// A group of ports of a standard switch with settings of its own.
class PortGroup : public ConnectionPoint {
 public:
  ~PortGroup() override;

  // 0 means none.
  virtual uint16_t GetVlan() const = 0;
  virtual void SetVlan(uint16_t vlan) = 0;
  virtual NicTeamingPolicy GetTeamingPolicy() const = 0;
  virtual void SetTeamingPolicy(const NicTeamingPolicy& policy) = 0;
  // The switch that it belongs to; null when that has vanished.
  virtual std::unique_ptr<VirtualSwitch> GetVirtualSwitch() const = 0;

 protected:
  PortGroup() = default;
};

}  // namespace Nodeplane::Network
