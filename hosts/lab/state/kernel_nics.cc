#include "hosts/lab/state/kernel_nics.h"

#include <algorithm>

#include "hostapi/nodeplane/ip_address.h"

namespace Lab {

using Nodeplane::Network::Ipv6Network;

namespace {

constexpr char STACK[] = "defaultTcpipStack";
constexpr int NO_CONNECTION = 0;

int64_t TypeOf(const Json& address) { return Number(address, "/type", Ipv6Network::STATIC); }

bool IsLinkLocal(const Json& address) {
  const Ipv6Network network(Text(address, "/address"));
  return Number(address, "/scope", network.GetIpv6Scope()) == Ipv6Network::LINK_LOCAL;
}

bool HasIpv6(const Json& nic, int type) {
  const Json& addresses = List(nic, "/running/ipv6");
  return std::any_of(addresses.begin(), addresses.end(), [type](const Json& address) {
    return TypeOf(address) == type && !IsLinkLocal(address);
  });
}

// An interface that is up and attached to something.
bool IsOnNetwork(const Json& nic) {
  return Flag(nic, "/enabled", true) && Number(nic, "/connection/type", NO_CONNECTION) > 0;
}

// Routes and name service come to the host from its management interface alone.
Json* RunningStack(Json& state, const Json& nic) {
  const std::string management = Text(state, "/network/management", "");
  const Json& nics = state["network"]["kernelNics"];
  const bool isManagement = nics.contains(management) && &nics.at(management) == &nic;
  return isManagement ? &state["network"]["stacks"][STACK]["running"] : nullptr;
}

void Copy(const Json& from, const char* name, Json& to, const char* toName) {
  if (from.contains(name)) to[toName] = from[name];
}

void TakeNameService(const Json& nic, const Json& offer, const char* servers, Json* stack) {
  if (stack == nullptr || !Flag(nic, "/stored/dhcpDns", false)) return;
  Copy(offer, "hostname", *stack, "hostname");
  Copy(offer, "domain", *stack, "domain");
  Copy(offer, "dns", *stack, servers);
}

void LoseLease4(Json& state, Json& nic) {
  nic["lease4"]["bound"] = false;
  for (const char* field : {"address", "netmask", "gateway"}) nic["running"].erase(field);
  if (Json* stack = RunningStack(state, nic)) (*stack)["gateway4"] = "";
}

void TakeLease4(Json& state, Json& nic, const Json& offer) {
  nic["lease4"]["bound"] = true;
  nic["running"]["address"] = Text(offer, "/address");
  nic["running"]["netmask"] = Text(offer, "/netmask", "255.255.255.0");
  Json* stack = RunningStack(state, nic);
  if (stack != nullptr) (*stack)["gateway4"] = Text(offer, "/gateway", "");
  TakeNameService(nic, offer, "dns4", stack);
}

void AskForLease4(Json& state, Json& nic) {
  LoseLease4(state, nic);
  if (IsOnNetwork(nic) && nic["lease4"].contains("offer")) {
    TakeLease4(state, nic, Json(nic["lease4"]["offer"]));
  }
}

void EraseIpv6(Json& nic, int type) {
  Json kept = Json::array();
  for (const Json& address : List(nic, "/running/ipv6")) {
    if (TypeOf(address) != type || IsLinkLocal(address)) kept.push_back(address);
  }
  nic["running"]["ipv6"] = kept;
}

void TakeLease6(Json& state, Json& nic, const Json& offer) {
  EraseIpv6(nic, Ipv6Network::DHCP);
  nic["running"]["ipv6"].push_back(
      {{"address", Text(offer, "/address")}, {"type", Ipv6Network::DHCP}});
  nic["lease6"]["bound"] = true;
  Json* stack = RunningStack(state, nic);
  TakeNameService(nic, offer, "dns6", stack);
  if (stack != nullptr) Copy(offer, "dns", *stack, "dns6FromDhcp");
}

void TakeRouterAdvertisement(Json& state, Json& nic) {
  const Json advertisement = nic["routerAdvertisement"];
  for (const Json& address : List(advertisement, "/addresses")) {
    nic["running"]["ipv6"].push_back({{"address", address}, {"type", Ipv6Network::AUTOCONF}});
  }
  Copy(advertisement, "gateway", nic["running"], "gateway6");
  if (Json* stack = RunningStack(state, nic)) Copy(advertisement, "gateway", *stack, "gateway6");
}

// The addresses of the modes in use that the interface does not have yet.
void AskForIpv6(Json& state, Json& nic) {
  if (!IsOnNetwork(nic)) return;
  if (nic.contains("linkLocal")) {
    Json& addresses = nic["running"]["ipv6"];
    if (std::none_of(addresses.begin(), addresses.end(), IsLinkLocal)) {
      addresses.push_back({{"address", nic["linkLocal"]}, {"type", Ipv6Network::AUTOCONF}});
    }
  }
  if (Flag(nic, "/stored/routerAdvertised", false) && nic.contains("routerAdvertisement") &&
      !HasIpv6(nic, Ipv6Network::AUTOCONF)) {
    TakeRouterAdvertisement(state, nic);
  }
  const bool dhcp = Flag(nic, "/stored/ipv6Dhcp", false) && !HasIpv6(nic, Ipv6Network::DHCP);
  if (dhcp && nic.value("lease6", Json::object()).contains("offer")) {
    TakeLease6(state, nic, Json(nic["lease6"]["offer"]));
  }
}

// What the interface got by itself and keeps under the stored modes.
bool StaysInUse(const Json& nic, const Json& address) {
  if (IsLinkLocal(address)) return TypeOf(address) != Ipv6Network::STATIC;
  switch (TypeOf(address)) {
    case Ipv6Network::STATIC:
      return false;
    case Ipv6Network::AUTOCONF:
      return Flag(nic, "/stored/routerAdvertised", false);
    case Ipv6Network::DHCP:
      return Flag(nic, "/stored/ipv6Dhcp", false);
    default:
      return true;
  }
}

void BringIpv6IntoEffect(Json& state, Json& nic, const Json& before) {
  nic["running"]["ipv6"] = Json::array();
  if (!Flag(state, "/network/ipv6/running", false)) return;
  nic["running"]["ipv6"] = List(nic, "/stored/ipv6");
  for (const Json& address : before) {
    if (StaysInUse(nic, address)) nic["running"]["ipv6"].push_back(address);
  }
  if (!HasIpv6(nic, Ipv6Network::DHCP) && nic.contains("lease6")) nic["lease6"]["bound"] = false;
  AskForIpv6(state, nic);
}

// With a lease in use, its addresses are in effect already.
void BringIpv4IntoEffect(Json& state, Json& nic, bool leaseInUse) {
  const Json& stored = nic["stored"];
  if (Flag(stored, "/dhcp", false)) {
    if (!leaseInUse) AskForLease4(state, nic);
    return;
  }
  nic["lease4"]["bound"] = false;
  for (const char* field : {"address", "netmask", "gateway"}) {
    nic["running"].erase(field);
    if (!Flag(stored, "/none", false)) Copy(stored, field, nic["running"], field);
  }
}

bool IsStillOffered(const Json& nic) {
  const std::string offered = Text(nic, "/lease4/offer/address", "");
  return !offered.empty() && offered == Text(nic, "/running/address", "");
}

}  // namespace

Json& KernelNicNode(Json& state, const std::string& name) {
  Json& nics = state["network"]["kernelNics"];
  if (!nics.contains(name)) throw StateError("no interface " + name);
  return nics[name];
}

void ConfigureKernelNic(Json& state, const std::string& name, Json stored) {
  Json& nic = KernelNicNode(state, name);
  const Json before = nic["running"].value("ipv6", Json::array());
  const bool leaseInUse = Flag(nic, "/stored/dhcp", false) && Flag(nic, "/lease4/bound", false);
  if (leaseInUse) nic["lease4"]["bound"] = IsStillOffered(nic);
  nic["stored"] = std::move(stored);
  for (const char* mode : {"dhcp", "none", "ipv6Dhcp", "routerAdvertised", "dhcpDns"}) {
    nic["running"].erase(mode);
  }
  if (!Flag(nic, "/enabled", true)) return;
  BringIpv4IntoEffect(state, nic, leaseInUse);
  Copy(nic["stored"], "gateway6", nic["running"], "gateway6");
  BringIpv6IntoEffect(state, nic, before);
}

void TakeDownKernelNic(Json& state, const std::string& name) {
  Json& nic = KernelNicNode(state, name);
  nic["enabled"] = false;
  nic["running"] = {{"ipv6", Json::array()}};
  for (const char* lease : {"lease4", "lease6"}) {
    if (nic.contains(lease)) nic[lease]["bound"] = false;
  }
}

void BringUpKernelNic(Json& state, const std::string& name) {
  Json& nic = KernelNicNode(state, name);
  nic["enabled"] = true;
  BringIpv4IntoEffect(state, nic, false);
  Copy(nic["stored"], "gateway6", nic["running"], "gateway6");
  BringIpv6IntoEffect(state, nic, Json::array());
}

void RenewLease4(Json& state, const std::string& name) {
  Json& nic = KernelNicNode(state, name);
  const Json lease = nic.value("lease4", Json::object());
  if (!Flag(nic, "/stored/dhcp", false) || !IsOnNetwork(nic)) return;
  const Json answer = lease.contains("onRenew") ? lease["onRenew"] : lease.value("offer", Json());
  if (answer == false) LoseLease4(state, nic);
  if (answer.is_object()) TakeLease4(state, nic, answer);
}

void RenewLease6(Json& state, const std::string& name) {
  Json& nic = KernelNicNode(state, name);
  const Json lease = nic.value("lease6", Json::object());
  const bool running = Flag(state, "/network/ipv6/running", false);
  if (!running || !Flag(nic, "/stored/ipv6Dhcp", false) || !IsOnNetwork(nic)) return;
  const Json answer = lease.contains("onRenew") ? lease["onRenew"] : lease.value("offer", Json());
  if (answer == false) {
    EraseIpv6(nic, Ipv6Network::DHCP);
    nic["lease6"]["bound"] = false;
  }
  if (answer.is_object()) TakeLease6(state, nic, answer);
}

}  // namespace Lab
