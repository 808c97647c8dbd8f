#include <gtest/gtest.h>
#include <linux/if_addr.h>
#include <linux/rtnetlink.h>
#include <net/if.h>
#include <netlink/netlink.h>
#include <netlink/route/addr.h>
#include <netlink/route/link.h>
#include <netlink/route/link/veth.h>
#include <netlink/route/nexthop.h>
#include <netlink/route/route.h>
#include <sched.h>

#include <memory>
#include <string>
#include <vector>

#include "hosts/machine/address_origin.h"
#include "hosts/machine/readers.h"

namespace Machine {
namespace {

TEST(AddressOrigin, Ipv4) {
  EXPECT_EQ(OriginOfIpv4(IFA_F_PERMANENT, false), Origin::STATIC);
  EXPECT_EQ(OriginOfIpv4(0, false), Origin::DHCP);
  EXPECT_EQ(OriginOfIpv4(IFA_F_PERMANENT, true), Origin::DHCP);
}

TEST(AddressOrigin, Ipv6) {
  struct Row {
    const char* name;
    uint32_t flags;
    int prefix;
    bool linkLocal;
    Origin origin;
  };
  const std::vector<Row> rows = {
      {"typed in", IFA_F_PERMANENT | IFA_F_NODAD, 64, false, Origin::STATIC},
      {"typed in, a single address", IFA_F_PERMANENT, 128, false, Origin::STATIC},
      {"the kernel's own", IFA_F_PERMANENT, 64, true, Origin::AUTOCONF},
      {"advertised", IFA_F_MANAGETEMPADDR, 64, false, Origin::AUTOCONF},
      {"advertised for ever", IFA_F_MANAGETEMPADDR | IFA_F_PERMANENT, 64, false, Origin::AUTOCONF},
      {"privacy", IFA_F_TEMPORARY, 64, false, Origin::AUTOCONF},
      {"advertised, without privacy", IFA_F_NOPREFIXROUTE, 64, false, Origin::AUTOCONF},
      {"leased", IFA_F_NOPREFIXROUTE, 128, false, Origin::DHCP},
  };
  for (const Row& row : rows) {
    EXPECT_EQ(OriginOfIpv6(row.flags, row.prefix, row.linkLocal), row.origin) << row.name;
  }
}

struct Release {
  void operator()(nl_sock* socket) const { nl_socket_free(socket); }
  void operator()(nl_addr* address) const { nl_addr_put(address); }
  void operator()(rtnl_addr* address) const { rtnl_addr_put(address); }
  void operator()(rtnl_link* link) const { rtnl_link_put(link); }
  void operator()(rtnl_route* route) const { rtnl_route_put(route); }
};
template <typename T>
using Owned = std::unique_ptr<T, Release>;

Owned<nl_addr> ParseAddress(const std::string& text) {
  nl_addr* address = nullptr;
  nl_addr_parse(text.c_str(), AF_UNSPEC, &address);
  return Owned<nl_addr>(address);
}

// A network of its own with the two ends of a cable, "near" and "far", both up.
class ManagementInterfaceTest : public testing::Test {
 protected:
  void SetUp() override {
    if (unshare(CLONE_NEWNET) != 0 && unshare(CLONE_NEWUSER | CLONE_NEWNET) != 0) {
      GTEST_SKIP() << "no network of its own here";
    }
    _socket.reset(nl_socket_alloc());
    ASSERT_EQ(nl_connect(_socket.get(), NETLINK_ROUTE), 0);
    if (rtnl_link_veth_add(_socket.get(), "near", "far", getpid()) < 0) {
      GTEST_SKIP() << "no virtual cables here";
    }
    _near = BringUp("near");
    BringUp("far");
  }

  int BringUp(const char* name) {
    rtnl_link* found = nullptr;
    EXPECT_EQ(rtnl_link_get_kernel(_socket.get(), 0, name, &found), 0);
    const Owned<rtnl_link> link(found);
    const Owned<rtnl_link> change(rtnl_link_alloc());
    rtnl_link_set_flags(change.get(), IFF_UP);
    EXPECT_EQ(rtnl_link_change(_socket.get(), found, change.get(), 0), 0);
    return rtnl_link_get_ifindex(found);
  }

