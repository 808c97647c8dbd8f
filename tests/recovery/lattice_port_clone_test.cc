#include "console/recovery/lattice_port_clone.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <utility>

#include "console/hostops/command_runner.h"
#include "hostapi/nodeplane/exception.h"
#include "tests/support/lab.h"

namespace Tarnel {

namespace {

using Nodeplane::Network::LatticePort;
using Nodeplane::Network::LatticePortParam;
using Testing::TraceLines;
using Lines = std::vector<std::string>;

constexpr char SCENARIO[] = "lattice-repair";

TEST(HostLocalKey, ChangesOnlyItsNumber) {
  const std::pair<const char*, const char*> rows[] = {
      {"100", "hlp-100#7"},
      {"", "hlp-#7"},
      {"hlp-100", "hlp-hlp-100#7"},
      {"xhlp-100#5", "hlp-xhlp-100#5#7"},
      {"HLP-100#5", "hlp-HLP-100#5#7"},
      {"hlp-100#5x", "hlp-hlp-100#5x#7"},
      {"hlp-100#99999", "hlp-100#7"},
      {"hlp-#5", "hlp-#7"},
      {"hlp-100#", "hlp-100#7"},
      {"hlp-1#2#3", "hlp-1#2#7"},
  };
  for (const auto& [oldKey, newKey] : rows) {
    EXPECT_EQ(MakeHostLocalKey(oldKey, "#7"), newKey) << oldKey;
  }
}

TEST(HostLocalKey, GetsANumberBelow100000) {
  const std::string suffix = DrawKeySuffix();
  EXPECT_TRUE(suffix.size() >= 2 && suffix.size() <= 6) << suffix;
  EXPECT_EQ(suffix[0], '#');
  EXPECT_EQ(suffix.find_first_not_of("0123456789", 1), std::string::npos) << suffix;
}

// Moves the management interface to a new port of the key "new"; gives the text of the exception.
std::string Move(const std::string& vlan, const LatticePortChoice& choice) {
  const auto point = LookupManagementInterface()->GetConnectionPoint();
  LatticePortParam param;
  param.switchId = "50 2a 11";
  param.portKey = "new";
  param.kind = LatticePortParam::HOST_LOCAL;
  param.vlan.vlanId = ParseVlanId(vlan);
  try {
    MoveManagementToNewPort(dynamic_cast<const LatticePort&>(*point), param, choice);
  } catch (const Nodeplane::Lib::NodeplaneException& error) {
    return error.what();
  }
  return "";
}

TEST(NewPort, TakesAVlanOfTheRange) {
  const std::pair<const char*, const char*> rows[] = {
      {"", "0"},          {"0", "0"},
      {"0042", "42"},     {"4094", "4094"},
      {"4095", nullptr},  {"65535", nullptr},
      {"65536", "0"},     {"69630", "4094"},
      {"69631", nullptr}, {"99999999999999999999", nullptr},
  };
  for (const auto& [text, vlan] : rows) {
    SCOPED_TRACE(text);
    Testing::LoadScenario(SCENARIO);
    EXPECT_EQ(Move(text, {}),
              vlan != nullptr ? "" : "Invalid LatticePort vlan specified. Valid range is 0-4094.");
    const Lines trace = TraceLines();
    ASSERT_EQ(trace.empty(), vlan == nullptr);
    if (vlan != nullptr) {
      EXPECT_EQ(trace[0], "LatticePortImpl::CreateLatticePort new \"50 2a 11\" \"kind 1\" \"vlan " +
                              std::string(vlan) + "\"");
    }
  }
}

const LatticePortChoice CHOICE = {true, {"Uplink 2", "Uplink 1"}};

const Lines WHOLE_MOVE = {
    R"(LatticePortImpl::CreateLatticePort new "50 2a 11" "kind 1" "vlan 42")",
    R"(LatticePort::SetBlocked new "true")",
    R"(LatticePort::SetFlowMonitoring new "true")",
    R"(LatticePort::SetTeaming new "{active:[],flags:[1,0,0,0,0,0,0,0],kind:1,)"
    R"(moreFlags:[0,0,0,0,1],number:5,standby:[Uplink 1]}")",
    R"(LatticePort::SetMacLearning new "true")",
    R"(LatticePort::SetMacLimit new "64")",
    R"(LatticePort::SetUplinkTransmitOnly new "true")",
    R"(LatticePort::SetSecurity new "{forgedTransmits:true,macChanges:false,promiscuous:true}")",
    R"(LatticePort::SetShaping new "1" "{average:1000,burst:3000,enabled:true,peak:2000}")",
    R"(LatticePort::SetShaping new "0" "{average:4000,burst:6000,enabled:true,peak:5000}")",
    R"(LatticePort::SetResourcePool new "pool-7")",
    R"(LatticePort::SetProperties new "16" "{rack:7}")",
    R"(LatticePort::SetVendorProperties new "16" "{slot:3}")",
    R"(LatticePort::SetFilterAgents new "[agent-1]")",
    R"(LatticePort::SetFilters new "[{name:filter-1,parameters:[a,b]}]")",
    R"(LatticePort::SetDescription new "Way to Fleetkeep")",
    R"(LatticePort::SetVlan new "{flags:[0,0],id:42,ranges:[]}")",
    R"(LatticePort::SetBlocked new "false")",
    R"(LatticePort::SetTeaming new "{active:[Uplink 2,Uplink 1],flags:[0,1,0,0,0,0,0,0],kind:3,)"
    R"(moreFlags:[0,1,0,1,1],number:0,standby:[]}")",
    R"(NetworkInterface::SetConnectionPoint core0 "lattice port new" "false")",
};
constexpr size_t UNBLOCK = 17;
constexpr char DESTROY[] = "LatticePortImpl::Destroy new";

