#include <gtest/gtest.h>

#include <optional>
#include <string>
#include <vector>

#include "hostapi/nodeplane/exception.h"
#include "hostapi/nodeplane/ip_address.h"

namespace Nodeplane::Network {
namespace {

using namespace std::string_literals;

struct TextCase {
  std::string input;
  // The text form of the parsed address; none for an input that is no address.
  std::optional<std::string> expected;
};

// The check and the constructor must agree on every input.
template <typename Address>
void ExpectParsed(const TextCase& textCase, bool (*isValid)(const std::string&),
                  std::string (Address::*text)() const = &Address::GetStringAddress) {
  SCOPED_TRACE("input: " + testing::PrintToString(textCase.input));
  EXPECT_EQ(isValid(textCase.input), textCase.expected.has_value());
  if (!textCase.expected) {
    EXPECT_THROW(Address{textCase.input}, Lib::NodeplaneException);
    return;
  }
  const Address address(textCase.input);
  EXPECT_EQ((address.*text)(), *textCase.expected);
  EXPECT_TRUE(Address((address.*text)()) == address);
}

TEST(Ipv4Address, IsFourDecimalNumbers) {
  const std::vector<TextCase> cases = {
      {"192.0.2.2", "192.0.2.2"},
      {"0.0.0.0", "0.0.0.0"},
      {"255.255.255.255", "255.255.255.255"},
      {"010.001.000.099", "10.1.0.99"},
      {"256.0.0.1", {}},
      {"0.0.0.256", {}},
      {"999.0.0.1", {}},
      {"0000.0.0.1", {}},
      {"0.0.0.0001", {}},
      {"1.2.3", {}},
      {"1.2.3.", {}},
      {"1.2.3.4.", {}},
      {"1.2.3.4.5", {}},
      {".1.2.3.4", {}},
      {"1..2.3", {}},
      {"-1.2.3.4", {}},
      {"+1.2.3.4", {}},
      {"0x1.2.3.4", {}},
      {"a.b.c.d", {}},
      {"", {}},
      {".", {}},
      {"...", {}},
      {" 1.2.3.4", {}},
      {"1.2.3.4 ", {}},
      {"1.2.3.4\n", {}},
      {"1. 2.3.4", {}},
      {"1.2.3.4\0"s, {}},
      {"1.2.3\0.4"s, {}},
      {std::string(100'000, '1'), {}},
      {"::1", {}},
  };
  for (const TextCase& textCase : cases) {
    ExpectParsed<Ipv4Address>(textCase, Ipv4Address::IsValidAddress);
  }
}

TEST(Ipv4Address, CountsInHostByteOrder) {
  EXPECT_EQ(Ipv4Address().GetBinaryAddress(), 0U);
  EXPECT_EQ(Ipv4Address("10.0.0.1").GetBinaryAddress(), 0x0A000001U);
  EXPECT_EQ(Ipv4Address("255.254.253.252").GetBinaryAddress(), 0xFFFEFDFCU);
}

TEST(Ipv4Address, NetmaskIsOnesThenZeros) {
  uint32_t mask = 0;
  for (int ones = 1; ones <= 32; ++ones) {
    mask = mask >> 1 | 0x80000000U;
    const std::string text = std::to_string(mask >> 24) + "." + std::to_string(mask >> 16 & 255) +
                             "." + std::to_string(mask >> 8 & 255) + "." +
                             std::to_string(mask & 255);
    EXPECT_TRUE(Ipv4Address(text).IsValidNetmask()) << text;
  }
  for (const char* text : {"0.0.0.0", "0.0.0.1", "127.255.255.255", "255.0.255.0", "255.255.0.1",
                           "0.255.255.255", "255.255.255.253", "192.0.2.2"}) {
    EXPECT_FALSE(Ipv4Address(text).IsValidNetmask()) << text;
  }
}

TEST(Ipv6Address, ShowsTheShortestForm) {
  const std::vector<TextCase> cases = {
      {"::", "::"},
      {"0:0:0:0:0:0:0:0", "::"},
      {"::1", "::1"},
      {"1::", "1::"},
      {"2001:DB8:0:0:0:0:0:1", "2001:db8::1"},
      {"2001:0db8:0000:0001:0000:0000:0000:0001", "2001:db8:0:1::1"},
      // The longer run of zeros is cut, of equal ones the first; a single zero stays.
      {"1:0:0:2:0:0:0:3", "1:0:0:2::3"},
      {"1:0:0:2:3:0:0:4", "1::2:3:0:0:4"},
      {"1:2:3:0:5:6:7:8", "1:2:3:0:5:6:7:8"},
      {"1:2:3::5:6:7:8", "1:2:3:0:5:6:7:8"},
      {"::ffff:192.0.2.2", "::ffff:192.0.2.2"},
      {"fe80::1", "fe80::1"},
      {"fe80::1%eth0", "fe80::1%eth0"},
      {"fe80::1%2", "fe80::1%2"},
      {"fe80::1%123456789012345", "fe80::1%123456789012345"},
      {"fe80::1%1234567890123456", {}},
      {"fe80::1%", {}},
      {"fe80::1%%eth0", {}},
      {"fe80::1%eth 0", {}},
      {"fe80::1%eth0\0"s, {}},
      {"fe80::1%eth/0", {}},
      {"%eth0", {}},
      {"", {}},
      {":", {}},
      {":::", {}},
      {"1", {}},
      {"1:2:3:4:5:6:7", {}},
      {"1:2:3:4:5:6:7:8:9", {}},
      {"1::2::3", {}},
      {":1:2:3:4:5:6:7", {}},
      {"1:2:3:4:5:6:7:", {}},
      {"12345::", {}},
      {"g::", {}},
      {" ::1", {}},
      {"::1 ", {}},
      {"::1\0"s, {}},
      {"::1\0%eth0"s, {}},
      {"::1/64", {}},
      {"::ffff:256.0.2.2", {}},
      {"192.0.2.2", {}},
      {"::" + std::string(100'000, '0'), {}},
  };
  for (const TextCase& textCase : cases) {
    ExpectParsed<Ipv6Address>(textCase, Ipv6Address::IsValidAddress,
                              &Ipv6Address::GetScopedStringAddress);
  }
}

TEST(Ipv6Address, ScopeIsNoPartOfTheAddress) {
  const Ipv6Address scoped("fe80::1%eth0");
  EXPECT_EQ(scoped.GetStringAddress(), "fe80::1");
  EXPECT_TRUE(scoped == Ipv6Address("fe80::1%eth1"));
  EXPECT_EQ(scoped.GetBinaryAddress(),
            (Ipv6Address::Bytes{0xfe, 0x80, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 1}));
}

TEST(Ipv6Address, LinkLocalByTheFirstTenBits) {
  for (const char* text : {"fe80::", "fe80::1", "fe81::1", "fe90::", "fea0::", "febf:ffff::1"}) {
    EXPECT_TRUE(Ipv6Address(text).IsLinkLocal()) << text;
  }
  for (const char* text : {"::", "fe7f:ffff::1", "fec0::", "ff02::1", "fd80::1", "80fe::1"}) {
    EXPECT_FALSE(Ipv6Address(text).IsLinkLocal()) << text;
  }
}

TEST(Ipv6Network, IsAddressSlashPrefix) {
  const std::vector<TextCase> cases = {
      {"2001:db8:0:0::1/64", "2001:db8::1/64"},
      {"::/1", "::/1"},
      {"::1/128", "::1/128"},
      {"::1/064", "::1/64"},
      {"fe80::1%eth0/64", "fe80::1/64"},
      {"::1/0", {}},
      {"::1/129", {}},
      {"::1/0064", {}},
      {"::1/", {}},
      {"::1", {}},
      {"/64", {}},
      {"", {}},
      {"::1/64/64", {}},
      {"::1/-1", {}},
      {"::1/+1", {}},
      {"::1/6x", {}},
      {"::1/ 64", {}},
      {"::1 /64", {}},
      {"::1/64 ", {}},
      {"::1/64\0"s, {}},
      {"fe80::1/64%eth0", {}},
      {"fe80::1%/64", {}},
      {"192.0.2.2/24", {}},
      {"::1/99999999999999999999", {}},
  };
  for (const TextCase& textCase : cases) {
    ExpectParsed<Ipv6Network>(textCase, Ipv6Network::IsValidAddressAndNetmask);
  }
}

TEST(Ipv6Network, KnowsItsScopeAndKeepsWhatIsSet) {
  EXPECT_EQ(Ipv6Network("fe80::1%eth0/64").GetAddress().GetScopedStringAddress(), "fe80::1%eth0");
  EXPECT_EQ(Ipv6Network("fe80::1/64").GetIpv6Scope(), Ipv6Network::LINK_LOCAL);
  Ipv6Network network("2001:db8::1/48");
  EXPECT_EQ(network.GetPrefix(), 48);
  EXPECT_EQ(network.GetIpv6Scope(), Ipv6Network::GLOBAL);
  EXPECT_EQ(network.GetIpv6AddressType(), Ipv6Network::STATIC);
  network.SetIpv6AddressType(42);
  network.SetIpv6Scope(7);
  EXPECT_EQ(network.GetIpv6AddressType(), 42);
  EXPECT_EQ(network.GetIpv6Scope(), 7);
  EXPECT_TRUE(network == Ipv6Network("2001:db8::1/48"));
  EXPECT_FALSE(network == Ipv6Network("2001:db8::1/64"));
  EXPECT_FALSE(network == Ipv6Network("2001:db8::2/48"));
}

TEST(MacAddress, IsSixPairsOfHexadecimalDigits) {
  const std::vector<TextCase> cases = {
      {"02:fc:00:00:00:01", "02:fc:00:00:00:01"},
      {"FF:Ff:fF:AB:cd:09", "ff:ff:ff:ab:cd:09"},
      {"02:fc:00:00:00", {}},
      {"02:fc:00:00:00:0", {}},
      {"02:fc:00:00:00:01:", {}},
      {"02:fc:00:00:00:01:02", {}},
      {"02-fc-00-00-00-01", {}},
      {"02:fc:00:00:00:0g", {}},
      {"02:fc:00:00:00:-1", {}},
      {"02:fc:00:00:00: 1", {}},
      {"02fc:00:00:00:011", {}},
      {"02:fc:00:00:00:0\0"s, {}},
      {"", {}},
  };
  for (const TextCase& textCase : cases) {
    ExpectParsed<MacAddress>(textCase, MacAddress::IsValidAddress);
  }
  EXPECT_EQ(MacAddress().GetStringAddress(), "00:00:00:00:00:00");
  EXPECT_FALSE(MacAddress() == MacAddress("00:00:00:00:00:01"));
}

TEST(IpAddress, TellsItsFamily) {
  const Ipv4Address v4("192.0.2.2");
  const Ipv6Address v6("fe80::1%eth0");
  const std::vector<const IpAddress*> addresses = {&v4, &v6};
  EXPECT_EQ(addresses[0]->GetFamily(), 0);
  EXPECT_EQ(addresses[0]->GetStringAddress(), "192.0.2.2");
  EXPECT_EQ(addresses[1]->GetFamily(), 1);
  EXPECT_EQ(addresses[1]->GetStringAddress(), "fe80::1");
}

}  // namespace
}  // namespace Nodeplane::Network
