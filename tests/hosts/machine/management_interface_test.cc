#include <gtest/gtest.h>
#include <linux/capability.h>
#include <linux/if_addr.h>
#include <linux/rtnetlink.h>
#include <sched.h>
#include <sys/prctl.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cstdlib>
#include <string>
#include <vector>

#include "hosts/machine/address_origin.h"
#include "hosts/machine/readers.h"

namespace Machine {
namespace {

TEST(AddressOrigin, FollowsFromFlagsAndPrefix) {
  EXPECT_EQ(OriginOfIpv4(IFA_F_PERMANENT, false), Origin::STATIC);
  EXPECT_EQ(OriginOfIpv4(0, false), Origin::DHCP);
  EXPECT_EQ(OriginOfIpv4(IFA_F_PERMANENT, true), Origin::DHCP);
  EXPECT_EQ(OriginOfIpv6(IFA_F_PERMANENT, 128, false), Origin::STATIC);
  EXPECT_EQ(OriginOfIpv6(IFA_F_NOPREFIXROUTE, 128, false), Origin::DHCP);
  EXPECT_EQ(OriginOfIpv6(IFA_F_PERMANENT, 64, true), Origin::AUTOCONF);
  // Advertised: for ever, with privacy, without it.
  for (const uint32_t flags :
       {IFA_F_MANAGETEMPADDR | IFA_F_PERMANENT, IFA_F_TEMPORARY, IFA_F_NOPREFIXROUTE}) {
    EXPECT_EQ(OriginOfIpv6(flags, 64, false), Origin::AUTOCONF) << flags;
  }
}

// In a new user namespace this process may do all, but what it starts nothing: it is not its root.
void KeepNetworkPowers() {
  __user_cap_header_struct header{_LINUX_CAPABILITY_VERSION_3, 0};
  __user_cap_data_struct powers[_LINUX_CAPABILITY_U32S_3] = {};
  syscall(SYS_capget, &header, powers);
  powers[0].inheritable |= 1U << CAP_NET_ADMIN;
  syscall(SYS_capset, &header, powers);
  prctl(PR_CAP_AMBIENT, PR_CAP_AMBIENT_RAISE, CAP_NET_ADMIN, 0, 0);
}

void Ip(const std::string& words) { EXPECT_EQ(system(("ip " + words).c_str()), 0) << words; }

// A network of its own with the two ends of a cable, "near" and "veth0", both up.
class ManagementInterfaceTest : public testing::Test {
 protected:
  void SetUp() override {
    if (unshare(CLONE_NEWNET) != 0 && unshare(CLONE_NEWUSER | CLONE_NEWNET) != 0) {
      GTEST_SKIP() << "no network of its own here";
    }
    KeepNetworkPowers();
    if (system("ip link add near type veth") != 0) GTEST_SKIP() << "no virtual cables here";
    Ip("link set near up");
    Ip("link set veth0 up");
  }
};

const char* NameOf(Origin origin) {
  return origin == Origin::STATIC ? "static" : origin == Origin::DHCP ? "DHCP" : "automatic";
}

// Without the address that the kernel gives each interface itself.
std::string Describe(const ManagementInterface& found) {
  const auto& [address, netmask, origin] = found.ipv4;
  std::string text =
      found.name + ": " + address + "/" + netmask + " " + NameOf(origin) + " by " + found.gateway4;
  for (const Ipv6& ipv6 : found.ipv6) {
    if (ipv6.linkLocal) continue;
    text += ", " + ipv6.address + "/" + std::to_string(ipv6.prefix) + " " + NameOf(ipv6.origin);
  }
  return text + " by " + found.gateway6;
}

TEST_F(ManagementInterfaceTest, StandsAtTheDefaultRoute) {
  Ip("address add 169.254.7.7/16 scope link dev near");
  Ip("address add 10.1.0.2/20 dev near valid_lft 3600 preferred_lft 3600");
  Ip("address add 2001:db8::2/64 dev near");
  Ip("route add default via 10.1.0.1 metric 200 dev near");
  Ip("route add default via 10.1.0.3 metric 100 dev near");
  Ip("-6 route add default via fe80::1 dev near");
  const ManagementInterface found = ReadManagementInterface({});
  EXPECT_EQ(found.mac.size(), 17U);
  EXPECT_EQ(Describe(found),
            "near: 10.1.0.2/255.255.240.0 DHCP by 10.1.0.3, 2001:db8::2/64 static by fe80::1");
}

TEST_F(ManagementInterfaceTest, EndlessLeaseShowsInTheRoute) {
  Ip("address add 10.1.0.2/32 dev near");
  Ip("address add 10.1.0.9/24 dev near");
  Ip("route add default via 10.1.0.1 dev near proto " + std::to_string(RTPROT_DHCP));
  EXPECT_EQ(Describe(ReadManagementInterface({})),
            "near: 10.1.0.2/255.255.255.255 DHCP by 10.1.0.1 by ");
}

TEST_F(ManagementInterfaceTest, WithoutARouteTheFirstAdapterWithAnAddress) {
  const std::vector<Adapter> adapters = {
      {"gone", "", true, ""}, {"veth0", "", true, ""}, {"near", "", true, ""}};
  // Addresses that reach no further than the cable do not count.
  EXPECT_EQ(ReadManagementInterface(adapters).name, "");
  Ip("address add 10.1.0.2/24 dev near");
  EXPECT_EQ(Describe(ReadManagementInterface(adapters)),
            "near: 10.1.0.2/255.255.255.0 static by  by ");
}

}  // namespace
}  // namespace Machine