TEST(NewPort, IsACopyWithTheOperatorsChoice) {
  Testing::LoadScenario(SCENARIO);
  EXPECT_EQ(Move("42", CHOICE), "");
  EXPECT_EQ(TraceLines(), WHOLE_MOVE);
  Testing::LoadScenario(SCENARIO);
  EXPECT_EQ(Move("42", {false, CHOICE.uplinks}), "");
  Lines blocked = WHOLE_MOVE;
  blocked.erase(blocked.begin() + UNBLOCK);
  EXPECT_EQ(TraceLines(), blocked);
}

void LoadWithFaults(const std::string& faults) {
  Testing::LoadScenario(SCENARIO, R"({"faults": [)" + faults + "]}");
}

std::string FaultOf(const std::string& operation, long call) {
  return R"({"operation": ")" + operation + R"(", "message": "told", "fromCall": )" +
         std::to_string(call) + ", \"times\": 1}";
}

TEST(NewPort, IsGoneAfterAFailureOfAnyStep) {
  for (size_t step = 0; step < WHOLE_MOVE.size(); ++step) {
    SCOPED_TRACE(WHOLE_MOVE[step]);
    const std::string operation = WHOLE_MOVE[step].substr(0, WHOLE_MOVE[step].find(' '));
    Lines expected(WHOLE_MOVE.begin(), WHOLE_MOVE.begin() + static_cast<long>(step) + 1);
    LoadWithFaults(FaultOf(
        operation, std::count_if(expected.begin(), expected.end(), [&](const std::string& line) {
          return line.starts_with(operation + " ");
        })));
    EXPECT_EQ(Move("42", CHOICE), "told");
    if (step > 0) {
      expected.emplace_back(DESTROY);
    }
    EXPECT_EQ(TraceLines(), expected);
  }
}

TEST(NewPort, IsGoneWithoutAManagementInterface) {
  LoadWithFaults(
      R"({"operation": "NetworkInfoImpl::GetManagementInterface", "returns": null, "fromCall": 2})");
  EXPECT_EQ(Move("42", CHOICE), "Could not find the management network");
  EXPECT_EQ(TraceLines().back(), DESTROY);
}

// What a port that cannot be removed says is not what the operator hears.
TEST(NewPort, KeepsTheFirstFailure) {
  LoadWithFaults(FaultOf("LatticePort::GetFilters", 1) +
                 R"(, {"operation": "LatticePortImpl::Destroy", "message": "stays"})");
  EXPECT_EQ(Move("42", CHOICE), "told");
  EXPECT_EQ(TraceLines().back(), DESTROY);
}

}  // namespace

}  // namespace Tarnel
