#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "hostapi/nodeplane/pci_device.h"
#include "hostapi/nodeplane/smart_card.h"

namespace Coreplane::Hardware {

// Every operation of these classes throws NodeplaneException when the host fails.

// Texts from the machine's firmware, as the firmware has them: blanks at the ends included.
class HardwareInfoImpl {
 public:
  HardwareInfoImpl();
  ~HardwareInfoImpl();
  HardwareInfoImpl(HardwareInfoImpl&&) noexcept;
  HardwareInfoImpl& operator=(HardwareInfoImpl&&) noexcept;

  std::string GetVendorName() const;
  std::string GetProductName() const;
  std::string GetSerialNumber() const;
  // Empty when the machine has none.
  std::string GetServiceTag() const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

class CpuInfoImpl {
 public:
  CpuInfoImpl();
  ~CpuInfoImpl();
  CpuInfoImpl(CpuInfoImpl&&) noexcept;
  CpuInfoImpl& operator=(CpuInfoImpl&&) noexcept;

  // Number of sockets in use.
  int GetNumCpuPackages() const;
  std::string GetModelName() const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

class MemoryInfoImpl {
 public:
  MemoryInfoImpl();
  ~MemoryInfoImpl();
  MemoryInfoImpl(MemoryInfoImpl&&) noexcept;
  MemoryInfoImpl& operator=(MemoryInfoImpl&&) noexcept;

  uint64_t GetTotalPages() const;
  // In bytes.
  uint64_t GetPageSize() const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

// A PCI device of which the host knows the driver.
class PciDeviceImpl : public Nodeplane::Hardware::PciDevice {
 public:
  ~PciDeviceImpl() override;
  // "(Unknown)" when the device has none.
  virtual std::string GetDriverName() const = 0;

 protected:
  PciDeviceImpl() = default;
};

class PciInfoImpl {
 public:
  PciInfoImpl();
  ~PciInfoImpl();
  PciInfoImpl(PciInfoImpl&&) noexcept;
  PciInfoImpl& operator=(PciInfoImpl&&) noexcept;

  // In the order of their addresses.
  std::vector<std::unique_ptr<Nodeplane::Hardware::PciDevice>> GetAllPciDevices() const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

class SmartCardInfoImpl {
 public:
  SmartCardInfoImpl();
  ~SmartCardInfoImpl();
  SmartCardInfoImpl(SmartCardInfoImpl&&) noexcept;
  SmartCardInfoImpl& operator=(SmartCardInfoImpl&&) noexcept;

  // The slots that are there, with or without a card in them.
  std::vector<Nodeplane::Hardware::SmartCardSlot> GetAllSlots() const;
  // False when there is no card in the slot; else the record is filled.
  bool GetToken(const Nodeplane::Hardware::SmartCardSlot& slot,
                Nodeplane::Hardware::SmartCardToken& token) const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

}  // namespace Coreplane::Hardware
