#include "console/login/host_summary.h"

#include <gtest/gtest.h>

#include <tuple>
#include <utility>

namespace Tarnel {

namespace {

using Nodeplane::Network::Ipv4Address;

constexpr uint64_t MIB = uint64_t{1} << 20;
constexpr uint64_t GIB = uint64_t{1} << 30;
constexpr uint64_t TIB = uint64_t{1} << 40;

TEST(MemoryLine, HasOneDecimalInTheLargestUnit) {
  const std::pair<uint64_t, const char*> rows[] = {
      {0, "0 MiB Memory"},
      {512 * MIB + MIB / 2, "512.5 MiB Memory"},
      {1023 * MIB, "1023 MiB Memory"},
      {GIB - 1, "1024 MiB Memory"},
      {GIB, "1 GiB Memory"},
      {GIB + GIB / 32, "1 GiB Memory"},
      {GIB + GIB / 16, "1.1 GiB Memory"},
      {TIB, "1 TiB Memory"},
      {1024 * TIB, "1 PiB Memory"},
      {1024000 * TIB, "1000 PiB Memory"},
  };
  for (const auto& [total, line] : rows) {
    EXPECT_EQ(MemoryLine(total), line) << total;
  }
}

TEST(CpuLine, NamesTheNumberOfSocketsFromTwoOn) {
  EXPECT_EQ(CpuLine(0, "Core"), "Core");
  EXPECT_EQ(CpuLine(1, "  Core \t 6214  "), "Core 6214");
  EXPECT_EQ(CpuLine(2, "Core"), "2 x Core");
}

TEST(MachineName, SaysTheVendorOnce) {
  const std::tuple<const char*, const char*, const char*> rows[] = {
      {"Halden", "R240", "Halden R240"},
      {" Halden  Systems\n", "Halden\tSystems  R240 ", "Halden Systems R240"},
      {"Halden", "halden R240", "Halden halden R240"},
      {"Halden", "The Halden", "Halden The Halden"},
      {"", "R240", "R240"},
      {"Halden", "", "Halden "},
  };
  for (const auto& [vendor, product, name] : rows) {
    EXPECT_EQ(MachineName(vendor, product), name);
  }
}

std::string Text(const ManagementAddresses& addresses, const std::string& hostname = "rack7",
                 bool ipv6Enabled = false) {
  return AddressText(addresses, hostname, ipv6Enabled, *StringFactory::ForLocale("en_US"));
}

constexpr char DOWNLOAD[] = "Download tools to manage this host from:";

struct OriginCase {
  bool none, dhcp, lease;
  const char* address;
  const char* rest;
};

TEST(AddressText, TellsWhereTheIpv4AddressIsFrom) {
  const OriginCase rows[] = {
      {false, false, false, "192.0.2.20", "\nhttp://192.0.2.20/ (STATIC)"},
      {false, false, true, "0.0.0.0", "\nhttp://0.0.0.0/ (STATIC)"},
      {true, false, true, "192.0.2.20", ""},
      {false, true, true, "0.0.0.0", "\nhttp://0.0.0.0/ (DHCP)"},
      {false, true, false, "192.0.2.20", "\nhttp://192.0.2.20/ (Waiting for DHCP...)"},
      {false, true, false, "0.0.0.0", "\nhttp://0.0.0.0/ "},
      // Without a line of its own the origin stands behind the line before.
      {true, true, true, "192.0.2.20", "(DHCP)"},
      {true, true, false, "192.0.2.20", "(Waiting for DHCP...)"},
      {true, true, false, "0.0.0.0", ""},
  };
  for (const OriginCase& row : rows) {
    EXPECT_EQ(Text({row.dhcp, row.none, row.lease, Ipv4Address(row.address), {}}),
              std::string(DOWNLOAD) + "\nhttp://rack7/ " + row.rest);
  }
}

TEST(AddressText, LeavesOutAHostNameThatIsNone) {
  for (const char* const hostname : {"", "localhost"}) {
    EXPECT_EQ(Text({}, hostname), std::string(DOWNLOAD) + "\nhttp://0.0.0.0/ (STATIC)");
  }
  EXPECT_EQ(Text({}, "localhost2"),
            std::string(DOWNLOAD) + "\nhttp://localhost2/ \nhttp://0.0.0.0/ (STATIC)");
}

TEST(AddressText, ShowsAllOfFiveIpv6AddressesAndFourOfMore) {
  struct Source {
    const char* address;
    int type;
  };
  constexpr Source SOURCES[] = {
      {"2001:db8:0:1:2:3:4:5/64", 7}, {"2001:db8::20/64", 0},   {"fe80::1/64", 3},
      {"2001:db8::d:7/128", 9},       {"2001:db8:5::9/64", 12}, {"::1/128", 0}};
  const std::string shortest = "http://[fe80::1]/ \n";
  const std::string rest =
      "http://[2001:db8::d:7]/ (DHCP)\n"
      "http://[2001:db8::20]/ (STATIC)\n"
      "http://[2001:db8:0:1:2:3:4:5]/ (AUTOCONF)\n";
  const std::string second = "http://[2001:db8:5::9]/ \n" + rest;
  for (const auto& [count, lines] : {std::pair<size_t, std::string>{0, ""},
                                     {4, shortest + rest},
                                     {5, shortest + second},
                                     {6, shortest + rest + "...\n"}}) {
    ManagementAddresses addresses;
    addresses.ipv4None = true;
    for (size_t i = 0; i < count; ++i) {
      addresses.ipv6.emplace_back(SOURCES[i].address);
      addresses.ipv6.back().SetIpv6AddressType(SOURCES[i].type);
    }
    EXPECT_EQ(Text(addresses, "", true), std::string(DOWNLOAD) + "\n" + lines) << count;
    EXPECT_EQ(Text(addresses, "", false), DOWNLOAD) << count;
  }
}

}  // namespace

}  // namespace Tarnel
