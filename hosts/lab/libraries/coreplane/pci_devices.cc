#include "hosts/lab/libraries/coreplane/pci_devices.h"

#include <algorithm>
#include <utility>

#include "hostapi/coreplane/hardware.h"

namespace {

using Coreplane::Hardware::PciDeviceImpl;
using Lab::Json;
using Nodeplane::Hardware::PassthruDevice;
using Nodeplane::Hardware::PciDevice;

constexpr char DEVICES[] = "/hardware/pci";

bool HasAddress(const Json& node, const std::string& address) {
  return Lab::Text(node, "/address") == address;
}

// The place of a device in the state's list; the end when there is none.
Json::const_iterator PlaceOf(const Json& state, const std::string& address) {
  const Json& devices = Lab::List(state, DEVICES);
  return std::find_if(devices.begin(), devices.end(),
                      [&](const Json& node) { return HasAddress(node, address); });
}

const Json& DeviceNode(const Json& state, const std::string& address) {
  const auto place = PlaceOf(state, address);
  if (place == Lab::List(state, DEVICES).end()) throw Lab::StateError("no device " + address);
  return *place;
}

// A device without a group is one by itself.
bool ShareFate(const Json& one, const Json& other) {
  const std::string group = Lab::Text(one, "/dependent/group", "");
  return Lab::Text(one, "/address") == Lab::Text(other, "/address") ||
         (!group.empty() && Lab::Text(other, "/dependent/group", "") == group);
}

// Does something to the device and to all that share its fate.
template <class Change>
void ChangeDevices(Json& state, const std::string& address, Change change) {
  const Json device = DeviceNode(state, address);
  for (Json& node : state["hardware"]["pci"]) {
    if (ShareFate(device, node)) change(node);
  }
}

class LabPassthruDevice : public PassthruDevice {
 public:
  LabPassthruDevice(std::string address, std::string name)
      : _address(std::move(address)), _name(std::move(name)) {}

  std::string GetName() const override { return _name; }

  int GetPassthruState() const override {
    return Lab::PerformRead<int>(
        {"PassthruDevice::GetPassthruState", _name}, [this](const Json& state) {
          return static_cast<int>(
              Lab::Number(DeviceNode(state, _address), "/dependent/state", RELEASED));
        });
  }

  void SetPassthruState(int state) override {
    Lab::PerformChange({"PassthruDevice::SetPassthruState", _name, {std::to_string(state)}},
                       [&](Json& document) {
                         ChangeDevices(document, _address,
                                       [&](Json& node) { node["dependent"]["state"] = state; });
                       });
  }

  std::vector<std::unique_ptr<PassthruDevice>> GetPassthruChildren() const override {
    using Children = std::vector<std::unique_ptr<PassthruDevice>>;
    return Lab::PerformRead<Children>(
        {"PassthruDevice::GetPassthruChildren", _name}, [this](const Json& state) {
          const Json& device = DeviceNode(state, _address);
          Children children;
          for (const Json& node : Lab::List(state, DEVICES)) {
            if (!ShareFate(device, node)) continue;
            children.push_back(std::make_unique<LabPassthruDevice>(
                Lab::Text(node, "/address"), Lab::Text(node, "/dependent/name")));
          }
          return children;
        });
  }

 private:
  std::string _address;
  std::string _name;
};

// What every device does, whether it tells its driver or not.
template <class Base>
class Device : public Base {
 public:
  explicit Device(std::string address) : _address(std::move(address)) {}

  std::string GetName() const override {
    return Lab::PerformRead<std::string>(
        {"PciDevice::GetName", _address}, [this](const Json& state) {
          return Lab::Text(DeviceNode(state, _address), "/name",
                           Lab::Text(DeviceNode(state, _address), "/device", _address));
        });
  }

  std::string GetAddress() const override { return ReadText("PciDevice::GetAddress", "/address"); }
  std::string GetVendorName() const override {
    return ReadText("PciDevice::GetVendorName", "/vendor");
  }
  std::string GetDeviceName() const override {
    return ReadText("PciDevice::GetDeviceName", "/device");
  }

