#include "hosts/lab/libraries/coreplane/kernel_nic.h"

#include <utility>

#include "hostapi/coreplane/network_info.h"
#include "hosts/lab/libraries/coreplane/connection_point.h"
#include "hosts/lab/libraries/perform.h"
#include "hosts/lab/state/kernel_nics.h"

namespace {

using Coreplane::Network::CoreNicImpl;
using Coreplane::Network::PnicImpl;
using Lab::Json;
using Lab::PerformChange;
using Lab::PerformRead;
using Nodeplane::Network::ConnectionPoint;
using Nodeplane::Network::CoreNic;
using Nodeplane::Network::IpConfig;
using Nodeplane::Network::Ipv4Address;
using Nodeplane::Network::Ipv6Address;
using Nodeplane::Network::Ipv6Network;
using Nodeplane::Network::MacAddress;
using Nodeplane::Network::NetworkInterface;

const Json& NicNode(const Json& state, const std::string& name) {
  return Lab::Object(state, ("/network/kernelNics/" + name).c_str());
}

void ReadIpv4(const Json& node, IpConfig& config) {
  config.SetIpv4Address(Ipv4Address(Lab::Text(node, "/address", "0.0.0.0")));
  config.SetIpv4Netmask(Ipv4Address(Lab::Text(node, "/netmask", "0.0.0.0")));
  config.SetIpv4Gateway(Ipv4Address(Lab::Text(node, "/gateway", "0.0.0.0")));
}

Ipv6Network ReadIpv6Network(const Json& node) {
  Ipv6Network network(Lab::Text(node, "/address"));
  network.SetIpv6AddressType(static_cast<int>(Lab::Number(node, "/type", Ipv6Network::STATIC)));
  network.SetIpv6Scope(static_cast<int>(Lab::Number(node, "/scope", network.GetIpv6Scope())));
  return network;
}

void ReadIpv6(const Json& node, IpConfig& config) {
  config.SetIpv6Gateway(Ipv6Address(Lab::Text(node, "/gateway6", "::")));
  for (const Json& network : Lab::List(node, "/ipv6")) {
    config.AddIpv6Network(ReadIpv6Network(network));
  }
}

// A mode that the view lacks is as it is stored.
void ReadModes(const Json& view, const Json& stored, IpConfig& config) {
  const auto mode = [&](const char* pointer) {
    return Lab::Flag(view, pointer, Lab::Flag(stored, pointer, false));
  };
  config.SetUseDhcp(mode("/dhcp"));
  if (mode("/none")) config.SetIpv4UseNone();
  config.SetUseIpv6Dhcp(mode("/ipv6Dhcp"));
  config.SetUseIpv6RouterAdvertised(mode("/routerAdvertised"));
  config.SetDhcpDns(mode("/dhcpDns"));
}

IpConfig ReadIpConfig(const Json& nic, const char* view) {
  const Json& node = Lab::Object(nic, view);
  IpConfig config;
  ReadIpv4(node, config);
  ReadIpv6(node, config);
  ReadModes(node, Lab::Object(nic, "/stored"), config);
  return config;
}

Json Ipv6Nodes(const IpConfig& config) {
  Json nodes = Json::array();
  for (const Ipv6Network& network : config.GetIpv6Network()) {
    // What the interface got by itself is not stored.
    if (network.GetIpv6AddressType() != Ipv6Network::STATIC) continue;
    nodes.push_back({{"address", network.GetStringAddress()},
                     {"type", Ipv6Network::STATIC},
                     {"scope", network.GetIpv6Scope()}});
  }
  return nodes;
}

Json StoredNode(const IpConfig& config) {
  Json node = {{"dhcp", config.GetUseDhcp()},
               {"none", config.GetIpv4UseNone()},
               {"ipv6Dhcp", config.GetUseIpv6Dhcp()},
               {"routerAdvertised", config.GetUseIpv6RouterAdvertised()},
               {"dhcpDns", config.GetDhcpDns()},
               {"ipv6", Ipv6Nodes(config)}};
  if (!config.GetUseDhcp() && !config.GetIpv4UseNone()) {
    node["address"] = config.GetIpv4Address().GetStringAddress();
    node["netmask"] = config.GetIpv4Netmask().GetStringAddress();
    node["gateway"] = config.GetIpv4Gateway().GetStringAddress();
  }
  node["gateway6"] = config.GetIpv6Gateway().GetScopedStringAddress();
  return node;
}

std::string DescribeIpv4(const IpConfig& config) {
  if (config.GetUseDhcp()) return "dhcp";
  if (config.GetIpv4UseNone()) return "none";
  return config.GetIpv4Address().GetStringAddress() + " " +
         config.GetIpv4Netmask().GetStringAddress();
}

std::string DescribeIpv6(const IpConfig& config) {
  std::string text = "ipv6";
  if (config.GetUseIpv6Dhcp()) text += " dhcp";
  if (config.GetUseIpv6RouterAdvertised()) text += " routerAdvertised";
  for (const Ipv6Network& network : config.GetIpv6Network()) {
    text += " " + network.GetStringAddress();
  }
  return text;
}

// What every kernel interface does, whether it can hold a lease or not.
template <class Base>
class KernelNic : public Base {
 public:
  explicit KernelNic(std::string name) : _name(std::move(name)) {}

