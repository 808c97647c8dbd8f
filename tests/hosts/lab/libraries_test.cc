#include <cerrno>
#include <cstring>

#include "hostapi/coreplane/advanced_option.h"
#include "hostapi/coreplane/hardware.h"
#include "hostapi/coreplane/ip_services.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/coreplane/system.h"
#include "hostapi/kernel.h"
#include "hostapi/nodeplane/host.h"
#include "tests/hosts/lab/lab_test.h"

namespace {

using Coreplane::Adv::AdvancedOptionImpl;
using Coreplane::Hardware::CpuInfoImpl;
using Coreplane::Hardware::HardwareInfoImpl;
using Coreplane::Hardware::MemoryInfoImpl;
using Coreplane::Hardware::SmartCardInfoImpl;
using Coreplane::Network::DnsConfigImpl;
using Coreplane::Network::NetworkInfoImpl;
using Coreplane::Network::PnicImpl;
using Coreplane::System::SystemInfoImpl;
using Coreplane::Util::SysinfoUtil;
using Nodeplane::HostFactory;
using Nodeplane::Adv::AdvancedIntegerOption;
using Nodeplane::Network::CoreNic;
using Nodeplane::Network::IpConfig;
using Nodeplane::Network::NetworkInterface;

class LibrariesTest : public LabTest {};

std::string Modes(const NetworkInterface& nic) {
  const IpConfig stored = nic.GetIpConfig();
  const auto* lease = dynamic_cast<const CoreNic*>(&nic);
  std::string modes = stored.GetUseDhcp() ? "dhcp" : "static";
  if (stored.GetIpv4UseNone()) modes += " none";
  if (lease != nullptr && lease->IsDhcpBound()) modes += " bound";
  return modes + " " + nic.GetRunningIpConfig().GetIpv4Address().GetStringAddress();
}

// What a scenario makes of the network, as "adapters, modes and address, IPv6, name".
std::string Network() {
  NetworkInfoImpl info;
  info.UpdateManagementInterface();
  const auto nic = info.GetManagementInterface();
  std::string text = std::to_string(info.GetPnics().size()) + ", ";
  text += (nic ? Modes(*nic) : "no management") + ", ";
  text += info.IsCoreIpv6Enabled() ? "on " : "off ";
  if (nic) text += std::to_string(nic->GetRunningIpConfig().GetIpv6Network().size());
  return text + ", " + DnsConfigImpl("defaultTcpipStack").GetHostname();
}

struct ScenarioCase {
  const char* scenario;
  const char* network;
};

class NetworkScenarioTest : public testing::TestWithParam<ScenarioCase> {};

TEST_P(NetworkScenarioTest, ReachesTheConsole) {
  Lab::LoadScenario(GetParam().scenario);
  EXPECT_EQ(Network(), GetParam().network);
}

INSTANTIATE_TEST_SUITE_P(
    All, NetworkScenarioTest,
    testing::Values(ScenarioCase{"static", "2, static 192.0.2.20, off 0, rack7"},
                    ScenarioCase{"dhcp", "2, dhcp bound 192.0.2.77, off 0, rack7"},
                    ScenarioCase{"dhcp-waiting", "2, dhcp 169.254.17.4, off 0, rack7"},
                    ScenarioCase{"dhcp-zero", "2, dhcp 0.0.0.0, off 0, rack7"},
                    ScenarioCase{"ipv4-none", "2, static none 0.0.0.0, off 0, rack7"},
                    ScenarioCase{"ipv6", "2, static 192.0.2.20, on 5, rack7"},
                    ScenarioCase{"ipv6-many", "2, static 192.0.2.20, on 7, rack7"},
                    ScenarioCase{"no-adapter", "0, static 192.0.2.20, off 0, rack7"},
                    ScenarioCase{"no-management", "2, no management, off , rack7"},
                    ScenarioCase{"localhost-name", "2, static 192.0.2.20, off 0, localhost"}));

TEST_F(LibrariesTest, AnAddressHasItsOriginAndScope) {
  Lab::LoadScenario("ipv6");
  const IpConfig config = NetworkInfoImpl().GetManagementInterface()->GetRunningIpConfig();
  std::string all;
  for (const auto& network : config.GetIpv6Network()) {
    all += network.GetStringAddress() + " " + std::to_string(network.GetIpv6AddressType()) + " " +
           std::to_string(network.GetIpv6Scope()) + "\n";
  }
  EXPECT_EQ(all,
            "2001:db8::20/64 0 3\n2001:db8:0:1:fc:ff:fe00:1/64 7 3\n2001:db8::d:77/128 9 3\n"
            "fe80::fc:ff:fe00:1/64 7 1\n2001:db8:5::9/64 4 3\n");
}

TEST_F(LibrariesTest, AnUpdateDecidesWhichInterfaceIsMeant) {
  Patch(R"({"network": {"kernelNics": {"core1": {"class": "plain",
            "stored": {"ipv6": []}, "running": {"ipv6": []}}}}})");
  NetworkInfoImpl info;
  info.UpdateManagementInterface();
  Patch(R"({"network": {"management": "core1"}})");
  EXPECT_EQ(info.GetManagementInterface()->GetName(), "core0");
  info.UpdateManagementInterface();
  const auto plain = info.GetManagementInterface();
  EXPECT_EQ(plain->GetName(), "core1");
  EXPECT_EQ(dynamic_cast<CoreNic*>(plain.get()), nullptr);
  EXPECT_EQ(NetworkInfoImpl().GetManagementInterface()->GetName(), "core1");
}

