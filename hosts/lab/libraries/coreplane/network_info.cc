#include "hostapi/coreplane/network_info.h"

#include <algorithm>
#include <optional>

#include "hosts/lab/libraries/coreplane/kernel_nic.h"
#include "hosts/lab/libraries/coreplane/pci_devices.h"
#include "hosts/lab/libraries/perform.h"
#include "hosts/lab/state/factory_network.h"

namespace Coreplane::Network {

using Lab::Json;
using Nodeplane::Hardware::PciDevice;
using Nodeplane::Network::MacAddress;
using Nodeplane::Network::NetworkInterface;

struct PnicImpl::Data {
  std::string name;

  // The adapter's node of the state.
  const Json& Find(const Json& state) const {
    const Json& pnics = Lab::List(state, "/network/pnics");
    const auto place = std::find_if(pnics.begin(), pnics.end(), [this](const Json& pnic) {
      return Lab::Text(pnic, "/name") == name;
    });
    if (place == pnics.end()) throw Lab::StateError("no adapter " + name);
    return *place;
  }
};

PnicImpl::PnicImpl(const std::string& name) : _data(std::make_unique<Data>(Data{name})) {}
PnicImpl::~PnicImpl() = default;
PnicImpl::PnicImpl(PnicImpl&&) noexcept = default;
PnicImpl& PnicImpl::operator=(PnicImpl&&) noexcept = default;

std::string PnicImpl::GetName() const { return _data->name; }

MacAddress PnicImpl::GetMacAddress() const {
  return Lab::PerformRead<MacAddress>(
      {"PnicImpl::GetMacAddress", _data->name},
      [this](const Json& state) { return MacAddress(Lab::Text(_data->Find(state), "/mac")); });
}

bool PnicImpl::IsLinkUp() const {
  return Lab::PerformRead<bool>({"PnicImpl::IsLinkUp", _data->name}, [this](const Json& state) {
    return Lab::Flag(_data->Find(state), "/linkUp");
  });
}

std::unique_ptr<PciDevice> PnicImpl::GetPciDevice() const {
  return Lab::PerformRead<std::unique_ptr<PciDevice>>(
      {"PnicImpl::GetPciDevice", _data->name}, [this](const Json& state) {
        return Lab::MakePciDevice(state, Lab::Text(_data->Find(state), "/pci", ""));
      });
}

// The interfaces are read from the state when they are asked for.
struct CorelinNicInfoImpl::Data {};

CorelinNicInfoImpl::CorelinNicInfoImpl() = default;
CorelinNicInfoImpl::~CorelinNicInfoImpl() = default;
CorelinNicInfoImpl::CorelinNicInfoImpl(CorelinNicInfoImpl&&) noexcept = default;
CorelinNicInfoImpl& CorelinNicInfoImpl::operator=(CorelinNicInfoImpl&&) noexcept = default;

std::vector<std::unique_ptr<NetworkInterface>> CorelinNicInfoImpl::GetCorelinNics() const {
  using Nics = std::vector<std::unique_ptr<NetworkInterface>>;
  return Lab::PerformRead<Nics>({"CorelinNicInfoImpl::GetCorelinNics"}, [](const Json& state) {
    Nics nics;
    for (const auto& [name, node] : Lab::Object(state, "/network/kernelNics").items()) {
      nics.push_back(Lab::MakeKernelNic(state, name));
    }
    return nics;
  });
}

struct NetworkInfoImpl::Data {
  // As of the last update; none before the first.
  std::optional<std::string> management;

  static std::string FindManagement(const Json& state) {
    return Lab::Text(state, "/network/management", "");
  }
};

NetworkInfoImpl::NetworkInfoImpl() : _data(std::make_unique<Data>()) {}
NetworkInfoImpl::~NetworkInfoImpl() = default;
NetworkInfoImpl::NetworkInfoImpl(NetworkInfoImpl&&) noexcept = default;
NetworkInfoImpl& NetworkInfoImpl::operator=(NetworkInfoImpl&&) noexcept = default;

bool NetworkInfoImpl::IsCoreIpv6Enabled() const {
  return Lab::PerformRead<bool>({"NetworkInfoImpl::IsCoreIpv6Enabled"}, [](const Json& state) {
    return Lab::Flag(state, "/network/ipv6/running");
  });
}

void NetworkInfoImpl::SetCoreIpv6Enabled(bool enabled) {
  Lab::PerformChange({"NetworkInfoImpl::SetCoreIpv6Enabled", "", {enabled ? "true" : "false"}},
                     [enabled](Json& state) { state["network"]["ipv6"]["nextStart"] = enabled; });
}

void NetworkInfoImpl::UpdateManagementInterface() {
  Lab::PerformRead<void>({"NetworkInfoImpl::UpdateManagementInterface"}, [this](const Json& state) {
    _data->management = Data::FindManagement(state);
  });
}

std::unique_ptr<NetworkInterface> NetworkInfoImpl::GetManagementInterface() const {
  return Lab::PerformRead<std::unique_ptr<NetworkInterface>>(
      {"NetworkInfoImpl::GetManagementInterface"}, [this](const Json& state) {
        return Lab::MakeKernelNic(state, _data->management.value_or(Data::FindManagement(state)));
      });
}

std::vector<std::unique_ptr<PnicImpl>> NetworkInfoImpl::GetPnics() const {
  using Pnics = std::vector<std::unique_ptr<PnicImpl>>;
  return Lab::PerformRead<Pnics>({"NetworkInfoImpl::GetPnics"}, [](const Json& state) {
    Pnics pnics;
    for (const Json& pnic : Lab::List(state, "/network/pnics")) {
      pnics.push_back(std::make_unique<PnicImpl>(Lab::Text(pnic, "/name")));
    }
    return pnics;
  });
}

void NetworkInfoImpl::DisableNetDumper() {
  Lab::PerformChange({"NetworkInfoImpl::DisableNetDumper"},
                     [](Json& state) { state["network"]["netDumper"] = false; });
}

void NetworkInfoImpl::ClearNetworkConfig() {
  Lab::PerformChange({"NetworkInfoImpl::ClearNetworkConfig"}, Lab::ClearNetwork);
}

void NetworkInfoImpl::AutoConfigNetwork() {
  Lab::PerformChange({"NetworkInfoImpl::AutoConfigNetwork"}, Lab::AutoConfigureNetwork);
}

}  // namespace Coreplane::Network
