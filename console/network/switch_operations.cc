#include "console/network/switch_operations.h"

#include <syslog.h>

#include <algorithm>
#include <memory>

#include "console/hostops/command_runner.h"
#include "hostapi/coreplane/switch_info.h"
#include "hostapi/nodeplane/exception.h"
#include "hostapi/nodeplane/lattice.h"

namespace Tarnel {

namespace {

using Nodeplane::Lib::NodeplaneException;
using Nodeplane::Network::ConnectionPoint;
using Nodeplane::Network::LatticePort;
using Nodeplane::Network::NetworkInterface;
using Nodeplane::Network::NicTeamingPolicy;
using Nodeplane::Network::PortGroup;
using Nodeplane::Network::VirtualSwitch;

// Runs an operation on the host; a failure of the host is logged and gives false.
template <class Operation>
bool Attempt(const std::string& prefix, Operation operation) {
  try {
    return operation();
  } catch (const NodeplaneException& error) {
    syslog(LOG_ERR, "%s", (prefix + error.what()).c_str());
    return false;
  }
}

std::unique_ptr<ConnectionPoint> ConnectionOf(const NetworkInterface& nic) {
  auto point = nic.GetConnectionPoint();
  if (point == nullptr) {
    throw NodeplaneException("The interface has no connection point");
  }
  return point;
}

// Null when the host says that it is a port group and gives something else.
PortGroup* AsPortGroup(ConnectionPoint& point) {
  if (point.GetConnecteeType() != ConnectionPoint::CONNECTEE_PORT_GROUP) {
    throw NodeplaneException("Unsupported softSwitch type");
  }
  return dynamic_cast<PortGroup*>(&point);
}

template <class Operation>
bool OnPortGroup(const NetworkInterface& nic, Operation operation) {
  const auto point = ConnectionOf(nic);
  PortGroup* const group = AsPortGroup(*point);
  return group != nullptr && operation(*group);
}

std::unique_ptr<VirtualSwitch> SwitchOf(const PortGroup& group) {
  auto virtualSwitch = group.GetVirtualSwitch();
  if (virtualSwitch == nullptr) {
    throw NodeplaneException("The port group has no switch");
  }
  return virtualSwitch;
}

// Takes the adapter off the first of these switches that has it.
template <class Switches>
void RemoveFromFirst(const Switches& switches, const std::string& name) {
  for (const auto& candidate : switches) {
    try {
      candidate->RemoveUplink(name, false);
      return;
    } catch (const NodeplaneException&) {
      // The adapter is not on this one.
    }
  }
}

bool IsSet(const NicTeamingPolicy& policy, NicTeamingPolicy::FieldMask field) {
  return (policy.GetFieldMask() & field) != 0;
}

// Allows that many more active uplinks where their number is limited. Gives whether it is. A limit
// at the end of its range stays there.
bool RaiseMaximum(NicTeamingPolicy& policy, int change) {
  if (!IsSet(policy, NicTeamingPolicy::MAX_ACTIVE_UPLINKS)) {
    return false;
  }
  const int64_t maximum = int64_t{policy.GetMaxActiveUplinks()} + change;
  policy.SetMaxActiveUplinks(
      static_cast<int32_t>(std::clamp<int64_t>(maximum, INT32_MIN, INT32_MAX)));
  return true;
}

template <class Handle>
bool NameOf(const Handle& portset, std::string& name) {
  if (portset == nullptr) {
    return false;
  }
  name = portset->GetName();
  return true;
}

}  // namespace

bool IsManagementOnLattice() {
  return Attempt("Could not determine if a Lattice was in use: ", [] {
    const auto nic = LookupManagementInterface();
    if (nic == nullptr) {
      syslog(LOG_ERR, "Could not locate the management interface");
      return false;
    }
    return ConnectionOf(*nic)->GetConnecteeType() == ConnectionPoint::CONNECTEE_LATTICE_PORT;
  });
}

bool GetSwitchName(NetworkInterface& nic, std::string& name) {
  return Attempt("Getting switch name failed: ", [&] {
    const auto point = ConnectionOf(nic);
    switch (point->GetConnecteeType()) {
      case ConnectionPoint::CONNECTEE_NONE:
        throw NodeplaneException("Unsupported connectee type");
      case ConnectionPoint::CONNECTEE_PORT_GROUP: {
        const auto* const group = dynamic_cast<const PortGroup*>(point.get());
        return group != nullptr && NameOf(group->GetVirtualSwitch(), name);
      }
      case ConnectionPoint::CONNECTEE_LATTICE_PORT: {
        const auto* const port = dynamic_cast<const LatticePort*>(point.get());
        return port != nullptr && NameOf(port->GetLatticeSwitch(), name);
      }
      case ConnectionPoint::CONNECTEE_OPAQUE_NETWORK:
        throw NodeplaneException("Opaque network connectee type not supported");
      default:
        name.clear();
        return true;
    }
  });
}

bool GetVlanId(NetworkInterface& nic, uint16_t& vlanId) {
  return Attempt("Getting VlanID failed: ", [&] {
    return OnPortGroup(nic, [&](const PortGroup& group) {
      vlanId = group.GetVlan();
      return true;
    });
  });
}

bool SetVlanId(NetworkInterface& nic, uint16_t vlanId) {
  return Attempt("Setting VlanID failed: ", [&] {
    return OnPortGroup(nic, [&](PortGroup& group) {
      group.SetVlan(vlanId);
      return true;
    });
  });
}

bool GetMaxActiveUplinks(NetworkInterface& nic, int32_t& maximum) {
  return Attempt("Getting max number of active uplinks failed: ", [&] {
    return OnPortGroup(nic, [&](const PortGroup& group) {
      maximum = group.GetTeamingPolicy().GetMaxActiveUplinks();
      return true;
    });
  });
}

bool GetActiveUplinks(NetworkInterface& nic, std::vector<std::string>& names) {
  return Attempt("Getting uplinks failed: ", [&] {
    return OnPortGroup(nic, [&](const PortGroup& group) {
      names = group.GetTeamingPolicy().GetUplinkOrder();
      return true;
    });
  });
}

bool RemoveManagementUplink(NetworkInterface& nic, const std::string& name) {
  return Attempt("Removing uplink " + name + " failed: ", [&] {
    return OnPortGroup(nic, [&](PortGroup& group) {
      SwitchOf(group)->RemoveUplink(name, false);
      return RemoveUplinkFromPolicy(name, group);
    });
  });
}

// The adapter is off its old switch already when a distributed switch refuses it.
bool AddManagementUplink(NetworkInterface& nic, const std::string& name) {
  return Attempt("Adding uplink " + name + " failed: ", [&] {
    const auto point = ConnectionOf(nic);
    DetachUplink(name);
    PortGroup* const group = AsPortGroup(*point);
    if (group == nullptr) {
      return false;
    }
    SwitchOf(*group)->AddUplink(name);
    return AddUplinkToPolicy(name, *group);
  });
}

bool RemoveUplinkFromPolicy(const std::string& name, PortGroup& group) {
  return Attempt("VS: remove uplink from teaming policy failed: ", [&] {
    NicTeamingPolicy policy = group.GetTeamingPolicy();
    if (IsSet(policy, NicTeamingPolicy::UPLINK_ORDER)) {
      std::vector<std::string> order = policy.GetUplinkOrder();
      const auto place = std::find(order.begin(), order.end(), name);
      if (place != order.end()) {
        order.erase(place);
        policy.SetUplinkOrder(order);
        RaiseMaximum(policy, -1);
      }
    }
    group.SetTeamingPolicy(policy);
    return true;
  });
}

bool AddUplinkToPolicy(const std::string& name, PortGroup& group) {
  return Attempt("VS: add uplink to teaming policy failed: ", [&] {
    NicTeamingPolicy policy = group.GetTeamingPolicy();
    AppendUplink(name, policy);
    group.SetTeamingPolicy(policy);
    return true;
  });
}

bool AppendUplink(const std::string& name, NicTeamingPolicy& policy) {
  std::vector<std::string> order;
  if (IsSet(policy, NicTeamingPolicy::UPLINK_ORDER)) {
    order = policy.GetUplinkOrder();
  }
  bool changed = RaiseMaximum(policy, 1);
  if (std::find(order.begin(), order.end(), name) == order.end()) {
    order.push_back(name);
    policy.SetUplinkOrder(order);
    changed = true;
  }
  return changed;
}

void DetachUplink(const std::string& name) {
  const Coreplane::Network::VirtualSwitchInfoImpl info;
  RemoveFromFirst(info.GetVirtualSwitches(), name);
  RemoveFromFirst(info.GetLatticeSwitches(), name);
}

}  // namespace Tarnel
