// The screen of the management network: what it shows, what it writes to the host and what becomes
// of a host that fails meanwhile.

#include <gtest/gtest.h>

#include <algorithm>

#include "tests/support/lab.h"
#include "tests/support/operator.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

using Lines = std::vector<std::string>;

constexpr char NETWORK_ROW[] = "Configure Management Network";

std::string Down(int times) { return times == 0 ? "" : DOWN + Down(times - 1); }

// The operator in front of the screen.
class NetworkScreen : public Operator {
 public:
  NetworkScreen() {
    GoTo(NETWORK_ROW);
    Press({ENTER});
  }

  // Opens the row that many rows further down and types into its form.
  void Edit(int rowsDown, const std::string& keys) {
    Press({Down(rowsDown) + ENTER, keys + ENTER});
  }

  // Leaves the screen with a yes and confirms each message.
  void Apply(const Lines& messages = {}) {
    Press({ESC});
    WaitFor("Apply changes and re");
    Type("y");
    for (const std::string& message : messages) {
      WaitFor(message);
      Settle();
      Type(ENTER);
    }
  }
};

// What the console tells the log from here on, but for what it tells of itself.
Lines Told(const Log& log) {
  Lines told;
  for (const LogLine& line : log.Lines()) {
    const std::string text = line.text.substr(line.text.find(": ") + 2);
    if (line.text.starts_with("TARNEL: ") && !text.starts_with("COLS=")) {
      told.push_back((line.level == "user.err" ? "error: " : "") + text);
    }
  }
  return told;
}

Lines TraceFrom(size_t start) {
  const Lines lines = TraceLines();
  return {lines.begin() + static_cast<ptrdiff_t>(std::min(start, lines.size())), lines.end()};
}

struct Pane {
  const char* scenario;
  int rowsDown;
  const char* title;
  Lines lines;
};

TEST(NetworkScreen, ShowsThePendingConfiguration) {
  const Pane panes[] = {
      {"sample", 0, "Network Adapters", {"corenic0 (Gigabit Network Adapter)", ""}},
      {"sample", 1, "VLAN (optional)", {"Not set", ""}},
      {"sample",
       2,
       "IPv4 Configuration",
       {"Manual", "", "IPv4 Address: 192.0.2.20", "Subnet Mask: 255.255.255.0",
        "Default Gateway: 192.0.2.1", ""}},
      {"ipv4-none", 2, "IPv4 Configuration", {"None", "", "IPv4 Address: Not set"}},
      {"dhcp", 2, "IPv4 Configuration", {"Automatic", "", "IPv4 Address: 192.0.2.77"}},
      {"sample", 3, "IPv6 Configuration", {"IPv6 is disabled.", ""}},
      {"ipv6",
       3,
       "IPv6 Configuration",
       {"IPv6 is enabled.", "", "Automatic", "", "IPv6 Addresses:", "2001:db8::20/64",
        "2001:db8:0:1:fc:ff:fe00:1/64", "...", "", "Default Gateway:"}},
      {"sample",
       4,
       "DNS Configuration",
       {"Manual", "", "Primary DNS Server:", "192.0.2.53", "Alternate DNS Server:", "Not set", "",
        "Hostname", "rack7", ""}},
      {"sample", 5, "Custom DNS Suffixes", {"example.com", ""}},
  };
  for (const Pane& pane : panes) {
    SCOPED_TRACE(std::string(pane.scenario) + ": " + pane.title);
    LoadScenario(pane.scenario);
    NetworkScreen screen;
    screen.Press({Down(pane.rowsDown)});
    EXPECT_EQ(screen.RightPane(1), pane.title);
    for (size_t i = 0; i < pane.lines.size(); ++i) {
      EXPECT_EQ(screen.RightPane(4 + static_cast<int>(i)), pane.lines[i]);
    }
  }
}

