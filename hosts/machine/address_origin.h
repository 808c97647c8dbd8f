#pragma once

#include <cstdint>

#include "hosts/machine/facts.h"

namespace Machine {

// The kernel does not keep who set an address; these are the signs that it does keep. `flags` are
// the IFA_F_ ones of the address.

// routeByDhcp: the interface's default route was set by a DHCP client.
Origin OriginOfIpv4(uint32_t flags, bool routeByDhcp);
Origin OriginOfIpv6(uint32_t flags, int prefix, bool linkLocal);

}  // namespace Machine
