#pragma once

#include <string>
#include <vector>

#include "hosts/machine/facts.h"

namespace Machine {

// One reader for each kind of fact. None of them throws on a file that is missing or odd.

Processor ReadProcessor(const Sources& sources);
Memory ReadMemory(const Sources& sources);
Firmware ReadFirmware(const Sources& sources);
std::vector<Adapter> ReadAdapters(const Sources& sources);
bool ReadIpv6Enabled(const Sources& sources);
Resolver ReadResolver(const Sources& sources);
HostName ReadHostName(const Sources& sources);
std::vector<PciDevice> ReadPciDevices(const Sources& sources);

// The interface of the default route, by IPv4 before IPv6; without such a route the first of the
// adapters that has an address.
ManagementInterface ReadManagementInterface(const std::vector<Adapter>& adapters);

}  // namespace Machine