  std::string GetName() const override { return _name; }

  IpConfig GetIpConfig() const override {
    return PerformRead<IpConfig>(
        {"NetworkInterface::GetIpConfig", _name},
        [this](const Json& state) { return ReadIpConfig(NicNode(state, _name), "/stored"); });
  }

  IpConfig GetRunningIpConfig() const override {
    return PerformRead<IpConfig>(
        {"NetworkInterface::GetRunningIpConfig", _name},
        [this](const Json& state) { return ReadIpConfig(NicNode(state, _name), "/running"); });
  }

  void SetIpConfig(const IpConfig& config) override {
    PerformChange({"NetworkInterface::SetIpConfig",
                   _name,
                   {DescribeIpv4(config), DescribeIpv6(config),
                    config.GetDhcpDns() ? "dns dhcp" : "dns manual"}},
                  [&](Json& state) { Lab::ConfigureKernelNic(state, _name, StoredNode(config)); });
  }

  bool IsConfigurable() const override {
    return PerformRead<bool>(
        {"NetworkInterface::IsConfigurable", _name},
        [this](const Json& state) { return Lab::Flag(NicNode(state, _name), "/configurable"); });
  }

  std::unique_ptr<ConnectionPoint> GetConnectionPoint() const override {
    return PerformRead<std::unique_ptr<ConnectionPoint>>(
        {"NetworkInterface::GetConnectionPoint", _name},
        [this](const Json& state) { return Lab::MakeConnectionPoint(state, _name); });
  }

  void SetConnectionPoint(ConnectionPoint* point, bool force) override {
    const auto* attachable = dynamic_cast<const Lab::Attachable*>(point);
    const Json connection = attachable == nullptr ? Json() : attachable->Connection();
    PerformChange({"NetworkInterface::SetConnectionPoint",
                   _name,
                   {Lab::DescribeConnection(connection), force ? "true" : "false"}},
                  [&](Json& state) {
                    if (connection.is_null()) throw Lab::StateError("nothing to attach to");
                    Lab::KernelNicNode(state, _name)["connection"] = connection;
                  });
  }

  void SetMacAddress(const MacAddress& address) override {
    SetMac({"NetworkInterface::SetMacAddress", _name, {address.GetStringAddress()}}, address);
  }

  void Disable() override {
    PerformChange({"NetworkInterface::Disable", _name},
                  [this](Json& state) { Lab::TakeDownKernelNic(state, _name); });
  }

  void Enable() override {
    PerformChange({"NetworkInterface::Enable", _name},
                  [this](Json& state) { Lab::BringUpKernelNic(state, _name); });
  }

  // Every read is fresh: there is nothing to bring up to date.
  void Refresh() override {
    Lab::PerformBesideState({"NetworkInterface::Refresh", _name}, [] {});
  }

 protected:
  void SetMac(const Lab::Call& call, const MacAddress& address) {
    PerformChange(call, [&](Json& state) {
      Lab::KernelNicNode(state, _name)["mac"] = address.GetStringAddress();
    });
  }

 private:
  std::string _name;
};

// An interface that can hold leases; Base is CoreNic or a class derived from it.
template <class Base>
class LeaseNic : public KernelNic<Base> {
 public:
  using KernelNic<Base>::KernelNic;
  using KernelNic<Base>::GetName;

  bool IsDhcpBound() const override {
    return PerformRead<bool>({"CoreNic::IsDhcpBound", GetName()}, [this](const Json& state) {
      return Lab::Flag(NicNode(state, GetName()), "/lease4/bound", false);
    });
  }

  void SetDhcpBound(bool bound) override {
    PerformChange(
        {"CoreNic::SetDhcpBound", GetName(), {bound ? "true" : "false"}},
        [&](Json& state) { Lab::KernelNicNode(state, GetName())["lease4"]["bound"] = bound; });
  }

  Ipv4Address GetDhcpServerAddress() const override {
    return PerformRead<Ipv4Address>(
        {"CoreNic::GetDhcpServerAddress", GetName()}, [this](const Json& state) {
          return Ipv4Address(Lab::Text(NicNode(state, GetName()), "/lease4/server", "0.0.0.0"));
        });
  }

  void RenewDhcpLease() override {
    PerformChange({"CoreNic::RenewDhcpLease", GetName()},
                  [this](Json& state) { Lab::RenewLease4(state, GetName()); });
  }

  void RenewDhcp6Lease() override {
    PerformChange({"CoreNic::RenewDhcp6Lease", GetName()},
                  [this](Json& state) { Lab::RenewLease6(state, GetName()); });
  }
};

class LabCoreNic : public LeaseNic<CoreNicImpl> {
 public:
  using LeaseNic::LeaseNic;

  void SetMacFromPnic(PnicImpl& pnic) override {
    const MacAddress address = pnic.GetMacAddress();
    SetMac({"CoreNicImpl::SetMacFromPnic", GetName(), {pnic.GetName()}}, address);
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
  if (type == "CoreNicImpl") return std::make_unique<LabCoreNic>(name);
  if (type == "CoreNic") return std::make_unique<LeaseNic<CoreNic>>(name);
  return std::make_unique<PlainNic>(name);
}

namespace Coreplane::Network {

CoreNicImpl::~CoreNicImpl() = default;

}  // namespace Coreplane::Network
