#include "hostapi/nodeplane/ip_config.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace Nodeplane::Network {
namespace {

std::string Modes(const IpConfig& config) {
  return std::string(config.GetUseDhcp() ? "dhcp " : "") + (config.GetIpv4UseNone() ? "none" : "");
}

TEST(IpConfig, Ipv4ModesAfterChanges) {
  IpConfig config;
  EXPECT_EQ(Modes(config), "");
  config.SetIpv4UseNone();
  config.SetUseDhcp(false);
  config.SetIpv4Netmask(Ipv4Address("255.0.0.0"));
  EXPECT_EQ(Modes(config), "none");
  config.SetIpv4Address(Ipv4Address("10.0.0.1"));
  EXPECT_EQ(Modes(config), "");
  config.SetUseDhcp(true, true);
  EXPECT_EQ(Modes(config), "dhcp ");
  config.SetIpv4UseNone();
  EXPECT_EQ(Modes(config), "dhcp none");
  config.SetUseDhcp(true);
  config.SetIpv4Address(Ipv4Address("10.0.0.1"));
  EXPECT_EQ(Modes(config), "dhcp ");
  config.SetUseDhcp(false, true);
  EXPECT_EQ(Modes(config), "none");
  config.SetUseDhcp(false, false);
  EXPECT_EQ(Modes(config), "");
}

TEST(IpConfig, RemovesNetworksByAddressAndPrefix) {
  IpConfig config;
  for (const char* text :
       {"2001:db8::1/64", "2001:db8::2/64", "2001:db8::1/64", "2001:db8::1/48"}) {
    config.AddIpv6Network(Ipv6Network(text));
  }
  // The argument is an entry of the list that is being changed.
  config.RemoveIpv6Network(config.GetIpv6Network().front());
  EXPECT_EQ(config.GetIpv6Network(),
            (std::vector{Ipv6Network("2001:db8::2/64"), Ipv6Network("2001:db8::1/48")}));
}

}  // namespace
}  // namespace Nodeplane::Network
