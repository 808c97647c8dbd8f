#pragma once

#include <string>

#include "hosts/lab/state/host_state.h"

// What the configuration of a kernel interface brings about. An interface is a node
//   {class, mac, enabled, configurable, stored{}, running{}, connection{}, lease4{}, lease6{}, ...}
// Its views "stored" and "running" have the modes {dhcp, none, ipv6Dhcp, routerAdvertised, dhcpDns}
// and {address, netmask, gateway, gateway6, ipv6[{address, type, scope}]}; a mode that "running"
// lacks is as in "stored". What the network around it has to give stands beside them:
//   lease4: {bound, server, offer{address, netmask, gateway, hostname, domain, dns[]}, onRenew}
//   lease6: {bound, offer{address, dns[]}, onRenew}
//   routerAdvertisement: {addresses[], gateway}     linkLocal: "fe80::1/64"
// Without an offer no server answers. "onRenew" is the offer to a renewal, false when the server
// takes the lease away.
namespace Lab {

// The interface's node; throws StateError when there is none.
Json& KernelNicNode(Json& state, const std::string& name);

// Makes a view the stored one and brings it into effect. A lease that stays in use keeps its
// address, but counts as bound only where the server still offers the same.
void ConfigureKernelNic(Json& state, const std::string& name, Json stored);

// Takes the interface down: it loses its addresses.
void TakeDownKernelNic(Json& state, const std::string& name);
// Brings it up by its stored configuration, with leases asked for anew.
void BringUpKernelNic(Json& state, const std::string& name);

// Asks for the lease again. An interface that is down or not in that mode asks for nothing.
void RenewLease4(Json& state, const std::string& name);
void RenewLease6(Json& state, const std::string& name);

}  // namespace Lab
