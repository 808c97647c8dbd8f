#include "console/network/dns_dialogs.h"

#include "tests/network/form_player.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

using Nodeplane::Network::IpAddress;
using Nodeplane::Network::Ipv4Address;
using Nodeplane::Network::Ipv6Address;

std::unique_ptr<IpAddress> Server(const std::string& text) {
  if (text.empty()) return nullptr;
  if (Ipv6Address::IsValidAddress(text)) return std::make_unique<Ipv6Address>(text);
  return std::make_unique<Ipv4Address>(text);
}

std::string Words(const IpAddress* server) {
  return server == nullptr ? "none" : server->GetStringAddress();
}

struct DnsCase {
  bool dhcpDns;
  bool usingDhcp;
  const char* primary;
  const char* alternate;
  std::string keys;
  const char* shown;
  const char* after;  // empty: not accepted
};

class DnsForm : public FormPlayer {
 protected:
  std::string PlayForm(const DnsCase& tried) {
    const auto primary = Server(tried.primary);
    const auto alternate = Server(tried.alternate);
    std::string words;
    Play(tried.keys, [&](Frame* parent) {
      DNSConfigurationDialog form(parent, tried.dhcpDns, tried.usingDhcp, primary.get(),
                                  alternate.get(), "rack7");
      const int answer = form.Exec();
      if (answer == 1) {
        words = form.IsDhcpDns() ? "dhcp " : "";
        words +=
            Words(form.PrimaryDns()) + " " + Words(form.AlternateDns()) + " " + form.Hostname();
      }
      return answer;
    });
    return words;
  }
};

TEST_F(DnsForm, ChecksWhatIsManual) {
  const std::string down = DOWN;
  const char* const four = "192.0.2.1";
  const char* const six = "2001:db8::53";
  const char* const refusal = "Please reenter a valid DNS server address (IP or IPv6).";
  const DnsCase cases[] = {
      {false, false, four, "192.0.2.2", "\r", "Alternate DNS Server   [ 192.0.2.2 ",
       "192.0.2.1 192.0.2.2 rack7"},
      {false, false, "", "", "\r", "( ) Obtain DNS", "none none rack7"},
      // On a host without DHCP the first field has the focus; the buttons cannot be reached.
      {false, false, four, six, std::string(UP) + "9.9.9.9\r",
       "IPv6 DNS Server        [ 2001:db8::53 ", "9.9.9.9 2001:db8::53 rack7"},
      {false, false, six, four, "\r", "Alternate DNS Server   [ 192.0.2.1 ",
       "2001:db8::53 192.0.2.1 rack7"},
      {false, false, four, six, "9xyz\r\r::g1\r", refusal, "::1 2001:db8::53 rack7"},
      {false, false, four, six, down + "1.2\r\r1.2.3.4\r", refusal, "192.0.2.1 1.2.3.4 rack7"},
      {false, false, four, six, "9" + down + "9\r\r9.9.9.9\r\r\x1b", refusal, ""},
      // Two columns are no IPv6 address any more.
      {false, false, four, six, down + END + BACKSPACE + "\x1b",
       "IPv6 DNS Server        [ 2001:db8::5 ", ""},
      {false, false, four, six, down + "1" + down + "\r\r\x1b", "Alternate DNS Server   [ 1 ", ""},
      {false, false, four, "", down + down + "a_b c:-1.x\r", "[ abc-1.x ",
       "192.0.2.1 none abc-1.x"},
      {false, false, four, "", down + down + BACKSPACE + "\r", "Hostname", "192.0.2.1 none "},
      // With DHCP's servers nothing else is looked at or taken.
      {false, true, four, six, down + down + "9" + UP + UP + " \r", "(o) Obtain DNS",
       "dhcp 192.0.2.1 2001:db8::53 rack7"},
      {true, true, four, six, down + " " + down + "1.1.1.1\r", "(o) Use the following",
       "1.1.1.1 2001:db8::53 rack7"},
      // Every row is disabled: only Enter and Esc act.
      {true, false, four, six, " 1" + down + UP + "\r", "(o) Obtain DNS",
       "dhcp 192.0.2.1 2001:db8::53 rack7"},
  };
  for (const DnsCase& tried : cases) {
    SCOPED_TRACE(tried.keys);
    EXPECT_EQ(PlayForm(tried), tried.after);
    EXPECT_TRUE(HasShown(tried.shown)) << _seen;
  }
}

TEST_F(DnsForm, ShowsTheCursorInFields) {
  const std::string down = DOWN;
  const std::pair<DnsCase, const char*> cases[] = {
      {{false, false, "", "", down + UP + UP + "\r", "", ""}, "||||"},
      {{false, true, "", "", down + down + UP + "\r", "", ""}, "..|."},
      {{true, false, "", "", down + UP + "\r", "", ""}, "..."},
  };
  for (const auto& [tried, cursors] : cases) {
    PlayForm(tried);
    EXPECT_EQ(_cursors, cursors);
  }
}

class SuffixesForm : public FormPlayer {};

TEST_F(SuffixesForm, TakesAnyListOfNames) {
  struct Case {
    const char* keys;
    const char* after;
    int result;
  };
  const Case cases[] = {
      {"\r", "lab.example", 1},
      {"\x1b", "lab.example", 0},
      {"A-1.b, c_/:;d\r", "A-1.b, cd", 1},
      {"\x7f\r", "", 1},
  };
  for (const auto& [keys, after, result] : cases) {
    SCOPED_TRACE(keys);
    std::string suffixes;
    EXPECT_EQ(Play(keys,
                   [&](Frame* parent) {
                     SuffixesDialog form(parent, "lab.example");
                     const int answer = form.Exec();
                     suffixes = form.Suffixes();
                     return answer;
                   }),
              result);
    EXPECT_EQ(suffixes, after);
    EXPECT_TRUE(HasShown("Suffixes:          [ lab.example "));
    EXPECT_EQ(_cursors.front(), '|');
  }
}

}  // namespace

}  // namespace Tarnel::Testing
