#include "hosts/machine/facts.h"

#include <filesystem>

#include "hosts/machine/readers.h"

namespace Machine {

namespace {

// Where /sys is not mounted nothing tells which links are adapters; the one that is in use leads
// outside all the same.
void AddAdapterInUse(Facts& facts, const Sources& sources) {
  std::error_code error;
  if (std::filesystem::exists(sources.root + "/sys/class", error)) return;
  const ManagementInterface& used = facts.management;
  if (!used.name.empty()) facts.adapters.push_back({used.name, used.mac, true, ""});
}

}  // namespace

Facts ReadFacts(const Sources& sources) {
  Facts facts;
  facts.processor = ReadProcessor(sources);
  facts.memory = ReadMemory(sources);
  facts.firmware = ReadFirmware(sources);
  facts.adapters = ReadAdapters(sources);
  facts.management = ReadManagementInterface(facts.adapters);
  AddAdapterInUse(facts, sources);
  facts.ipv6Enabled = ReadIpv6Enabled(sources);
  facts.resolver = ReadResolver(sources);
  facts.hostName = ReadHostName(sources);
  facts.pciDevices = ReadPciDevices(sources);
  return facts;
}

}  // namespace Machine
