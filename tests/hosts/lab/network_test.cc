// What changes of the network leave in the state, and what a later start makes of it.

#include "hostapi/coreplane/ip_services.h"
#include "hostapi/coreplane/network_info.h"
#include "tests/hosts/lab/lab_test.h"

namespace {

using Coreplane::Network::CoreNicImpl;
using Coreplane::Network::DnsConfigImpl;
using Coreplane::Network::NetworkInfoImpl;
using Coreplane::Network::PnicImpl;
using Coreplane::Network::RoutingInfoImpl;
using Nodeplane::Network::CoreNic;
using Nodeplane::Network::IpConfig;
using Nodeplane::Network::Ipv4Address;
using Nodeplane::Network::Ipv6Address;
using Nodeplane::Network::Ipv6Network;
using Nodeplane::Network::MacAddress;
using Nodeplane::Network::NetworkInterface;

constexpr char STACK[] = "defaultTcpipStack";

class NetworkTest : public LabTest {};

std::string StateAt(const std::string& pointer) {
  return Lab::ReadState()->at(Lab::Json::json_pointer(pointer)).dump();
}

std::unique_ptr<NetworkInterface> Management() {
  return NetworkInfoImpl().GetManagementInterface();
}

CoreNic& AsCoreNic(const std::unique_ptr<NetworkInterface>& nic) {
  return dynamic_cast<CoreNic&>(*nic);
}

// Changes the running view, as the console does, and sets it.
void Configure(void (*change)(IpConfig& config)) {
  IpConfig config = Management()->GetRunningIpConfig();
  change(config);
  Management()->SetIpConfig(config);
}

void RestartInterface() {
  Management()->Disable();
  Management()->Enable();
}

// "192.0.2.77/255.255.255.0 bound via 192.0.2.1" and the IPv6 addresses.
std::string InEffect() {
  const auto nic = Management();
  const IpConfig config = nic->GetRunningIpConfig();
  std::string text =
      config.GetIpv4Address().GetStringAddress() + "/" + config.GetIpv4Netmask().GetStringAddress();
  if (AsCoreNic(nic).IsDhcpBound()) text += " bound";
  const RoutingInfoImpl routing(STACK);
  text += " via " + routing.GetCorelinDefaultGateway().GetStringAddress();
  for (const Ipv6Network& network : config.GetIpv6Network()) {
    text += ", " + network.GetStringAddress();
  }
  return text;
}

constexpr char NO_OFFER[] =
    R"({"network": {"kernelNics": {"core0": {"lease4": {"offer": null}}}}})";
constexpr char UNATTACHED[] =
    R"({"network": {"kernelNics": {"core0": {"connection": {"type": 0}}}}})";
constexpr char DOWN[] = R"({"network": {"kernelNics": {"core0": {"enabled": false}}}})";
constexpr char OTHER_OFFER[] =
    R"({"network": {"kernelNics": {"core0": {"lease4": {"offer": {"address": "192.0.2.99"}}}}}})";
constexpr char REFUSED[] =
    R"({"network": {"kernelNics": {"core0": {"lease4": {"onRenew": false}}}}})";

void ToDhcp(IpConfig& config) { config.SetUseDhcp(true); }
void ToNone(IpConfig& config) { config.SetUseDhcp(false, true); }
void ToStatic(IpConfig& config) {
  config.SetUseDhcp(false, false);
  config.SetIpv4Address(Ipv4Address("192.0.2.30"));
}

TEST_F(NetworkTest, Ipv4InEffectFollowsTheConfiguration) {
  struct Row {
    const char* what;
    const char* scenario;
    const char* patch;
    void (*act)();
    const char* inEffect;
  };
  const Row rows[] = {
      {"static address", "static", "{}", [] { Configure(ToStatic); },
       "192.0.2.30/255.255.255.0 via 192.0.2.1"},
      {"a lease is asked for", "static", "{}", [] { Configure(ToDhcp); },
       "192.0.2.77/255.255.255.0 bound via 192.0.2.1"},
      {"no server answers", "static", NO_OFFER, [] { Configure(ToDhcp); },
       "0.0.0.0/0.0.0.0 via 0.0.0.0"},
      {"nothing to ask on", "static", UNATTACHED, [] { Configure(ToDhcp); },
       "0.0.0.0/0.0.0.0 via 0.0.0.0"},
      {"while down, only stored", "static", DOWN, [] { Configure(ToDhcp); },
       "192.0.2.20/255.255.255.0 via 192.0.2.1"},
      {"no IPv4", "static", "{}", [] { Configure(ToNone); }, "0.0.0.0/0.0.0.0 via 192.0.2.1"},
      {"a lease given up", "dhcp", "{}", [] { Configure(ToStatic); },
       "192.0.2.30/255.255.255.0 via 192.0.2.1"},
      {"the same lease is offered", "dhcp", "{}", [] { Configure(ToDhcp); },
       "192.0.2.77/255.255.255.0 bound via 192.0.2.1"},
      {"a lease in use outlives its server", "dhcp", NO_OFFER, [] { Configure(ToDhcp); },
       "192.0.2.77/255.255.255.0 via 192.0.2.1"},
      {"another offer does not touch a lease in use", "dhcp", OTHER_OFFER,
       [] { Configure(ToDhcp); }, "192.0.2.77/255.255.255.0 via 192.0.2.1"},
      {"a restart asks anew", "dhcp", OTHER_OFFER, RestartInterface,
       "192.0.2.99/255.255.255.0 bound via 192.0.2.1"},
      {"a restart without a server", "dhcp", NO_OFFER, RestartInterface,
       "0.0.0.0/0.0.0.0 via 0.0.0.0"},
      {"a static address comes back", "static", "{}", RestartInterface,
       "192.0.2.20/255.255.255.0 via 192.0.2.1"},
      {"down", "dhcp", "{}", [] { Management()->Disable(); }, "0.0.0.0/0.0.0.0 via 192.0.2.1"},
      {"renewed to another address", "network-dhcp", "{}",
       [] { AsCoreNic(Management()).RenewDhcpLease(); },
       "192.0.2.78/255.255.255.0 bound via 192.0.2.1, 2001:db8::d:77/128, "
       "fe80::fc:ff:fe00:1/64"},
      {"renewal refused", "dhcp", REFUSED, [] { AsCoreNic(Management()).RenewDhcpLease(); },
       "0.0.0.0/0.0.0.0 via 0.0.0.0"},
      {"renewal not answered", "dhcp", NO_OFFER, [] { AsCoreNic(Management()).RenewDhcpLease(); },
       "192.0.2.77/255.255.255.0 bound via 192.0.2.1"},
      {"nothing to renew", "static", "{}", [] { AsCoreNic(Management()).RenewDhcpLease(); },
       "192.0.2.20/255.255.255.0 via 192.0.2.1"},
  };
  for (const auto& [what, scenario, patch, act, inEffect] : rows) {
    Lab::LoadScenario(scenario);
    Patch(patch);
    act();
    EXPECT_EQ(InEffect(), inEffect) << what;
  }
}

// The IPv6 addresses in effect, and which of them are stored.
std::string Ipv6() {
  const std::string running = InEffect();
  std::string text = running.substr(std::min(running.find(','), running.size()));
  const IpConfig stored = Management()->GetIpConfig();
  for (const Ipv6Network& network : stored.GetIpv6Network()) {
    text += ", stored " + network.GetStringAddress();
  }
  return text.empty() ? "" : text.substr(2);
}

TEST_F(NetworkTest, Ipv6KeepsWhatItsModesAllow) {
  struct Row {
    const char* what;
    const char* scenario;
    void (*act)();
    const char* addresses;
  };
  const Row rows[] = {
      {"as it was", "ipv6", [] { Configure([](IpConfig&) {}); },
       "2001:db8::20/64, 2001:db8:0:1:fc:ff:fe00:1/64, 2001:db8::d:77/128, "
       "fe80::fc:ff:fe00:1/64, 2001:db8:5::9/64, stored 2001:db8::20/64"},
      {"no DHCPv6", "ipv6", [] { Configure([](IpConfig& c) { c.SetUseIpv6Dhcp(false); }); },
       "2001:db8::20/64, 2001:db8:0:1:fc:ff:fe00:1/64, fe80::fc:ff:fe00:1/64, "
       "2001:db8:5::9/64, stored 2001:db8::20/64"},
      {"static alone", "network-dhcp",
       [] {
         Configure([](IpConfig& c) {
           c.SetUseIpv6Dhcp(false);
           c.AddIpv6Network(Ipv6Network("2001:db8::9/64"));
         });
       },
       "2001:db8::9/64, fe80::fc:ff:fe00:1/64, stored 2001:db8::9/64"},
      {"asked for anew", "ipv6", RestartInterface,
       "2001:db8::20/64, fe80::fc:ff:fe00:1/64, 2001:db8:0:1:fc:ff:fe00:1/64, "
       "2001:db8::d:77/128, stored 2001:db8::20/64"},
      {"static addresses come back", "ipv6-static", RestartInterface,
       "2001:db8::20/64, 2001:db8:1::20/64, 2001:db8:2::20/64, stored 2001:db8::20/64, "
       "stored 2001:db8:1::20/64, stored 2001:db8:2::20/64"},
      {"renewed", "network-dhcp", [] { AsCoreNic(Management()).RenewDhcp6Lease(); },
       "fe80::fc:ff:fe00:1/64, 2001:db8::d:78/128"},
      {"not in the kernel yet", "static",
       [] { Configure([](IpConfig& c) { c.AddIpv6Network(Ipv6Network("2001:db8::9/64")); }); },
       "stored 2001:db8::9/64"},
      {"switched on at the next start", "static",
       [] {
         Configure([](IpConfig& c) { c.AddIpv6Network(Ipv6Network("2001:db8::9/64")); });
         NetworkInfoImpl().SetCoreIpv6Enabled(true);
         EXPECT_FALSE(NetworkInfoImpl().IsCoreIpv6Enabled());
         Lab::StartAfresh();
       },
       "2001:db8::9/64, stored 2001:db8::9/64"},
  };
  for (const auto& [what, scenario, act, addresses] : rows) {
    Lab::LoadScenario(scenario);
    act();
    EXPECT_EQ(Ipv6(), addresses) << what;
  }
}

TEST_F(NetworkTest, NoIpv4IsAModeOfBothViews) {
  Configure(ToNone);
  EXPECT_TRUE(Management()->GetIpConfig().GetIpv4UseNone());
  EXPECT_TRUE(Management()->GetRunningIpConfig().GetIpv4UseNone());
}

TEST_F(NetworkTest, AServerGivesNamesOnlyWhereItMay) {
  Lab::LoadScenario("network-dhcp");
  DnsConfigImpl(STACK).RemoveNameServers();
  Configure([](IpConfig& config) { config.SetDhcpDns(false); });
  AsCoreNic(Management()).RenewDhcpLease();
  EXPECT_TRUE(DnsConfigImpl(STACK).GetNameServers().empty());
  Configure([](IpConfig& config) { config.SetDhcpDns(true); });
  AsCoreNic(Management()).RenewDhcpLease();
  AsCoreNic(Management()).RenewDhcp6Lease();
  EXPECT_EQ(DnsConfigImpl(STACK).GetNameServers().size(), 2U);
  EXPECT_EQ(DnsConfigImpl(STACK).GetIpv6NameServers(true).size(), 1U);
}

TEST_F(NetworkTest, TheMacAddressComesFromTextOrAdapter) {
  const auto nic = Management();
  nic->SetMacAddress(MacAddress("02:00:00:00:00:09"));
  EXPECT_EQ(StateAt("/network/kernelNics/core0/mac"), R"("02:00:00:00:00:09")");
  PnicImpl pnic("corenic1");
  dynamic_cast<CoreNicImpl&>(*nic).SetMacFromPnic(pnic);
  EXPECT_EQ(StateAt("/network/kernelNics/core0/mac"), R"("02:fc:00:00:00:02")");
}

// Name, domain, suffixes and name servers of the running host.
std::string NameService() {
  const DnsConfigImpl dns(STACK);
  std::string text = dns.GetHostname() + "|" + dns.GetDomain() + "|";
  for (const std::string& domain : dns.GetSearchDomains()) text += domain + " ";
  for (const Ipv4Address& server : dns.GetNameServers()) text += server.GetStringAddress() + " ";
  for (const Ipv6Address& server : dns.GetIpv6NameServers(false)) {
    text += server.GetStringAddress() + " ";
  }
  return text;
}

TEST_F(NetworkTest, NameServiceIsLostUnlessSaved) {
  struct Row {
    const char* what;
    void (*change)(DnsConfigImpl& dns);
    const char* result;
  };
  const Row rows[] = {
      {"name alone", [](DnsConfigImpl& dns) { dns.SetHostname("rack8", false); },
       "rack8|example.com|example.com 192.0.2.53 "},
      {"name and domain", [](DnsConfigImpl& dns) { dns.SetFqdn("a.b.c", false, ""); },
       "a|b.c|example.com 192.0.2.53 "},
      {"domain apart", [](DnsConfigImpl& dns) { dns.SetFqdn("a.b.c", false, "d"); },
       "a|d|example.com 192.0.2.53 "},
      {"no servers", [](DnsConfigImpl& dns) { dns.RemoveNameServers(); },
       "rack7|example.com|example.com "},
      {"servers of both families",
       [](DnsConfigImpl& dns) {
         dns.AddNameServer(Ipv6Address("2001:db8::53"));
         dns.AddNameServer(Ipv4Address("192.0.2.9"));
       },
       "rack7|example.com|example.com 192.0.2.53 192.0.2.9 2001:db8::53 "},
      {"suffixes, each once",
       [](DnsConfigImpl& dns) {
         dns.SetSearchDomainsString(" x.org,,y.org ");
         dns.AddSearchDomain("z.org");
         dns.AddSearchDomain("x.org");
       },
       "rack7|example.com|x.org y.org z.org 192.0.2.53 "},
  };
  for (const auto& [what, change, result] : rows) {
    Lab::LoadScenario("sample");
    const std::string before = NameService();
    DnsConfigImpl dns(STACK);
    change(dns);
    EXPECT_EQ(NameService(), result) << what;
    Lab::StartAfresh();
    EXPECT_EQ(NameService(), before) << what;
    change(dns);
    dns.SaveConfig();
    Lab::StartAfresh();
    EXPECT_EQ(NameService(), result) << what;
  }
}

TEST_F(NetworkTest, AStartWritesTheHostsOwnNameAnew) {
  DnsConfigImpl dns(STACK);
  dns.SetFqdn("rack8.example.org", false, "");
  dns.SaveConfig();
  Configure(ToStatic);
  Lab::StartAfresh();
  EXPECT_EQ(Lab::ReadFile("/etc/hosts"),
            "127.0.0.1\tlocalhost\n::1\tlocalhost\n192.0.2.30\track8.example.org rack8\n");
}

TEST_F(NetworkTest, AGatewayIsStoredUnlessAServerGaveIt) {
  RoutingInfoImpl routing(STACK);
  routing.SetCorelinDefaultGateway(Ipv4Address("192.0.2.9"), true);
  EXPECT_EQ(StateAt("/network/stacks/defaultTcpipStack/stored/gateway4"), R"("192.0.2.1")");
  routing.SetCorelinDefaultGateway(Ipv4Address(), false);
  routing.SetIpv6CorelinDefaultGateway(Ipv6Address("fe80::1%core0"));
  Lab::StartAfresh();
  EXPECT_EQ(routing.GetCorelinDefaultGateway(), Ipv4Address());
  EXPECT_EQ(routing.GetIpv6CorelinDefaultGateway().GetScopedStringAddress(), "fe80::1%core0");
}

TEST_F(NetworkTest, TheHostsFileLosesOneName) {
  struct Row {
    const char* before;
    const char* after;
  };
  const Row rows[] = {
      {"1.2.3.4\track7\n", ""},
      {"1.2.3.4 RACK7 # own", ""},
      {"1.2.3.4  a rack7  b # rack7\n", "1.2.3.4\ta b # rack7\n"},
      {"1.2.3.4 a  rack77\n# rack7\n\n", "1.2.3.4 a  rack77\n# rack7\n\n"},
      {"::1 rack7 x\n1.2.3.4 rack7\n", "::1\tx\n"},
  };
  for (const auto& [before, after] : rows) {
    Lab::ReplaceFile("/etc/hosts", before);
    Coreplane::Network::HostsFile().RemoveEntryByHostName("rack7");
    EXPECT_EQ(Lab::ReadFile("/etc/hosts"), after) << before;
  }
  unlink("/etc/hosts");
  EXPECT_NE(Thrown([] { Coreplane::Network::HostsFile().RemoveEntryByHostName("rack7"); }), "none");
}

TEST_F(NetworkTest, AFactoryNetworkIsOutOfReachAndThenBack) {
  Lab::LoadScenario("adapters");
  NetworkInfoImpl info;
  info.ClearNetworkConfig();
  EXPECT_EQ(Management(), nullptr);
  EXPECT_EQ(StateAt("/network/switches") + StateAt("/network/lattices"), "{}{}");
  info.AutoConfigNetwork();
  EXPECT_EQ(InEffect(), "192.0.2.77/255.255.255.0 bound via 192.0.2.1");
  EXPECT_EQ(StateAt("/network/switches/softSwitch0/uplinks"), R"(["upnic0"])");
  EXPECT_EQ(StateAt("/network/kernelNics/core0/mac"), R"("02:fc:00:00:01:00")");
}

}  // namespace
