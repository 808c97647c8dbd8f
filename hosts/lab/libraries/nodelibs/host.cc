#include "hostapi/nodeplane/host.h"

#include <string>
#include <utility>

#include "hosts/lab/libraries/perform.h"

namespace Nodeplane {

namespace {

using Lab::Json;

Hardware::BiosData ReadBiosData(const Json& state) {
  const Json& bios = Lab::Object(state, "/hardware/firmware/bios");
  Hardware::BiosData data;
  data.vendor = Lab::Text(bios, "/vendor", "");
  data.versionName = Lab::Text(bios, "/versionName", "");
  data.versionSuffix = Lab::Text(bios, "/versionSuffix", "");
  data.assetTag = Lab::Text(bios, "/assetTag", "");
  data.releaseDate = Lab::Text(bios, "/releaseDate", "");
  data.machineUuid = Lab::Text(bios, "/machineUuid", "");
  data.serialNumber = Lab::Text(state, "/hardware/firmware/serialNumber");
  data.majorNumber = static_cast<int>(Lab::Number(bios, "/majorNumber", 0));
  data.minorNumber = static_cast<int>(Lab::Number(bios, "/minorNumber", 0));
  return data;
}

class LabHardwareService : public Hardware::HardwareService {
 public:
  void Refresh() override {
    Lab::PerformRead<void>({"HardwareService::Refresh"}, [this](const Json& state) {
      _bios = ReadBiosData(state);
      _bmcVersion = Lab::Text(state, "/hardware/bmc");
    });
  }
  Hardware::BiosData GetBiosData() const override {
    return Lab::PerformRead<Hardware::BiosData>({"HardwareService::GetBiosData"},
                                                [this](const Json&) { return _bios; });
  }
  std::string GetBmcVersion() const override {
    return Lab::PerformRead<std::string>({"HardwareService::GetBmcVersion"},
                                         [this](const Json&) { return _bmcVersion; });
  }

 private:
  Hardware::BiosData _bios;
  std::string _bmcVersion;
};

class LabStorageAdapter : public Storage::StorageAdapter {
 public:
  LabStorageAdapter(std::string name, std::string driver)
      : _name(std::move(name)), _driver(std::move(driver)) {}
  std::string GetName() const override { return _name; }
  std::string GetDriverName() const override {
    return Lab::PerformRead<std::string>({"StorageAdapter::GetDriverName", _name},
                                         [this](const Json&) { return _driver; });
  }

 private:
  std::string _name;
  std::string _driver;
};

using StorageAdapters = std::vector<std::unique_ptr<Storage::StorageAdapter>>;

class LabStorageService : public Storage::StorageService {
 public:
  StorageAdapters GetAdapters() const override {
    return Lab::PerformRead<StorageAdapters>(
        {"StorageService::GetAdapters"}, [](const Json& state) {
          StorageAdapters adapters;
          for (const Json& adapter : Lab::List(state, "/hardware/storage")) {
            adapters.push_back(std::make_unique<LabStorageAdapter>(Lab::Text(adapter, "/name"),
                                                                   Lab::Text(adapter, "/driver")));
          }
          return adapters;
        });
  }
};

class LabHostDriver : public Driver::HostDriver {
 public:
  LabHostDriver(std::string name, std::string version)
      : _name(std::move(name)), _version(std::move(version)) {}
  std::string GetVersion() const override {
    return Lab::PerformRead<std::string>({"HostDriver::GetVersion", _name},
                                         [this](const Json&) { return _version; });
  }

 private:
  std::string _name;
  std::string _version;
};

class LabDriverService : public Driver::DriverService {
 public:
  std::unique_ptr<Driver::HostDriver> FindDriver(const std::string& name) const override {
    return Lab::PerformRead<std::unique_ptr<Driver::HostDriver>>(
        {"DriverService::FindDriver", name}, [&name](const Json& state) {
          const Json& drivers = Lab::Object(state, "/hardware/drivers");
          if (!drivers.contains(name)) throw Lab::StateError("no driver " + name);
          return std::make_unique<LabHostDriver>(name, Lab::Text(drivers[name], "/version"));
        });
  }
};

class LabHostSystem : public System::HostSystem {
 public:
  int GetDriverVMState() const override {
    return Lab::PerformRead<int>({"HostSystem::GetDriverVMState"}, [](const Json& state) {
      return static_cast<int>(Lab::Number(state, "/host/driverVmState", 0));
    });
  }
};

class LabHost : public Host {
 public:
  Hardware::HardwareService& GetHardwareService() override { return _hardware; }
  Storage::StorageService& GetStorageService() override { return _storage; }
  Driver::DriverService& GetDriverService() override { return _driver; }
  System::HostSystem& GetSystem() override { return _system; }

 private:
  LabHardwareService _hardware;
  LabStorageService _storage;
  LabDriverService _driver;
  LabHostSystem _system;
};

}  // namespace

std::unique_ptr<Host> HostFactory::GetHost() {
  return Lab::PerformRead<std::unique_ptr<Host>>(
      {"HostFactory::GetHost"}, [](const Json&) { return std::make_unique<LabHost>(); });
}

}  // namespace Nodeplane
