#include "hosts/lab/state/factory_network.h"

#include "hosts/lab/state/default_host.h"
#include "hosts/lab/state/kernel_nics.h"

namespace Lab {

namespace {

constexpr char SWITCH[] = "softSwitch0";
constexpr char PORT_GROUP[] = "Management Network";
constexpr int PORTS = 128;
// The uplink order and the maximum of active uplinks are set.
constexpr int TEAMING_MASK = 0x50;

Json Views(bool dhcp) {
  const Json stored = {{"dhcp", dhcp},      {"none", !dhcp},
                       {"ipv6Dhcp", false}, {"routerAdvertised", dhcp},
                       {"dhcpDns", dhcp},   {"ipv6", Json::array()}};
  return {{"stored", stored}, {"running", {{"ipv6", Json::array()}}}};
}

// What an interface is without its configuration.
Json ClearedNic(const Json& nic) {
  Json cleared = Views(false);
  cleared.merge_patch({{"class", "CoreNicImpl"}, {"enabled", false}, {"configurable", true}});
  cleared["connection"] = {{"type", 0}};
  for (const char* field :
       {"class", "mac", "lease4", "lease6", "routerAdvertisement", "linkLocal"}) {
    if (nic.contains(field)) cleared[field] = nic[field];
  }
  return cleared;
}

Json ClearedStack() {
  const Json settings = {{"hostname", "localhost"}, {"domain", ""},   {"suffixes", Json::array()},
                         {"gateway4", ""},          {"gateway6", ""}, {"dns4", Json::array()},
                         {"dns6", Json::array()}};
  return {{"running", settings}, {"stored", settings}};
}

// The first adapter with a link, else the first at all; null when there is none.
Json ChooseAdapter(const Json& state) {
  const Json& pnics = List(state, "/network/pnics");
  for (const Json& pnic : pnics) {
    if (Flag(pnic, "/linkUp", false)) return pnic;
  }
  return pnics.empty() ? Json() : pnics[0];
}

}  // namespace

Json FactorySwitches(const std::string& adapter) {
  Json uplinks = Json::array();
  if (!adapter.empty()) uplinks.push_back(adapter);
  const Json teaming = {{"mask", TEAMING_MASK}, {"order", uplinks}, {"max", uplinks.size()}};
  const Json portGroup = {{"vlan", 0}, {"teaming", teaming}};
  return {{SWITCH,
           {{"ports", PORTS},
            {"uplinks", uplinks},
            {"teaming", {{"mask", 0}, {"order", Json::array()}, {"max", 0}}},
            {"portGroups", {{PORT_GROUP, portGroup}}}}}};
}

Json FactoryConnection() { return {{"type", 1}, {"portGroup", PORT_GROUP}}; }

void ClearNetwork(Json& state) {
  Json& network = state["network"];
  const std::string management = Text(network, "/management", DEFAULT_NIC);
  const Json nic = network["kernelNics"].value(management, Json::object());
  network["kernelNics"] = {{DEFAULT_NIC, ClearedNic(nic)}};
  network["switches"] = Json::object();
  network["lattices"] = Json::object();
  network.erase("management");
  for (Json& stack : network["stacks"]) stack = ClearedStack();
}

void AutoConfigureNetwork(Json& state) {
  Json& network = state["network"];
  const Json adapter = ChooseAdapter(state);
  const bool found = !adapter.is_null();
  network["switches"] = FactorySwitches(found ? Text(adapter, "/name") : "");
  network["management"] = DEFAULT_NIC;
  Json& nic = network["kernelNics"][DEFAULT_NIC];
  nic = ClearedNic(nic.is_null() ? Json::object() : nic);
  nic.merge_patch(Views(true));
  nic["connection"] = FactoryConnection();
  if (found) nic["mac"] = Text(adapter, "/mac");
  BringUpKernelNic(state, DEFAULT_NIC);
}

}  // namespace Lab
