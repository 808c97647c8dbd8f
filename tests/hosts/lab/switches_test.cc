// Standard and distributed switches of the lab host, and what an interface is attached to.

#include "hostapi/coreplane/network_info.h"
#include "hostapi/coreplane/switch_info.h"
#include "tests/hosts/lab/lab_test.h"

namespace {

using Coreplane::Network::LatticePortImpl;
using Coreplane::Network::NetworkInfoImpl;
using Coreplane::Network::PortGroupImpl;
using Coreplane::Network::PortsetImpl;
using Coreplane::Network::VirtualSwitchInfoImpl;
using Nodeplane::Network::ConnectionPoint;
using Nodeplane::Network::LatticePort;
using Nodeplane::Network::LatticePortParam;
using Nodeplane::Network::LatticeSwitch;
using Nodeplane::Network::NicTeamingPolicy;
using Nodeplane::Network::PortGroup;
using Nodeplane::Network::VirtualSwitch;

class SwitchesTest : public LabTest {};

std::string StateAt(const std::string& pointer) {
  return Lab::ReadState()->at(Lab::Json::json_pointer(pointer)).dump();
}

std::unique_ptr<ConnectionPoint> Point() {
  return NetworkInfoImpl().GetManagementInterface()->GetConnectionPoint();
}

std::unique_ptr<VirtualSwitch> First() {
  return std::move(VirtualSwitchInfoImpl().GetVirtualSwitches().at(0));
}

std::unique_ptr<LatticeSwitch> Lattice() {
  return std::move(VirtualSwitchInfoImpl().GetLatticeSwitches().at(0));
}

PortGroup& AsPortGroup(const std::unique_ptr<ConnectionPoint>& point) {
  return dynamic_cast<PortGroup&>(*point);
}

LatticePort& AsLatticePort(const std::unique_ptr<ConnectionPoint>& point) {
  return dynamic_cast<LatticePort&>(*point);
}

TEST_F(SwitchesTest, AnAdapterIsOnOneSwitchAtMost) {
  struct Row {
    void (*act)();
    const char* error;
    const char* uplinks;  // of both standard switches and the distributed one afterwards
  };
  const Row rows[] = {
      {[] { First()->AddUplink("upnic2"); }, "none", R"(["upnic0","upnic2"]["upnic1"]["upnic10"])"},
      {[] { First()->AddUplink("upnic1"); }, "VirtualSwitch::AddUplink: upnic1 is in use",
       R"(["upnic0"]["upnic1"]["upnic10"])"},
      {[] { First()->AddUplink("upnic10"); }, "VirtualSwitch::AddUplink: upnic10 is in use",
       R"(["upnic0"]["upnic1"]["upnic10"])"},
      {[] { First()->AddUplink("upnic3"); }, "VirtualSwitch::AddUplink: no adapter upnic3",
       R"(["upnic0"]["upnic1"]["upnic10"])"},
      {[] { First()->RemoveUplink("upnic0", false); }, "none", R"([]["upnic1"]["upnic10"])"},
      {[] { First()->RemoveUplink("upnic1", false); },
       "VirtualSwitch::RemoveUplink: upnic1 is not on this switch",
       R"(["upnic0"]["upnic1"]["upnic10"])"},
      {[] { Lattice()->RemoveUplink("upnic10", false); }, "none", R"(["upnic0"]["upnic1"][])"},
      {[] { Lattice()->RemoveUplink("upnic0", false); },
       "LatticeSwitch::RemoveUplink: upnic0 is not on this switch",
       R"(["upnic0"]["upnic1"]["upnic10"])"},
  };
  for (const auto& [act, error, uplinks] : rows) {
    Lab::LoadScenario("adapters");
    EXPECT_EQ(Thrown(act), error);
    EXPECT_EQ(StateAt("/network/switches/softSwitch0/uplinks") +
                  StateAt("/network/switches/softSwitch1/uplinks") +
                  StateAt("/network/lattices/50 2a 11/uplinks"),
              uplinks);
  }
}

TEST_F(SwitchesTest, NamesAreTakenOnce) {
  Lab::LoadScenario("adapters");
  EXPECT_TRUE(PortsetImpl::IsValidVirtualSwitch("softSwitch1"));
  EXPECT_FALSE(PortsetImpl::IsValidVirtualSwitch("softSwitch2"));
  // A port group of another switch counts too.
  EXPECT_TRUE(PortGroupImpl::IsValidPortGroup("Machines"));
  EXPECT_NE(Thrown([] { First()->AddPortGroup("Machines"); }), "none");
  EXPECT_NE(Thrown([] { VirtualSwitchInfoImpl().AddVirtualSwitch("softSwitch1", 8); }), "none");
  const auto fresh = VirtualSwitchInfoImpl().AddVirtualSwitch("softSwitch2", 128);
  const auto group = fresh->AddPortGroup("Management Network0");
  NetworkInfoImpl().GetManagementInterface()->SetConnectionPoint(group.get(), false);
  EXPECT_EQ(AsPortGroup(Point()).GetVirtualSwitch()->GetName(), "softSwitch2");
  EXPECT_EQ(group->GetTeamingPolicy().GetFieldMask(), 0U);
  EXPECT_TRUE(fresh->GetUplinks().empty());
}

TEST_F(SwitchesTest, APolicyIsCarriedWhole) {
  Patch(R"({"network": {"switches": {"softSwitch0": {"portGroups": {"Management Network": {
      "teaming": {"linkCriteria": {"beacon": true, "speed": true, "megabits": 1000}}}}}}}})");
  const auto point = Point();
  NicTeamingPolicy policy = AsPortGroup(point).GetTeamingPolicy();
  policy.SetUplinkOrder({"corenic1", "corenic0"});
  AsPortGroup(point).SetTeamingPolicy(policy);
  AsPortGroup(point).SetVlan(4094);
  EXPECT_EQ(Lab::ReadState()->at(Lab::Json::json_pointer(
                "/network/switches/softSwitch0/portGroups/Management Network")),
            Lab::Json::parse(R"({"vlan": 4094, "teaming": {"mask": 80, "max": 1,
      "order": ["corenic1", "corenic0"],
      "linkCriteria": {"beacon": true, "duplex": false, "speed": true, "megabits": 1000}}})"));
  EXPECT_EQ(Lab::ReadFile("/etc/halvren/lab/trace"),
            "PortGroup::SetTeamingPolicy \"Management Network\" "
            "\"mask 80 order corenic1 corenic0 max 1\"\n"
            "PortGroup::SetVlan \"Management Network\" \"4094\"\n");
}