TEST_F(LibrariesTest, AnAdapterThatVanishedThrowsAtTheFirstRead) {
  const auto pnics = NetworkInfoImpl().GetPnics();
  EXPECT_EQ(pnics[1]->GetMacAddress().GetStringAddress(), "02:fc:00:00:00:02");
  EXPECT_TRUE(pnics[0]->IsLinkUp());
  Patch(R"({"network": {"pnics": []}})");
  EXPECT_EQ(pnics[0]->GetName(), "corenic0");
  EXPECT_EQ(Thrown([&] { pnics[0]->IsLinkUp(); }), "PnicImpl::IsLinkUp: no adapter corenic0");
}

TEST_F(LibrariesTest, FirmwareIsAsOfTheLastRefresh) {
  Lab::LoadScenario("firmware-rich");
  const auto host = HostFactory::GetHost();
  auto& hardware = host->GetHardwareService();
  EXPECT_EQ(hardware.GetBmcVersion(), "");
  hardware.Refresh();
  Patch(R"({"hardware": {"bmc": "9", "firmware": {"bios": {"assetTag": "new"}}}})");
  EXPECT_EQ(hardware.GetBmcVersion(), "2.61.03");
  const auto bios = hardware.GetBiosData();
  EXPECT_EQ(bios.assetTag, "AT-1017 / Row 4");
  EXPECT_EQ(bios.majorNumber, 3);
  hardware.Refresh();
  EXPECT_EQ(hardware.GetBiosData().assetTag, "new");
}

TEST_F(LibrariesTest, AnAdaptersDriverHasAVersion) {
  Lab::LoadScenario("firmware-rich");
  const auto host = HostFactory::GetHost();
  const auto adapters = host->GetStorageService().GetAdapters();
  ASSERT_EQ(adapters.size(), 2U);
  EXPECT_EQ(adapters[1]->GetName(), "sthba0");
  const auto& drivers = host->GetDriverService();
  EXPECT_EQ(drivers.FindDriver(adapters[1]->GetDriverName())->GetVersion(), "7.703.18");
  EXPECT_EQ(Thrown([&] { drivers.FindDriver("none"); }),
            "DriverService::FindDriver: no driver none");
}

TEST_F(LibrariesTest, ASlotWithoutACardHasNoToken) {
  Lab::LoadScenario("smart-card");
  const SmartCardInfoImpl cards;
  const auto slots = cards.GetAllSlots();
  ASSERT_EQ(slots.size(), 2U);
  Nodeplane::Hardware::SmartCardToken token;
  EXPECT_FALSE(cards.GetToken(slots[0], token));
  EXPECT_TRUE(cards.GetToken(slots[1], token));
  EXPECT_EQ(token.userIds, (std::vector<std::string>{"", "root"}));
  Patch(R"({"hardware": {"cardSlots": []}})");
  EXPECT_EQ(Thrown([&] { cards.GetToken(slots[0], token); }),
            "SmartCardInfoImpl::GetToken: no such slot");
}

TEST_F(LibrariesTest, AnIntegerOptionKeepsItsValue) {
  Patch(R"({"options": {"advanced": {"/UserVars/A~B": {"type": "integer", "value": -1},
                                     "/UserVars/Text": {"type": "string", "value": "x"}}}})");
  const auto option = AdvancedOptionImpl::FindOption("/UserVars/A~B");
  auto& number = dynamic_cast<AdvancedIntegerOption&>(*option);
  EXPECT_EQ(number.GetValue(), -1);
  number.SetValue(900);
  EXPECT_EQ(number.GetValue(), 900);
  const auto text = AdvancedOptionImpl::FindOption("/UserVars/Text");
  ASSERT_NE(text, nullptr);
  EXPECT_EQ(dynamic_cast<AdvancedIntegerOption*>(text.get()), nullptr);
  EXPECT_EQ(AdvancedOptionImpl::FindOption("/UserVars/None"), nullptr);
  Patch(R"({"options": {"advanced": {"/UserVars/A~B": null}}})");
  EXPECT_NE(Thrown([&] { number.SetValue(1); }), "none");
}

