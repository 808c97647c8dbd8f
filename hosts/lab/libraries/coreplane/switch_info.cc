#include "hostapi/coreplane/switch_info.h"

#include "hosts/lab/libraries/coreplane/lattice.h"
#include "hosts/lab/libraries/coreplane/teaming.h"
#include "hosts/lab/libraries/coreplane/virtual_switch.h"
#include "hosts/lab/libraries/perform.h"

namespace Coreplane::Network {

using Lab::Json;
using Nodeplane::Network::LatticeSwitch;
using Nodeplane::Network::NicTeamingPolicy;
using Nodeplane::Network::VirtualSwitch;

// Everything is read from the state when it is asked for.
struct VirtualSwitchInfoImpl::Data {};

VirtualSwitchInfoImpl::VirtualSwitchInfoImpl() = default;
VirtualSwitchInfoImpl::~VirtualSwitchInfoImpl() = default;
VirtualSwitchInfoImpl::VirtualSwitchInfoImpl(VirtualSwitchInfoImpl&&) noexcept = default;
VirtualSwitchInfoImpl& VirtualSwitchInfoImpl::operator=(VirtualSwitchInfoImpl&&) noexcept = default;

std::vector<std::unique_ptr<VirtualSwitch>> VirtualSwitchInfoImpl::GetVirtualSwitches() const {
  using Switches = std::vector<std::unique_ptr<VirtualSwitch>>;
  return Lab::PerformRead<Switches>(
      {"VirtualSwitchInfoImpl::GetVirtualSwitches"}, [](const Json& state) {
        Switches switches;
        for (const auto& [name, node] : Lab::Object(state, "/network/switches").items()) {
          switches.push_back(Lab::MakeVirtualSwitch(name));
        }
        return switches;
      });
}

std::vector<std::unique_ptr<LatticeSwitch>> VirtualSwitchInfoImpl::GetLatticeSwitches() const {
  using Switches = std::vector<std::unique_ptr<LatticeSwitch>>;
  return Lab::PerformRead<Switches>(
      {"VirtualSwitchInfoImpl::GetLatticeSwitches"}, [](const Json& state) {
        Switches switches;
        for (const auto& [id, node] : Lab::Object(state, "/network/lattices").items()) {
          switches.push_back(Lab::MakeLatticeSwitch(state, id));
        }
        return switches;
      });
}

std::unique_ptr<VirtualSwitch> VirtualSwitchInfoImpl::AddVirtualSwitch(const std::string& name,
                                                                       unsigned int ports) {
  return Lab::PerformChange<std::unique_ptr<VirtualSwitch>>(
      {"VirtualSwitchInfoImpl::AddVirtualSwitch", "", {name, std::to_string(ports)}},
      [&](Json& state) {
        Json& switches = state["network"]["switches"];
        if (switches.contains(name)) throw Lab::StateError(name + " is taken");
        switches[name] = {{"ports", ports},
                          {"uplinks", Json::array()},
                          {"teaming", Lab::TeamingNode(NicTeamingPolicy())},
                          {"portGroups", Json::object()}};
        return Lab::MakeVirtualSwitch(name);
      });
}

bool PortsetImpl::IsValidVirtualSwitch(const std::string& name) {
  return Lab::PerformRead<bool>({"PortsetImpl::IsValidVirtualSwitch", name},
                                [&name](const Json& state) {
                                  return Lab::Object(state, "/network/switches").contains(name);
                                });
}

bool PortGroupImpl::IsValidPortGroup(const std::string& name) {
  return Lab::PerformRead<bool>(
      {"PortGroupImpl::IsValidPortGroup", name},
      [&name](const Json& state) { return Lab::HasPortGroup(state, name); });
}

}  // namespace Coreplane::Network
