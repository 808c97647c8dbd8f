#include "hosts/lab/libraries/coreplane/kernel_nic.h"

#include <utility>

#include "hosts/lab/libraries/perform.h"

namespace {

using Lab::Json;
using Nodeplane::Network::CoreNic;
using Nodeplane::Network::IpConfig;
using Nodeplane::Network::Ipv4Address;
using Nodeplane::Network::Ipv6Address;
using Nodeplane::Network::Ipv6Network;
using Nodeplane::Network::NetworkInterface;

const Json& NicNode(const Json& state, const std::string& name) {
  return Lab::Object(state, ("/network/kernelNics/" + name).c_str());
}

void ReadIpv4(const Json& node, IpConfig& config) {
  config.SetIpv4Address(Ipv4Address(Lab::Text(node, "/address", "0.0.0.0")));
  config.SetIpv4Netmask(Ipv4Address(Lab::Text(node, "/netmask", "0.0.0.0")));
  config.SetIpv4Gateway(Ipv4Address(Lab::Text(node, "/gateway", "0.0.0.0")));
  config.SetUseDhcp(Lab::Flag(node, "/dhcp", false));
  if (Lab::Flag(node, "/none", false)) config.SetIpv4UseNone();
}

Ipv6Network ReadIpv6Network(const Json& node) {
  Ipv6Network network(Lab::Text(node, "/address"));
  network.SetIpv6AddressType(static_cast<int>(Lab::Number(node, "/type", Ipv6Network::STATIC)));
  network.SetIpv6Scope(static_cast<int>(Lab::Number(node, "/scope", network.GetIpv6Scope())));
  return network;
}

void ReadIpv6(const Json& node, IpConfig& config) {
  config.SetUseIpv6Dhcp(Lab::Flag(node, "/ipv6Dhcp", false));
  config.SetUseIpv6RouterAdvertised(Lab::Flag(node, "/routerAdvertised", false));
  config.SetIpv6Gateway(Ipv6Address(Lab::Text(node, "/gateway6", "::")));
  for (const Json& network : Lab::List(node, "/ipv6")) {
    config.AddIpv6Network(ReadIpv6Network(network));
  }
}

// A node such as {dhcp, none, address, netmask, gateway, ipv6Dhcp, routerAdvertised, gateway6,
// dhcpDns, ipv6[{address, type, scope}]}; only the list has to be there.
IpConfig ReadIpConfig(const Json& node) {
  IpConfig config;
  ReadIpv4(node, config);
  ReadIpv6(node, config);
  config.SetDhcpDns(Lab::Flag(node, "/dhcpDns", false));
  return config;
}

// What every kernel interface does, whether it can hold a lease or not.
template <class Base>
class KernelNic : public Base {
 public:
  explicit KernelNic(std::string name) : _name(std::move(name)) {}

  std::string GetName() const override { return _name; }

  IpConfig GetIpConfig() const override {
    return Lab::PerformRead<IpConfig>(
        {"NetworkInterface::GetIpConfig", _name}, [this](const Json& state) {
          return ReadIpConfig(Lab::Object(NicNode(state, _name), "/stored"));
        });
  }

  IpConfig GetRunningIpConfig() const override {
    return Lab::PerformRead<IpConfig>(
        {"NetworkInterface::GetRunningIpConfig", _name}, [this](const Json& state) {
          return ReadIpConfig(Lab::Object(NicNode(state, _name), "/running"));
        });
  }

  bool IsConfigurable() const override {
    return Lab::PerformRead<bool>(
        {"NetworkInterface::IsConfigurable", _name},
        [this](const Json& state) { return Lab::Flag(NicNode(state, _name), "/configurable"); });
  }

 private:
  std::string _name;
};

class LabCoreNic : public KernelNic<CoreNic> {
 public:
  using KernelNic::KernelNic;

  bool IsDhcpBound() const override {
    return Lab::PerformRead<bool>({"CoreNic::IsDhcpBound", GetName()}, [this](const Json& state) {
      return Lab::Flag(NicNode(state, GetName()), "/lease4/bound");
    });
  }

  Ipv4Address GetDhcpServerAddress() const override {
    return Lab::PerformRead<Ipv4Address>(
        {"CoreNic::GetDhcpServerAddress", GetName()}, [this](const Json& state) {
          return Ipv4Address(Lab::Text(NicNode(state, GetName()), "/lease4/server", "0.0.0.0"));
        });
  }
};

using PlainNic = KernelNic<NetworkInterface>;

}  // namespace

template <>
std::unique_ptr<NetworkInterface> Lab::MakeOtherClass<NetworkInterface>() {
  const auto state = ReadState();
  return std::make_unique<PlainNic>(Text(*state, "/network/management"));
}

std::unique_ptr<NetworkInterface> Lab::MakeKernelNic(const Json& state, const std::string& name) {
  if (name.empty()) return nullptr;
  const std::string type = Text(NicNode(state, name), "/class");
  if (type == "CoreNic") return std::make_unique<LabCoreNic>(name);
  return std::make_unique<PlainNic>(name);
}
