#pragma once

#include <memory>
#include <string>

#include "hostapi/nodeplane/virtual_switch.h"
#include "hosts/lab/state/host_state.h"

// Standard switches in the state, by their names at /network/switches:
//   {ports, uplinks[], teaming{}, portGroups{NAME: {vlan, teaming{}}}}
namespace Lab {

std::unique_ptr<Nodeplane::Network::VirtualSwitch> MakeVirtualSwitch(const std::string& name);
std::unique_ptr<Nodeplane::Network::PortGroup> MakePortGroup(const std::string& name);

bool HasPortGroup(const Json& state, const std::string& name);

// Takes the adapter out of the list "uplinks" of a switch of either kind; an adapter that is not
// there is an error.
void RemoveUplink(Json& node, const std::string& adapter);

}  // namespace Lab
