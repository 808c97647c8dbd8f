#pragma once

#include <memory>
#include <string>
#include <vector>

namespace Nodeplane {

namespace Hardware {

// What the firmware says of itself, in the order in which the host gives it.
struct BiosData {
  std::string vendor;
  std::string versionName;
  std::string versionSuffix;
  std::string assetTag;
  std::string releaseDate;
  std::string machineUuid;
  std::string serialNumber;
  int releaseMonth = 0;
  int releaseYear = 0;
  int majorNumber = 0;
  int minorNumber = 0;
  std::vector<std::string> oemStrings;
};

// Firmware facts as of the last Refresh().
class HardwareService {
 public:
  virtual ~HardwareService();
  // Reads the facts anew.
  virtual void Refresh() = 0;
  virtual BiosData GetBiosData() const = 0;
  // Firmware version of the baseboard management controller.
  virtual std::string GetBmcVersion() const = 0;
};

}  // namespace Hardware

namespace Storage {

class StorageAdapter {
 public:
  virtual ~StorageAdapter();
  virtual std::string GetName() const = 0;
  virtual std::string GetDriverName() const = 0;
};

class StorageService {
 public:
  virtual ~StorageService();
  virtual std::vector<std::unique_ptr<StorageAdapter>> GetAdapters() const = 0;
};

}  // namespace Storage

namespace Driver {

class HostDriver {
 public:
  virtual ~HostDriver();
  virtual std::string GetVersion() const = 0;
};

class DriverService {
 public:
  virtual ~DriverService();
  // Throws NodeplaneException when the host has no driver of that name.
  virtual std::unique_ptr<HostDriver> FindDriver(const std::string& name) const = 0;
};

}  // namespace Driver

namespace System {

// What the host offers to the DriverVM, the virtual machine that drives devices for it.
enum DriverVMState : int {
  // The host has a DriverVM that takes no devices at present.
  DRIVER_VM_PRESENT = 1,
  DRIVER_VM_CONFIGURABLE = 2,
};

class HostSystem {
 public:
  virtual ~HostSystem();
  // A DriverVMState; any other value means that the host has no DriverVM.
  virtual int GetDriverVMState() const = 0;
};

}  // namespace System

// The host itself. The services belong to it and live as long as it does.
class Host {
 public:
  virtual ~Host();
  virtual Hardware::HardwareService& GetHardwareService() = 0;
  virtual Storage::StorageService& GetStorageService() = 0;
  virtual Driver::DriverService& GetDriverService() = 0;
  virtual System::HostSystem& GetSystem() = 0;
};

class HostFactory {
 public:
  // Never null; throws NodeplaneException when the host cannot be reached.
  static std::unique_ptr<Host> GetHost();
};

}  // namespace Nodeplane