TEST(NetworkScreen, OpensOnlyWithAnInterfaceOnAStandardOrDistributedSwitch) {
  struct Row {
    const char* scenario;
    const char* patch;
    const char* shown;
    Lines told;
  };
  const Row rows[] = {
      {"sample",
       R"({"network": {"kernelNics": {"core0": {"connection": {"type": 3}}}}})",
       "System Customization",
       {"error: Getting uplinks failed: Unsupported softSwitch type"}},
      {"sample",
       R"({"network": {"kernelNics": {"core0": {"connection": {"type": 0}}}}})",
       "System Customization",
       {"error: Getting uplinks failed: Unsupported softSwitch type"}},
      {"sample",
       R"({"faults": [{"operation": "NetworkInfoImpl::GetManagementInterface", "returns": null}]})",
       "Management network interface cannot be found.",
       {"error: Could not get a suitable management interface"}},
      {"sample",
       R"({"faults": [{"operation": "NetworkInterface::GetRunningIpConfig", "message": "x"}]})",
       "System Customization",
       {}},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.patch);
    LoadScenario(row.scenario);
    Operator terminal;
    terminal.GoTo(NETWORK_ROW);
    SetState(row.patch);
    const Log log;
    terminal.Press({ENTER});
    terminal.WaitFor(row.shown);
    EXPECT_EQ(Told(log), row.told);
  }
}

// An uplink, the VLAN, the address, a name server with the host's name, and the suffixes.
void ChangeEverything(NetworkScreen& screen) {
  screen.Edit(0, DOWN + " ");
  screen.Edit(1, "100");
  screen.Edit(1, Down(3) + "192.0.2.30");
  screen.Edit(2, "192.0.2.54" + Down(2) + "rack8.example.org");
  screen.Edit(1, "a.example, b.example");
}

const Lines EVERYTHING = {
    R"(VirtualSwitch::RemoveUplink softSwitch0 "corenic1" "false")",
    R"(VirtualSwitch::AddUplink softSwitch0 "corenic1")",
    R"(PortGroup::SetTeamingPolicy "Management Network" "mask 80 order corenic0 corenic1 max 2")",
    R"(PortGroup::SetVlan "Management Network" "100")",
    R"(NetworkInfoImpl::SetCoreIpv6Enabled "false")",
    R"(NetworkInterface::SetIpConfig core0 "192.0.2.30 255.255.255.0" "ipv6" "dns manual")",
    R"(RoutingInfoImpl::SetCorelinDefaultGateway defaultTcpipStack "192.0.2.1" "false")",
    R"(NetworkInterface::Disable core0)",
    R"(NetworkInterface::Refresh core0)",
    R"(NetworkInterface::Enable core0)",
    R"(DnsConfigImpl::SetFqdn defaultTcpipStack "rack8.example.org" "false" "")",
    R"(DnsConfigImpl::RemoveNameServers defaultTcpipStack)",
    R"(DnsConfigImpl::AddNameServer defaultTcpipStack "192.0.2.54")",
    R"(DnsConfigImpl::SetSearchDomainsString defaultTcpipStack "example.org")",
    R"(DnsConfigImpl::AddSearchDomain defaultTcpipStack "a.example")",
    R"(DnsConfigImpl::AddSearchDomain defaultTcpipStack "b.example")",
    R"(DnsConfigImpl::SaveConfig defaultTcpipStack)",
    R"(program /bin/stew-cmd stew-cmd -U root internalsvc/refresh)",
};

constexpr char SWITCH_IPV6[] = R"(NetworkInfoImpl::SetCoreIpv6Enabled "false")";
constexpr char SAME_ADDRESS[] =
    R"(NetworkInterface::SetIpConfig core0 "192.0.2.20 255.255.255.0" "ipv6" "dns manual")";
constexpr char HOSTNAME[] = R"(DnsConfigImpl::SetHostname defaultTcpipStack "rack7" "false")";
constexpr char DOMAIN[] =
    R"(DnsConfigImpl::SetSearchDomainsString defaultTcpipStack "example.com")";
constexpr char IPV6_ON[] = R"(NetworkInfoImpl::SetCoreIpv6Enabled "true")";
constexpr char LEASES[] = R"(NetworkInterface::SetIpConfig core0 "dhcp" )"
                          R"("ipv6 dhcp 2001:db8::d:77/128 fe80::fc:ff:fe00:1/64" "dns dhcp")";
