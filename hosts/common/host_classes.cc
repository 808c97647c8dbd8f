// The destructors of the classes that a host derives from. They stand here, once, so that every
// library agrees on the type of an object and a cast from one library's object works in another.

#include "hostapi/coreplane/advanced_option.h"
#include "hostapi/nodeplane/host.h"
#include "hostapi/nodeplane/lattice.h"
#include "hostapi/nodeplane/network_interface.h"
#include "hostapi/nodeplane/pci_device.h"

namespace Nodeplane {

Network::NetworkInterface::~NetworkInterface() = default;
Network::CoreNic::~CoreNic() = default;

Network::Portset::~Portset() = default;
Network::ConnectionPoint::~ConnectionPoint() = default;
Network::VirtualSwitch::~VirtualSwitch() = default;
Network::PortGroup::~PortGroup() = default;
Network::LatticeSwitch::~LatticeSwitch() = default;
Network::LatticePort::~LatticePort() = default;

Hardware::HardwareService::~HardwareService() = default;
Hardware::PassthruDevice::~PassthruDevice() = default;
Hardware::PciDevice::~PciDevice() = default;
Storage::StorageAdapter::~StorageAdapter() = default;
Storage::StorageService::~StorageService() = default;
Driver::HostDriver::~HostDriver() = default;
Driver::DriverService::~DriverService() = default;
System::HostSystem::~HostSystem() = default;
Host::~Host() = default;

Adv::AdvancedOption::~AdvancedOption() = default;
Adv::AdvancedIntegerOption::~AdvancedIntegerOption() = default;

}  // namespace Nodeplane
