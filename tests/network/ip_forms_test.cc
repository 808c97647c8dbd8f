// The forms for the VLAN and for the addresses of both families.

#include <algorithm>

#include "console/network/ip_configuration_dialog.h"
#include "console/network/ipv6_configuration_dialog.h"
#include "console/network/vlan_dialog.h"
#include "tests/network/form_player.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

using Nodeplane::Network::IpConfig;
using Nodeplane::Network::Ipv4Address;
using Nodeplane::Network::Ipv6Address;
using Nodeplane::Network::Ipv6Network;

std::string Times(int count, const std::string& keys) {
  std::string repeated;
  while (count-- > 0) repeated += keys;
  return repeated;
}

class Vlan : public FormPlayer {};

TEST_F(Vlan, TakesNothingOrANumberInRange) {
  struct Case {
    uint16_t before;
    std::string keys;
    const char* shown;
    int after;  // -1: not accepted
  };
  const Case cases[] = {
      {0, "\r", "4095 to access all VLANs):        [       ]", 0},
      {7, "\r", "[ 7     ]", 7},
      {0, "1\r", "Cancel", 1},
      {0, "4094\r", "[ 4094  ]", 4094},
      {0, "4095\r\r", "You entered a VLAN ID of 4095.", 4095},
      // What was refused is replaced by the next character.
      {0, "4096\r\r5\r", "Please reenter a valid VLAN ID (1-4095).", 5},
      {0, std::string("0\r\r") + ESC, "Invalid VLAN ID", -1},
      {0, std::string("99999999999999999999\r\r") + ESC, "Invalid VLAN ID", -1},
      {12, std::string("a-. ") + END + "3\r", "[ 123   ]", 123},
      {12, std::string(BACKSPACE) + "\r", "[       ]", 0},
  };
  for (const auto& [before, keys, shown, after] : cases) {
    SCOPED_TRACE(keys);
    int accepted = -1;
    const int result = Play(keys, [&accepted, before = before](Frame* parent) {
      VlanDialog form(parent, before);
      const int answer = form.Exec();
      accepted = answer == 1 ? form.GetVlanId() : -1;
      return answer;
    });
    EXPECT_EQ(result, after == -1 ? 0 : 1);
    EXPECT_EQ(accepted, after);
    EXPECT_TRUE(HasShown(shown)) << _seen;
    EXPECT_EQ(_cursors.front(), '|');
    EXPECT_FALSE(CursesScreen::CursorVisible());
  }
}

class Ipv4Form : public FormPlayer {
 protected:
  // The accepted configuration in words, empty when none was.
  std::string PlayForm(const std::string& mode, const std::string& keys) {
    IpConfig config;
    config.SetIpv4Address(Ipv4Address("10.0.0.5"));
    config.SetIpv4Netmask(Ipv4Address("255.255.255.0"));
    config.SetIpv4Gateway(Ipv4Address("10.0.0.1"));
    if (mode == "none") config.SetIpv4UseNone();
    std::string words;
    Play(keys, [&](Frame* parent) {
      IPConfigurationDialog form(parent, mode == "none", mode == "dhcp", config);
      const int answer = form.Exec();
      words = answer == 1 ? Words(form.Config()) : "";
      return answer;
    });
    return words;
  }

 private:
  static std::string Words(const IpConfig& config) {
    const std::string mode = config.GetUseDhcp() ? "dhcp " : "";
    return mode + (config.GetIpv4UseNone() ? "none " : "") +
           config.GetIpv4Address().GetStringAddress() + " " +
           config.GetIpv4Netmask().GetStringAddress() + " " +
           config.GetIpv4Gateway().GetStringAddress();
  }
};

