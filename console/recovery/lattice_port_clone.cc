#include "console/recovery/lattice_port_clone.h"

#include <boost/regex.hpp>
#include <cstdlib>
#include <ctime>

#include "console/hostops/command_runner.h"
#include "hostapi/coreplane/switch_info.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

using Coreplane::Network::LatticePortImpl;
using Nodeplane::Lib::NodeplaneException;
using Nodeplane::Network::LatticePort;
using Nodeplane::Network::LatticePortParam;
using Nodeplane::Network::LatticeTeaming;

namespace {

constexpr char KEY_PREFIX[] = "hlp-";
constexpr char HOST_LOCAL_KEY[] = "^hlp\\-.*\\#[0-9]*$";
constexpr char KEY_SUFFIX[] = "#[0-9]*$";

constexpr int MAX_VLAN_ID = 4094;

// The order is the one in which a port takes its settings.
void CopySettings(const LatticePort& from, LatticePort& to) {
  to.SetBlocked(from.GetBlocked());
  to.SetFlowMonitoring(from.GetFlowMonitoring());
  to.SetTeaming(from.GetTeaming());
  to.SetMacLearning(from.GetMacLearning());
  to.SetMacLimit(from.GetMacLimit());
  to.SetUplinkTransmitOnly(from.GetUplinkTransmitOnly());
  to.SetSecurity(from.GetSecurity());
  to.SetShaping(LatticePort::INBOUND, from.GetShaping(LatticePort::INBOUND));
  to.SetShaping(LatticePort::OUTBOUND, from.GetShaping(LatticePort::OUTBOUND));
  to.SetResourcePool(from.GetResourcePool());
  to.SetProperties(LatticePort::PORT_SETTINGS, from.GetProperties(LatticePort::PORT_SETTINGS));
  to.SetVendorProperties(LatticePort::PORT_SETTINGS,
                         from.GetVendorProperties(LatticePort::PORT_SETTINGS));
  to.SetFilterAgents(from.GetFilterAgents());
  to.SetFilters(from.GetFilters());
  to.SetDescription(from.GetDescription());
}

// The flags mean what the host takes them for; this is how a management port uses its uplinks.
LatticeTeaming MakeTeaming(const std::vector<std::string>& uplinks) {
  LatticeTeaming teaming;
  teaming.policyKind = 3;
  teaming.flags = {0, 1, 0, 0, 0, 0, 0, 0};
  teaming.number = 0;
  teaming.moreFlags = {0, 1, 0, 1, 1};
  teaming.activeUplinks = uplinks;
  return teaming;
}

void SetUpPort(const LatticePort& oldPort, const LatticePortParam& param,
               const LatticePortChoice& choice, LatticePort& newPort) {
  CopySettings(oldPort, newPort);
  newPort.SetVlan(param.vlan);
  if (choice.unblock) {
    newPort.SetBlocked(false);
  }
  newPort.SetTeaming(MakeTeaming(choice.uplinks));
}

void AttachManagement(LatticePort& port) {
  const auto management = LookupManagementInterface();
  if (management == nullptr) {
    throw NodeplaneException("Could not find the management network");
  }
  management->SetConnectionPoint(&port, false);
}

// A port that cannot be removed stays; what failed before is what the operator is told.
void Discard(LatticePortImpl& port) {
  try {
    port.Destroy();
  } catch (const NodeplaneException&) {
  }
}

}  // namespace

std::string MakeHostLocalKey(const std::string& oldKey, const std::string& suffix) {
  if (!boost::regex_match(oldKey, boost::regex(HOST_LOCAL_KEY))) {
    return KEY_PREFIX + oldKey + suffix;
  }
  return boost::regex_replace(oldKey, boost::regex(KEY_SUFFIX), suffix);
}

std::string DrawKeySuffix() {
  srand(static_cast<unsigned int>(time(nullptr)));
  return "#" + std::to_string(rand() % 100000);
}

uint16_t ParseVlanId(const std::string& text) {
  return static_cast<uint16_t>(strtol(text.c_str(), nullptr, 10));
}

void MoveManagementToNewPort(const LatticePort& oldPort, const LatticePortParam& param,
                             const LatticePortChoice& choice) {
  if (param.vlan.vlanId > MAX_VLAN_ID) {
    throw NodeplaneException("Invalid LatticePort vlan specified. Valid range is 0-4094.");
  }
  const auto newPort = LatticePortImpl::CreateLatticePort(param, param.portKey);
  if (newPort == nullptr) {
    throw NodeplaneException("The host made no port");
  }
  try {
    SetUpPort(oldPort, param, choice, *newPort);
    AttachManagement(*newPort);
  } catch (const NodeplaneException&) {
    Discard(*newPort);
    throw;
  }
}

}  // namespace Tarnel
