#include <gtest/gtest.h>
#include <sys/utsname.h>

#include <string>
#include <vector>

#include "hosts/machine/readers.h"
#include "tests/hosts/machine/made_up_tree.h"

namespace Machine {
namespace {

std::string ThisArchitecture() {
  utsname system{};
  uname(&system);
  return std::string(system.machine) + " processor";
}

TEST(Processor, ModelAndSockets) {
  struct Row {
    const char* name;
    std::string cpuinfo;
    std::string model;
    int sockets;
  };
  const std::vector<Row> rows = {
      {"two sockets with two cores each",
       "processor\t: 0\nmodel name\t: Made-Up CPU @ 2.00GHz\nphysical id\t: 0\ncore id\t: 0\n\n"
       "processor\t: 1\nmodel name\t: Made-Up CPU @ 2.00GHz\nphysical id\t: 1\ncore id\t: 0\n\n"
       "processor\t: 2\nmodel name\t: Made-Up CPU @ 2.00GHz\nphysical id\t: 0\ncore id\t: 1\n\n"
       "processor\t: 3\nmodel name\t: Made-Up CPU @ 2.00GHz\nphysical id\t: 1\ncore id\t: 1\n",
       "Made-Up CPU @ 2.00GHz", 2},
      {"a lone socket whose number is not 0", "model name : A\nphysical id : 3\n", "A", 1},
      {"no physical id", "processor\t: 0\nmodel name\t: A: B \nprocessor\t: 1\nmodel name\t: C\n",
       "A: B", 1},
      {"another architecture's key", "processor : 0\ncpu\t\t: MADE9 (architected)\n",
       "MADE9 (architected)", 1},
      {"ARM names the board at the end",
       "processor\t: 0\nCPU implementer\t: 0x41\nCPU architecture: 8\n\nModel\t\t: Small Board\n",
       "Small Board", 1},
      {"no model at all", "processor\t: 0\nCPU implementer\t: 0x41\n", ThisArchitecture(), 1},
      {"an empty model", "model name\t:\n", ThisArchitecture(), 1},
      {"noise", "::::\n\n:\nmodel name", ThisArchitecture(), 1},
      {"empty file", "", ThisArchitecture(), 1},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    MadeUpTree tree;
    tree.Write("/proc/cpuinfo", row.cpuinfo);
    const Processor processor = ReadProcessor(tree.AsSources());
    EXPECT_EQ(processor.model, row.model);
    EXPECT_EQ(processor.sockets, row.sockets);
  }
}

TEST(Memory, TotalInBytes) {
  const std::vector<std::pair<std::string, uint64_t>> rows = {
      {"MemTotal:       24683620 kB\nMemFree:        1 kB\n", 24683620ULL * 1024},
      {"MemFree: 7 kB\nMemTotal: 8589934592 kB\n", 8589934592ULL * 1024},
      {"MemTotal: lots\n", 0},
      {"MemTotal: 99999999999999999999999 kB\n", 0},
      {"", 0},
  };
  for (const auto& [meminfo, total] : rows) {
    MadeUpTree tree;
    tree.Write("/proc/meminfo", meminfo);
    EXPECT_EQ(ReadMemory(tree.AsSources()).totalBytes, total) << meminfo;
  }
}

TEST(Firmware, TextsAsTheFirmwareHasThem) {
  MadeUpTree tree;
  tree.Write("/sys/class/dmi/id/sys_vendor", " Made Up Inc.  \n");
  tree.Write("/sys/class/dmi/id/product_name", "Box\t\xff 1\nsecond line\n");
  tree.Write("/sys/class/dmi/id/product_serial", "");
  tree.Write("/sys/class/dmi/id/bios_date", "02/29/2024");
  const Firmware firmware = ReadFirmware(tree.AsSources());
  EXPECT_EQ(firmware.vendor, " Made Up Inc.  ");
  EXPECT_EQ(firmware.product, "Box\t\xff 1");
  EXPECT_EQ(firmware.serialNumber, "");
  EXPECT_EQ(firmware.biosDate, "02/29/2024");
  EXPECT_EQ(firmware.biosVersion, "");
}

void AddPciDevice(MadeUpTree& tree, const std::string& address, const std::string& vendor,
                  const std::string& device, const std::string& deviceClass) {
  const std::string directory = "/sys/bus/pci/devices/" + address + "/";
  tree.Write(directory + "vendor", vendor + "\n");
  tree.Write(directory + "device", device + "\n");
  tree.Write(directory + "class", deviceClass + "\n");
}

TEST(PciDevices, AreNamedAndSorted) {
  MadeUpTree tree;
  AddPciDevice(tree, "0000:01:00.1", "0xfffe", "0x1234", "0x030000");
  AddPciDevice(tree, "0000:00:1f.2", "0x8086", "0x100e", "0x020000");
  AddPciDevice(tree, "10000:00:00.0", "0x8086", "0x100e", "0x020000");
  tree.Link("/sys/bus/pci/devices/0000:00:1f.2/driver", "/sys/bus/pci/drivers/made-up-driver");
  const std::vector<PciDevice> devices = ReadPciDevices(tree.AsSources());
  ASSERT_EQ(devices.size(), 3U);
  EXPECT_EQ(devices[0].address, "0000:00:1f.2");
  EXPECT_EQ(devices[0].deviceClass, 0x0200);
  EXPECT_EQ(devices[0].driver, "made-up-driver");
  EXPECT_NE(devices[0].vendor, "");
  EXPECT_EQ(devices[1].address, "0000:01:00.1");
  EXPECT_EQ(devices[1].deviceClass, 0x0300);
  EXPECT_EQ(devices[1].device, "Device 1234");
  EXPECT_EQ(devices[1].driver, "");
  EXPECT_EQ(devices[2].address, "10000:00:00.0");
}

TEST(PciDevices, BrokenTreesGiveNone) {
  EXPECT_TRUE(ReadPciDevices({"/nonexistent"}).empty());
  MadeUpTree notADirectory;
  notADirectory.Write("/sys/bus/pci/devices", "");
  EXPECT_TRUE(ReadPciDevices(notADirectory.AsSources()).empty());
}

TEST(PciDevices, BrokenEntriesAreLeftOut) {
  MadeUpTree tree;
  AddPciDevice(tree, "0000:00:01.0", "0x8086", "0x100e", "0x020000");
  AddPciDevice(tree, "not-an-address", "0x8086", "0x100e", "0x020000");
  tree.Write("/sys/bus/pci/devices/0000:00:00.0/class", "0x020000\n");
  const std::vector<PciDevice> devices = ReadPciDevices(tree.AsSources());
  ASSERT_EQ(devices.size(), 1U);
  EXPECT_EQ(devices[0].address, "0000:00:01.0");
}

}  // namespace
}  // namespace Machine