  uint16_t GetDeviceClass() const override {
    return Lab::PerformRead<uint16_t>(
        {"PciDevice::GetDeviceClass", _address}, [this](const Json& state) {
          return static_cast<uint16_t>(Lab::Number(DeviceNode(state, _address), "/class"));
        });
  }

  bool IsPassthruCapable() const override {
    return Lab::PerformRead<bool>(
        {"PciDevice::IsPassthruCapable", _address}, [this](const Json& state) {
          return Lab::Flag(DeviceNode(state, _address), "/passthru", false);
        });
  }

  std::unique_ptr<PassthruDevice> GetDependentDevice() const override {
    using Result = std::unique_ptr<PassthruDevice>;
    return Lab::PerformRead<Result>(
        {"PciDevice::GetDependentDevice", _address}, [this](const Json& state) -> Result {
          const Json& node = DeviceNode(state, _address);
          if (!node.contains("dependent")) return nullptr;
          return std::make_unique<LabPassthruDevice>(_address, Lab::Text(node, "/dependent/name"));
        });
  }

  std::string GetOwner() const override {
    return Lab::PerformRead<std::string>(
        {"PciDevice::GetOwner", _address},
        [this](const Json& state) { return Lab::Text(DeviceNode(state, _address), "/owner", ""); });
  }

  void SetOwner(const std::string& owner) override {
    Lab::PerformChange({"PciDevice::SetOwner", _address, {owner}}, [&](Json& state) {
      ChangeDevices(state, _address, [&](Json& node) { node["owner"] = Lab::TextNode(owner); });
    });
  }

 protected:
  std::string ReadText(const char* operation, const char* pointer) const {
    return Lab::PerformRead<std::string>({operation, _address}, [&](const Json& state) {
      return Lab::Text(DeviceNode(state, _address), pointer);
    });
  }

  std::string _address;
};

using PlainDevice = Device<PciDevice>;

class KnownDevice : public Device<PciDeviceImpl> {
 public:
  using Device::Device;

  std::string GetDriverName() const override {
    return Lab::PerformRead<std::string>(
        {"PciDeviceImpl::GetDriverName", _address}, [this](const Json& state) -> std::string {
          const std::string driver = Lab::Text(DeviceNode(state, _address), "/driver", "");
          return driver.empty() ? "(Unknown)" : driver;
        });
  }
};

std::unique_ptr<PciDevice> MakeDevice(const Json& node) {
  const std::string address = Lab::Text(node, "/address");
  if (Lab::Flag(node, "/plain", false)) return std::make_unique<PlainDevice>(address);
  return std::make_unique<KnownDevice>(address);
}

}  // namespace

std::unique_ptr<PciDevice> Lab::MakePciDevice(const Json& state, const std::string& address) {
  const auto place = PlaceOf(state, address);
  return place == List(state, DEVICES).end() ? nullptr : MakeDevice(*place);
}

namespace Coreplane::Hardware {

PciDeviceImpl::~PciDeviceImpl() = default;

// The lab reads every device from its state when it is asked for.
struct PciInfoImpl::Data {};

PciInfoImpl::PciInfoImpl() = default;
PciInfoImpl::~PciInfoImpl() = default;
PciInfoImpl::PciInfoImpl(PciInfoImpl&&) noexcept = default;
PciInfoImpl& PciInfoImpl::operator=(PciInfoImpl&&) noexcept = default;

std::vector<std::unique_ptr<PciDevice>> PciInfoImpl::GetAllPciDevices() const {
  using Devices = std::vector<std::unique_ptr<PciDevice>>;
  return Lab::PerformRead<Devices>({"PciInfoImpl::GetAllPciDevices"}, [](const Json& state) {
    std::vector<Json> nodes = Lab::List(state, DEVICES);
    std::sort(nodes.begin(), nodes.end(), [](const Json& one, const Json& other) {
      return Lab::Text(one, "/address") < Lab::Text(other, "/address");
    });
    Devices devices;
    for (const Json& node : nodes) devices.push_back(MakeDevice(node));
    return devices;
  });
}

}  // namespace Coreplane::Hardware