// Every setting of a port full of them, set to another port, gives the same port.
TEST_F(SwitchesTest, APortCanTakeOverEachSetting) {
  Lab::LoadScenario("distributed-switch");
  Patch(R"({"network": {"lattices": {"50 2a 11": {"ports": {"100": {
      "blocked": true, "flowMonitoring": true, "macLearning": true, "macLimit": 64,
      "uplinkTransmitOnly": true, "resourcePool": "pool", "description": "text",
      "vlan": {"flags": [1, 2], "id": 100, "ranges": [{"first": 3, "last": 4}]},
      "teaming": {"kind": 3, "flags": [0, 1, 2, 3, 4, 5, 6, 7], "number": 9,
                  "moreFlags": [5, 4, 3, 2, 1], "active": ["a"], "standby": ["b"]},
      "security": {"promiscuous": true, "macChanges": false, "forgedTransmits": true},
      "shapingInbound": {"enabled": true, "average": 1, "peak": 2, "burst": 3},
      "shapingOutbound": {"enabled": false, "average": 4, "peak": 5, "burst": 6},
      "properties": {"a": "b"}, "vendorProperties": {"c": "d"}, "filterAgents": ["e"],
      "filters": [{"name": "f", "parameters": ["g"]}]}}}}}})");
  const auto point = Point();
  const LatticePort& from = AsLatticePort(point);
  const auto to = LatticePortImpl::CreateLatticePort({from.GetSwitchId(), "new", 1, {}}, "new");
  to->SetVlan(from.GetVlan());
  to->SetBlocked(from.GetBlocked());
  to->SetFlowMonitoring(from.GetFlowMonitoring());
  to->SetTeaming(from.GetTeaming());
  to->SetMacLearning(from.GetMacLearning());
  to->SetMacLimit(from.GetMacLimit());
  to->SetUplinkTransmitOnly(from.GetUplinkTransmitOnly());
  to->SetSecurity(from.GetSecurity());
  for (const int direction : {LatticePort::INBOUND, LatticePort::OUTBOUND}) {
    to->SetShaping(direction, from.GetShaping(direction));
  }
  to->SetResourcePool(from.GetResourcePool());
  to->SetProperties(16, from.GetProperties(16));
  to->SetVendorProperties(16, from.GetVendorProperties(16));
  to->SetFilterAgents(from.GetFilterAgents());
  to->SetFilters(from.GetFilters());
  to->SetDescription(from.GetDescription());
  Lab::Json ports = Lab::ReadState()->at("network").at("lattices").at("50 2a 11").at("ports");
  ports["100"].merge_patch({{"name", "new"}, {"kind", 1}});
  EXPECT_EQ(ports["new"], ports["100"]);
  to->Destroy();
  EXPECT_EQ(Lattice()->GetPort("new"), nullptr);
  EXPECT_NE(Thrown([&] { to->GetBlocked(); }), "none");
}

