#include "hosts/lab/libraries/coreplane/lattice.h"

#include <utility>

#include "hosts/lab/libraries/coreplane/connection_point.h"
#include "hosts/lab/libraries/coreplane/lattice_records.h"
#include "hosts/lab/libraries/coreplane/teaming.h"
#include "hosts/lab/libraries/coreplane/virtual_switch.h"

namespace {

using Coreplane::Network::LatticePortImpl;
using Lab::Json;
using Lab::PerformChange;
using Lab::PerformRead;
using Nodeplane::Network::LatticeFilter;
using Nodeplane::Network::LatticePort;
using Nodeplane::Network::LatticePortParam;
using Nodeplane::Network::LatticeSecurity;
using Nodeplane::Network::LatticeShaping;
using Nodeplane::Network::LatticeSwitch;
using Nodeplane::Network::LatticeTeaming;
using Nodeplane::Network::LatticeVlan;
using Nodeplane::Network::Portset;
using Properties = std::map<std::string, std::string>;

bool HasSwitch(const Json& state, const std::string& id) {
  return state.at("network").value("lattices", Json::object()).contains(id);
}

// State is the state or the state to change; so is the node that is found.
template <class State>
State& SwitchNode(State& state, const std::string& id) {
  if (!HasSwitch(state, id)) throw Lab::StateError("no switch " + id);
  return state.at("network").at("lattices").at(id);
}

template <class State>
State& PortNode(State& state, const std::string& id, const std::string& key) {
  State& node = SwitchNode(state, id);
  if (!node.contains("ports") || !node.at("ports").contains(key)) {
    throw Lab::StateError("no port " + key);
  }
  return node.at("ports").at(key);
}

LatticePortParam DescribePort(const Json& node, const std::string& id, const std::string& key) {
  LatticePortParam param{id, key, 0, {}};
  const Json& ports = node.at("ports");
  if (ports.contains(key)) {
    param.kind = static_cast<int32_t>(Lab::Number(ports.at(key), "/kind", 0));
    Lab::FromNode(ports.at(key).value("vlan", Json::object()), param.vlan);
  }
  return param;
}

class LabLatticeSwitch : public LatticeSwitch {
 public:
  LabLatticeSwitch(std::string id, std::string name) : _id(std::move(id)), _name(std::move(name)) {}

  std::string GetName() const override {
    return PerformRead<std::string>({"LatticeSwitch::GetName", _name},
                                    [this](const Json&) { return _name; });
  }

  std::vector<std::string> GetUplinks() const override {
    return PerformRead<std::vector<std::string>>(
        {"Portset::GetUplinks", _name}, [this](const Json& state) {
          return Lab::Texts(Lab::List(SwitchNode(state, _id), "/uplinks"));
        });
  }

  void RemoveUplink(const std::string& adapter, bool force) override {
    PerformChange({"LatticeSwitch::RemoveUplink", _name, {adapter, force ? "true" : "false"}},
                  [&](Json& state) {
                    Json& node = SwitchNode(state, _id);
                    Lab::RemoveUplink(node, adapter);
                    if (node.contains("uplinkPorts")) node["uplinkPorts"].erase(adapter);
                  });
  }

  bool IsNativeSwitch() const override {
    return PerformRead<bool>({"LatticeSwitch::IsNativeSwitch", _name}, [this](const Json& state) {
      return Lab::Flag(SwitchNode(state, _id), "/native");
    });
  }

  std::map<std::string, LatticePortParam> GetUplinkPorts() const override {
    using Result = std::map<std::string, LatticePortParam>;
    return PerformRead<Result>({"LatticeSwitch::GetUplinkPorts", _name}, [this](const Json& state) {
      const Json& node = SwitchNode(state, _id);
      Result ports;
      for (const auto& [adapter, key] : Lab::Object(node, "/uplinkPorts").items()) {
        ports[adapter] = DescribePort(node, _id, Lab::Text(key, ""));
      }
      return ports;
    });
  }

  std::unique_ptr<LatticePort> GetPort(const std::string& key) const override {
    using Result = std::unique_ptr<LatticePort>;
    return PerformRead<Result>({"LatticeSwitch::GetPort", _name, {key}},
                               [&](const Json& state) -> Result {
                                 if (!Lab::Object(SwitchNode(state, _id), "/ports").contains(key))
                                   return nullptr;
                                 return Lab::MakeLatticePort(_id, key);
                               });
  }

