#include "hosts/machine/facts.h"

#include "hosts/machine/readers.h"

namespace Machine {

Facts ReadFacts(const Sources& sources) {
  Facts facts;
  facts.processor = ReadProcessor(sources);
  facts.memory = ReadMemory(sources);
  facts.firmware = ReadFirmware(sources);
  facts.adapters = ReadAdapters(sources);
  facts.management = ReadManagementInterface(facts.adapters);
  facts.ipv6Enabled = ReadIpv6Enabled(sources);
  facts.resolver = ReadResolver(sources);
  facts.hostName = ReadHostName(sources);
  facts.pciDevices = ReadPciDevices(sources);
  return facts;
}

}  // namespace Machine
