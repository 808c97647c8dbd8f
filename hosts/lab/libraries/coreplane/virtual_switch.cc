#include "hosts/lab/libraries/coreplane/virtual_switch.h"

#include <algorithm>
#include <utility>

#include "hosts/lab/libraries/coreplane/connection_point.h"
#include "hosts/lab/libraries/coreplane/teaming.h"

namespace {

using Lab::Json;
using Lab::PerformChange;
using Lab::PerformRead;
using Nodeplane::Network::NicTeamingPolicy;
using Nodeplane::Network::PortGroup;
using Nodeplane::Network::Portset;
using Nodeplane::Network::VirtualSwitch;

// State is the state or the state to change; so is the node that is found.
template <class State>
State& SwitchNode(State& state, const std::string& name) {
  State& switches = state.at("network").at("switches");
  if (!switches.contains(name)) throw Lab::StateError("no switch " + name);
  return switches.at(name);
}

// The name of the switch that the port group is on; empty when there is none.
std::string SwitchOf(const Json& state, const std::string& portGroup) {
  for (const auto& [name, node] : Lab::Object(state, "/network/switches").items()) {
    if (node.value("portGroups", Json::object()).contains(portGroup)) return name;
  }
  return "";
}

template <class State>
State& PortGroupNode(State& state, const std::string& name) {
  const std::string owner = SwitchOf(state, name);
  if (owner.empty()) throw Lab::StateError("no port group " + name);
  return SwitchNode(state, owner).at("portGroups").at(name);
}

bool IsInUse(const Json& state, const std::string& adapter) {
  for (const char* kind : {"switches", "lattices"}) {
    for (const Json& node : state.at("network").value(kind, Json::object())) {
      const std::vector<std::string> uplinks = Lab::Texts(Lab::List(node, "/uplinks"));
      if (std::find(uplinks.begin(), uplinks.end(), adapter) != uplinks.end()) return true;
    }
  }
  return false;
}

bool Exists(const Json& state, const std::string& adapter) {
  const Json& pnics = Lab::List(state, "/network/pnics");
  return std::any_of(pnics.begin(), pnics.end(),
                     [&adapter](const Json& pnic) { return Lab::Text(pnic, "/name") == adapter; });
}

class LabVirtualSwitch : public VirtualSwitch {
 public:
  explicit LabVirtualSwitch(std::string name) : _name(std::move(name)) {}

  std::string GetName() const override {
    return PerformRead<std::string>({"VirtualSwitch::GetName", _name},
                                    [this](const Json&) { return _name; });
  }

  std::vector<std::string> GetUplinks() const override {
    return PerformRead<std::vector<std::string>>(
        {"Portset::GetUplinks", _name}, [this](const Json& state) {
          return Lab::Texts(Lab::List(SwitchNode(state, _name), "/uplinks"));
        });
  }

  void AddUplink(const std::string& adapter) override {
    PerformChange({"VirtualSwitch::AddUplink", _name, {adapter}}, [&](Json& state) {
      if (!Exists(state, adapter)) throw Lab::StateError("no adapter " + adapter);
      if (IsInUse(state, adapter)) throw Lab::StateError(adapter + " is in use");
      SwitchNode(state, _name)["uplinks"].push_back(adapter);
    });
  }

  void RemoveUplink(const std::string& adapter, bool force) override {
    PerformChange({"VirtualSwitch::RemoveUplink", _name, {adapter, force ? "true" : "false"}},
                  [&](Json& state) { Lab::RemoveUplink(SwitchNode(state, _name), adapter); });
  }

  std::unique_ptr<PortGroup> AddPortGroup(const std::string& name) override {
    return PerformChange<std::unique_ptr<PortGroup>>(
        {"VirtualSwitch::AddPortGroup", _name, {name}}, [&](Json& state) {
          if (Lab::HasPortGroup(state, name)) throw Lab::StateError(name + " is taken");
          SwitchNode(state, _name)["portGroups"][name] = {
              {"vlan", 0}, {"teaming", Lab::TeamingNode(NicTeamingPolicy())}};
          return Lab::MakePortGroup(name);
        });
  }

