#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "console/texts/string_factory.h"
#include "hostapi/nodeplane/ip_address.h"

namespace Tarnel {

// What the welcome screen tells of the management interface.
struct ManagementAddresses {
  bool useDhcp = false;
  // IPv4 is switched off.
  bool ipv4None = false;
  bool dhcpLease = false;
  Nodeplane::Network::Ipv4Address ipv4;
  std::vector<Nodeplane::Network::Ipv6Network> ipv6;

  // The interface wants an address by DHCP, has none from there, and answers at another.
  bool DhcpFailed() const;
};

// The marked-up text of the places where the host can be reached.
std::string AddressText(const ManagementAddresses& addresses, const std::string& hostname,
                        bool ipv6Enabled, StringFactory& strings);

// Vendor and product of the machine, without saying the vendor twice.
std::string MachineName(const std::string& vendor, const std::string& product);

std::string CpuLine(int packages, const std::string& model);

// totalBytes with one decimal at most, in the largest unit from MiB to PiB that it fills.
std::string MemoryLine(uint64_t totalBytes);

}  // namespace Tarnel
