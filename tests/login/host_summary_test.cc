#include "login/host_summary.h"

#include <gtest/gtest.h>

namespace Tarnel {

namespace {

using Nodeplane::Network::Ipv4Address;

constexpr uint64_t MIB = uint64_t{1} << 20;
constexpr uint64_t GIB = uint64_t{1} << 30;
constexpr uint64_t TIB = uint64_t{1} << 40;
constexpr uint64_t PIB = uint64_t{1} << 50;

struct MemoryCase {
  uint64_t total;
  const char* line;
};

TEST(MemoryLine, HasOneDecimalInTheLargestUnit) {
  for (const MemoryCase& row : {
           MemoryCase{0, "0 MiB Memory"},
           MemoryCase{512 * MIB + MIB / 2, "512.5 MiB Memory"},
           MemoryCase{1023 * MIB, "1023 MiB Memory"},
           MemoryCase{GIB - 1, "1024 MiB Memory"},
           MemoryCase{GIB, "1 GiB Memory"},
           MemoryCase{GIB + GIB / 32, "1 GiB Memory"},
           MemoryCase{GIB + GIB / 16, "1.1 GiB Memory"},
           MemoryCase{16 * GIB - 100 * MIB, "15.9 GiB Memory"},
           MemoryCase{16 * GIB - 10 * MIB, "16 GiB Memory"},
           MemoryCase{1023 * GIB, "1023 GiB Memory"},
           MemoryCase{TIB, "1 TiB Memory"},
           MemoryCase{TIB + TIB / 2, "1.5 TiB Memory"},
           MemoryCase{PIB, "1 PiB Memory"},
           MemoryCase{1000 * PIB, "1000 PiB Memory"},
       }) {
    EXPECT_EQ(MemoryLine(row.total), row.line) << row.total;
  }
}

struct CpuCase {
  int packages;
  const char* model;
  const char* line;
};

TEST(CpuLine, NamesTheNumberOfSocketsFromTwoOn) {
  for (const CpuCase& row :
       {CpuCase{0, "Core", "Core"}, CpuCase{1, "  Core \t 6214  ", "Core 6214"},
        CpuCase{2, "Core", "2 x Core"}, CpuCase{16, "", "16 x "}}) {
    EXPECT_EQ(CpuLine(row.packages, row.model), row.line);
  }
}

struct MachineCase {
  const char* vendor;
  const char* product;
  const char* name;
};

TEST(MachineName, SaysTheVendorOnce) {
  for (const MachineCase& row :
       {MachineCase{"Halden", "R240", "Halden R240"},
        MachineCase{"Halden", "Halden R240", "Halden R240"},
        MachineCase{" Halden  Systems\n", "Halden\tSystems  R240 ", "Halden Systems R240"},
        MachineCase{"Halden", "halden R240", "Halden halden R240"},
        MachineCase{"Halden", "The Halden", "Halden The Halden"}, MachineCase{"", "R240", "R240"},
        MachineCase{"Halden", "", "Halden "}, MachineCase{"", "", ""}}) {
    EXPECT_EQ(MachineName(row.vendor, row.product), row.name);
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
  for (const OriginCase& row : {
           OriginCase{false, false, false, "192.0.2.20", "\nhttp://192.0.2.20/ (STATIC)"},
           OriginCase{false, false, true, "0.0.0.0", "\nhttp://0.0.0.0/ (STATIC)"},
           OriginCase{true, false, true, "192.0.2.20", ""},
           OriginCase{false, true, true, "0.0.0.0", "\nhttp://0.0.0.0/ (DHCP)"},
           OriginCase{false, true, false, "192.0.2.20",
                      "\nhttp://192.0.2.20/ (Waiting for DHCP...)"},
           OriginCase{false, true, false, "0.0.0.0", "\nhttp://0.0.0.0/ "},
           // Without a line of its own the origin stands behind the line before.
           OriginCase{true, true, true, "192.0.2.20", "(DHCP)"},
           OriginCase{true, true, false, "192.0.2.20", "(Waiting for DHCP...)"},
           OriginCase{true, true, false, "0.0.0.0", ""},
       }) {
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
  constexpr char FOUR[] =
      "http://[fe80::1]/ \n"
      "http://[2001:db8::d:7]/ (DHCP)\n"
      "http://[2001:db8::20]/ (STATIC)\n"
      "http://[2001:db8:0:1:2:3:4:5]/ (AUTOCONF)\n";
  const std::string five =
      "http://[fe80::1]/ \n"
      "http://[2001:db8:5::9]/ \n"
      "http://[2001:db8::d:7]/ (DHCP)\n"
      "http://[2001:db8::20]/ (STATIC)\n"
      "http://[2001:db8:0:1:2:3:4:5]/ (AUTOCONF)\n";
  for (const auto& [count, lines] : {std::pair<size_t, std::string>{0, ""},
                                     {1, "http://[2001:db8:0:1:2:3:4:5]/ (AUTOCONF)\n"},
                                     {4, FOUR},
                                     {5, five},
                                     {6, std::string(FOUR) + "...\n"}}) {
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