 private:
  std::string _id;
  std::string _name;
};

// Which of the two nodes a port has for traffic in this direction.
const char* ShapingField(int direction) {
  switch (direction) {
    case LatticePort::OUTBOUND:
      return "shapingOutbound";
    case LatticePort::INBOUND:
      return "shapingInbound";
    default:
      throw Nodeplane::Lib::NodeplaneException("no such direction");
  }
}

// A map of one kind of settings; a port has no others.
const char* SettingsField(int kind, const char* field) {
  if (kind == LatticePort::PORT_SETTINGS) return field;
  throw Nodeplane::Lib::NodeplaneException("no such kind of settings");
}

class LabLatticePort : public LatticePortImpl, public Lab::Attachable {
 public:
  LabLatticePort(std::string switchId, std::string key)
      : _switchId(std::move(switchId)), _key(std::move(key)) {}

  int GetConnecteeType() const override {
    return PerformRead<int>({"ConnectionPoint::GetConnecteeType", _key},
                            [](const Json&) { return CONNECTEE_LATTICE_PORT; });
  }

  std::unique_ptr<Portset> GetPortset() const override {
    return PerformRead<std::unique_ptr<Portset>>(
        {"ConnectionPoint::GetPortset", _key}, [this](const Json& state) {
          if (!HasSwitch(state, _switchId)) throw Lab::StateError("no switch " + _switchId);
          return Lab::MakeLatticeSwitch(state, _switchId);
        });
  }

  std::unique_ptr<LatticeSwitch> GetLatticeSwitch() const override {
    return PerformRead<std::unique_ptr<LatticeSwitch>>(
        {"LatticePort::GetLatticeSwitch", _key},
        [this](const Json& state) { return Lab::MakeLatticeSwitch(state, _switchId); });
  }

  std::string GetSwitchId() const override {
    return PerformRead<std::string>({"LatticePort::GetSwitchId", _key},
                                    [this](const Json&) { return _switchId; });
  }
  std::string GetKey() const override {
    return PerformRead<std::string>({"LatticePort::GetKey", _key},
                                    [this](const Json&) { return _key; });
  }
  std::string GetName() const override { return Read<std::string>("LatticePort::GetName", "name"); }

  LatticeVlan GetVlan() const override { return Read<LatticeVlan>("LatticePort::GetVlan", "vlan"); }
  void SetVlan(const LatticeVlan& vlan) override { Write("LatticePort::SetVlan", "vlan", vlan); }

  bool GetBlocked() const override { return Read<bool>("LatticePort::GetBlocked", "blocked"); }
  void SetBlocked(bool blocked) override { Write("LatticePort::SetBlocked", "blocked", blocked); }

  bool GetFlowMonitoring() const override {
    return Read<bool>("LatticePort::GetFlowMonitoring", "flowMonitoring");
  }
  void SetFlowMonitoring(bool monitoring) override {
    Write("LatticePort::SetFlowMonitoring", "flowMonitoring", monitoring);
  }

  LatticeTeaming GetTeaming() const override {
    return Read<LatticeTeaming>("LatticePort::GetTeaming", "teaming");
  }
  void SetTeaming(const LatticeTeaming& teaming) override {
    Write("LatticePort::SetTeaming", "teaming", teaming);
  }

  bool GetMacLearning() const override {
    return Read<bool>("LatticePort::GetMacLearning", "macLearning");
  }
  void SetMacLearning(bool learning) override {
    Write("LatticePort::SetMacLearning", "macLearning", learning);
  }

  int32_t GetMacLimit() const override {
    return Read<int32_t>("LatticePort::GetMacLimit", "macLimit");
  }
  void SetMacLimit(int32_t limit) override { Write("LatticePort::SetMacLimit", "macLimit", limit); }

  bool GetUplinkTransmitOnly() const override {
    return Read<bool>("LatticePort::GetUplinkTransmitOnly", "uplinkTransmitOnly");
  }
  void SetUplinkTransmitOnly(bool transmitOnly) override {
    Write("LatticePort::SetUplinkTransmitOnly", "uplinkTransmitOnly", transmitOnly);
  }

  LatticeSecurity GetSecurity() const override {
    return Read<LatticeSecurity>("LatticePort::GetSecurity", "security");
  }
  void SetSecurity(const LatticeSecurity& security) override {
    Write("LatticePort::SetSecurity", "security", security);
  }

  LatticeShaping GetShaping(int direction) const override {
    return Read<LatticeShaping>("LatticePort::GetShaping", ShapingField(direction),
                                {std::to_string(direction)});
  }
  void SetShaping(int direction, const LatticeShaping& shaping) override {
    Write("LatticePort::SetShaping", ShapingField(direction), shaping, {std::to_string(direction)});
  }