TEST_F(LibrariesTest, TheVersionRecordCutsWhatDoesNotFit) {
  Lab::LoadScenario("hostile-texts");
  SystemVersionRecord record;
  memset(&record, 'x', sizeof record);
  SysinfoUtil::SysinfoGet(SYSNODE_NODE_system_version, &record, sizeof record, nullptr);
  EXPECT_STREQ(record.productName, "Lab{color:red}\tHost\x1b[31m with a");
  EXPECT_STREQ(record.version, "8.0.2\r\n");
  EXPECT_STREQ(record.releaseType, "release");
  EXPECT_EQ(record.buildNumber, 24022U);
}

TEST_F(LibrariesTest, ASysinfoNodeFailsWithACodeOrAnException) {
  SystemBootOptionRecord record{};
  EXPECT_EQ(Sysnode_Get(SYSNODE_NODE_system_bootOption, &record, sizeof record), 0);
  EXPECT_EQ(record.auditMode, 0);
  Lab::LoadScenario("audit");
  EXPECT_EQ(Sysnode_Get(SYSNODE_NODE_system_bootOption, &record, sizeof record), 0);
  EXPECT_EQ(record.auditMode, 1);
  EXPECT_EQ(Sysnode_Get(SYSNODE_NODE_system_bootOption, &record, 3), EIO);
  Patch(R"({"host": {"version": {"product": null}}})");
  SystemVersionRecord version{};
  EXPECT_EQ(Thrown([&] {
              SysinfoUtil::SysinfoGet(SYSNODE_NODE_system_version, &version, sizeof version,
                                      nullptr);
            }),
            "SysinfoUtil::SysinfoGet: /host/version/product is missing");
}

struct HostileCase {
  const char* patch;
  void (*call)();
};

class HostileStateTest : public LabTest, public testing::WithParamInterface<HostileCase> {};

TEST_P(HostileStateTest, IsTheHostsException) {
  EXPECT_EQ(Thrown(GetParam().call), "none");
  Patch(GetParam().patch);
  EXPECT_NE(Thrown(GetParam().call), "none");
}

INSTANTIATE_TEST_SUITE_P(
    All, HostileStateTest,
    testing::Values(
        HostileCase{R"({"host": 7})", [] { SystemInfoImpl().GetWelcomeMessage(); }},
        HostileCase{R"({"host": []})", [] { SystemInfoImpl().SetSystemAlert("x"); }},
        HostileCase{R"({"hardware": null})", [] { HardwareInfoImpl().GetVendorName(); }},
        HostileCase{R"({"hardware": {"cpu": {"model": 1}}})", [] { CpuInfoImpl().GetModelName(); }},
        HostileCase{R"({"hardware": {"memory": {"pages": "1"}}})",
                    [] { MemoryInfoImpl().GetTotalPages(); }},
        HostileCase{R"({"network": {"pnics": {}}})", [] { NetworkInfoImpl().GetPnics(); }},
        HostileCase{R"({"network": {"pnics": [1]}})", [] { NetworkInfoImpl().GetPnics(); }},
        HostileCase{R"({"network": {"pnics": [1]}})", [] { PnicImpl("corenic0").IsLinkUp(); }},
        HostileCase{R"({"network": {"management": "none"}})",
                    [] { NetworkInfoImpl().GetManagementInterface(); }},
        HostileCase{R"({"network": {"kernelNics": {"core0": {"running": {"address": "1.2.3"}}}}})",
                    [] { NetworkInfoImpl().GetManagementInterface()->GetRunningIpConfig(); }},
        HostileCase{R"({"network": {"kernelNics": {"core0": {"stored": {"ipv6": ["x"]}}}}})",
                    [] { NetworkInfoImpl().GetManagementInterface()->GetIpConfig(); }},
        HostileCase{R"({"network": {"stacks": {"defaultTcpipStack": 1}}})",
                    [] { DnsConfigImpl("defaultTcpipStack").GetDomain(); }},
        HostileCase{R"({"hardware": {"storage": [{}]}})",
                    [] { HostFactory::GetHost()->GetStorageService().GetAdapters(); }},
        HostileCase{R"({"faults": [{}]})", [] { HostFactory::GetHost(); }},
        HostileCase{R"({"faults": 3})", [] { HostFactory::GetHost(); }}));

}  // namespace
