#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "hosts/machine/pci_address.h"
#include "hosts/machine/readers.h"
#include "tests/hosts/machine/made_up_tree.h"

namespace Machine {
namespace {

struct NetLink {
  std::string name;
  int index;
  // The index of the other end; the same for a link without one.
  int peer;
  std::string type = "1";
  std::string uevent{};
  // Where the device sits; empty for a virtual link.
  std::string device{};
  std::string carrier = "1\n";
};

void AddLink(MadeUpTree& tree, const NetLink& link) {
  const std::string directory = "/sys/class/net/" + link.name + "/";
  tree.Write(directory + "type", link.type + "\n");
  tree.Write(directory + "ifindex", std::to_string(link.index) + "\n");
  tree.Write(directory + "iflink", std::to_string(link.peer) + "\n");
  tree.Write(directory + "uevent", link.uevent + "INTERFACE=" + link.name + "\n");
  tree.Write(directory + "address", "02:00:00:00:00:0" + std::to_string(link.index % 10) + "\n");
  tree.Write(directory + "carrier", link.carrier);
  if (!link.device.empty()) tree.Link(directory + "device", link.device);
}

const NetLink LOOPBACK = {"lo", 1, 1, "772"};
const NetLink DUMMY = {"dummy0", 2, 2};
const NetLink BRIDGE = {"br0", 3, 3, "1", "DEVTYPE=bridge\n"};
const NetLink TUNNEL = {"tun0", 4, 4, "65534"};
const NetLink VLAN = {"eth0.5", 5, 9, "1", "DEVTYPE=vlan\n"};
const NetLink CONTAINER_END = {"eth0", 6, 77};

std::string Names(const std::vector<Adapter>& adapters) {
  std::string names;
  for (const Adapter& adapter : adapters) names += adapter.name + " ";
  return names;
}

TEST(Adapters, PhysicalEthernetOnly) {
  const NetLink first = {"enp3s0", 9, 9, "1", "", "/sys/devices/pci0000:00/0000:00:03.0"};
  const NetLink second = {"a-usb0", 10, 10, "1", "", "/sys/devices/usb1/1-1"};
  const NetLink infiniband = {"ib0", 11, 11, "32", "", "/sys/devices/pci0000:00/0000:00:05.0"};
  const NetLink wireless = {"wlan0", 12, 12, "1", "DEVTYPE=wlan\n", "/sys/devices/pci0/card"};
  struct Row {
    const char* name;
    std::vector<NetLink> links;
    std::string expected;
  };
  const std::vector<Row> rows = {
      {"in the kernel's order, not by name", {second, first, LOOPBACK}, "enp3s0 a-usb0 "},
      {"virtual links beside a device", {LOOPBACK, BRIDGE, VLAN, CONTAINER_END, first}, "enp3s0 "},
      {"not Ethernet", {infiniband, LOOPBACK}, ""},
      {"wireless has a device", {wireless}, "wlan0 "},
      {"a container", {LOOPBACK, DUMMY, BRIDGE, TUNNEL, VLAN, CONTAINER_END}, "eth0 "},
      {"nothing but virtual links", {LOOPBACK, DUMMY, BRIDGE, TUNNEL}, ""},
      {"nothing", {}, ""},
  };
  for (const Row& row : rows) {
    MadeUpTree tree;
    for (const NetLink& link : row.links) AddLink(tree, link);
    EXPECT_EQ(Names(ReadAdapters(tree.AsSources())), row.expected) << row.name;
  }
}

TEST(Adapters, TellAddressLinkAndPlace) {
  MadeUpTree tree;
  AddLink(tree, {"eth0", 2, 2, "1", "", "/sys/devices/pci0000:00/0000:00:03.0/virtio2"});
  AddLink(tree,
          {"eth1", 3, 3, "1", "", "/sys/devices/pci0000:00/0000:00:1c.0/0000:02:00.1", "0\n"});
  // The kernel refuses to tell the carrier of an interface that is down.
  AddLink(tree, {"eth2", 4, 4, "1", "", "/sys/devices/platform/soc/ethernet", ""});
  const std::vector<Adapter> adapters = ReadAdapters(tree.AsSources());
  ASSERT_EQ(Names(adapters), "eth0 eth1 eth2 ");
  EXPECT_EQ(adapters[0].mac, "02:00:00:00:00:02");
  EXPECT_TRUE(adapters[0].linkUp);
  EXPECT_EQ(adapters[0].pciAddress, "0000:00:03.0");
  EXPECT_FALSE(adapters[1].linkUp);
  EXPECT_EQ(adapters[1].pciAddress, "0000:02:00.1");
  EXPECT_FALSE(adapters[2].linkUp);
  EXPECT_EQ(adapters[2].pciAddress, "");
}

TEST(PciAddress, Form) {
  for (const char* text : {"0000:00:03.0", "ffff:FF:1f.7", "10000:00:00.0"}) {
    EXPECT_TRUE(IsPciAddress(text)) << text;
  }
  for (const char* text : {"", "pci0000:00", "000:00:03.0", "0000:00:03", "0000:00:03.", "00:03.0",
                           "0000:00:03.0x", "000g:00:03.0", "0000.00:03.0", "123456789:00:03.0"}) {
    EXPECT_FALSE(IsPciAddress(text)) << text;
  }
}

}  // namespace
}  // namespace Machine
