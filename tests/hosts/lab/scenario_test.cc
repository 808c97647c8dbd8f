#include <sys/stat.h>

#include <filesystem>

#include "hosts/lab/state/default_host.h"
#include "hosts/lab/state/faults.h"
#include "hosts/lab/state/trace.h"
#include "tests/hosts/lab/lab_test.h"

namespace {

using Lab::Json;
using Machine::Origin;

constexpr char DIRECTORY[] = "/tmp/scenarios";

class ScenarioTest : public LabTest {
 protected:
  void SetUp() override {
    LabTest::SetUp();
    std::filesystem::create_directories(DIRECTORY);
  }
  static void Write(const std::string& name, const std::string& text) {
    Lab::ReplaceFile(std::string(DIRECTORY) + "/" + name + ".json", text);
  }
  static std::string ErrorOf(const std::string& scenario) {
    return Thrown<Lab::StateError>(
        [&] { Lab::MergeScenario(Json::object(), scenario, DIRECTORY); });
  }
};

TEST_F(ScenarioTest, IsMergedOverWhatItNames) {
  Write("low", R"({"description": "x", "a": {"b": 1, "c": 2}, "list": [1, 2]})");
  Write("high", R"({"over": "low", "a": {"b": null, "d": 3}, "list": [9]})");
  const Json merged = Lab::MergeScenario(Json{{"a", {{"z", 0}}}}, "high", DIRECTORY);
  EXPECT_EQ(
      merged,
      Json::parse(R"({"a": {"c": 2, "d": 3, "z": 0}, "list": [9], "scenarios": ["low", "high"]})"));
}

TEST_F(ScenarioTest, AnUnusableOneSaysWhy) {
  Write("broken", "{\"a\": 1,}");
  Write("list", "[]");
  Write("loop", R"({"over": "pool"})");
  Write("pool", R"({"over": "loop"})");
  EXPECT_EQ(ErrorOf("absent"), "/tmp/scenarios/absent.json: No such file or directory");
  EXPECT_EQ(ErrorOf("/tmp/scenarios/broken.json"),
            "/tmp/scenarios/broken.json: not JSON at byte 9");
  EXPECT_EQ(ErrorOf("list"), "/tmp/scenarios/list.json: not an object");
  EXPECT_EQ(ErrorOf("loop"), "/tmp/scenarios/pool.json: stands over itself");
}

TEST_F(ScenarioTest, WritesAndRemovesItsFiles) {
  Lab::ReplaceFile("/tmp/gone", "x");
  Write("files", R"({"files": {"/tmp/made/here": {"content": "text\n", "mode": "0600"},
                               "/tmp/bytes": {"content": {"bytes": "00ff"}},
                               "/tmp/gone": {"absent": true}, "/tmp/absent": {"absent": true}}})");
  Lab::LoadScenario("/tmp/scenarios/files.json");
  struct stat status {};
  EXPECT_EQ(Lab::ReadFile("/tmp/made/here"), "text\n");
  ASSERT_EQ(stat("/tmp/made/here", &status), 0);
  EXPECT_EQ(status.st_mode & 07777, 0600U);
  EXPECT_EQ(Lab::ReadFile("/tmp/bytes"), std::string("\0\xff", 2));
  EXPECT_FALSE(std::filesystem::exists("/tmp/gone"));
}

TEST_F(ScenarioTest, ANewOneStartsAfresh) {
  Patch(R"({"host": {"welcomeMessage": "old"}, "faults": [{"operation": "o", "times": 1}]})");
  Lab::TakeFault(*Lab::ReadState(), {"o"});
  Lab::TraceLine("old");
  Lab::LoadScenarios({"dhcp", "audit"});
  const auto state = Lab::ReadState();
  EXPECT_EQ(Lab::Text(*state, "/host/welcomeMessage"), "");
  EXPECT_FALSE(state->contains("faults"));
  EXPECT_TRUE(Lab::Flag(*state, "/host/auditMode"));
  EXPECT_EQ(TraceText(), "");
  EXPECT_FALSE(std::filesystem::exists(LabFile("counts")));
  EXPECT_EQ(Lab::ReadFile("/etc/hosts"),
            "127.0.0.1\tlocalhost\n::1\tlocalhost\n192.0.2.77\track7.example.com rack7\n");
}

