#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "hostapi/nodeplane/exception.h"
#include "hostapi/nodeplane/ip_address.h"

namespace Nodeplane::Network {
namespace {

using namespace std::string_literals;

using Texts = std::vector<std::string>;
// Texts with the form in which they are shown.
using Forms = std::vector<std::pair<std::string, std::string>>;

// The check and the constructor must agree on every text.
template <typename Address>
void ExpectForms(bool (*isValid)(const std::string&), std::string (Address::*show)() const,
                 const Forms& taken, const Texts& refused) {
  for (const auto& [text, shown] : taken) {
    EXPECT_TRUE(isValid(text)) << text;
    EXPECT_EQ((Address(text).*show)(), shown);
    EXPECT_TRUE(Address(shown) == Address(text)) << text;
  }
  for (const std::string& text : refused) {
    SCOPED_TRACE(testing::PrintToString(text));
    EXPECT_FALSE(isValid(text));
    EXPECT_THROW(Address{text}, Lib::NodeplaneException);
  }
}

TEST(Ipv4Address, IsFourDecimalNumbers) {
  const Forms taken = {
      {"0.0.0.0", "0.0.0.0"},
      {"255.255.255.255", "255.255.255.255"},
      {"010.001.000.099", "10.1.0.99"},
  };
  const Texts refused({"", "...", "256.0.0.1", "0.0.0.256", "0.0.0.0001", "1.2.3", "1.2.3.4.",
                       "1.2.3.4.5", "1..2.3", "-1.2.3.4", "+1.2.3.4", "0x1.2.3.4", " 1.2.3.4",
                       "1.2.3.4\n", "1.2.3.4\0"s, "::1"});
  ExpectForms(Ipv4Address::IsValidAddress, &Ipv4Address::GetStringAddress, taken, refused);
  EXPECT_EQ(Ipv4Address("255.254.253.1").GetBinaryAddress(), 0xFFFEFD01U);
}

TEST(Ipv4Address, NetmaskIsOnesThenZeros) {
  for (const char* text : {"128.0.0.0", "255.255.240.0", "255.255.255.254", "255.255.255.255"}) {
    EXPECT_TRUE(Ipv4Address(text).IsValidNetmask()) << text;
  }
  for (const char* text : {"0.0.0.0", "0.0.0.1", "127.255.255.255", "255.0.255.0", "255.255.0.1"}) {
    EXPECT_FALSE(Ipv4Address(text).IsValidNetmask()) << text;
  }
}

TEST(Ipv6Address, ShowsTheShortestForm) {
  const Forms taken = {
      {"0:0:0:0:0:0:0:0", "::"},
      {"2001:0DB8:0000:0001:0000:0000:0000:0001", "2001:db8:0:1::1"},
      // The longer run of zeros is cut, of equal ones the first; a single zero stays.
      {"1:0:0:2:0:0:0:3", "1:0:0:2::3"},
      {"1:0:0:2:3:0:0:4", "1::2:3:0:0:4"},
      {"1:2:3::5:6:7:8", "1:2:3:0:5:6:7:8"},
      {"::ffff:192.0.2.2", "::ffff:192.0.2.2"},
      {"fe80::1%123456789012345", "fe80::1%123456789012345"},
  };
  const Texts refused({"", ":::", "1:2:3:4:5:6:7", "1:2:3:4:5:6:7:8:9", "1::2::3",
                       "12345::", "g::", " ::1", "::1 ", "::1\0"s, "::1\0%eth0"s, "::1/64",
                       "192.0.2.2", "%eth0", "fe80::1%", "fe80::1%1234567890123456",
                       "fe80::1%%eth0", "fe80::1%eth 0", "fe80::1%eth/0"});
  ExpectForms(Ipv6Address::IsValidAddress, &Ipv6Address::GetScopedStringAddress, taken, refused);
  // The scope is no part of the address.
  EXPECT_TRUE(Ipv6Address("fe80::1%eth0") == Ipv6Address("fe80::1%eth1"));
}

TEST(Ipv6Address, LinkLocalByTheFirstTenBits) {
  for (const char* text : {"fe80::", "fea0::", "febf:ffff::1"}) {
    EXPECT_TRUE(Ipv6Address(text).IsLinkLocal()) << text;
  }
  for (const char* text : {"::", "fe7f:ffff::1", "fec0::", "ff82::1", "80fe::1"}) {
    EXPECT_FALSE(Ipv6Address(text).IsLinkLocal()) << text;
  }
}

TEST(Ipv6Network, IsAddressSlashPrefix) {
  const Forms taken = {
      {"2001:db8:0:0::1/64", "2001:db8::1/64"},
      {"::/1", "::/1"},
      {"::1/128", "::1/128"},
      {"::1/064", "::1/64"},
      {"fe80::1%eth0/64", "fe80::1/64"},
  };
  const Texts refused({"", "/64", "::1", "::1/", "::1/0", "::1/129", "::1/0064", "::1/64/64",
                       "::1/-1", "::1/+1", "::1/6x", "::1/ 64", "::1 /64", "::1/64\0"s,
                       "fe80::1/64%eth0", "192.0.2.2/24"});
  ExpectForms(Ipv6Network::IsValidAddressAndNetmask, &Ipv6Network::GetStringAddress, taken,
              refused);
  EXPECT_EQ(Ipv6Network("2001:db8::1/48").GetIpv6Scope(), Ipv6Network::GLOBAL);
  EXPECT_EQ(Ipv6Network("fe80::1/64").GetIpv6Scope(), Ipv6Network::LINK_LOCAL);
  EXPECT_FALSE(Ipv6Network("2001:db8::1/48") == Ipv6Network("2001:db8::1/64"));
}

TEST(MacAddress, IsSixPairsOfHexadecimalDigits) {
  const Forms taken = {{"02:fc:00:00:00:01", "02:fc:00:00:00:01"},
                       {"FF:Ff:fF:AB:cd:09", "ff:ff:ff:ab:cd:09"}};
  const Texts refused({"", "02:fc:00:00:00:0", "02:fc:00:00:00:01:", "02-fc-00-00-00-01",
                       "02:fc:00:00:00:0g", "02:fc:00:00:00:-1", "02fc:00:00:00:011",
                       "02:fc:00:00:00:0\0"s});
  ExpectForms(MacAddress::IsValidAddress, &MacAddress::GetStringAddress, taken, refused);
}

}  // namespace
}  // namespace Nodeplane::Network