constexpr char STILL_BOUND[] = R"(CoreNic::SetDhcpBound core0 "true")";
constexpr char SAME_SUFFIX[] = R"(DnsConfigImpl::AddSearchDomain defaultTcpipStack "example.com")";
constexpr char SAVE[] = "DnsConfigImpl::SaveConfig defaultTcpipStack";
constexpr char REFRESH[] = "program /bin/stew-cmd stew-cmd -U root internalsvc/refresh";

struct Change {
  const char* name;
  const char* scenario;
  const char* patch;
  void (*edit)(NetworkScreen& screen);
  Lines told;
  Lines trace;
};

TEST(ApplyChanges, WriteWhatIsPendingInItsOrder) {
  const Change changes[] = {
      {"everything",
       "sample",
       "",
       ChangeEverything,
       {"Setting adapters to corenic0 corenic1",
        "Setting ipv4 configuration to 192.0.2.30 255.255.255.0 on core0",
        "Setting default gateway to 192.0.2.1", "Changed vlan, restarting management interface",
        "Setting hostname to rack8.example.org", "Setting nameservers to 192.0.2.54 ",
        "Setting suffixes to a.example, b.example", "Network settings changed."},
       EVERYTHING},
      {"suffixes alone",
       "sample",
       "",
       [](NetworkScreen& screen) {
         screen.Edit(5, "");
         screen.Edit(0, "x.example  y,z");
       },
       {"Setting adapters to corenic0", "Setting hostname to rack7",
        "Setting nameservers to 192.0.2.53 ", "Setting suffixes to x.example  y,z",
        "Network settings changed."},
       {SWITCH_IPV6, SAME_ADDRESS, HOSTNAME, "DnsConfigImpl::RemoveNameServers defaultTcpipStack",
        R"(DnsConfigImpl::AddNameServer defaultTcpipStack "192.0.2.53")", DOMAIN,
        R"(DnsConfigImpl::AddSearchDomain defaultTcpipStack "x.example")",
        R"(DnsConfigImpl::AddSearchDomain defaultTcpipStack "y")",
        R"(DnsConfigImpl::AddSearchDomain defaultTcpipStack "z")",
        "DnsConfigImpl::SaveConfig defaultTcpipStack", REFRESH}},
      {"a gateway and an unset name server",
       "sample",
       "",
       [](NetworkScreen& screen) {
         screen.Edit(2, Down(5) + "192.0.2.9");
         screen.Edit(2, Down(1) + "0.0.0.0");
       },
       {"Setting adapters to corenic0", "Setting default gateway to 192.0.2.9",
        "Setting hostname to rack7", "Setting nameservers to 192.0.2.53 0.0.0.0",
        "Setting suffixes to example.com", "Network settings changed."},
       {SWITCH_IPV6, SAME_ADDRESS,
        R"(RoutingInfoImpl::SetCorelinDefaultGateway defaultTcpipStack "192.0.2.9" "false")",
        HOSTNAME, "DnsConfigImpl::RemoveNameServers defaultTcpipStack",
        R"(DnsConfigImpl::AddNameServer defaultTcpipStack "192.0.2.53")", DOMAIN,
        R"(DnsConfigImpl::AddSearchDomain defaultTcpipStack "example.com")",
        "DnsConfigImpl::SaveConfig defaultTcpipStack", REFRESH}},
      {"another order and a lease",
       "network-dhcp",
       R"({"network": {"switches": {"softSwitch0": {"uplinks": ["corenic0", "corenic1"],
           "portGroups": {"Management Network":
             {"teaming": {"mask": 80, "order": ["corenic0", "corenic1"], "max": 2}}}}}}})",
       [](NetworkScreen& screen) { screen.Edit(0, "  "); },
       {"Setting adapters to corenic1 corenic0", "Setting ipv6 configuration",
        "Setting suffixes to example.com", "Network settings changed."},
       {R"(CoreNicImpl::SetMacFromPnic core0 "corenic1")", IPV6_ON, LEASES, STILL_BOUND, DOMAIN,
        SAME_SUFFIX, SAVE, REFRESH}},
      {"no adapter with a lease",
       "network-dhcp",
       "",
       [](NetworkScreen& screen) { screen.Edit(0, " "); },
       {"Setting adapters to", "Setting ipv6 configuration", "Renew DHCP lease on core0",
        "Setting suffixes to example.com", "Network settings changed."},
       {R"(VirtualSwitch::RemoveUplink softSwitch0 "corenic0" "false")",
        R"(PortGroup::SetTeamingPolicy "Management Network" "mask 80 order max 0")", IPV6_ON,
        LEASES, STILL_BOUND, "CoreNic::RenewDhcpLease core0", "CoreNic::RenewDhcp6Lease core0",
        DOMAIN, SAME_SUFFIX, SAVE, REFRESH}},
      {"from a lease to a static address",
       "network-dhcp",
       "",
       [](NetworkScreen& screen) {
         screen.Edit(2, Down(2) + " " + Down(1) + "192.0.2.30" + Down(1) + "255.255.255.0" +
                            Down(1) + "192.0.2.1");
       },
       {"Setting adapters to corenic0",
        "Setting ipv4 configuration to 192.0.2.30 255.255.255.0 on core0",
        "Setting ipv6 configuration", "Setting default gateway to 192.0.2.1",
        "Setting suffixes to example.com", "Network settings changed."},
       {IPV6_ON,
        R"(NetworkInterface::SetIpConfig core0 "192.0.2.30 255.255.255.0" )"
        R"("ipv6 dhcp 2001:db8::d:77/128 fe80::fc:ff:fe00:1/64" "dns dhcp")",
        R"(RoutingInfoImpl::SetCorelinDefaultGateway defaultTcpipStack "192.0.2.1" "false")",
        DOMAIN, SAME_SUFFIX, SAVE, REFRESH}},
  };
  for (const Change& change : changes) {
    SCOPED_TRACE(change.name);
    LoadScenario(change.scenario, change.patch);
    NetworkScreen screen;
    change.edit(screen);
    const size_t start = TraceLines().size();
    const Log log;
    screen.Apply();
    screen.WaitFor("System Customization");
    EXPECT_EQ(TraceFrom(start), change.trace);
    EXPECT_EQ(Told(log), change.told);
  }
}

