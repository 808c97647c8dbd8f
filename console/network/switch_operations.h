#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "hostapi/nodeplane/network_interface.h"

// Which switch, VLAN and uplinks the management network has, and how an uplink is moved. A failure
// of the host is logged here and becomes false. What had been done before it stays done.
namespace Tarnel {

// The management interface hangs on a distributed switch, which is managed from outside. False also
// when that cannot be told.
bool IsManagementOnLattice();

// Name of the switch that the interface is attached to, of either kind.
bool GetSwitchName(Nodeplane::Network::NetworkInterface& nic, std::string& name);

// The others know standard switches only; on any other one they fail.

// VLAN id of the interface's port group, 0 for none.
bool GetVlanId(Nodeplane::Network::NetworkInterface& nic, uint16_t& vlanId);
bool SetVlanId(Nodeplane::Network::NetworkInterface& nic, uint16_t vlanId);
// How many of the port group's uplinks may be active at once.
bool GetMaxActiveUplinks(Nodeplane::Network::NetworkInterface& nic, int32_t& maximum);
// Names of the port group's adapters in teaming order.
bool GetActiveUplinks(Nodeplane::Network::NetworkInterface& nic, std::vector<std::string>& names);

// Takes the adapter off the switch and out of the port group's teaming policy.
bool RemoveManagementUplink(Nodeplane::Network::NetworkInterface& nic, const std::string& name);
// Takes the adapter off whatever switch it is on, and adds it to this one and to the policy.
bool AddManagementUplink(Nodeplane::Network::NetworkInterface& nic, const std::string& name);
bool RemoveUplinkFromPolicy(const std::string& name, Nodeplane::Network::PortGroup& group);
bool AddUplinkToPolicy(const std::string& name, Nodeplane::Network::PortGroup& group);

// Adds the adapter at the end of the policy's order, unless it is there already, and raises the
// maximum of active uplinks by one where it is set. Gives whether the policy changed.
bool AppendUplink(const std::string& name, Nodeplane::Network::NicTeamingPolicy& policy);

// Takes the adapter off its standard switch and off its distributed switch, if it is on any. Throws
// NodeplaneException when the switches cannot be read.
void DetachUplink(const std::string& name);

}  // namespace Tarnel
