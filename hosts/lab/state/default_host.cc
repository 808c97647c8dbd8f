#include "hosts/lab/state/default_host.h"

#include <algorithm>

#include "hostapi/nodeplane/pci_device.h"
#include "hosts/lab/state/factory_network.h"

namespace Lab {

namespace {

using Machine::Facts;
using Machine::Origin;

constexpr char GENERIC_PRODUCT[] = "Generic Machine";
constexpr char GENERIC_PROCESSOR[] = "Generic Processor";
// A console with hundreds of devices would spend its start on reading them.
constexpr size_t MAX_PCI_DEVICES = 64;

// What no machine says of itself.
Json BuiltInHost() {
  return Json::parse(R"({
    "host": {
      "version": {"product": "Ostrel Laboratory Host", "version": "8.0.2",
                  "releaseType": "release", "buildText": "24022", "buildNumber": 24022},
      "auditMode": false, "welcomeMessage": "", "systemAlert": "", "driverVmState": 0,
      "keyboard": {"configured": "US Default", "loaded": "US Default",
                   "layouts": ["Belgian", "Brazilian", "Croatian", "Czechoslovakian", "Danish",
                               "Estonian", "Finnish", "French", "German", "Greek",
                               "Icelandic", "Italian", "Japanese", "Latin American", "Norwegian",
                               "Polish", "Portuguese", "Russian", "Slovenian", "Spanish",
                               "Swedish", "Swiss French", "Swiss German", "Turkish", "US Default",
                               "US Dvorak", "Ukrainian", "United Kingdom"]}
    },
    "files": {"/var/run/halvren/show-tarnel-login": {"content": ""}},
    "notary": {"init": 0},
    "hardware": {"bmc": "N/A", "storage": [], "drivers": {}, "cardSlots": []},
    "network": {"kernelNics": {}, "switches": {}, "lattices": {}, "netDumper": false,
                "rulesets": {"sshServer": {"follows": true, "on": false}}},
    "names": {}, "ping": {},
    "services": {
      "OstrelShell": {"running": false, "enabled": false},
      "SSH": {"running": false, "enabled": false},
      "stewardd": {"running": true, "enabled": true}
    },
    "options": {
      "user": [],
      "advanced": {
        "/UserVars/TarnelTimeOut": {"type": "integer", "value": 600},
        "/UserVars/OstrelShellTimeOut": {"type": "integer", "value": 0},
        "/UserVars/OstrelShellInteractiveTimeOut": {"type": "integer", "value": 0}
      }
    },
    "agent": {"lockdown": {"on": false, "possible": true}, "refreshes": 0},
    "virtualMachines": []
  })");
}

std::string OrElse(const std::string& text, const char* fallback) {
  return text.empty() ? fallback : text;
}

// The functions of one card have to be given away together.
Json PassthruRecord(const std::string& address) {
  return {{"name", address},
          {"state", Nodeplane::Hardware::PassthruDevice::RELEASED},
          {"group", address.substr(0, address.find('.'))}};
}

Json PciDevices(const Facts& facts) {
  Json devices = Json::array();
  for (const Machine::PciDevice& device : facts.pciDevices) {
    if (devices.size() == MAX_PCI_DEVICES) break;
    devices.push_back({{"address", device.address},
                       {"class", device.deviceClass},
                       {"vendor", TextNode(device.vendor)},
                       {"device", TextNode(device.device)},
                       {"driver", device.driver},
                       {"passthru", true},
                       {"dependent", PassthruRecord(device.address)}});
  }
  return devices;
}

Json Hardware(const Facts& facts) {
  const Machine::Firmware& firmware = facts.firmware;
  return {{"firmware",
           {{"vendor", TextNode(firmware.vendor)},
            {"product", TextNode(OrElse(firmware.product, GENERIC_PRODUCT))},
            {"serialNumber", TextNode(firmware.serialNumber)},
            {"serviceTag", TextNode(firmware.serialNumber)},
            {"bios",
             {{"vendor", TextNode(firmware.biosVendor)},
              {"versionName", TextNode(OrElse(firmware.biosVersion, "N/A"))},
              {"versionSuffix", TextNode(firmware.biosDate)},
              {"assetTag", TextNode(firmware.assetTag)},
              {"releaseDate", TextNode(firmware.biosDate)},
              {"machineUuid", TextNode(firmware.uuid)}}}}},
          {"cpu",
           {{"model", TextNode(OrElse(facts.processor.model, GENERIC_PROCESSOR))},
            {"packages", facts.processor.sockets}}},
          {"memory",
           {{"pages", facts.memory.totalBytes / std::max<uint64_t>(facts.memory.pageSize, 1)},
            {"pageSize", facts.memory.pageSize}}},
          {"pci", PciDevices(facts)}};
}

Json Pnics(const Facts& facts) {
  Json pnics = Json::array();
  for (const Machine::Adapter& adapter : facts.adapters) {
    pnics.push_back({{"name", adapter.name},
                     {"mac", adapter.mac},
                     {"linkUp", adapter.linkUp},
                     {"pci", adapter.pciAddress}});
  }
  return pnics;
}

int AddressType(Origin origin) {
  switch (origin) {
    case Origin::DHCP:
      return 9;
    case Origin::AUTOCONF:
      return 7;
    case Origin::STATIC:
      return 0;
  }
  return 0;
}

Json Ipv6Node(const Machine::Ipv6& address) {
  return {{"address", address.address + "/" + std::to_string(address.prefix)},
          {"type", AddressType(address.origin)},
          {"scope", address.linkLocal ? 1 : 3}};
}

bool HasIpv6From(const Machine::ManagementInterface& nic, Origin origin) {
  return std::any_of(nic.ipv6.begin(), nic.ipv6.end(), [origin](const Machine::Ipv6& address) {
    return address.origin == origin && !address.linkLocal;
  });
}

// The modes that lead to the addresses which the interface has.
Json StoredConfig(const Machine::ManagementInterface& nic) {
  const bool dhcp = !nic.ipv4.address.empty() && nic.ipv4.origin == Origin::DHCP;
  Json stored = {{"dhcp", dhcp},
                 {"none", nic.ipv4.address.empty()},
                 {"ipv6Dhcp", HasIpv6From(nic, Origin::DHCP)},
                 {"routerAdvertised", HasIpv6From(nic, Origin::AUTOCONF)},
                 {"dhcpDns", dhcp},
                 {"ipv6", Json::array()}};
  if (!dhcp && !nic.ipv4.address.empty()) {
    stored["address"] = nic.ipv4.address;
    stored["netmask"] = nic.ipv4.netmask;
  }
  for (const Machine::Ipv6& address : nic.ipv6) {
    if (address.origin == Origin::STATIC) stored["ipv6"].push_back(Ipv6Node(address));
  }
  return stored;
}

Json RunningConfig(const Machine::ManagementInterface& nic) {
  Json running = {{"ipv6", Json::array()}};
  const auto set = [&running](const char* name, const std::string& value) {
    if (!value.empty()) running[name] = value;
  };
  set("address", nic.ipv4.address);
  set("netmask", nic.ipv4.netmask);
  set("gateway", nic.gateway4);
  set("gateway6", nic.gateway6);
  for (const Machine::Ipv6& address : nic.ipv6) running["ipv6"].push_back(Ipv6Node(address));
  return running;
}

// What the network would give the interface if it asked: the addresses that it has.
Json Offers(const Machine::ManagementInterface& nic) {
  Json offers = Json::object();
  Json advertised = Json::array();
  if (!nic.ipv4.address.empty()) {
    offers["lease4"]["offer"] = {
        {"address", nic.ipv4.address}, {"netmask", nic.ipv4.netmask}, {"gateway", nic.gateway4}};
  }
  for (const Machine::Ipv6& address : nic.ipv6) {
    const Json text = Ipv6Node(address)["address"];
    if (address.linkLocal) {
      offers["linkLocal"] = text;
    } else if (address.origin == Origin::DHCP) {
      offers["lease6"] = {{"bound", true}, {"offer", {{"address", text}}}};
    } else if (address.origin == Origin::AUTOCONF) {
      advertised.push_back(text);
    }
  }
  if (!advertised.empty()) {
    offers["routerAdvertisement"] = {{"addresses", advertised}, {"gateway", nic.gateway6}};
  }
  return offers;
}

Json KernelNic(const Machine::ManagementInterface& nic) {
  Json stored = StoredConfig(nic);
  const bool bound = stored["dhcp"];
  Json node = {{"class", "CoreNicImpl"},
               {"mac", OrElse(nic.mac, "00:00:00:00:00:00")},
               {"enabled", true},
               {"configurable", true},
               {"stored", std::move(stored)},
               {"running", RunningConfig(nic)},
               {"connection", FactoryConnection()},
               {"lease4", {{"bound", bound}}}};
  node.merge_patch(Offers(nic));
  return node;
}

// The adapter with the interface's address, else the first with a link, else the first.
std::string ManagementAdapter(const Facts& facts) {
  const auto& adapters = facts.adapters;
  auto place = std::find_if(
      adapters.begin(), adapters.end(),
      [&facts](const Machine::Adapter& adapter) { return adapter.mac == facts.management.mac; });
  if (place == adapters.end()) {
    place = std::find_if(adapters.begin(), adapters.end(),
                         [](const Machine::Adapter& adapter) { return adapter.linkUp; });
  }
  if (place == adapters.end()) place = adapters.begin();
  return place == adapters.end() ? "" : place->name;
}

Json Stack(const Facts& facts) {
  Json settings = {{"hostname", TextNode(facts.hostName.name)},
                   {"domain", TextNode(facts.hostName.domain)},
                   {"suffixes", facts.resolver.searchDomains},
                   {"gateway4", facts.management.gateway4},
                   {"gateway6", facts.management.gateway6},
                   {"dns4", Json::array()},
                   {"dns6", Json::array()}};
  for (const std::string& server : facts.resolver.nameServers) {
    const bool ipv6 = server.find(':') != std::string::npos;
    settings[ipv6 ? "dns6" : "dns4"].push_back(server);
  }
  return {{"running", settings}, {"stored", settings}};
}

// What the network around the machine answers: its own name, and its name servers.
Json Surroundings(const Facts& facts) {
  Json names = Json::object();
  Json ping = Json::object();
  const auto& [host, domain] = facts.hostName;
  const std::string name = domain.empty() ? host : host + "." + domain;
  const std::string& address = facts.management.ipv4.address;
  // A name that is no text cannot be a key.
  if (!name.empty() && !address.empty() && TextNode(name).is_string()) {
    names[name]["answers"] = Json::array({address});
  }
  for (const std::string& server : facts.resolver.nameServers) ping[server] = {{"exit", 0}};
  return {{"names", names}, {"ping", ping}};
}

Json Network(const Facts& facts) {
  Json network = {{"ipv6", {{"running", facts.ipv6Enabled}, {"nextStart", facts.ipv6Enabled}}},
                  {"pnics", Pnics(facts)},
                  {"switches", FactorySwitches(ManagementAdapter(facts))},
                  {"stacks", {{"defaultTcpipStack", Stack(facts)}}}};
  if (!facts.management.name.empty()) {
    network["management"] = DEFAULT_NIC;
    network["kernelNics"][DEFAULT_NIC] = KernelNic(facts.management);
  }
  return network;
}

}  // namespace

Json DefaultHost(const Facts& facts) {
  Json state = BuiltInHost();
  state.merge_patch({{"hardware", Hardware(facts)}, {"network", Network(facts)}});
  state.merge_patch(Surroundings(facts));
  return state;
}

}  // namespace Lab
