#pragma once

#include <memory>
#include <string>

#include "hostapi/nodeplane/pci_device.h"
#include "hosts/lab/libraries/perform.h"

namespace Lab {

// The device at that address; null when the state has none. A device of the state's list
// "/hardware/pci" reads
//   {address, name, class, vendor, device, driver, passthru, owner, plain, dependent{name, state,
//    group}}
// A plain one does not tell its driver. Devices of the same group share their fate: state and
// owner of one are those of all.
std::unique_ptr<Nodeplane::Hardware::PciDevice> MakePciDevice(const Json& state,
                                                              const std::string& address);

}  // namespace Lab