  NicTeamingPolicy GetTeamingPolicy() const override {
    return PerformRead<NicTeamingPolicy>(
        {"VirtualSwitch::GetTeamingPolicy", _name}, [this](const Json& state) {
          return Lab::ReadTeaming(Lab::Object(SwitchNode(state, _name), "/teaming"));
        });
  }

  void SetTeamingPolicy(const NicTeamingPolicy& policy) override {
    PerformChange(
        {"VirtualSwitch::SetTeamingPolicy", _name, {Lab::DescribeTeaming(policy)}},
        [&](Json& state) { SwitchNode(state, _name)["teaming"] = Lab::TeamingNode(policy); });
  }

 private:
  std::string _name;
};

class LabPortGroup : public PortGroup, public Lab::Attachable {
 public:
  explicit LabPortGroup(std::string name) : _name(std::move(name)) {}

  int GetConnecteeType() const override {
    return PerformRead<int>({"ConnectionPoint::GetConnecteeType", _name},
                            [](const Json&) { return CONNECTEE_PORT_GROUP; });
  }

  std::unique_ptr<Portset> GetPortset() const override {
    return PerformRead<std::unique_ptr<Portset>>(
        {"ConnectionPoint::GetPortset", _name}, [this](const Json& state) {
          const std::string owner = SwitchOf(state, _name);
          if (owner.empty()) throw Lab::StateError("no port group " + _name);
          return Lab::MakeVirtualSwitch(owner);
        });
  }

  uint16_t GetVlan() const override {
    return PerformRead<uint16_t>({"PortGroup::GetVlan", _name}, [this](const Json& state) {
      return static_cast<uint16_t>(Lab::Number(PortGroupNode(state, _name), "/vlan", 0));
    });
  }

  void SetVlan(uint16_t vlan) override {
    PerformChange({"PortGroup::SetVlan", _name, {std::to_string(vlan)}},
                  [&](Json& state) { PortGroupNode(state, _name)["vlan"] = vlan; });
  }

  NicTeamingPolicy GetTeamingPolicy() const override {
    return PerformRead<NicTeamingPolicy>(
        {"PortGroup::GetTeamingPolicy", _name}, [this](const Json& state) {
          return Lab::ReadTeaming(Lab::Object(PortGroupNode(state, _name), "/teaming"));
        });
  }

  void SetTeamingPolicy(const NicTeamingPolicy& policy) override {
    PerformChange(
        {"PortGroup::SetTeamingPolicy", _name, {Lab::DescribeTeaming(policy)}},
        [&](Json& state) { PortGroupNode(state, _name)["teaming"] = Lab::TeamingNode(policy); });
  }

  std::unique_ptr<VirtualSwitch> GetVirtualSwitch() const override {
    using Result = std::unique_ptr<VirtualSwitch>;
    return PerformRead<Result>({"PortGroup::GetVirtualSwitch", _name},
                               [this](const Json& state) -> Result {
                                 const std::string owner = SwitchOf(state, _name);
                                 return owner.empty() ? nullptr : Lab::MakeVirtualSwitch(owner);
                               });
  }

  Json Connection() const override {
    return {{"type", CONNECTEE_PORT_GROUP}, {"portGroup", _name}};
  }

 private:
  std::string _name;
};

}  // namespace

namespace Lab {

std::unique_ptr<VirtualSwitch> MakeVirtualSwitch(const std::string& name) {
  return std::make_unique<LabVirtualSwitch>(name);
}

std::unique_ptr<PortGroup> MakePortGroup(const std::string& name) {
  return std::make_unique<LabPortGroup>(name);
}

bool HasPortGroup(const Json& state, const std::string& name) {
  return !SwitchOf(state, name).empty();
}

void RemoveUplink(Json& node, const std::string& adapter) {
  Json& uplinks = node["uplinks"];
  const auto place = std::find(uplinks.begin(), uplinks.end(), adapter);
  if (place == uplinks.end()) throw StateError(adapter + " is not on this switch");
  uplinks.erase(place);
}

}  // namespace Lab
