#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

// PCI devices and who drives them. All objects are made by the host; every operation throws
// NodeplaneException when it fails.
namespace Nodeplane::Hardware {

// The host's record of a device that a virtual machine can drive.
class PassthruDevice {
 public:
  enum PassthruState : int { RELEASED = 2, ASSIGNED = 3 };

  virtual ~PassthruDevice();
  // For log lines.
  virtual std::string GetName() const = 0;
  // A PassthruState; a host may give other values too.
  virtual int GetPassthruState() const = 0;
  virtual void SetPassthruState(int state) = 0;
  // The devices that must move together with this one, itself among them.
  virtual std::vector<std::unique_ptr<PassthruDevice>> GetPassthruChildren() const = 0;

 protected:
  PassthruDevice() = default;
};

class PciDevice {
 public:
  virtual ~PciDevice();
  // What the device is called in the host's inventory.
  virtual std::string GetName() const = 0;
  // Segment, bus, slot and function, "0000:02:00.0".
  virtual std::string GetAddress() const = 0;
  virtual std::string GetVendorName() const = 0;
  virtual std::string GetDeviceName() const = 0;
  // Base class in the high byte, sub-class in the low one, as PCI numbers them.
  virtual uint16_t GetDeviceClass() const = 0;
  // A virtual machine can drive it.
  virtual bool IsPassthruCapable() const = 0;
  // Null when the host keeps none.
  virtual std::unique_ptr<PassthruDevice> GetDependentDevice() const = 0;
  // Name of the virtual machine that it is given to, empty for none.
  virtual std::string GetOwner() const = 0;
  virtual void SetOwner(const std::string& owner) = 0;

 protected:
  PciDevice() = default;
};

}  // namespace Nodeplane::Hardware
