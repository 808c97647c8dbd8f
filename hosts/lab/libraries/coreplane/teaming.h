#pragma once

#include <string>
#include <vector>

#include "hostapi/nodeplane/nic_teaming_policy.h"
#include "hosts/lab/state/host_state.h"

// Teaming policies as nodes of the state,
//   {mask, order[], max, linkCriteria{beacon, duplex, speed, megabits}}
// of which each part may be missing, and as texts of the trace.
namespace Lab {

Nodeplane::Network::NicTeamingPolicy ReadTeaming(const Json& node);
Json TeamingNode(const Nodeplane::Network::NicTeamingPolicy& policy);
// Such as "mask 80 order corenic0 corenic1 max 2".
std::string DescribeTeaming(const Nodeplane::Network::NicTeamingPolicy& policy);

// A list of texts.
std::vector<std::string> Texts(const Json& list);

}  // namespace Lab