struct FailingStep {
  const char* operation;
  // What the operator confirms, empty for nothing.
  std::string message;
  // What the log tells of the failure.
  std::string told;
  // Beginnings of the lines of EVERYTHING that are missing, as the step's failure has it.
  Lines missing;
  // A line that comes in addition, and before which one.
  const char* added = nullptr;
  const char* before = "NetworkInterface::Disable";
};

bool IsAmong(const Lines& beginnings, const std::string& line) {
  return std::any_of(beginnings.begin(), beginnings.end(),
                     [&](const std::string& beginning) { return line.starts_with(beginning); });
}

TEST(ApplyChanges, GoOnAfterAStepThatFails) {
  const Lines restart = {"NetworkInterface::Disable", "NetworkInterface::Refresh",
                         "NetworkInterface::Enable"};
  const Lines afterFqdn = {"DnsConfigImpl::RemoveNameServers", "DnsConfigImpl::AddNameServer",
                           "DnsConfigImpl::SetSearch", "DnsConfigImpl::AddSearch",
                           "DnsConfigImpl::SaveConfig"};
  const Lines afterDomain = {"DnsConfigImpl::SetSearch", "DnsConfigImpl::AddSearch",
                             "DnsConfigImpl::SaveConfig"};
  Lines vlanAndRestart = restart;
  vlanAndRestart.emplace_back("PortGroup::SetVlan");
  const FailingStep steps[] = {
      {"PortGroup::GetTeamingPolicy",
       "",
       "Getting uplinks failed: a=broken;",
       {"VirtualSwitch::RemoveUplink", "VirtualSwitch::AddUplink", "PortGroup::SetTeaming"},
       R"(CoreNicImpl::SetMacFromPnic core0 "corenic0")",
       "PortGroup::SetVlan"},
      {"NetworkInterface::GetRunningIpConfig",
       "Setting ip configuration failed: broken",
       "",
       {"RoutingInfoImpl::SetCorelin"},
       "CoreNic::RenewDhcpLease core0"},
      {"CoreNic::IsDhcpBound",
       "Setting ip/ipv6 configuration failed: broken",
       "",
       {"NetworkInterface::SetIpConfig"}},
      {"RoutingInfoImpl::GetCorelinDefaultGateway",
       "Setting default gateway failed: a=broken;",
       "",
       {"RoutingInfoImpl::SetCorelin"}},
      {"DnsConfigImpl::AddNameServer", "Setting DNS failed: broken", "", afterDomain},
      {"DnsConfigImpl::AddSearchDomain",
       "Setting DNS failed: broken",
       "",
       {R"(DnsConfigImpl::AddSearchDomain defaultTcpipStack "b)", "DnsConfigImpl::SaveConfig"}},
      {"VirtualSwitch::AddUplink",
       "",
       "Adding uplink corenic1 failed: a=broken;",
       {"PortGroup::SetTeaming"}},
      {"PortGroup::SetTeamingPolicy", "", "VS: add uplink to teaming policy failed: a=broken;", {}},
      {"PortGroup::GetVlan", "", "Getting VlanID failed: a=broken;", vlanAndRestart},
      {"PortGroup::SetVlan", "", "Setting VlanID failed: a=broken;", restart},
      {"NetworkInterface::GetIpConfig",
       "Setting ip configuration failed: broken",
       "",
       {"RoutingInfoImpl::SetCorelin"},
       "CoreNic::RenewDhcpLease core0"},
      {"NetworkInfoImpl::SetCoreIpv6Enabled",
       "Setting ipv6 configuration failed: broken",
       "",
       {},
       "CoreNic::RenewDhcp6Lease core0"},
      {"NetworkInterface::SetIpConfig", "Setting ip/ipv6 configuration failed: broken", "", {}},
      {"RoutingInfoImpl::SetCorelinDefaultGateway",
       "Setting default gateway failed: a=broken;",
       "",
       {}},
      {"DnsConfigImpl::SetFqdn", "Setting DNS failed: broken", "", afterFqdn},
      {"DnsConfigImpl::GetDomain", "Setting DNS failed: broken", "", afterDomain},
      {"DnsConfigImpl::SaveConfig", "Setting DNS failed: broken", "", {}},
  };
  for (const FailingStep& step : steps) {
    SCOPED_TRACE(step.operation);
    LoadScenario("sample");
    NetworkScreen screen;
    ChangeEverything(screen);
    SetState(R"({"faults": [{"operation": ")" + std::string(step.operation) +
             R"(", "message": "a=broken;"}]})");
    const size_t start = TraceLines().size();
    const Log log;
    screen.Apply(step.message.empty() ? Lines{} : Lines{step.message});
    screen.WaitFor("System Customization");
    Lines expected = EVERYTHING;
    std::erase_if(expected, [&](const std::string& line) { return IsAmong(step.missing, line); });
    if (step.added != nullptr) {
      const auto place =
          std::find_if(expected.begin(), expected.end(),
                       [&](const std::string& line) { return line.starts_with(step.before); });
      expected.insert(place, step.added);
    }
    EXPECT_EQ(TraceFrom(start), expected);
    const Lines told = Told(log);
    const std::string line = "error: " + (step.told.empty() ? step.message : step.told);
    EXPECT_NE(std::find(told.begin(), told.end(), line), told.end()) << line;
    EXPECT_EQ(told.back(), "Network settings changed.");
  }
}

