#pragma once

#include <memory>
#include <string>

#include "hostapi/coreplane/switch_info.h"
#include "hosts/lab/state/host_state.h"

// Distributed switches in the state, by their identifiers at /network/lattices:
//   {name, native, uplinks[], uplinkPorts{ADAPTER: KEY}, ports{KEY: {...}}}
namespace Lab {

// Null when there is no such switch.
std::unique_ptr<Nodeplane::Network::LatticeSwitch> MakeLatticeSwitch(const Json& state,
                                                                     const std::string& id);
std::unique_ptr<Coreplane::Network::LatticePortImpl> MakeLatticePort(const std::string& switchId,
                                                                     const std::string& key);

}  // namespace Lab
