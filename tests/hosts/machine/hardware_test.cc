#include <gtest/gtest.h>
#include <sys/utsname.h>

#include <string>
#include <vector>

#include "hosts/machine/readers.h"
#include "tests/hosts/machine/made_up_tree.h"

namespace Machine {
namespace {

TEST(Processor, ModelAndSockets) {
  utsname system{};
  uname(&system);
  const std::string architecture = std::string(system.machine) + " processor";
  struct Row {
    std::string cpuinfo;
    std::string model;
    int sockets;
  };
  const std::vector<Row> rows = {
      {"processor\t: 0\nmodel name\t: Made-Up CPU @ 2.00GHz\nphysical id\t: 0\ncore id\t: 0\n\n"
       "processor\t: 1\nmodel name\t: Made-Up CPU @ 2.00GHz\nphysical id\t: 1\ncore id\t: 0\n\n"
       "processor\t: 2\nmodel name\t: Made-Up CPU @ 2.00GHz\nphysical id\t: 0\ncore id\t: 1\n",
       "Made-Up CPU @ 2.00GHz", 2},
      {"model name : A\nphysical id : 3\n", "A", 1},
      {"processor\t: 0\nmodel name\t: A: B \nprocessor\t: 1\nmodel name\t: C\n", "A: B", 1},
      {"processor\t: 0\nCPU implementer\t: 0x41\n\nModel\t\t: Small Board\n", "Small Board", 1},
      {"model name\t:\n::::\n\n:\nmodel name", architecture, 1},
      {"", architecture, 1},
  };
  for (const Row& row : rows) {
    const MadeUpTree tree{{"/proc/cpuinfo", row.cpuinfo}};
    const Processor processor = ReadProcessor(tree.AsSources());
    EXPECT_EQ(processor.model, row.model) << row.cpuinfo;
    EXPECT_EQ(processor.sockets, row.sockets) << row.cpuinfo;
  }
}

TEST(Memory, TotalInBytes) {
  const std::vector<std::pair<std::string, uint64_t>> rows = {
      {"MemFree: 7 kB\nMemTotal:  8589934592 kB\n", 8589934592ULL * 1024},
      {"MemTotal: 99999999999999999999999 kB\n", 0},
      {"MemTotal: lots\n", 0},
  };
  for (const auto& [meminfo, total] : rows) {
    const MadeUpTree tree{{"/proc/meminfo", meminfo}};
    EXPECT_EQ(ReadMemory(tree.AsSources()).totalBytes, total) << meminfo;
  }
}

TEST(Firmware, TextsAreFirstLinesAsTheyAre) {
  const MadeUpTree tree{{"/sys/class/dmi/id/product_name", " Box\t\xff 1 \nsecond line\n"}};
  EXPECT_EQ(ReadFirmware(tree.AsSources()).product, " Box\t\xff 1 ");
  EXPECT_EQ(ReadFirmware(tree.AsSources()).vendor, "");
}

TEST(PciDevices, AreNamedAndSortedWithoutBrokenOnes) {
  MadeUpTree tree{{"/sys/bus/pci/devices/0000:00:00.0/class", "0x020000\n"}};
  for (const char* address : {"0000:01:00.1", "10000:00:00.0", "0000:00:1f.2", "no-address"}) {
    const std::string directory = std::string("/sys/bus/pci/devices/") + address;
    tree.Write(directory + "/vendor", "0xfffe\n");
    tree.Write(directory + "/device", "0x1234\n");
    tree.Write(directory + "/class", "0x030000\n");
  }
  tree.Link("/sys/bus/pci/devices/0000:00:1f.2/driver", "/sys/bus/pci/drivers/made-up-driver");
  const std::vector<PciDevice> devices = ReadPciDevices(tree.AsSources());
  ASSERT_EQ(devices.size(), 3U);
  EXPECT_EQ(devices[0].address, "0000:00:1f.2");
  EXPECT_EQ(devices[0].deviceClass, 0x0300);
  EXPECT_EQ(devices[0].device, "Device 1234");
  EXPECT_EQ(devices[0].driver, "made-up-driver");
  EXPECT_EQ(devices[1].address, "0000:01:00.1");
  EXPECT_EQ(devices[1].driver, "");
  EXPECT_EQ(devices[2].address, "10000:00:00.0");
}

}  // namespace
}  // namespace Machine