struct UncaughtFailure {
  const char* scenario;
  void (*edit)(NetworkScreen& screen);
  const char* operation;
};

// What comes later is not done, and the terminal is given back.
TEST(ApplyChanges, EndTheConsoleWhenTheInterfaceDoesNotComeBack) {
  const auto changeVlan = [](NetworkScreen& screen) { screen.Edit(1, "100"); };
  const UncaughtFailure failures[] = {
      {"network-dhcp", [](NetworkScreen& screen) { screen.Edit(0, " "); },
       "CoreNic::RenewDhcpLease"},
      {"sample", changeVlan, "NetworkInterface::Disable"},
      {"sample", changeVlan, "NetworkInterface::Refresh"},
      {"sample", changeVlan, "NetworkInterface::Enable"},
  };
  for (const auto& [scenario, edit, operation] : failures) {
    SCOPED_TRACE(operation);
    LoadScenario(scenario);
    NetworkScreen screen;
    edit(screen);
    SetState(R"({"faults": [{"operation": ")" + std::string(operation) +
             R"(", "message": "broken"}]})");
    const Log log;
    screen.Apply();
    EXPECT_EQ(screen.WaitForEnd(), 0);
    EXPECT_TRUE(screen.ModesAreRestored());
    log.WaitFor({"user.err", "TARNEL: TARNEL aborted by exception: broken"});
    EXPECT_EQ(TraceLines().back(), std::string(operation) + " core0");
  }
}

