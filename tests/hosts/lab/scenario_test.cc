#include <sys/stat.h>

#include <filesystem>

#include "hosts/lab/state/default_host.h"
#include "hosts/lab/state/faults.h"
#include "hosts/lab/state/trace.h"
#include "tests/hosts/lab/lab_test.h"

namespace {

using Lab::Json;
using Machine::Origin;

class ScenarioTest : public LabTest {};

void Write(const std::string& name, const std::string& text) {
  Lab::ReplaceFile("/tmp/" + name + ".json", text);
}

TEST_F(ScenarioTest, IsMergedOverWhatItNames) {
  Write("low", R"({"description": "x", "a": {"b": 1, "c": 2}, "list": [1, 2]})");
  Write("high", R"({"over": "low", "a": {"b": null, "d": 3}, "list": [9]})");
  EXPECT_EQ(
      Lab::MergeScenario(Json{{"a", {{"z", 0}}}}, "high", "/tmp"),
      Json::parse(R"({"a": {"c": 2, "d": 3, "z": 0}, "list": [9], "scenarios": ["low", "high"]})"));
}

TEST_F(ScenarioTest, AnUnusableOneSaysWhy) {
  Write("broken", "{\"a\": 1,}");
  Write("list", "[]");
  Write("loop", R"({"over": "loop"})");
  for (const std::string error :
       {"absent.json: No such file or directory", "broken.json: not JSON at byte 9",
        "list.json: not an object", "loop.json: stands over itself"}) {
    const std::string name = error.substr(0, error.find('.'));
    EXPECT_EQ(Thrown([&] { Lab::MergeScenario(Json::object(), name, "/tmp"); }),
              "state: /tmp/" + error);
  }
}

TEST_F(ScenarioTest, ANewOneStartsAfreshWithItsFiles) {
  Patch(R"({"host": {"welcomeMessage": "old"}, "faults": [{"operation": "o", "times": 1}]})");
  Lab::TakeFault(*Lab::ReadState(), {"o"});
  Lab::TraceLine("old");
  Lab::ReplaceFile("/tmp/gone", "x");
  Write("files", R"({"files": {"/tmp/made/here": {"content": {"bytes": "00ff"}, "mode": "0600"},
                               "/tmp/gone": {"absent": true}, "/tmp/absent": {"absent": true}}})");
  Lab::LoadScenarios({"dhcp", "audit", "/tmp/files.json"});
  const auto state = Lab::ReadState();
  EXPECT_EQ(Lab::Text(*state, "/host/welcomeMessage"), "");
  EXPECT_FALSE(state->contains("faults"));
  EXPECT_TRUE(Lab::Flag(*state, "/host/auditMode"));
  EXPECT_EQ(Lab::ReadFile("/etc/halvren/lab/trace"), "");
  EXPECT_EQ(Lab::ReadFile("/etc/hosts"),
            "127.0.0.1\tlocalhost\n::1\tlocalhost\n192.0.2.77\track7.example.com rack7\n");
  struct stat status {};
  ASSERT_EQ(stat("/tmp/made/here", &status), 0);
  EXPECT_EQ(status.st_mode & 07777, 0600U);
  EXPECT_EQ(Lab::ReadFile("/tmp/made/here"), std::string("\0\xff", 2));
  EXPECT_FALSE(std::filesystem::exists("/tmp/gone"));
}

TEST(DefaultHostTest, ShowsTheMachine) {
  Machine::Facts facts;
  facts.memory = {8192, 4096};
  facts.firmware.vendor = "Ven\xff";
  facts.management.name = "eth0";
  facts.management.ipv4 = {"192.0.2.9", "255.255.255.0", Origin::DHCP};
  facts.management.ipv6 = {{"2001:db8::1", 128, false, Origin::DHCP},
                           {"2001:db8::2", 64, false, Origin::STATIC},
                           {"fe80::1", 64, true, Origin::AUTOCONF}};
  facts.resolver.nameServers = {"192.0.2.53", "2001:db8::53"};
  const Json nodes = Json::parse(R"({
    "/hardware/memory/pages": 2, "/hardware/firmware/vendor": {"bytes": "56656eff"},
    "/hardware/cpu/model": "Generic Processor", "/network/pnics": [],
    "/network/kernelNics/core0/stored": {
      "dhcp": true, "none": false, "dhcpDns": true, "ipv6Dhcp": true, "routerAdvertised": false,
      "ipv6": [{"address": "2001:db8::2/64", "type": 0, "scope": 3}]},
    "/network/kernelNics/core0/running": {
      "address": "192.0.2.9", "netmask": "255.255.255.0",
      "ipv6": [{"address": "2001:db8::1/128", "type": 9, "scope": 3},
               {"address": "2001:db8::2/64", "type": 0, "scope": 3},
               {"address": "fe80::1/64", "type": 7, "scope": 1}]},
    "/network/stacks/defaultTcpipStack/running/dns4": ["192.0.2.53"],
    "/network/stacks/defaultTcpipStack/running/dns6": ["2001:db8::53"]
  })");
  for (const auto& [pointer, value] : nodes.items()) {
    EXPECT_EQ(Lab::DefaultHost(facts).at(Json::json_pointer(pointer)), value) << pointer;
  }
}

TEST(DefaultHostTest, OfAMachineThatSaysNothingHasNoManagement) {
  Machine::Facts nothing;
  nothing.memory.pageSize = 0;
  const Json network = Lab::DefaultHost(nothing).at("network");
  EXPECT_FALSE(network.contains("management"));
  EXPECT_EQ(network.at("kernelNics"), Json::object());
}

}  // namespace