  std::string GetResourcePool() const override {
    return Read<std::string>("LatticePort::GetResourcePool", "resourcePool");
  }
  void SetResourcePool(const std::string& pool) override {
    Write("LatticePort::SetResourcePool", "resourcePool", pool);
  }

  Properties GetProperties(int kind) const override {
    return Read<Properties>("LatticePort::GetProperties", SettingsField(kind, "properties"),
                            {std::to_string(kind)});
  }
  void SetProperties(int kind, const Properties& properties) override {
    Write("LatticePort::SetProperties", SettingsField(kind, "properties"), properties,
          {std::to_string(kind)});
  }

  Properties GetVendorProperties(int kind) const override {
    return Read<Properties>("LatticePort::GetVendorProperties",
                            SettingsField(kind, "vendorProperties"), {std::to_string(kind)});
  }
  void SetVendorProperties(int kind, const Properties& properties) override {
    Write("LatticePort::SetVendorProperties", SettingsField(kind, "vendorProperties"), properties,
          {std::to_string(kind)});
  }

  std::vector<std::string> GetFilterAgents() const override {
    return Read<std::vector<std::string>>("LatticePort::GetFilterAgents", "filterAgents");
  }
  void SetFilterAgents(const std::vector<std::string>& agents) override {
    Write("LatticePort::SetFilterAgents", "filterAgents", agents);
  }

  std::vector<LatticeFilter> GetFilters() const override {
    return Read<std::vector<LatticeFilter>>("LatticePort::GetFilters", "filters");
  }
  void SetFilters(const std::vector<LatticeFilter>& filters) override {
    Write("LatticePort::SetFilters", "filters", filters);
  }

  std::string GetDescription() const override {
    return Read<std::string>("LatticePort::GetDescription", "description");
  }
  void SetDescription(const std::string& description) override {
    Write("LatticePort::SetDescription", "description", description);
  }

  void Destroy() override {
    PerformChange({"LatticePortImpl::Destroy", _key}, [this](Json& state) {
      static_cast<void>(PortNode(state, _switchId, _key));
      SwitchNode(state, _switchId)["ports"].erase(_key);
    });
  }

  Json Connection() const override {
    return {{"type", CONNECTEE_LATTICE_PORT}, {"lattice", _switchId}, {"port", _key}};
  }

 private:
  // The port's setting of this name, a fresh value where it has none.
  template <class T>
  T Read(const char* operation, const char* field, std::vector<std::string> arguments = {}) const {
    return PerformRead<T>({operation, _key, std::move(arguments)}, [&](const Json& state) {
      const Json& node = PortNode(state, _switchId, _key);
      T value{};
      if (node.contains(field)) Lab::FromNode(node.at(field), value);
      return value;
    });
  }

  template <class T>
  void Write(const char* operation, const char* field, const T& value,
             std::vector<std::string> arguments = {}) {
    const Json node = Lab::ToNode(value);
    arguments.push_back(Lab::DescribeNode(node));
    PerformChange({operation, _key, std::move(arguments)},
                  [&](Json& state) { PortNode(state, _switchId, _key)[field] = node; });
  }

  std::string _switchId;
  std::string _key;
};

}  // namespace

namespace Lab {

std::unique_ptr<LatticeSwitch> MakeLatticeSwitch(const Json& state, const std::string& id) {
  if (!HasSwitch(state, id)) return nullptr;
  return std::make_unique<LabLatticeSwitch>(id, Text(SwitchNode(state, id), "/name"));
}

std::unique_ptr<LatticePortImpl> MakeLatticePort(const std::string& switchId,
                                                 const std::string& key) {
  return std::make_unique<LabLatticePort>(switchId, key);
}

}  // namespace Lab

namespace Coreplane::Network {

LatticePortImpl::~LatticePortImpl() = default;

std::unique_ptr<LatticePortImpl> LatticePortImpl::CreateLatticePort(const LatticePortParam& param,
                                                                    const std::string& key) {
  return PerformChange<std::unique_ptr<LatticePortImpl>>(
      {"LatticePortImpl::CreateLatticePort",
       key,
       {param.switchId, "kind " + std::to_string(param.kind),
        "vlan " + std::to_string(param.vlan.vlanId)}},
      [&](Json& state) {
        Json& ports = SwitchNode(state, param.switchId)["ports"];
        if (ports.contains(key)) throw Lab::StateError(key + " is taken");
        ports[key] = {{"name", key}, {"kind", param.kind}, {"vlan", Lab::ToNode(param.vlan)}};
        return Lab::MakeLatticePort(param.switchId, key);
      });
}

}  // namespace Coreplane::Network
