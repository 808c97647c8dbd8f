#include "hosts/machine/facts.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <string>

namespace Machine {
namespace {

TEST(Facts, OfNoMachineAreDefaults) {
  const Facts facts = ReadFacts({"/nonexistent"});
  EXPECT_NE(facts.processor.model, "");
  EXPECT_EQ(facts.processor.sockets, 1);
  EXPECT_EQ(facts.memory.totalBytes, 0U);
  // A lab that shares the machine's network sees the link in use, which no file tells of.
  EXPECT_EQ(facts.adapters.size(), facts.management.name.empty() ? 0U : 1U);
  EXPECT_FALSE(facts.ipv6Enabled);
  EXPECT_EQ(facts.hostName.name, "localhost");
  EXPECT_TRUE(facts.pciDevices.empty());
}

// The same facts, asked of the kernel in another way.
TEST(Facts, OfThisMachineAreTrue) {
  const Facts facts = ReadFacts();
  EXPECT_GE(facts.processor.sockets, 1);
  EXPECT_LE(facts.processor.sockets, sysconf(_SC_NPROCESSORS_CONF));
  EXPECT_EQ(facts.memory.totalBytes / facts.memory.pageSize,
            static_cast<uint64_t>(sysconf(_SC_PHYS_PAGES)));
  char name[256] = "";
  ASSERT_EQ(gethostname(name, sizeof name), 0);
  EXPECT_TRUE(std::string(name).starts_with(facts.hostName.name)) << name;
}

}  // namespace
}  // namespace Machine
