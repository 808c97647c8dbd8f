#pragma once

#include <array>
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "hostapi/nodeplane/virtual_switch.h"

// Distributed switches, managed from outside, and their ports. All objects are made by the host;
// every operation throws NodeplaneException when it fails.
namespace Nodeplane::Network {

struct VlanRange {
  uint16_t first = 0;
  uint16_t last = 0;
};

// VLANs of a port. The flags are the host's.
struct LatticeVlan {
  std::array<uint8_t, 2> flags{};
  // 0 means none.
  uint16_t vlanId = 0;
  std::vector<VlanRange> ranges;
};

// What a port is made from.
struct LatticePortParam {
  enum Kind : int32_t { HOST_LOCAL = 1 };

  std::string switchId;
  std::string portKey;
  // A Kind; a host may give other values too.
  int32_t kind = 0;
  LatticeVlan vlan;
};

// How a port uses the uplinks of its switch. Flags and numbers are the host's.
struct LatticeTeaming {
  int32_t policyKind = 0;
  std::array<uint8_t, 8> flags{};
  int16_t number = 0;
  std::array<uint8_t, 5> moreFlags{};
  std::vector<std::string> activeUplinks;
  std::vector<std::string> standbyUplinks;
};

// What a port lets its guest do.
struct LatticeSecurity {
  bool promiscuous = false;
  bool macChanges = false;
  bool forgedTransmits = false;
};

// Limits of the traffic in one direction.
struct LatticeShaping {
  bool enabled = false;
  // In bits per second.
  int64_t averageBandwidth = 0;
  int64_t peakBandwidth = 0;
  // In bytes.
  int64_t burstSize = 0;
};

struct LatticeFilter {
  std::string name;
  std::vector<std::string> parameters;
};

class LatticePort;

// A distributed switch as this host sees it.
class LatticeSwitch : public Portset {
 public:
  ~LatticeSwitch() override;

  virtual std::string GetName() const = 0;
  // Throws when the adapter is not on this switch. With force, also where the host objects.
  virtual void RemoveUplink(const std::string& adapter, bool force) = 0;
  // False for a switch of another vendor.
  virtual bool IsNativeSwitch() const = 0;
  // The uplink ports by the names of their adapters.
  virtual std::map<std::string, LatticePortParam> GetUplinkPorts() const = 0;
  // Null when the switch has no port with this key.
  virtual std::unique_ptr<LatticePort> GetPort(const std::string& key) const = 0;

 protected:
  LatticeSwitch() = default;
};

// A port of a distributed switch.
class LatticePort : public ConnectionPoint {
 public:
  enum Direction : int { OUTBOUND = 0, INBOUND = 1 };
  // The kind of settings that both maps of texts are asked for.
  static constexpr int PORT_SETTINGS = 16;

  ~LatticePort() override;

  // Null when the switch has vanished.
  virtual std::unique_ptr<LatticeSwitch> GetLatticeSwitch() const = 0;
  virtual std::string GetSwitchId() const = 0;
  virtual std::string GetKey() const = 0;
  virtual std::string GetName() const = 0;
  virtual LatticeVlan GetVlan() const = 0;
  virtual void SetVlan(const LatticeVlan& vlan) = 0;

  // What a new port can take over from another one, in the order in which it is to be set.
  virtual bool GetBlocked() const = 0;
  virtual void SetBlocked(bool blocked) = 0;
  virtual bool GetFlowMonitoring() const = 0;
  virtual void SetFlowMonitoring(bool monitoring) = 0;
  virtual LatticeTeaming GetTeaming() const = 0;
  virtual void SetTeaming(const LatticeTeaming& teaming) = 0;
  virtual bool GetMacLearning() const = 0;
  virtual void SetMacLearning(bool learning) = 0;
  virtual int32_t GetMacLimit() const = 0;
  virtual void SetMacLimit(int32_t limit) = 0;
  virtual bool GetUplinkTransmitOnly() const = 0;
  virtual void SetUplinkTransmitOnly(bool transmitOnly) = 0;
  virtual LatticeSecurity GetSecurity() const = 0;
  virtual void SetSecurity(const LatticeSecurity& security) = 0;
  virtual LatticeShaping GetShaping(int direction) const = 0;
  virtual void SetShaping(int direction, const LatticeShaping& shaping) = 0;
  virtual std::string GetResourcePool() const = 0;
  virtual void SetResourcePool(const std::string& pool) = 0;
  virtual std::map<std::string, std::string> GetProperties(int kind) const = 0;
  virtual void SetProperties(int kind, const std::map<std::string, std::string>& properties) = 0;
  virtual std::map<std::string, std::string> GetVendorProperties(int kind) const = 0;
  virtual void SetVendorProperties(int kind,
                                   const std::map<std::string, std::string>& properties) = 0;
  virtual std::vector<std::string> GetFilterAgents() const = 0;
  virtual void SetFilterAgents(const std::vector<std::string>& agents) = 0;
  virtual std::vector<LatticeFilter> GetFilters() const = 0;
  virtual void SetFilters(const std::vector<LatticeFilter>& filters) = 0;
  virtual std::string GetDescription() const = 0;
  virtual void SetDescription(const std::string& description) = 0;

 protected:
  LatticePort() = default;
};

}  // namespace Nodeplane::Network