TEST_F(Ipv4Form, ChecksWhatIsStatic) {
  struct Case {
    const char* mode;
    std::string keys;
    const char* shown;
    const char* after;
  };
  const std::string toAddress = Times(3, DOWN);
  const std::string toNetmask = Times(4, DOWN);
  const std::string toGateway = Times(5, DOWN);
  const char* const before = "10.0.0.5 255.255.255.0 10.0.0.1";
  const char* const badAddress = "Please reenter a valid IPv4 address (x.x.x.x).";
  const char* const badNetmask = "Please reenter a valid subnet (x.x.x.x).";
  const char* const badGateway = "Please reenter a valid gateway address (x.x.x.x).";
  const Case cases[] = {
      {"static", "\r", "(o) Set static IPv4 address and network configuration:", before},
      {"static", ESC, "[ 10.0.0.5         ]", ""},
      {"static", toAddress + "12x :.0.0.9\r", "[ 12.0.0.9 ", "12.0.0.9 255.255.255.0 10.0.0.1"},
      {"static", toAddress + "10.0.0.256\r\r10.0.0.255\r", badAddress,
       "10.0.0.255 255.255.255.0 10.0.0.1"},
      {"static", toNetmask + "255.0.255.0\r\r" + ESC, badNetmask, ""},
      {"static", toNetmask + "0.0.0.0\r\r" + ESC, badNetmask, ""},
      {"static", toNetmask + "1\r\r255.255.255.255\r", badNetmask,
       "10.0.0.5 255.255.255.255 10.0.0.1"},
      {"static", toGateway + BACKSPACE + "\r\r0.0.0.0\r", badGateway,
       "10.0.0.5 255.255.255.0 0.0.0.0"},
      // The address comes first, whatever else is wrong; the focus goes there.
      {"static", toGateway + "9" + UP + "9" + UP + "9" + UP + "\r\r1.2.3.4\r\r" + ESC, badAddress,
       ""},
      // What is disabled is not looked at; the gateway goes.
      {"static", toAddress + "9" + UP + UP + " \r", "(o) Use dynamic",
       "dhcp 10.0.0.5 255.255.255.0 0.0.0.0"},
      {"static", " \r", "(o) Disable IPv4", "none 10.0.0.5 255.255.255.0 0.0.0.0"},
      {"dhcp", "\r", "(o) Use dynamic", "dhcp 10.0.0.5 255.255.255.0 0.0.0.0"},
      {"none", Times(2, DOWN) + " \r", "(o) Set static", before},
      {"none", DOWN + std::string(" \r"), "(o) Use dynamic", "dhcp 10.0.0.5 255.255.255.0 0.0.0.0"},
      {"dhcp", Times(9, DOWN) + "1 \r", "(o) Set static", before},
  };
  for (const auto& [mode, keys, shown, after] : cases) {
    SCOPED_TRACE(keys);
    EXPECT_EQ(PlayForm(mode, keys), after);
    EXPECT_TRUE(HasShown(shown)) << _seen;
  }
}

TEST_F(Ipv4Form, ShowsTheCursorInFields) {
  PlayForm("static", Times(4, DOWN) + UP + UP + ESC);
  EXPECT_EQ(_cursors, "...|||.");
  // On a field that is refused, too, wherever Enter was pressed.
  PlayForm("static", Times(3, DOWN) + "1" + UP + "\r\r1.2.3.4\r");
  EXPECT_EQ(_cursors.substr(5), "..||||||||");
}

class Ipv6Form : public FormPlayer {
 protected:
  static IpConfig Config(bool dhcp, bool routerAdvertised) {
    IpConfig config;
    config.SetUseIpv6Dhcp(dhcp);
    config.SetUseIpv6RouterAdvertised(routerAdvertised);
    config.SetIpv6Gateway(Ipv6Address("fe80::1%kcore0"));
    for (const char* network : {"fe80::5/64", "2001:db8::1/64"}) {
      config.AddIpv6Network(Ipv6Network(network));
    }
    return config;
  }
  // The accepted configuration in words, empty when none was.
  std::string PlayForm(const std::string& keys, bool enabled, const IpConfig& modes,
                       const IpConfig& working) {
    std::string words;
    Play(keys, [&](Frame* parent) {
      IPv6ConfigurationDialog form(parent, enabled, modes, working);
      const int answer = form.Exec();
      if (answer == 1) {
        words = std::string(form.IsEnabled() ? "on " : "off ") + Words(form.Config()) +
                (form.IsAddressEdited() ? " edited" : "");
      }
      return answer;
    });
    return words;
  }
  std::string PlayForm(const std::string& keys, bool enabled, const IpConfig& config) {
    return PlayForm(keys, enabled, config, config);
  }

 private:
  static std::string Words(const IpConfig& config) {
    std::string words;
    if (config.GetUseIpv6Dhcp()) words += "dhcp ";
    if (config.GetUseIpv6RouterAdvertised()) words += "ra ";
    for (const Ipv6Network& network : config.GetIpv6Network()) {
      words += network.GetStringAddress() + " ";
      if (network.GetIpv6Scope() == Ipv6Network::LINK_LOCAL) words += "link ";
    }
    return words + "gw " + config.GetIpv6Gateway().GetScopedStringAddress();
  }
};

