#include "hosts/machine/facts.h"

#include <arpa/inet.h>
#include <gtest/gtest.h>
#include <netinet/ether.h>
#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <string>

namespace Machine {
namespace {

bool IsAddress(int family, const std::string& text) {
  in6_addr address{};
  return inet_pton(family, text.c_str(), &address) == 1;
}

TEST(Facts, OfNoMachineAreDefaults) {
  const Facts facts = ReadFacts({"/nonexistent"});
  EXPECT_NE(facts.processor.model, "");
  EXPECT_EQ(facts.processor.sockets, 1);
  EXPECT_EQ(facts.memory.totalBytes, 0U);
  EXPECT_EQ(facts.firmware.vendor, "");
  EXPECT_TRUE(facts.adapters.empty());
  EXPECT_FALSE(facts.ipv6Enabled);
  EXPECT_EQ(facts.hostName.name, "localhost");
  EXPECT_TRUE(facts.pciDevices.empty());
}

// The same facts, asked of the kernel in another way.
TEST(Facts, OfThisMachineAreTrue) {
  if (!std::filesystem::exists("/proc/meminfo")) GTEST_SKIP() << "no /proc here";
  const Facts facts = ReadFacts();
  EXPECT_NE(facts.processor.model, "");
  EXPECT_GE(facts.processor.sockets, 1);
  EXPECT_LE(facts.processor.sockets, sysconf(_SC_NPROCESSORS_CONF));
  EXPECT_EQ(facts.memory.pageSize, static_cast<uint64_t>(sysconf(_SC_PAGESIZE)));
  EXPECT_EQ(facts.memory.totalBytes / facts.memory.pageSize,
            static_cast<uint64_t>(sysconf(_SC_PHYS_PAGES)));
  char name[256] = "";
  ASSERT_EQ(gethostname(name, sizeof name), 0);
  EXPECT_TRUE(std::string(name).starts_with(facts.hostName.name)) << name;
}

TEST(Facts, OfThisMachineAreWellFormed) {
  const Facts facts = ReadFacts();
  for (const Adapter& adapter : facts.adapters) {
    EXPECT_NE(adapter.name, "lo");
    EXPECT_EQ(adapter.mac.size(), 17U) << adapter.mac;
    EXPECT_NE(ether_aton(adapter.mac.c_str()), nullptr) << adapter.mac;
  }
  const ManagementInterface& management = facts.management;
  EXPECT_EQ(management.ipv4.address.empty(), management.ipv4.netmask.empty());
  EXPECT_TRUE(management.ipv4.address.empty() || IsAddress(AF_INET, management.ipv4.address));
  for (const Ipv6& address : management.ipv6) EXPECT_TRUE(IsAddress(AF_INET6, address.address));
  const auto byAddress = [](const PciDevice& left, const PciDevice& right) {
    return left.address < right.address;
  };
  EXPECT_TRUE(std::is_sorted(facts.pciDevices.begin(), facts.pciDevices.end(), byAddress));
  for (const PciDevice& device : facts.pciDevices) EXPECT_NE(device.device, "") << device.address;
}

}  // namespace
}  // namespace Machine
