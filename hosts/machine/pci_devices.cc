extern "C" {
#include <pci/pci.h>
}

#include <csetjmp>
#include <cstdio>
#include <memory>
#include <utility>

#include "hosts/machine/pci_address.h"
#include "hosts/machine/readers.h"
#include "hosts/machine/text_file.h"

namespace Machine {

namespace {

using Access = std::unique_ptr<pci_access, decltype(&pci_cleanup)>;
using Device = std::unique_ptr<pci_dev, decltype(&pci_free_dev)>;

constexpr int WANTED_FIELDS = PCI_FILL_IDENT | PCI_FILL_CLASS | PCI_FILL_DRIVER;

// The library forbids its error function to return: it jumps here instead of ending the process.
jmp_buf onPciError;

__attribute__((noreturn)) void JumpOnError(char*, ...) { longjmp(onPciError, 1); }
void KeepQuiet(char*, ...) {}

// False when the library gave up. Nothing that `step` holds may have a destructor to run.
template <typename Step>
bool Succeeds(Step step) {
  if (setjmp(onPciError) != 0) return false;
  step();
  return true;
}

Access OpenAccess(std::string bus) {
  Access access(pci_alloc(), pci_cleanup);
  access->method = PCI_ACCESS_SYS_BUS_PCI;
  access->error = JumpOnError;
  access->warning = KeepQuiet;
  std::string parameter = "sysfs.path";
  pci_set_param(access.get(), parameter.data(), bus.data());
  pci_access* opened = access.get();
  return Succeeds([opened] { pci_init(opened); }) ? std::move(access)
                                                  : Access(nullptr, pci_cleanup);
}

// Null for an address that cannot be.
Device GetDevice(pci_access* access, const std::string& address) {
  unsigned domain = 0;
  unsigned bus = 0;
  unsigned device = 0;
  unsigned function = 0;
  const int read = sscanf(address.c_str(), "%x:%x:%x.%x", &domain, &bus, &device, &function);
  if (read != 4 || !IsPciAddress(address)) return Device(nullptr, pci_free_dev);
  return Device(pci_get_dev(access, static_cast<int>(domain), static_cast<int>(bus),
                            static_cast<int>(device), static_cast<int>(function)),
                pci_free_dev);
}

// From the list of names alone: the library loses memory when it asks udev's and there is none.
std::string LookupName(pci_access* access, int what, const pci_dev& device) {
  char buffer[256] = "";
  const char* name = pci_lookup_name(access, buffer, sizeof buffer, what | PCI_LOOKUP_NO_HWDB,
                                     device.vendor_id, device.device_id);
  return name == nullptr ? "" : name;
}

PciDevice Describe(pci_access* access, const std::string& address, pci_dev* device) {
  const char* driver = pci_get_string_property(device, PCI_FILL_DRIVER);
  return {address, device->device_class, LookupName(access, PCI_LOOKUP_VENDOR, *device),
          LookupName(access, PCI_LOOKUP_DEVICE, *device), driver == nullptr ? "" : driver};
}

}  // namespace

std::vector<PciDevice> ReadPciDevices(const Sources& sources) {
  const std::string bus = sources.root + "/sys/bus/pci";
  const std::vector<std::string> addresses = ListDirectory(bus + "/devices");
  if (addresses.empty()) return {};
  const Access access = OpenAccess(bus);
  if (access == nullptr) return {};
  std::vector<PciDevice> devices;
  for (const std::string& address : addresses) {
    const Device device = GetDevice(access.get(), address);
    pci_dev* filled = device.get();
    // A device may go away while it is being read.
    if (filled == nullptr || !Succeeds([filled] { pci_fill_info(filled, WANTED_FIELDS); }))
      continue;
    devices.push_back(Describe(access.get(), address, filled));
  }
  return devices;
}

}  // namespace Machine
