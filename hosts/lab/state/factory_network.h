#pragma once

#include <string>

#include "hosts/lab/state/host_state.h"

// The network of a fresh host: one standard switch with one adapter and the port group of the
// management interface.
namespace Lab {

// The node "switches"; without an adapter the switch has no uplink.
Json FactorySwitches(const std::string& adapter);
// The node "connection" of an interface on that port group.
Json FactoryConnection();

// Removes all configuration: switches, the interfaces but one, and what that one and the TCP/IP
// stacks were told. What the network outside has to offer stays.
void ClearNetwork(Json& state);
// The network of a fresh host, with the first adapter that has a link and an address by DHCP.
void AutoConfigureNetwork(Json& state);

}  // namespace Lab