TEST(ApplyChanges, TellWhenTheMacAddressCannotBeTaken) {
  LoadScenario("sample", R"({"network": {"switches": {"softSwitch0": {"portGroups":
      {"Management Network": {"teaming": {"order": ["corenic1", "corenic0"]}}}}}},
      "faults": [{"operation": "CoreNicImpl::SetMacFromPnic", "message": "a=broken;"}]})");
  NetworkScreen screen;
  screen.Edit(0, DOWN + "  ");
  screen.Apply({"Setting mac address of upnic failed: broken"});
  screen.WaitFor("System Customization");
  EXPECT_EQ(TraceLines().back(), REFRESH);
}

TEST(ApplyChanges, ShowInThePaneBeforeTheSlowerSteps) {
  LoadScenario("network-dhcp", R"({
      "network": {"kernelNics": {"core0": {"stored": {"ipv6Dhcp": false}}}},
      "faults": [{"operation": "RoutingInfoImpl::SetCorelinDefaultGateway", "delayMs": 1000}]})");
  NetworkScreen screen;
  screen.Edit(2, Down(2) + " " + Down(1) + "192.0.2.30" + Down(1) + "255.255.255.0" + Down(1) +
                     "192.0.2.1");
  screen.Press({DOWN, DOWN});
  EXPECT_EQ(screen.RightPane(4), "Automatic");
  const Log log;
  screen.Apply();
  screen.WaitUntil([&] { return screen.RightPane(4) == "Manual"; }, "the new mode");
  EXPECT_FALSE(log.Contains({"user.info", "TARNEL: Setting suffixes to example.com"}));
  screen.WaitFor("System Customization");
}

TEST(ApplyChanges, ShowOnTheWelcomeScreen) {
  LoadScenario("sample");
  NetworkScreen screen;
  screen.Edit(2, Down(3) + "192.0.2.30");
  screen.Apply();
  screen.WaitFor("System Customization");
  screen.Settle();
  screen.Press({ESC});
  screen.WaitFor("http://192.0.2.30/ (STATIC)");
}

TEST(ApplyChanges, AskBeforeAndRestartTheHostForIpv6) {
  LoadScenario("host-stays-up");
  NetworkScreen screen;
  screen.Edit(3, Down(1) + " ");
  EXPECT_EQ(screen.RightPane(4), "IPv6 is enabled.");
  screen.Press({ESC});
  screen.WaitFor("Apply changes and reboot host?");
  // Back on the screen everything is still pending; no drops it.
  screen.Press({ESC});
  EXPECT_EQ(screen.RightPane(4), "IPv6 is enabled.");
  screen.Apply();
  screen.WaitFor("Restart in progress...");
  screen.WaitUntil([] { return TraceLines().back().starts_with("program /sbin/reboot"); },
                   "the restart");
  EXPECT_EQ(GetState("/network/ipv6/nextStart"), "true\n");
}

TEST(ApplyChanges, LeaveTheHostAloneAfterANo) {
  LoadScenario("sample");
  NetworkScreen screen;
  screen.Edit(1, "100");
  const size_t start = TraceLines().size();
  screen.Press({ESC, "n"});
  screen.WaitFor("System Customization");
  EXPECT_EQ(TraceFrom(start), Lines{});
}

struct Restart {
  const char* scenario;
  const char* patch;
  Lines keys;
  // What the dialog shows when all is done, or the message.
  Lines shown;
};

