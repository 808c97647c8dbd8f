#include "console/menu/driver_vm_dialog.h"

#include <syslog.h>

#include "console/screen/colours.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"
#include "console/widgets/message_dialog.h"
#include "hostapi/coreplane/hardware.h"
#include "hostapi/coreplane/system.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

using Nodeplane::Hardware::PassthruDevice;
using Nodeplane::Hardware::PciDevice;
using Nodeplane::Lib::NodeplaneException;

const std::string DriverVMDialog::DEFAULT_DRIVERVM = "Halvren";

namespace {

constexpr int TEXT_TITLE = 73;
constexpr int TEXT_BODY = 74;
constexpr int TEXT_WARNING_TITLE = 75;
constexpr int TEXT_WARNING = 76;

constexpr char HEADING[] =
    "    {align:padding:13}PCI Device{/align}{align:padding:28}Vendor{/align}"
    "{align:padding:30}Device{/align}";

// Base classes, as PCI numbers them.
constexpr int MASS_STORAGE = 1;
constexpr int NETWORK = 2;

constexpr char NO_DRIVER[] = "(Unknown)";

// The host tells the driver of some devices only; the others are never offered.
bool IsOffered(const PciDevice& device, bool allowDrivers) {
  const int baseClass = device.GetDeviceClass() >> 8;
  if (baseClass != MASS_STORAGE && baseClass != NETWORK) {
    return false;
  }
  const auto* const known = dynamic_cast<const Coreplane::Hardware::PciDeviceImpl*>(&device);
  if (known == nullptr || (!allowDrivers && known->GetDriverName() != NO_DRIVER)) {
    return false;
  }
  return device.IsPassthruCapable();
}

std::string ReadAddress(const PciDevice& device) {
  try {
    return device.GetAddress();
  } catch (const NodeplaneException&) {
    syslog(LOG_ERR, "Error: exception getting PCI string for device");
    return "";
  }
}

bool IsInState(const PciDevice& device, PassthruDevice::PassthruState state) {
  const auto dependent = device.GetDependentDevice();
  return dependent != nullptr && dependent->GetPassthruState() == state;
}

void LogNoChildren(const PassthruDevice& dependent) {
  syslog(LOG_ERR, "%s",
         ("Error: dependent device" + dependent.GetName() + "has no passthru children\n").c_str());
}

std::string Shorten(const std::string& text, size_t limit) {
  return text.size() < limit ? text : text.substr(0, limit - 4) + "...";
}

}  // namespace

std::string FormatDeviceRow(const std::string& address, const std::string& vendor,
                            const std::string& device) {
  return "{align:padding:13}" + Shorten(address, 16) + "{/align}{align:padding:24}" +
         Shorten(vendor, 23) + "{/align}{align:padding:30}" + Shorten(device, 29) + "{/align}";
}

DriverVMDialog::DriverVMDialog(Frame* parent) : Dialog(parent, 78, 21, 7) {
  const bool allowDrivers =
      Coreplane::System::KernelOpts::GetRuntimeValueBool("driverVMAllowDevicesWithDrivers");
  try {
    FindDevices(allowDrivers);
  } catch (const NodeplaneException& error) {
    syslog(LOG_ERR, "Getting devices for DriverVM failed: %s", error.what());
    _devices.clear();
  }
  _items.push_back(std::make_unique<LabelItem>(HEADING, false));
  for (const auto& device : _devices) {
    AddRow(*device);
  }
  if (_devices.empty()) {
    _items.push_back(std::make_unique<LabelItem>("There are no available devices", true));
  }
  _list = _content->Add<ItemList>(0, 0, _content->Width(), _content->Height());
}

void DriverVMDialog::FindDevices(bool allowDrivers) {
  _devices = Coreplane::Hardware::PciInfoImpl().GetAllPciDevices();
  std::erase_if(_devices, [allowDrivers](const std::unique_ptr<PciDevice>& device) {
    return !IsOffered(*device, allowDrivers);
  });
}

void DriverVMDialog::AddRow(const PciDevice& device) {
  _addresses.push_back(ReadAddress(device));
  _vendors.push_back(device.GetVendorName());
  _deviceNames.push_back(device.GetDeviceName());
  auto item = std::make_unique<CheckItem>(
      FormatDeviceRow(_addresses.back(), _vendors.back(), _deviceNames.back()), false, 0);
  const auto dependent = device.GetDependentDevice();
  if (dependent == nullptr) {
    syslog(LOG_ERR, "Error: no dependent for device");
  } else if (dependent->GetPassthruState() == PassthruDevice::ASSIGNED &&
             device.GetOwner() == DEFAULT_DRIVERVM) {
    item->SetChecked(true);
  }
  _items.push_back(std::move(item));
}

int DriverVMDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  _list->SetItems(_items);
  _list->Repaint();
  SetFooter(HINT_DETAILS);
  for (;;) {
    switch (WaitKey(true)) {
      case KEY_UP:
        _list->MoveUp();
        break;
      case KEY_DOWN:
        _list->MoveDown();
        break;
      case 'D':
      case 'd':
        ShowDetails();
        break;
      case SPACE_KEY:
        ToggleFocused();
        break;
      case ENTER_KEY:
        return 1;
      case ESC_KEY:
        return 0;
      default:
        break;
    }
  }
}

void DriverVMDialog::ShowDetails() {
  if (_devices.empty()) {
    return;
  }
  const auto index = static_cast<size_t>(_list->SelectionIndex());
  DeviceInfoDialog(this, _addresses[index], _vendors[index], _deviceNames[index]).Exec();
}

void DriverVMDialog::ToggleFocused() {
  if (_devices.empty()) {
    return;
  }
  const auto index = static_cast<size_t>(_list->SelectionIndex());
  const auto dependent = _devices[index]->GetDependentDevice();
  if (dependent == nullptr) {
    syslog(LOG_ERR, "%s",
           "Error.. did not find dependent device for a device which should be passthru capable\n");
  } else if (CheckItemOf(index)->IsChecked()) {
    Release(index, *dependent);
  } else {
    Assign(index, *dependent);
  }
  _list->Repaint();
}

void DriverVMDialog::Assign(size_t index, PassthruDevice& dependent) {
  dependent.SetPassthruState(PassthruDevice::ASSIGNED);
  _devices[index]->SetOwner(DEFAULT_DRIVERVM);
  const size_t children = dependent.GetPassthruChildren().size();
  if (children > 1) {
    MarkAssignedDevices();
    WarnOfOthers();
  } else if (children == 1) {
    CheckItemOf(index)->SetChecked(true);
  } else {
    LogNoChildren(dependent);
  }
}

void DriverVMDialog::Release(size_t index, PassthruDevice& dependent) {
  dependent.SetPassthruState(PassthruDevice::RELEASED);
  const size_t children = dependent.GetPassthruChildren().size();
  if (children > 1) {
    ReleaseDevices();
    WarnOfOthers();
  } else if (children == 1) {
    _devices[index]->SetOwner("");
    CheckItemOf(index)->SetChecked(false);
  } else {
    LogNoChildren(dependent);
  }
}

void DriverVMDialog::MarkAssignedDevices() {
  for (size_t i = 0; i < _devices.size(); ++i) {
    if (IsInState(*_devices[i], PassthruDevice::ASSIGNED) &&
        _devices[i]->GetOwner() == DEFAULT_DRIVERVM) {
      CheckItemOf(i)->SetChecked(true);
    }
  }
}

// Not only the devices that moved: the DriverVM loses whatever it still owns.
void DriverVMDialog::ReleaseDevices() {
  for (size_t i = 0; i < _devices.size(); ++i) {
    if (IsInState(*_devices[i], PassthruDevice::RELEASED) ||
        _devices[i]->GetOwner() == DEFAULT_DRIVERVM) {
      _devices[i]->SetOwner("");
      CheckItemOf(i)->SetChecked(false);
    }
  }
}

void DriverVMDialog::WarnOfOthers() {
  MessageDialog(this, TEXT_WARNING_TITLE, TEXT_WARNING).Exec();
}

CheckItem* DriverVMDialog::CheckItemOf(size_t index) const {
  return static_cast<CheckItem*>(_items[index + 1].get());
}

DeviceInfoDialog::DeviceInfoDialog(Frame* parent, const std::string& address,
                                   const std::string& vendor, const std::string& device)
    : Dialog(parent, 70, 13, 5),
      _address(address),
      _vendor(vendor),
      _device(device),
      _addressText(
          _content->Add<TextArea>(0, 0, _content->Width(), _content->Height(), PARENT_COLOUR)) {}

int DeviceInfoDialog::Run() {
  SetTitle("Device Details");
  SetBody("Vendor: " + _vendor + " Device: " + _device);
  _addressText->SetText("PCI Device: " + _address + "\n");
  SetFooter(HINT_OK);
  WaitForEnter();
  return 1;
}

}  // namespace Tarnel
