#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "hosts/machine/readers.h"
#include "tests/hosts/machine/made_up_tree.h"

namespace Machine {
namespace {

using Texts = std::vector<std::string>;

TEST(Resolver, ReadsWhatTheCLibraryWouldUse) {
  struct Row {
    const char* name;
    std::string file;
    Texts nameServers;
    Texts searchDomains;
  };
  const std::vector<Row> rows = {
      {"both families in order",
       "nameserver 192.0.2.53\nnameserver 2001:db8::53\n",
       {"192.0.2.53", "2001:db8::53"},
       {}},
      {"scope, tabs, no final newline",
       "nameserver\t fe80::1%eth0\t# gateway",
       {"fe80::1%eth0"},
       {}},
      {"at most three",
       "nameserver 1.1.1.1\nnameserver 2.2.2.2\nnameserver 3.3.3.3\n"
       "nameserver 4.4.4.4\n",
       {"1.1.1.1", "2.2.2.2", "3.3.3.3"},
       {}},
      {"no addresses",
       "nameserver\nnameserver  \nnameserver dns.example.com\nnameserver 1.2.3\n"
       "nameservers 1.1.1.1\n",
       {},
       {}},
      {"comments and indented lines",
       "# nameserver 1.1.1.1\n;nameserver 1.1.1.1\n nameserver 1.1.1.1\n",
       {},
       {}},
      {"several search domains",
       "search a.example b.example.\tc.example\noptions ndots:1\n",
       {},
       {"a.example", "b.example", "c.example"}},
      {"the last of search and domain holds",
       "search a.example\ndomain b.example c.example\n",
       {},
       {"b.example"}},
      {"the root domain is none", "search .\n", {}, {}},
      {"a search without a domain changes nothing",
       "search a.example\nsearch\n",
       {},
       {"a.example"}},
      {"line ends of another system",
       "nameserver 1.1.1.1\r\nsearch a.example\r\n",
       {"1.1.1.1"},
       {"a.example"}},
      {"noise", std::string("\0\xff\n\n   \nsearch", 14), {}, {}},
      {"empty", "", {}, {}},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    MadeUpTree tree;
    tree.Write("/etc/resolv.conf", row.file);
    const Resolver resolver = ReadResolver(tree.AsSources());
    EXPECT_EQ(resolver.nameServers, row.nameServers);
    EXPECT_EQ(resolver.searchDomains, row.searchDomains);
  }
}

TEST(Resolver, LooksBehindALocalStub) {
  MadeUpTree tree;
  tree.Write("/etc/resolv.conf", "nameserver 127.0.0.53\nsearch stub.example\n");
  EXPECT_EQ(ReadResolver(tree.AsSources()).nameServers, Texts{"127.0.0.53"});
  tree.Write("/run/systemd/resolve/resolv.conf", "nameserver 192.0.2.53\nsearch real.example\n");
  EXPECT_EQ(ReadResolver(tree.AsSources()).nameServers, Texts{"192.0.2.53"});
  EXPECT_EQ(ReadResolver(tree.AsSources()).searchDomains, Texts{"real.example"});
}

TEST(HostName, NameAndDomain) {
  struct Row {
    const char* name;
    std::string kernel;
    std::string hosts;
    std::string resolver;
    std::string host;
    std::string domain;
  };
  const std::vector<Row> rows = {
      {"full name in the kernel", "box.a.example\n", "1.2.3.4 box.b.example\n",
       "search c.example\n", "box", "a.example"},
      {"full name in /etc/hosts", "box\n",
       "127.0.0.1 localhost\n127.0.1.1\tother.x.example box.b.example box # box.y.example\n",
       "search c.example\n", "box", "b.example"},
      {"only a longer name in /etc/hosts", "box\n", "1.2.3.4 boxes.b.example\n",
       "domain c.example\n", "box", "c.example"},
      {"first search domain", "box\n", "", "search c.example d.example\n", "box", "c.example"},
      {"no domain anywhere", "box\n", "1.2.3.4 box box.\n#1.2.3.4 box.b.example\n", "", "box", ""},
      {"a dot at the end", "box.\n", "", "search c.example\n", "box", ""},
      {"a dot at the start", ".example\n", "", "", "localhost", "example"},
      {"unset in the kernel", "(none)\n", "", "", "localhost", ""},
      {"empty", "\n", "", "", "localhost", ""},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    MadeUpTree tree;
    tree.Write("/proc/sys/kernel/hostname", row.kernel);
    tree.Write("/etc/hosts", row.hosts);
    tree.Write("/etc/resolv.conf", row.resolver);
    const HostName hostName = ReadHostName(tree.AsSources());
    EXPECT_EQ(hostName.name, row.host);
    EXPECT_EQ(hostName.domain, row.domain);
  }
}

TEST(Ipv6Enabled, ByTheKernelSwitch) {
  MadeUpTree tree;
  EXPECT_FALSE(ReadIpv6Enabled(tree.AsSources()));
  tree.Write("/proc/sys/net/ipv6/conf/all/disable_ipv6", "1\n");
  EXPECT_FALSE(ReadIpv6Enabled(tree.AsSources()));
  tree.Write("/proc/sys/net/ipv6/conf/all/disable_ipv6", "0\n");
  EXPECT_TRUE(ReadIpv6Enabled(tree.AsSources()));
}

}  // namespace
}  // namespace Machine
