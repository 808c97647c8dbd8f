#include "hosts/machine/address_origin.h"

#include <linux/if_addr.h>

namespace Machine {

Origin OriginOfIpv4(uint32_t flags, bool routeByDhcp) {
  // A lease ends; an endless lease still shows in the route that came with it.
  const bool leased = (flags & IFA_F_PERMANENT) == 0;
  return leased || routeByDhcp ? Origin::DHCP : Origin::STATIC;
}

Origin OriginOfIpv6(uint32_t flags, int prefix, bool linkLocal) {
  const bool autoconfigured = (flags & (IFA_F_MANAGETEMPADDR | IFA_F_TEMPORARY)) != 0;
  if (linkLocal || autoconfigured) return Origin::AUTOCONF;
  if ((flags & IFA_F_PERMANENT) != 0) return Origin::STATIC;
  // DHCPv6 hands out single addresses; advertised prefixes are shorter.
  return prefix == 128 ? Origin::DHCP : Origin::AUTOCONF;
}

}  // namespace Machine
