#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace Machine {

// Texts are the bytes that the machine gives, without the newline behind them; firmware texts may
// hold anything, invalid UTF-8 included. What cannot be read stays at the default of its field.

// Where the files are read from.
struct Sources {
  // Stands before /proc, /sys, /etc and /run; empty for the machine itself.
  std::string root;
};

struct Processor {
  std::string model;
  int sockets = 1;
};

struct Memory {
  uint64_t totalBytes = 0;
  uint64_t pageSize = 4096;
};

// All empty on a machine without firmware tables; the serial numbers also for an ordinary user.
struct Firmware {
  std::string vendor;
  std::string product;
  std::string serialNumber;
  std::string uuid;
  std::string assetTag;
  std::string biosVendor;
  std::string biosVersion;
  // As the firmware writes it, usually "MM/DD/YYYY".
  std::string biosDate;
};

// A physical Ethernet adapter, or what stands for one in a container.
struct Adapter {
  std::string name;
  // Lower case, "02:fc:00:00:00:01".
  std::string mac;
  bool linkUp = false;
  // "0000:00:03.0"; empty for an adapter that is not on a PCI bus.
  std::string pciAddress;
};

// How an interface came by an address.
enum class Origin { STATIC, DHCP, AUTOCONF };

struct Ipv4 {
  // Both empty when the interface has no IPv4 address.
  std::string address;
  std::string netmask;
  Origin origin = Origin::STATIC;
};

struct Ipv6 {
  // Without a scope.
  std::string address;
  int prefix = 128;
  bool linkLocal = false;
  Origin origin = Origin::STATIC;
};

// The interface through which the machine is reached.
struct ManagementInterface {
  // Empty when there is none.
  std::string name;
  std::string mac;
  Ipv4 ipv4;
  std::vector<Ipv6> ipv6;
  // Default gateways; empty when there is none.
  std::string gateway4;
  std::string gateway6;
};

struct Resolver {
  // Addresses of both families in the order in which they are asked, at most three.
  std::vector<std::string> nameServers;
  std::vector<std::string> searchDomains;
};

struct HostName {
  // Without the domain.
  std::string name = "localhost";
  // Empty when the machine has none.
  std::string domain;
};

struct PciDevice {
  // "0000:00:03.0"
  std::string address;
  // Base class and subclass: 0x0200 is an Ethernet controller.
  int deviceClass = 0;
  std::string vendor;
  std::string device;
  // Empty when no driver holds it.
  std::string driver;
};

struct Facts {
  Processor processor;
  Memory memory;
  Firmware firmware;
  // In the order in which the kernel found them.
  std::vector<Adapter> adapters;
  ManagementInterface management;
  bool ipv6Enabled = false;
  Resolver resolver;
  HostName hostName;
  // By ascending address.
  std::vector<PciDevice> pciDevices;
};

// Everything at once. Addresses and routes come from the kernel, whatever the root. Never throws.
Facts ReadFacts(const Sources& sources = {});

}  // namespace Machine