Machine::Facts Rack() {
  Machine::Facts facts;
  facts.processor = {"Core", 2};
  facts.memory = {8192, 4096};
  facts.firmware.vendor = "Ven\xff";
  facts.firmware.product = "Box";
  facts.adapters = {{"eth0", "02:00:00:00:00:01", true, "0000:00:03.0"}};
  facts.management.name = "eth0";
  facts.management.ipv4 = {"192.0.2.9", "255.255.255.0", Origin::DHCP};
  facts.management.ipv6 = {{"2001:db8::1", 64, false, Origin::AUTOCONF},
                           {"2001:db8::2", 64, false, Origin::STATIC},
                           {"fe80::1", 64, true, Origin::AUTOCONF}};
  facts.management.gateway4 = "192.0.2.1";
  facts.resolver.nameServers = {"192.0.2.53", "2001:db8::53"};
  return facts;
}

void ExpectNodes(const Json& state, const Json& nodes) {
  for (const auto& [pointer, value] : nodes.items()) {
    EXPECT_EQ(state.at(Json::json_pointer(pointer)), value) << pointer;
  }
}

TEST(DefaultHostTest, ShowsTheMachine) {
  ExpectNodes(Lab::DefaultHost(Rack()), Json::parse(R"({
    "/hardware/cpu": {"model": "Core", "packages": 2},
    "/hardware/memory/pages": 2,
    "/hardware/firmware/vendor": {"bytes": "56656eff"},
    "/network/pnics/0/name": "eth0",
    "/network/management": "core0",
    "/network/kernelNics/core0/lease4/bound": true,
    "/network/kernelNics/core0/stored": {
      "dhcp": true, "none": false, "dhcpDns": true, "ipv6Dhcp": false, "routerAdvertised": true,
      "ipv6": [{"address": "2001:db8::2/64", "type": 0, "scope": 3}]},
    "/network/kernelNics/core0/running": {
      "address": "192.0.2.9", "netmask": "255.255.255.0", "gateway": "192.0.2.1",
      "ipv6": [{"address": "2001:db8::1/64", "type": 7, "scope": 3},
               {"address": "2001:db8::2/64", "type": 0, "scope": 3},
               {"address": "fe80::1/64", "type": 7, "scope": 1}]},
    "/network/stacks/defaultTcpipStack/running/dns4": ["192.0.2.53"],
    "/network/stacks/defaultTcpipStack/running/dns6": ["2001:db8::53"]
  })"));
}

TEST(DefaultHostTest, OfAMachineThatSaysNothingIsPlain) {
  Machine::Facts nothing;
  nothing.memory.pageSize = 0;
  const Json state = Lab::DefaultHost(nothing);
  ExpectNodes(state, Json::parse(R"({
    "/hardware/cpu": {"model": "Generic Processor", "packages": 1},
    "/hardware/firmware/vendor": "", "/hardware/firmware/product": "Generic Machine",
    "/hardware/memory/pages": 0, "/network/pnics": [], "/network/kernelNics": {},
    "/network/stacks/defaultTcpipStack/running/hostname": "localhost"
  })"));
  EXPECT_FALSE(state.at("network").contains("management"));
}

TEST(DefaultHostTest, AnInterfaceWithoutIpv4HasItOff) {
  Machine::Facts facts = Rack();
  facts.management.ipv4 = {"", "", Origin::DHCP};
  ExpectNodes(Lab::DefaultHost(facts), Json::parse(R"({
    "/network/kernelNics/core0/stored/none": true,
    "/network/kernelNics/core0/stored/dhcp": false,
    "/network/kernelNics/core0/lease4/bound": false
  })"));
}

}  // namespace