  // A lifetime of 0 seconds is none: the address is permanent.
  void AddAddress(const std::string& text, uint32_t lifetime = 0, int scope = RT_SCOPE_UNIVERSE) {
    const Owned<nl_addr> local = ParseAddress(text);
    const Owned<rtnl_addr> address(rtnl_addr_alloc());
    rtnl_addr_set_ifindex(address.get(), _near);
    rtnl_addr_set_local(address.get(), local.get());
    rtnl_addr_set_scope(address.get(), scope);
    rtnl_addr_set_flags(address.get(), IFA_F_NODAD);
    if (lifetime != 0) {
      rtnl_addr_set_valid_lifetime(address.get(), lifetime);
      rtnl_addr_set_preferred_lifetime(address.get(), lifetime);
    }
    EXPECT_EQ(rtnl_addr_add(_socket.get(), address.get(), 0), 0) << text;
  }

  void AddDefaultRoute(const std::string& gateway, uint32_t priority, int protocol) {
    const Owned<nl_addr> via = ParseAddress(gateway);
    const bool v6 = nl_addr_get_family(via.get()) == AF_INET6;
    const Owned<nl_addr> everything = ParseAddress(v6 ? "::/0" : "0.0.0.0/0");
    const Owned<rtnl_route> route(rtnl_route_alloc());
    rtnl_route_set_dst(route.get(), everything.get());
    rtnl_route_set_priority(route.get(), priority);
    rtnl_route_set_protocol(route.get(), static_cast<uint8_t>(protocol));
    rtnl_nexthop* hop = rtnl_route_nh_alloc();
    rtnl_route_nh_set_ifindex(hop, _near);
    rtnl_route_nh_set_gateway(hop, via.get());
    rtnl_route_add_nexthop(route.get(), hop);
    EXPECT_EQ(rtnl_route_add(_socket.get(), route.get(), 0), 0) << gateway;
  }

 private:
  Owned<nl_sock> _socket;
  int _near = 0;
};

TEST_F(ManagementInterfaceTest, StandsAtTheDefaultRoute) {
  AddAddress("169.254.7.7/16", 0, RT_SCOPE_LINK);
  AddAddress("10.1.0.2/20", 3600);
  AddAddress("2001:db8::2/64");
  AddDefaultRoute("10.1.0.1", 200, RTPROT_STATIC);
  AddDefaultRoute("10.1.0.3", 100, RTPROT_STATIC);
  AddDefaultRoute("fe80::1", 1024, RTPROT_STATIC);
  const ManagementInterface found = ReadManagementInterface({});
  EXPECT_EQ(found.name, "near");
  EXPECT_EQ(found.mac.size(), 17U);
  EXPECT_EQ(found.ipv4.address, "10.1.0.2");
  EXPECT_EQ(found.ipv4.netmask, "255.255.240.0");
  EXPECT_EQ(found.ipv4.origin, Origin::DHCP);
  EXPECT_EQ(found.gateway4, "10.1.0.3");
  EXPECT_EQ(found.gateway6, "fe80::1");
  ASSERT_FALSE(found.ipv6.empty());
  EXPECT_EQ(found.ipv6[0].address, "2001:db8::2");
  EXPECT_EQ(found.ipv6[0].prefix, 64);
  EXPECT_EQ(found.ipv6[0].origin, Origin::STATIC);
  EXPECT_FALSE(found.ipv6[0].linkLocal);
}

TEST_F(ManagementInterfaceTest, EndlessLeaseShowsInTheRoute) {
  AddAddress("10.1.0.2/32");
  AddAddress("10.1.0.9/24");
  AddDefaultRoute("10.1.0.1", 0, RTPROT_DHCP);
  const ManagementInterface found = ReadManagementInterface({});
  EXPECT_EQ(found.ipv4.address, "10.1.0.2");
  EXPECT_EQ(found.ipv4.netmask, "255.255.255.255");
  EXPECT_EQ(found.ipv4.origin, Origin::DHCP);
}

TEST_F(ManagementInterfaceTest, WithoutARouteTheFirstAdapterWithAnAddress) {
  const std::vector<Adapter> adapters = {
      {"gone", "", true, ""}, {"far", "", true, ""}, {"near", "", true, ""}};
  // Addresses that reach no further than the cable do not count.
  EXPECT_EQ(ReadManagementInterface(adapters).name, "");
  AddAddress("10.1.0.2/24");
  EXPECT_EQ(ReadManagementInterface(adapters).name, "near");
  EXPECT_EQ(ReadManagementInterface(adapters).gateway4, "");
  EXPECT_EQ(ReadManagementInterface({}).name, "");
}

}  // namespace
}  // namespace Machine
