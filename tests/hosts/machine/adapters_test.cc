#include <gtest/gtest.h>

#include <string>
#include <vector>

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

// The adapters as "name mac place" with "+" where the link is up.
std::string AdaptersOf(const std::vector<NetLink>& links) {
  MadeUpTree tree;
  for (const NetLink& link : links) AddLink(tree, link);
  std::string text;
  for (const Adapter& adapter : ReadAdapters(tree.AsSources())) {
    text += (text.empty() ? "" : ", ") + adapter.name + " " + adapter.mac + " " +
            adapter.pciAddress + (adapter.linkUp ? "+" : "");
  }
  return text;
}

const NetLink LOOPBACK = {"lo", 1, 1, "772"};
const NetLink BRIDGE = {"br0", 3, 3, "1", "DEVTYPE=bridge\n"};
const NetLink TUNNEL = {"tun0", 4, 4, "65534"};
const NetLink VLAN = {"eth0.5", 5, 9, "1", "DEVTYPE=vlan\n"};
const NetLink CONTAINER_END = {"eth0", 6, 77};
const NetLink INFINIBAND = {"ib0", 7, 7, "32", "", "/sys/devices/pci0000:00/0000:00:05.0"};
const NetLink WIRELESS = {"wlan0", 8, 8, "1", "DEVTYPE=wlan\n", "/sys/devices/usb1/1-1", "0\n"};
const NetLink VIRTIO = {"ens3", 9, 9, "1", "", "/sys/devices/pci0000:00/0000:00:03.0/virtio2"};
// The kernel refuses to tell the carrier of an interface that is down.
const NetLink BEHIND_BRIDGE = {
    "a0", 10, 10, "1", "", "/sys/devices/pci0000:00/0000:00:1c.0/0000:02:00.1", ""};

TEST(Adapters, AreTheEthernetLinksThatLeadOutside) {
  struct Row {
    const char* name;
    std::vector<NetLink> links;
    std::string adapters;
  };
  const std::vector<Row> rows = {
      {"in the kernel's order, not by name",
       {BEHIND_BRIDGE, VIRTIO},
       "ens3 02:00:00:00:00:09 0000:00:03.0+, a0 02:00:00:00:00:00 0000:02:00.1"},
      {"with a device, virtual links do not count",
       {LOOPBACK, BRIDGE, VLAN, CONTAINER_END, WIRELESS},
       "wlan0 02:00:00:00:00:08 "},
      {"in a container",
       {LOOPBACK, BRIDGE, TUNNEL, VLAN, CONTAINER_END},
       "eth0 02:00:00:00:00:06 +"},
      {"no Ethernet that leads outside", {LOOPBACK, BRIDGE, TUNNEL, INFINIBAND}, ""},
      {"nothing", {}, ""},
  };
  for (const Row& row : rows) EXPECT_EQ(AdaptersOf(row.links), row.adapters) << row.name;
}

}  // namespace
}  // namespace Machine
