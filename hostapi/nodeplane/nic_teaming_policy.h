#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace Nodeplane::Network {

// By which signs an uplink counts as usable. The console only carries it along.
struct LinkCriteriaSelectionPolicy {
  bool checkBeacon = false;
  bool checkDuplex = false;
  bool checkSpeed = false;
  int32_t speedMegabits = 0;
};

// How the uplinks of a switch or of a port group share the traffic. It is read, edited and written
// back whole; what the console does not know of it stays as it was.
class NicTeamingPolicy {
 public:
  // Bits of the field mask: which fields are set, and so not inherited.
  enum FieldMask : uint32_t { UPLINK_ORDER = 0x10, MAX_ACTIVE_UPLINKS = 0x40 };

  uint32_t GetFieldMask() const;
  void SetFieldMask(uint32_t mask);

  // Names of adapters; the first ones are the active ones.
  const std::vector<std::string>& GetUplinkOrder() const;
  // Sets UPLINK_ORDER in the mask.
  void SetUplinkOrder(const std::vector<std::string>& order);

  // How many uplinks may be active at once.
  int32_t GetMaxActiveUplinks() const;
  // Sets MAX_ACTIVE_UPLINKS in the mask.
  void SetMaxActiveUplinks(int maxActiveUplinks);

  const LinkCriteriaSelectionPolicy& GetLinkCriteria() const;
  void SetLinkCriteria(const LinkCriteriaSelectionPolicy& criteria);

 private:
  uint32_t _fieldMask = 0;
  std::vector<std::string> _uplinkOrder;
  int32_t _maxActiveUplinks = 0;
  LinkCriteriaSelectionPolicy _linkCriteria;
};

}  // namespace Nodeplane::Network
