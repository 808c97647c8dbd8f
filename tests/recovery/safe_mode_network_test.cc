#include "console/recovery/safe_mode_network.h"

#include <gtest/gtest.h>

#include <tuple>

#include "tests/support/lab.h"

namespace Tarnel {

namespace {

using Nodeplane::Network::NicTeamingPolicy;
using Testing::Log;
using Testing::Logged;
using Testing::TraceLines;
using Lines = std::vector<std::string>;

const Lines WHOLE_MOVE = {
    R"(VirtualSwitchInfoImpl::AddVirtualSwitch "softSwitch1" "128")",
    R"(VirtualSwitch::AddPortGroup softSwitch1 "Management Network0")",
    R"(NetworkInterface::Disable core0)",
    R"(NetworkInterface::Disable core1)",
    R"(NetworkInterface::SetConnectionPoint core0 "port group Management Network0" "false")",
    R"(VirtualSwitch::RemoveUplink softSwitch0 "corenic0" "false")",
    R"(VirtualSwitch::RemoveUplink softSwitch1 "corenic0" "false")",
    R"(LatticeSwitch::RemoveUplink latticeSwitch0 "corenic0" "false")",
    R"(VirtualSwitch::AddUplink softSwitch1 "corenic0")",
    R"(VirtualSwitch::SetTeamingPolicy softSwitch1 "mask 16 order corenic0 max 0")",
    R"(VirtualSwitch::RemoveUplink softSwitch0 "corenic1" "false")",
    R"(VirtualSwitch::RemoveUplink softSwitch1 "corenic1" "false")",
    R"(LatticeSwitch::RemoveUplink latticeSwitch0 "corenic1" "false")",
    R"(VirtualSwitch::AddUplink softSwitch1 "corenic1")",
    R"(VirtualSwitch::SetTeamingPolicy softSwitch1 "mask 16 order corenic0 corenic1 max 0")",
    R"(NetworkInterface::Enable core0)",
};

TEST(MoveManagement, GoesThroughItsStepsInOrder) {
  Testing::LoadScenario("lattice-repair");
  const Log log;
  MoveManagementToNewSwitch();
  EXPECT_EQ(TraceLines(), WHOLE_MOVE);
  EXPECT_EQ(Logged(log), Lines());
}

std::string OperationOf(const std::string& line) { return line.substr(0, line.find(' ')); }

struct FailedStep {
  const char* operation;
  const char* rest;  // of the fault
  const char* done;  // for each step of the whole move, X when it was tried
  const char* log;
};

constexpr char TOLD[] = R"("message": "told", "times": 1)";
constexpr char MOVE_FAILED[] = "Changing to legacy virtual switch failed: told";
constexpr char UPLINK_FAILED[] = "Moving uplink corenic0 failed: told";

// What becomes of the move when one operation of the host fails: those of the interface end it,
// those of an uplink cost only that uplink.
const FailedStep FAILED_STEPS[] = {
    {"NetworkInfoImpl::UpdateManagementInterface", TOLD, "................", MOVE_FAILED},
    {"NetworkInfoImpl::GetManagementInterface", R"("returns": null)", "................",
     "Could not find the management network"},
    {"NetworkInterface::GetConnectionPoint", TOLD, "................", MOVE_FAILED},
    {"NetworkInterface::GetConnectionPoint", R"("returns": null)", "................",
     "Changing to legacy virtual switch failed: The host gave no object"},
    {"ConnectionPoint::GetPortset", TOLD, "................", MOVE_FAILED},
    {"Portset::GetUplinks", TOLD, "................", MOVE_FAILED},
    {"PortsetImpl::IsValidVirtualSwitch", TOLD, "................", MOVE_FAILED},
    {"PortsetImpl::IsValidVirtualSwitch", R"("returns": true)", "................",
     "Changing to legacy virtual switch failed: The host says that every name is taken"},
    {"VirtualSwitchInfoImpl::AddVirtualSwitch", TOLD, "X...............", MOVE_FAILED},
    {"PortGroupImpl::IsValidPortGroup", TOLD, "X...............", MOVE_FAILED},
    {"VirtualSwitch::AddPortGroup", TOLD, "XX..............", MOVE_FAILED},
    {"CorelinNicInfoImpl::GetCorelinNics", TOLD, "XX..............", MOVE_FAILED},
    {"NetworkInterface::Disable", TOLD, "XXX.............", MOVE_FAILED},
    {"NetworkInterface::Disable", R"("message": "told", "fromCall": 2)", "XXXX............",
     MOVE_FAILED},
    {"NetworkInterface::SetConnectionPoint", TOLD, "XXXXX...........", MOVE_FAILED},
    {"VirtualSwitchInfoImpl::GetVirtualSwitches", TOLD, "XXXXX.....XXXXXX", UPLINK_FAILED},
    {"VirtualSwitchInfoImpl::GetLatticeSwitches", TOLD, "XXXXXXX...XXXXXX", UPLINK_FAILED},
    {"LatticeSwitch::RemoveUplink", TOLD, "XXXXXXXXX.XXXXXX",
     "Moving uplink corenic0 failed: VirtualSwitch::AddUplink: corenic0 is in use"},
    {"PortGroup::GetVirtualSwitch", TOLD, "XXXXXXXX..XXXXXX", UPLINK_FAILED},
    {"VirtualSwitch::GetTeamingPolicy", TOLD, "XXXXXXXX..XXXXXX", UPLINK_FAILED},
    {"VirtualSwitch::AddUplink", TOLD, "XXXXXXXXX.XXXXXX", UPLINK_FAILED},
    {"VirtualSwitch::SetTeamingPolicy", TOLD, "XXXXXXXXXXXXXXXX", UPLINK_FAILED},
    {"NetworkInterface::Enable", TOLD, "XXXXXXXXXXXXXXXX", MOVE_FAILED},
};

TEST(MoveManagement, StaysWhereAFailureLeavesIt) {
  for (const FailedStep& step : FAILED_STEPS) {
    SCOPED_TRACE(std::string(step.operation) + " " + step.rest);
    Testing::LoadScenario("lattice-repair", std::string(R"({"faults": [{"operation": ")") +
                                                step.operation + "\", " + step.rest + "}]}");
    const Log log;
    MoveManagementToNewSwitch();
    Lines expected;
    for (size_t i = 0; i < WHOLE_MOVE.size(); ++i) {
      if (step.done[i] == 'X') {
        expected.push_back(OperationOf(WHOLE_MOVE[i]));
      }
    }
    Lines tried;
    for (const std::string& line : TraceLines()) {
      tried.push_back(OperationOf(line));
    }
    EXPECT_EQ(tried, expected);
    EXPECT_EQ(Logged(log), Lines({std::string("user.err ") + step.log}));
  }
}

TEST(MoveManagement, TakesTheLowestFreeNames) {
  const std::tuple<const char*, const char*, const char*> rows[] = {
      {R"({"softSwitch0": null, "softSwitch1": {"portGroups": {"Management Network1": {}}}})",
       "softSwitch0", "Management Network0"},
      {R"({"softSwitch1": {"portGroups": {"Management Network0": {}}}})", "softSwitch2",
       "Management Network1"},
  };
  for (const auto& [switches, newSwitch, newPortGroup] : rows) {
    SCOPED_TRACE(switches);
    // Without uplinks there is little else to do.
    Testing::LoadScenario(
        "lattice-repair",
        R"({"network": {"lattices": {"50 2a 11": {"uplinks": []}}, "switches": )" +
            std::string(switches) + "}}");
    MoveManagementToNewSwitch();
    const Lines trace = TraceLines();
    ASSERT_EQ(trace.size(), 6U);
    EXPECT_EQ(trace[1], "VirtualSwitch::AddPortGroup " + std::string(newSwitch) + " \"" +
                            newPortGroup + "\"");
    EXPECT_EQ(trace[5], WHOLE_MOVE.back());
  }
}

struct PolicyCase {
  uint32_t mask;
  Lines order;
  bool changed;
  uint32_t newMask;
  Lines newOrder;
  int32_t newMaximum;
};

TEST(AddUplinkToNewPolicy, ChangesWhatThePolicyHas) {
  const PolicyCase rows[] = {
      {0x00, {}, true, 0x10, {"b"}, 2},
      // An order that is not set does not count.
      {0x00, {"a"}, true, 0x10, {"b"}, 2},
      {0x10, {"a"}, true, 0x10, {"a", "b"}, 2},
      {0x10, {"b", "a"}, false, 0x10, {"b", "a"}, 2},
      {0x40, {}, true, 0x50, {"b"}, 3},
      {0x50, {"a", "b"}, true, 0x50, {"a", "b"}, 3},
      {0x50, {"a"}, true, 0x50, {"a", "b"}, 3},
  };
  for (const PolicyCase& row : rows) {
    SCOPED_TRACE(&row - rows);
    NicTeamingPolicy policy;
    policy.SetUplinkOrder(row.order);
    policy.SetMaxActiveUplinks(2);
    policy.SetFieldMask(row.mask);
    EXPECT_EQ(AddUplinkToNewPolicy("b", policy), row.changed);
    EXPECT_EQ(policy.GetFieldMask(), row.newMask);
    EXPECT_EQ(policy.GetUplinkOrder(), row.newOrder);
    EXPECT_EQ(policy.GetMaxActiveUplinks(), row.newMaximum);
  }
  NicTeamingPolicy policy;
  policy.SetMaxActiveUplinks(INT32_MAX);
  AddUplinkToNewPolicy("b", policy);
  EXPECT_EQ(policy.GetMaxActiveUplinks(), INT32_MAX);
}

}  // namespace

}  // namespace Tarnel