TEST_F(SwitchesTest, ADistributedSwitchTellsItsUplinksAndOrigin) {
  Lab::LoadScenario("distributed-switch");
  std::string text;
  for (const auto& [adapter, param] : Lattice()->GetUplinkPorts()) {
    text += adapter + ": " + Lattice()->GetPort(param.portKey)->GetName() + ", ";
  }
  EXPECT_EQ(text, "corenic0: Uplink 1, corenic1: Uplink 2, ");
  EXPECT_TRUE(Lattice()->IsNativeSwitch());
  EXPECT_EQ(Point()->GetPortset()->GetUplinks().size(), 2U);
  Lab::LoadScenario("foreign-switch");
  EXPECT_FALSE(AsLatticePort(Point()).GetLatticeSwitch()->IsNativeSwitch());
}

// Type and class of the management interface's connection point.
std::string Kind() {
  const auto point = Point();
  std::string text = std::to_string(point->GetConnecteeType());
  if (const auto* group = dynamic_cast<PortGroup*>(point.get())) {
    text += group->GetVirtualSwitch() == nullptr ? " group without switch" : " group";
  }
  if (const auto* port = dynamic_cast<LatticePort*>(point.get())) {
    text += port->GetLatticeSwitch() == nullptr ? " port without switch" : " port";
  }
  return text;
}

TEST_F(SwitchesTest, AConnectionPointIsWhatTheStateSays) {
  struct Row {
    const char* scenario;
    const char* fault;
    const char* kind;
  };
  const Row rows[] = {
      {"static", "{}", "1 group"},
      {"distributed-switch", "{}", "2 port"},
      {"opaque-network", "{}", "3"},
      {"no-connection", "{}", "0"},
      {"static",
       R"({"operation": "NetworkInterface::GetConnectionPoint", "returns": "otherClass"})", "1"},
      {"distributed-switch",
       R"({"operation": "NetworkInterface::GetConnectionPoint", "returns": "otherClass"})", "2"},
      {"static", R"({"operation": "PortGroup::GetVirtualSwitch", "returns": null})",
       "1 group without switch"},
      {"distributed-switch", R"({"operation": "LatticePort::GetLatticeSwitch", "returns": null})",
       "2 port without switch"},
      {"static", R"({"operation": "ConnectionPoint::GetConnecteeType", "returns": 7})", "7 group"},
  };
  for (const auto& [scenario, fault, kind] : rows) {
    Lab::LoadScenario(scenario);
    if (fault != std::string("{}")) Patch(std::string(R"({"faults": [)") + fault + "]}");
    EXPECT_EQ(Kind(), kind) << scenario << fault;
  }
}

TEST_F(SwitchesTest, AFailedMakingGivesNothingAndLeavesNothing) {
  Patch(R"({"faults": [{"operation": "VirtualSwitchInfoImpl::AddVirtualSwitch",
                        "message": "told", "times": 1},
                       {"operation": "VirtualSwitchInfoImpl::AddVirtualSwitch",
                        "message": "late", "when": "after", "times": 1}]})");
  const auto add = [] { VirtualSwitchInfoImpl().AddVirtualSwitch("softSwitch9", 8); };
  EXPECT_EQ(Thrown(add), "told");
  EXPECT_FALSE(PortsetImpl::IsValidVirtualSwitch("softSwitch9"));
  EXPECT_EQ(Thrown(add), "late");
  EXPECT_TRUE(PortsetImpl::IsValidVirtualSwitch("softSwitch9"));
}

}  // namespace
