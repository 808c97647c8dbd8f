#include <cstring>

#include "hostapi/coreplane/hardware.h"
#include "hostapi/coreplane/ip_services.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/coreplane/system.h"
#include "hostapi/kernel.h"
#include "hostapi/nodeplane/host.h"
#include "tests/hosts/lab/lab_test.h"

namespace {

using Coreplane::Network::DnsConfigImpl;
using Coreplane::Network::NetworkInfoImpl;
using Coreplane::Network::PnicImpl;
using Nodeplane::Network::CoreNic;
using Nodeplane::Network::IpConfig;

class LibrariesTest : public LabTest {};

// The management interface's modes and address, the number of adapters, the host's name.
std::string Network() {
  NetworkInfoImpl info;
  info.UpdateManagementInterface();
  std::string text = std::to_string(info.GetPnics().size()) + " adapters, ";
  if (const auto nic = info.GetManagementInterface()) {
    const IpConfig stored = nic->GetIpConfig();
    if (stored.GetUseDhcp()) text += "dhcp ";
    if (stored.GetIpv4UseNone()) text += "none ";
    if (dynamic_cast<CoreNic&>(*nic).IsDhcpBound()) text += "bound ";
    text += nic->GetRunningIpConfig().GetIpv4Address().GetStringAddress() + ", ";
  }
  return text + DnsConfigImpl("defaultTcpipStack").GetHostname();
}

// The addresses with their types and scopes.
std::string Ipv6() {
  const IpConfig config = NetworkInfoImpl().GetManagementInterface()->GetRunningIpConfig();
  std::string text = NetworkInfoImpl().IsCoreIpv6Enabled() ? "on" : "off";
  for (const auto& network : config.GetIpv6Network()) {
    text += ", " + network.GetStringAddress() + " " + std::to_string(network.GetIpv6AddressType()) +
            " " + std::to_string(network.GetIpv6Scope());
  }
  return text;
}

std::string CardUsers() {
  const Coreplane::Hardware::SmartCardInfoImpl cards;
  std::string text;
  for (const auto& slot : cards.GetAllSlots()) {
    Nodeplane::Hardware::SmartCardToken token;
    text += cards.GetToken(slot, token) ? "card" : "empty";
    for (const std::string& user : token.userIds) text += " '" + user + "'";
    text += ", ";
  }
  return text;
}

std::string Version() {
  SystemVersionRecord record;
  memset(&record, 'x', sizeof record);
  Coreplane::Util::SysinfoUtil::SysinfoGet(SYSNODE_NODE_system_version, &record, sizeof record,
                                           nullptr);
  return std::string(record.productName) + "|" + record.version + "|" +
         std::to_string(record.buildNumber);
}

TEST_F(LibrariesTest, ShowWhatTheScenarioHas) {
  struct Row {
    const char* scenario;
    std::string (*read)();
    const char* text;
  };
  const Row rows[] = {
      {"dhcp", Network, "2 adapters, dhcp bound 192.0.2.77, rack7"},
      {"ipv4-none", Network, "2 adapters, none 0.0.0.0, rack7"},
      {"no-management", Network, "2 adapters, rack7"},
      {"ipv6", Ipv6,
       "on, 2001:db8::20/64 0 3, 2001:db8:0:1:fc:ff:fe00:1/64 7 3, 2001:db8::d:77/128 9 3, "
       "fe80::fc:ff:fe00:1/64 7 1, 2001:db8:5::9/64 4 3"},
      {"smart-card", CardUsers, "empty, card '' 'root', "},
      // A text that does not fit is cut.
      {"hostile-texts", Version, "Lab{color:red}\tHost\x1b[31m with a|8.0.2\r\n|24022"},
  };
  for (const Row& row : rows) {
    Lab::LoadScenario(row.scenario);
    EXPECT_EQ(row.read(), row.text) << row.scenario;
  }
}

TEST_F(LibrariesTest, AnUpdateDecidesWhichInterfaceIsMeant) {
  Patch(R"({"network": {"kernelNics": {"core1": {"class": "plain"}}}})");
  NetworkInfoImpl info;
  info.UpdateManagementInterface();
  Patch(R"({"network": {"management": "core1"}})");
  EXPECT_EQ(info.GetManagementInterface()->GetName(), "core0");
  info.UpdateManagementInterface();
  EXPECT_EQ(info.GetManagementInterface()->GetName(), "core1");
  EXPECT_EQ(dynamic_cast<CoreNic*>(info.GetManagementInterface().get()), nullptr);
}

TEST_F(LibrariesTest, AHostileStateIsTheHostsException) {
  struct Row {
    const char* patch;
    void (*call)();
  };
  const Row rows[] = {
      {R"({"host": []})", [] { Coreplane::System::SystemInfoImpl().SetSystemAlert("x"); }},
      {R"({"hardware": null})", [] { Coreplane::Hardware::HardwareInfoImpl().GetVendorName(); }},
      {R"({"hardware": {"cardSlots": 7}})", [] { CardUsers(); }},
      {R"({"host": {"version": {"product": null}}})", [] { Version(); }},
      {R"({"network": {"pnics": [1]}})", [] { PnicImpl("corenic0").IsLinkUp(); }},
      {R"({"network": {"pnics": []}})", [] { PnicImpl("corenic0").GetMacAddress(); }},
      {R"({"network": {"management": "none"}})", [] { Network(); }},
      {R"({"network": {"kernelNics": {"core0": {"running": {"address": "1.2"}}}}})",
       [] { Network(); }},
      {R"({"network": {"kernelNics": {"core0": {"running": {"ipv6": ["x"]}}}}})", [] { Ipv6(); }},
      {R"({"faults": [{}]})", [] { Nodeplane::HostFactory::GetHost(); }},
  };
  for (const auto& [patch, call] : rows) {
    Lab::LoadScenario("sample");
    EXPECT_EQ(Thrown(call), "none") << patch;
    Patch(patch);
    const std::string thrown = Thrown(call);
    EXPECT_TRUE(thrown != "none" && !thrown.starts_with("state: ")) << patch << ": " << thrown;
  }
}

}  // namespace