TEST(RestartNetwork, TellsEachStage) {
  // The second Enter means nothing.
  const Lines confirmed = {ENTER, ENTER, F11};
  const Restart restarts[] = {
      {"sample",
       "",
       confirmed,
       {"Stopping management network. Done.", "Starting management network.",
        "   IP address is  192.0.2.20"}},
      {"dhcp",
       "",
       confirmed,
       {"Stopping management network. Done.", "Starting management network. Done."}},
      {"sample",
       R"({"faults": [{"operation": "NetworkInterface::Enable", "message": "x"}]})",
       confirmed,
       {"Operation on the management network interface failed."}},
      {"sample",
       R"({"faults": [{"operation": "NetworkInfoImpl::GetManagementInterface", "returns": null}]})",
       {ENTER},
       {"Management network interface cannot be found."}},
  };
  for (const Restart& restart : restarts) {
    SCOPED_TRACE(std::string(restart.scenario) + restart.patch);
    LoadScenario(restart.scenario);
    Operator terminal;
    terminal.GoTo("Restart Management Network");
    if (*restart.patch != '\0') SetState(restart.patch);
    terminal.Press(restart.keys);
    for (const std::string& line : restart.shown) terminal.WaitFor(line);
    terminal.WaitFor("<Enter> OK");
    terminal.Press({ENTER});
    terminal.WaitFor("<Enter> Restart");
  }
}

struct NetworkTest {
  const char* name;
  std::string keys;
  Lines shown;
  Lines leave = {ENTER};
};

// The sample's gateway and name server, then what is typed over them.
TEST(TestNetwork, PingsAndResolves) {
  LoadScenario("ping");
  const std::string hosts = ReadFile("/etc/hosts");
  Operator terminal;
  terminal.GoTo("Test Management Network");
  const NetworkTest tests[] = {
      {"a bad address", "1.2.3" + ENTER, {"Invalid IP or IPv6 address."}, {ENTER, ESC}},
      {"no step", "\b" + DOWN + "\b" + DOWN + "\b" + DOWN + "\b" + ENTER, {"<Enter> OK"}},
      {"the host's own",
       ENTER,
       {"Pinging address #1 (192.0.2.1).", "Resolving hostname (rack7.example.com).", "OK."}},
      {"an unreachable one and an unknown name",
       Down(1) + "203.0.113.9" + Down(2) + "nowhere.example" + ENTER,
       {"Pinging address #2 (203.0.113.9).", "Failed.", "Resolving hostname (nowhere.example)."}},
  };
  for (const NetworkTest& test : tests) {
    SCOPED_TRACE(test.name);
    terminal.Press({ENTER, test.keys});
    for (const std::string& text : test.shown) terminal.WaitFor(text);
    terminal.WaitFor("<Enter> OK");
    terminal.Press(test.leave);
    terminal.WaitFor("<Enter> Run Test");
    EXPECT_EQ(ReadFile("/etc/hosts"), hosts);
  }
}

TEST(TestNetwork, PutsTheHostsFileBackAfterTheConsoleHasEnded) {
  LoadScenario("ping", R"({"names": {"rack7.example.com": {"answers": [], "delayMs": 500}}})");
  const std::string hosts = ReadFile("/etc/hosts");
  Operator terminal;
  terminal.GoTo("Test Management Network");
  terminal.Press({ENTER});
  terminal.Type(ENTER);
  terminal.WaitFor("Resolving hostname (rack7.example.com).");
  terminal.WaitUntil([&] { return ReadFile("/etc/hosts") != hosts; }, "the lookup");
  terminal.Type("\x1c");
  EXPECT_EQ(terminal.WaitForEnd(), 0);
  terminal.WaitUntil([&] { return ReadFile("/etc/hosts") == hosts; }, "the file's return");
}

TEST(TestNetwork, CanBeLeftWhileAStepRuns) {
  LoadScenario("sample", R"({"ping": {"192.0.2.1": {"delayMs": 60000}}})");
  Operator terminal;
  terminal.GoTo("Test Management Network");
  terminal.Press({ENTER, ENTER});
  terminal.WaitFor("Pinging address #1 (192.0.2.1).");
  terminal.Press({ENTER, "x"});
  terminal.WaitFor("<Esc> Cancel");
  terminal.Press({ESC});
  terminal.WaitFor("<Enter> Run Test");
}

}  // namespace

}  // namespace Tarnel::Testing
