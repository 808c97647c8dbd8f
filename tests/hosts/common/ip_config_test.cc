#include "hostapi/nodeplane/ip_config.h"

#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "hostapi/nodeplane/nic_teaming_policy.h"

namespace Nodeplane::Network {
namespace {

TEST(IpConfig, StartsStaticAndEmpty) {
  const IpConfig config;
  EXPECT_FALSE(config.GetUseDhcp());
  EXPECT_FALSE(config.GetIpv4UseNone());
  EXPECT_FALSE(config.GetUseIpv6Dhcp());
  EXPECT_FALSE(config.GetUseIpv6RouterAdvertised());
  EXPECT_FALSE(config.GetDhcpDns());
  EXPECT_EQ(config.GetIpv4Address().GetStringAddress(), "0.0.0.0");
  EXPECT_EQ(config.GetIpv6Gateway().GetStringAddress(), "::");
  EXPECT_TRUE(config.GetIpv6Network().empty());
}

TEST(IpConfig, Ipv4ModeAfterAChange) {
  using Change = std::function<void(IpConfig&)>;
  const Change toStatic = [](IpConfig&) {};
  const Change toDhcp = [](IpConfig& c) { c.SetUseDhcp(true); };
  const Change toNone = [](IpConfig& c) { c.SetIpv4UseNone(); };
  const auto address = [](IpConfig& c) { c.SetIpv4Address(Ipv4Address("10.0.0.1")); };
  const auto netmask = [](IpConfig& c) { c.SetIpv4Netmask(Ipv4Address("255.0.0.0")); };
  const auto endDhcp = [](IpConfig& c) { c.SetUseDhcp(false); };
  struct Row {
    const char* name;
    Change from;
    Change change;
    bool dhcp;
    bool none;
  };
  const std::vector<Row> rows = {
      {"none, then DHCP", toNone, toDhcp, true, false},
      {"none, then an address", toNone, address, false, false},
      {"none, then a netmask", toNone, netmask, false, true},
      {"none, then no DHCP", toNone, endDhcp, false, true},
      {"none, then both off", toNone, [](IpConfig& c) { c.SetUseDhcp(false, false); }, false,
       false},
      {"DHCP, then none", toDhcp, toNone, true, true},
      {"DHCP, then both arguments none", toDhcp, [](IpConfig& c) { c.SetUseDhcp(false, true); },
       false, true},
      {"DHCP, then no DHCP", toDhcp, endDhcp, false, false},
      {"DHCP, then its address", toDhcp, address, true, false},
      {"static, then DHCP and none", toStatic, [](IpConfig& c) { c.SetUseDhcp(true, true); }, true,
       false},
      {"static, then none", toStatic, toNone, false, true},
  };
  for (const Row& row : rows) {
    IpConfig config;
    row.from(config);
    row.change(config);
    EXPECT_EQ(config.GetUseDhcp(), row.dhcp) << row.name;
    EXPECT_EQ(config.GetIpv4UseNone(), row.none) << row.name;
  }
}

TEST(IpConfig, UsesDhcpWithEitherFamily) {
  for (const bool v4 : {false, true}) {
    for (const bool v6 : {false, true}) {
      IpConfig config;
      config.SetUseDhcp(v4);
      config.SetUseIpv6Dhcp(v6);
      config.SetUseIpv6RouterAdvertised(!v6);
      EXPECT_EQ(config.IsUsingDhcp(), v4 || v6);
      EXPECT_EQ(config.IsUsingIpv6Dhcp(), v6);
    }
  }
}

std::vector<std::string> NetworkTexts(const IpConfig& config) {
  std::vector<std::string> texts;
  for (const Ipv6Network& network : config.GetIpv6Network()) {
    texts.push_back(network.GetStringAddress());
  }
  return texts;
}

TEST(IpConfig, RemovesNetworksByAddressAndPrefix) {
  IpConfig config;
  for (const char* text :
       {"2001:db8::1/64", "2001:db8::2/64", "2001:db8::1/64", "2001:db8::1/48"}) {
    config.AddIpv6Network(Ipv6Network(text));
  }
  config.RemoveIpv6Network(Ipv6Network("2001:db8::9/64"));
  EXPECT_EQ(config.GetIpv6Network().size(), 4U);
  // The argument is an entry of the list that is being changed.
  config.RemoveIpv6Network(config.GetIpv6Network().front());
  EXPECT_EQ(NetworkTexts(config), (std::vector<std::string>{"2001:db8::2/64", "2001:db8::1/48"}));
}

TEST(IpConfig, CopiesAreIndependent) {
  IpConfig config;
  config.SetIpv4Gateway(Ipv4Address("192.0.2.1"));
  IpConfig copy = config;
  copy.SetIpv4Gateway(Ipv4Address("192.0.2.254"));
  copy.AddIpv6Network(Ipv6Network("::1/128"));
  EXPECT_EQ(config.GetIpv4Gateway().GetStringAddress(), "192.0.2.1");
  EXPECT_TRUE(config.GetIpv6Network().empty());
}

TEST(NicTeamingPolicy, SettersMarkTheirField) {
  NicTeamingPolicy policy;
  policy.SetFieldMask(0x1);
  policy.SetUplinkOrder({"eth1", "eth0"});
  EXPECT_EQ(policy.GetFieldMask(), 0x11U);
  policy.SetMaxActiveUplinks(2);
  EXPECT_EQ(policy.GetFieldMask(), 0x51U);
  EXPECT_EQ(policy.GetUplinkOrder(), (std::vector<std::string>{"eth1", "eth0"}));
  EXPECT_EQ(policy.GetMaxActiveUplinks(), 2);
}

}  // namespace
}  // namespace Nodeplane::Network