TEST_F(Ipv6Form, ChoosesAModeAndChecksWhatIsStatic) {
  struct Case {
    bool enabled;
    IpConfig config;
    std::string keys;
    const char* shown;
    const char* after;
  };
  const IpConfig fixed = Config(false, false);
  const IpConfig stateless = Config(false, true);
  const IpConfig dhcp = Config(true, false);
  const IpConfig both = Config(true, true);
  // From the first row over the greyed check to the first address.
  const std::string toAddress = Times(3, DOWN);
  const std::string toGateway = Times(6, DOWN);
  const char* const before = "on fe80::5/64 link 2001:db8::1/64 gw fe80::1%kcore0";
  const char* const badAddress = "Please reenter a valid IPv6 network address (x:x:x/x).";
  const Case cases[] = {
      {true, fixed, "\r", "Static address #1        [ 2001:db8::1/64 ", before},
      {true, fixed, "\r", "Default gateway          [ fe80::1%kcore0 ", before},
      {true, stateless, "\r", "    [ ] Use DHCPv6", "on ra fe80::5/64 link gw fe80::1%kcore0"},
      {true, dhcp, DOWN + std::string(DOWN) + " \r", "    [X] Use DHCPv6",
       "on ra fe80::5/64 link gw fe80::1%kcore0"},
      {true, dhcp, " \r", "(o) Disable IPv6", "off dhcp fe80::5/64 link gw fe80::1%kcore0"},
      // On the way over "disabled" the check keeps the mode.
      {true, both, " " + std::string(DOWN) + " \r", "(o) Use dynamic",
       "on dhcp fe80::5/64 link gw fe80::1%kcore0"},
      {true, fixed, DOWN + std::string(" \r"), "[ ] Use DHCPv6",
       "on ra fe80::5/64 link gw fe80::1%kcore0"},
      {false, fixed, Times(2, DOWN) + " \r", "(o) Set static", before},
      {false, dhcp, Times(9, DOWN) + " \r", "(o) Set static", before},
      {true, fixed, toAddress + BACKSPACE + "\r", "#1        [        ",
       "on fe80::5/64 link gw fe80::1%kcore0 edited"},
      {true, fixed, toAddress + END + "8" + BACKSPACE + "\r", "1/648",
       "on fe80::5/64 link 2001:db8::1/64 gw fe80::1%kcore0 edited"},
      {true, fixed, toAddress + "2001:db8::9.-\r\r2001:db8::9/128\r", badAddress,
       "on fe80::5/64 link 2001:db8::9/128 gw fe80::1%kcore0 edited"},
      {true, fixed, toAddress + DOWN + "2001:db8::2/0\r\r" + ESC, badAddress, ""},
      {true, fixed, toAddress + DOWN + DOWN + "febf::1/10\r\rfec0::1/10\r",
       "Cannot add a link-local address as static address.",
       "on fe80::5/64 link 2001:db8::1/64 fec0::1/10 gw fe80::1%kcore0 edited"},
      {true, fixed, toGateway + "1\r\r" + BACKSPACE + "\r",
       "Please reenter a valid IPv6 gateway address (x:x:x).",
       "on fe80::5/64 link 2001:db8::1/64 gw ::"},
      {true, fixed, toGateway + "2001:db8::fe\r", "Cancel",
       "on fe80::5/64 link 2001:db8::1/64 gw 2001:db8::fe"},
  };
  for (const Case& tried : cases) {
    SCOPED_TRACE(tried.keys);
    EXPECT_EQ(PlayForm(tried.keys, tried.enabled, tried.config), tried.after);
    EXPECT_TRUE(HasShown(tried.shown)) << _seen;
  }
}

TEST_F(Ipv6Form, ShowsThreeStaticAddressesAndKeepsTheOthers) {
  IpConfig config;
  for (const char* text :
       {"2001:db8::1/64", "2001:db8::2/64", "2001:db8::3/64", "2001:db8::4/64"}) {
    config.AddIpv6Network(Ipv6Network(text));
  }
  Ipv6Network advertised("2001:db8::a/64");
  advertised.SetIpv6AddressType(Ipv6Network::AUTOCONF);
  config.AddIpv6Network(advertised);
  EXPECT_EQ(PlayForm("\r", true, config),
            "on 2001:db8::4/64 2001:db8::a/64 2001:db8::1/64 2001:db8::2/64 2001:db8::3/64 gw ::");
  EXPECT_TRUE(HasShown("#3        [ 2001:db8::3/64 "));
  EXPECT_FALSE(HasShown("2001:db8::4") || HasShown("2001:db8::a") || HasShown("[ :: "));
}

// The form opens on the stored mode and is checked by the one in effect.
TEST_F(Ipv6Form, ChecksAnUntouchedFormByTheWorkingConfiguration) {
  IpConfig working = Config(false, false);
  working.AddIpv6Network(Ipv6Network("2001:db8::7/64"));
  EXPECT_EQ(PlayForm("\r", true, Config(false, true), working),
            "on fe80::5/64 link 2001:db8::1/64 2001:db8::7/64 gw fe80::1%kcore0");
  EXPECT_TRUE(HasShown("(o) Use dynamic"));
}

TEST_F(Ipv6Form, ShowsTheCursorInFields) {
  PlayForm(Times(4, DOWN) + UP + UP + ESC, true, Config(false, false));
  EXPECT_EQ(_cursors, "...|||.");
}

}  // namespace

}  // namespace Tarnel::Testing
