#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "hosts/machine/readers.h"
#include "tests/hosts/machine/made_up_tree.h"

namespace Machine {
namespace {

// The name servers, a bar and the search domains.
std::string ResolverOf(const MadeUpTree& tree) {
  const Resolver resolver = ReadResolver(tree.AsSources());
  std::string text;
  for (const std::string& server : resolver.nameServers) text += server + " ";
  text += "|";
  for (const std::string& domain : resolver.searchDomains) text += " " + domain;
  return text;
}

TEST(Resolver, ReadsWhatTheCLibraryWouldUse) {
  struct Row {
    std::string file;
    std::string resolver;
  };
  const std::vector<Row> rows = {
      {"nameserver 2001:db8::53\nnameserver 192.0.2.53\n", "2001:db8::53 192.0.2.53 |"},
      {"nameserver\t fe80::1%eth0\t# gateway", "fe80::1%eth0 |"},
      {"nameserver 1.1.1.1\nnameserver 2.2.2.2\nnameserver 3.3.3.3\nnameserver 4.4.4.4\n",
       "1.1.1.1 2.2.2.2 3.3.3.3 |"},
      {"nameserver\nnameserver dns.example\nnameserver 1.2.3\nnameservers 1.1.1.1\n", "|"},
      {"# nameserver 1.1.1.1\n;nameserver 1.1.1.1\n nameserver 1.1.1.1\n", "|"},
      {"search a.example b.example.\tc.example\noptions x\n", "| a.example b.example c.example"},
      {"search a.example\ndomain b.example c.example\n", "| b.example"},
      {"search a.example\nsearch\n", "| a.example"},
      {"nameserver 1.1.1.1\r\nsearch a.example\r\n", "1.1.1.1 | a.example"},
      {std::string("\0\xff\n\n   \nsearch", 14), "|"},
  };
  for (const Row& row : rows) {
    EXPECT_EQ(ResolverOf(MadeUpTree{{"/etc/resolv.conf", row.file}}), row.resolver) << row.file;
  }
}

TEST(Resolver, LooksBehindALocalStub) {
  MadeUpTree tree{{"/etc/resolv.conf", "nameserver 127.0.0.53\nsearch stub.example\n"}};
  EXPECT_EQ(ResolverOf(tree), "127.0.0.53 | stub.example");
  tree.Write("/run/systemd/resolve/resolv.conf", "nameserver 192.0.2.53\nsearch real.example\n");
  EXPECT_EQ(ResolverOf(tree), "192.0.2.53 | real.example");
}

TEST(HostName, NameAndDomain) {
  struct Row {
    std::string kernel;
    std::string hosts;
    std::string resolver;
    std::string name;
    std::string domain;
  };
  const std::vector<Row> rows = {
      {"box.a.example", "1.2.3.4 box.b.example", "search c.example", "box", "a.example"},
      {"box", "127.0.0.1 localhost\n127.0.1.1\tother.x.example box.b.example # box.y.example",
       "search c.example", "box", "b.example"},
      {"box", "1.2.3.4 boxes.b.example", "search c.example d.example", "box", "c.example"},
      {"box", "1.2.3.4 box box.\n#1.2.3.4 box.b.example", "", "box", ""},
      {"box.", "", "search c.example", "box", ""},
      {".example", "", "", "localhost", "example"},
      {"(none)", "", "", "localhost", ""},
      {"", "", "", "localhost", ""},
  };
  for (const Row& row : rows) {
    const MadeUpTree tree{{"/proc/sys/kernel/hostname", row.kernel + "\n"},
                          {"/etc/hosts", row.hosts + "\n"},
                          {"/etc/resolv.conf", row.resolver + "\n"}};
    const HostName hostName = ReadHostName(tree.AsSources());
    EXPECT_EQ(hostName.name, row.name) << row.kernel;
    EXPECT_EQ(hostName.domain, row.domain) << row.hosts;
  }
}

}  // namespace
}  // namespace Machine
