#include "hostapi/nodeplane/nic_teaming_policy.h"

namespace Nodeplane::Network {

uint32_t NicTeamingPolicy::GetFieldMask() const { return _fieldMask; }
void NicTeamingPolicy::SetFieldMask(uint32_t mask) { _fieldMask = mask; }

const std::vector<std::string>& NicTeamingPolicy::GetUplinkOrder() const { return _uplinkOrder; }

void NicTeamingPolicy::SetUplinkOrder(const std::vector<std::string>& order) {
  _uplinkOrder = order;
  _fieldMask |= UPLINK_ORDER;
}

int32_t NicTeamingPolicy::GetMaxActiveUplinks() const { return _maxActiveUplinks; }

void NicTeamingPolicy::SetMaxActiveUplinks(int maxActiveUplinks) {
  _maxActiveUplinks = maxActiveUplinks;
  _fieldMask |= MAX_ACTIVE_UPLINKS;
}

const LinkCriteriaSelectionPolicy& NicTeamingPolicy::GetLinkCriteria() const {
  return _linkCriteria;
}

void NicTeamingPolicy::SetLinkCriteria(const LinkCriteriaSelectionPolicy& criteria) {
  _linkCriteria = criteria;
}

}  // namespace Nodeplane::Network
