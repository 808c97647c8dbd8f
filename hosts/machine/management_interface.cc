#include <arpa/inet.h>
#include <linux/if_addr.h>
#include <linux/rtnetlink.h>
#include <netlink/cache.h>
#include <netlink/netlink.h>
#include <netlink/route/addr.h>
#include <netlink/route/link.h>
#include <netlink/route/nexthop.h>
#include <netlink/route/route.h>

#include <algorithm>
#include <memory>

#include "hosts/machine/address_origin.h"
#include "hosts/machine/readers.h"

namespace Machine {

namespace {

struct Deleter {
  void operator()(nl_sock* socket) const { nl_socket_free(socket); }
  void operator()(nl_cache* cache) const { nl_cache_free(cache); }
  void operator()(rtnl_link* link) const { rtnl_link_put(link); }
};
using Socket = std::unique_ptr<nl_sock, Deleter>;
using Cache = std::unique_ptr<nl_cache, Deleter>;
using Link = std::unique_ptr<rtnl_link, Deleter>;

struct DefaultRoute {
  int family;
  int interfaceIndex;
  uint32_t priority;
  bool byDhcp;
  std::string gateway;
};

struct InterfaceAddress {
  int interfaceIndex;
  int family;
  std::string address;
  int prefix;
  uint32_t flags;
  int scope;
};

// What the kernel knows, read once. The caches are null when it cannot be asked.
struct Tables {
  Cache links;
  std::vector<InterfaceAddress> addresses;
  // The ones that the kernel prefers first.
  std::vector<DefaultRoute> routes;
};

// Calls `visit` with each object of a cache.
template <typename Object, typename Visit>
void ForEach(const Cache& cache, Visit visit) {
  if (cache == nullptr) return;
  for (nl_object* object = nl_cache_get_first(cache.get()); object != nullptr;
       object = nl_cache_get_next(object)) {
    visit(reinterpret_cast<Object*>(object));
  }
}

// The address without its prefix.
std::string AddressText(const nl_addr* address) {
  char text[INET6_ADDRSTRLEN] = "";
  if (address != nullptr) {
    inet_ntop(nl_addr_get_family(address), nl_addr_get_binary_addr(address), text, sizeof text);
  }
  return text;
}

bool IsDefault(rtnl_route* route) {
  return rtnl_route_get_table(route) == RT_TABLE_MAIN &&
         rtnl_route_get_type(route) == RTN_UNICAST &&
         nl_addr_get_prefixlen(rtnl_route_get_dst(route)) == 0 &&
         rtnl_route_get_nnexthops(route) > 0;
}

std::vector<DefaultRoute> ReadRoutes(nl_sock* socket) {
  nl_cache* cache = nullptr;
  if (rtnl_route_alloc_cache(socket, AF_UNSPEC, 0, &cache) < 0) return {};
  std::vector<DefaultRoute> routes;
  ForEach<rtnl_route>(Cache(cache), [&](rtnl_route* route) {
    if (!IsDefault(route)) return;
    rtnl_nexthop* hop = rtnl_route_nexthop_n(route, 0);
    routes.push_back({rtnl_route_get_family(route), rtnl_route_nh_get_ifindex(hop),
                      rtnl_route_get_priority(route), rtnl_route_get_protocol(route) == RTPROT_DHCP,
                      AddressText(rtnl_route_nh_get_gateway(hop))});
  });
  std::stable_sort(routes.begin(), routes.end(), [](const auto& left, const auto& right) {
    return left.priority < right.priority;
  });
  return routes;
}

std::vector<InterfaceAddress> ReadAddresses(nl_sock* socket) {
  nl_cache* cache = nullptr;
  if (rtnl_addr_alloc_cache(socket, &cache) < 0) return {};
  std::vector<InterfaceAddress> addresses;
  ForEach<rtnl_addr>(Cache(cache), [&](rtnl_addr* address) {
    addresses.push_back({rtnl_addr_get_ifindex(address), rtnl_addr_get_family(address),
                         AddressText(rtnl_addr_get_local(address)),
                         rtnl_addr_get_prefixlen(address), rtnl_addr_get_flags(address),
                         rtnl_addr_get_scope(address)});
  });
  return addresses;
}

Tables ReadTables() {
  const Socket socket(nl_socket_alloc());
  if (socket == nullptr || nl_connect(socket.get(), NETLINK_ROUTE) < 0) return {};
  nl_cache* links = nullptr;
  rtnl_link_alloc_cache(socket.get(), AF_UNSPEC, &links);
  return {Cache(links), ReadAddresses(socket.get()), ReadRoutes(socket.get())};
}

const DefaultRoute* FindRoute(const Tables& tables, int family, int interfaceIndex) {
  for (const DefaultRoute& route : tables.routes) {
    if (route.family == family && route.interfaceIndex == interfaceIndex) return &route;
  }
  return nullptr;
}

std::string NetmaskText(int prefix) {
  const in_addr mask{htonl(prefix == 0 ? 0 : ~uint32_t{0} << (32 - prefix))};
  char text[INET_ADDRSTRLEN] = "";
  inet_ntop(AF_INET, &mask, text, sizeof text);
  return text;
}

// The first address of the interface that reaches beyond its link, else the first at all.
const InterfaceAddress* FindIpv4(const Tables& tables, int interfaceIndex) {
  const InterfaceAddress* found = nullptr;
  for (const InterfaceAddress& address : tables.addresses) {
    if (address.interfaceIndex != interfaceIndex || address.family != AF_INET) continue;
    if (address.scope == RT_SCOPE_UNIVERSE) return &address;
    if (found == nullptr) found = &address;
  }
  return found;
}

Ipv4 DescribeIpv4(const Tables& tables, int interfaceIndex) {
  const InterfaceAddress* found = FindIpv4(tables, interfaceIndex);
  if (found == nullptr) return {};
  const DefaultRoute* route = FindRoute(tables, AF_INET, interfaceIndex);
  return {found->address, NetmaskText(found->prefix),
          OriginOfIpv4(found->flags, route != nullptr && route->byDhcp)};
}

std::vector<Ipv6> DescribeIpv6(const Tables& tables, int interfaceIndex) {
  std::vector<Ipv6> described;
  for (const InterfaceAddress& address : tables.addresses) {
    if (address.interfaceIndex != interfaceIndex || address.family != AF_INET6) continue;
    const bool linkLocal = address.scope == RT_SCOPE_LINK;
    described.push_back({address.address, address.prefix, linkLocal,
                         OriginOfIpv6(address.flags, address.prefix, linkLocal)});
  }
  return described;
}

ManagementInterface Describe(const Tables& tables, rtnl_link* link) {
  const int index = rtnl_link_get_ifindex(link);
  ManagementInterface described;
  described.name = rtnl_link_get_name(link);
  char mac[32] = "";
  if (nl_addr* address = rtnl_link_get_addr(link)) nl_addr2str(address, mac, sizeof mac);
  described.mac = mac;
  described.ipv4 = DescribeIpv4(tables, index);
  described.ipv6 = DescribeIpv6(tables, index);
  const DefaultRoute* route4 = FindRoute(tables, AF_INET, index);
  const DefaultRoute* route6 = FindRoute(tables, AF_INET6, index);
  if (route4 != nullptr) described.gateway4 = route4->gateway;
  if (route6 != nullptr) described.gateway6 = route6->gateway;
  return described;
}

Link FindDefaultLink(const Tables& tables) {
  for (const int family : {AF_INET, AF_INET6}) {
    for (const DefaultRoute& route : tables.routes) {
      if (route.family != family) continue;
      Link link(rtnl_link_get(tables.links.get(), route.interfaceIndex));
      if (link != nullptr) return link;
    }
  }
  return nullptr;
}

bool HasAddress(const ManagementInterface& candidate) {
  return !candidate.ipv4.address.empty() ||
         std::any_of(candidate.ipv6.begin(), candidate.ipv6.end(),
                     [](const Ipv6& address) { return !address.linkLocal; });
}

}  // namespace

ManagementInterface ReadManagementInterface(const std::vector<Adapter>& adapters) {
  const Tables tables = ReadTables();
  if (tables.links == nullptr) return {};
  if (const Link link = FindDefaultLink(tables)) return Describe(tables, link.get());
  for (const Adapter& adapter : adapters) {
    const Link link(rtnl_link_get_by_name(tables.links.get(), adapter.name.c_str()));
    if (link == nullptr) continue;
    ManagementInterface candidate = Describe(tables, link.get());
    if (HasAddress(candidate)) return candidate;
  }
  return {};
}

}  // namespace Machine
