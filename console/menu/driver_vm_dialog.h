#pragma once

#include <memory>
#include <string>
#include <vector>

#include "console/widgets/dialog.h"
#include "console/widgets/item.h"
#include "console/widgets/item_list.h"
#include "hostapi/nodeplane/pci_device.h"

namespace Tarnel {

// Gives network and storage devices to the DriverVM, a service machine that drives them, and takes
// them back. Each mark takes effect on the host at once. Gives 1 for Enter and 0 for Esc.
// Exceptions of the host pass to the caller, but for those of the search for devices.
class DriverVMDialog : public Dialog {
 public:
  // Owner of a device that is given away.
  static const std::string DEFAULT_DRIVERVM;

  explicit DriverVMDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  using PciDevice = Nodeplane::Hardware::PciDevice;
  using PassthruDevice = Nodeplane::Hardware::PassthruDevice;

  void FindDevices(bool allowDrivers);
  void AddRow(const PciDevice& device);
  void ShowDetails();
  void ToggleFocused();
  void Assign(size_t index, PassthruDevice& dependent);
  void Release(size_t index, PassthruDevice& dependent);
  void MarkAssignedDevices();
  void ReleaseDevices();
  void WarnOfOthers();

  CheckItem* CheckItemOf(size_t index) const;

  ItemList* _list;
  // A heading, then one row for each device.
  std::vector<std::unique_ptr<Item>> _items;
  std::vector<std::unique_ptr<PciDevice>> _devices;
  // The texts of each device in full.
  std::vector<std::string> _addresses;
  std::vector<std::string> _vendors;
  std::vector<std::string> _deviceNames;
};

// Shows the names of a device in full.
class DeviceInfoDialog : public Dialog {
 public:
  DeviceInfoDialog(Frame* parent, const std::string& address, const std::string& vendor,
                   const std::string& device);

 protected:
  int Run() override;

 private:
  std::string _address;
  std::string _vendor;
  std::string _device;
  TextArea* _addressText;
};

// The row of a device, without its box, as marked-up text. Texts that are too long are shortened.
std::string FormatDeviceRow(const std::string& address, const std::string& vendor,
                            const std::string& device);

}  // namespace Tarnel
