// What the welcome screen shows of each state of the host.

#include <gtest/gtest-spi.h>
#include <gtest/gtest.h>

#include <csignal>
#include <utility>

#include "tests/e2e/welcome_picture.h"
#include "tests/support/lab.h"
#include "tests/support/terminal.h"

namespace Tarnel::Testing {

namespace {

TEST(WelcomeScreen, ShowsTheWholePicture) {
  LoadScenario("static");
  Terminal terminal;
  terminal.WaitForPicture(
      "+------------------------------------------------------------------------------+\n"
      "|                                                                              |\n"
      "|                                                                              |\n"
      "|                                                                              |\n"
      "|                                                                              |\n"
      "|       Ostrel Laboratory Host 8.0.2 (Corelin release Build 24022)             |\n"
      "|                                                                              |\n"
      "|       Halden Systems Rackline R240                                           |\n"
      "|                                                                              |\n"
      "|       Halden Core 6214 CPU @ 2.40GHz                                         |\n"
      "|       16 GiB Memory                                                          |\n"
      "|                                                                              |\n"
      "|                                                                              |\n"
      "|       Download tools to manage this host from:                               |\n"
      "|       http://rack7/                                                          |\n"
      "|       http://192.0.2.20/ (STATIC)                                            |\n"
      "|                                                                              |\n"
      "|                                                                              |\n"
      "|                                                                              |\n"
      "|                                                                              |\n"
      "|                                                                              |\n"
      "|                                                                              |\n"
      "|                                                                              |\n"
      "| <F2> Customize System/View Logs                      <F12> Shut Down/Restart |\n"
      "+------------------------------------------------------------------------------+\n");
  EXPECT_FALSE(terminal.CursorVisible());
}

TEST(WelcomeScreen, ThatIsWrongIsNoticed) {
  LoadScenario("static");
  Terminal terminal;
  terminal.WaitForPicture(WelcomePicture({.network = STATIC_NETWORK}));
  terminal.SetPatience(std::chrono::milliseconds(50));
  std::string wrong = WelcomePicture({.network = STATIC_NETWORK});
  wrong[wrong.find("16 GiB")] = '7';
  EXPECT_NONFATAL_FAILURE(terminal.WaitForPicture(wrong), "this picture");
  EXPECT_NONFATAL_FAILURE(terminal.WaitFor("17 GiB"), "17 GiB");
  terminal.SetPatience(PATIENCE);
}

struct HostCase {
  const char* scenario;
  Welcome welcome;
};

void PrintTo(const HostCase& row, std::ostream* out) { *out << row.scenario; }

std::vector<std::string> Network(const std::vector<std::string>& lines) {
  std::vector<std::string> network = {"Download tools to manage this host from:"};
  network.insert(network.end(), lines.begin(), lines.end());
  return network;
}

const std::vector<std::string> DHCP_WARNING = {
    "Warning: DHCP lookup failed. You may be unable to access this system until you customize its "
    "network",
    "configuration."};
const std::vector<std::string> AUDIT_WARNING = {
    "Warning: Host is running in audit mode. Your configuration will not be persistent across "
    "reboots.",
    "Please contact support."};
const std::vector<std::string> IPV6_LINES = {
    "http://192.0.2.20/ (STATIC)", "http://[2001:db8::20]/ (STATIC)",
    "http://[2001:db8::d:77]/ (DHCP)", "http://[fe80::fc:ff:fe00:1]/ (AUTOCONF)",
    "http://[2001:db8:0:1:fc:ff:fe00:1]/ (AUTOCONF)"};

const HostCase HOSTS[] = {
    {"dhcp", {.network = Network({"http://rack7/", "http://192.0.2.77/ (DHCP)"})}},
    {"dhcp-waiting",
     {.network = Network({"http://rack7/", "http://169.254.17.4/ (Waiting for DHCP...)"}),
      .warning = DHCP_WARNING}},
    {"dhcp-zero", {.network = Network({"http://rack7/", "http://0.0.0.0/"})}},
    {"ipv4-none", {.network = Network({"http://rack7/"})}},
    {"audit", {.network = STATIC_NETWORK, .warning = AUDIT_WARNING}},
    {"audit-dhcp",
     {.network = Network({"http://rack7/", "http://169.254.17.4/ (Waiting for DHCP...)"}),
      .warning = AUDIT_WARNING}},
    {"no-management", {.network = Network({"http://rack7/", "http://0.0.0.0/ (STATIC)"})}},
    {"localhost-name", {.network = Network({"http://192.0.2.20/ (STATIC)"})}},
    {"vendor-in-product", {.network = STATIC_NETWORK}},
    {"two-sockets",
     {.network = STATIC_NETWORK,
      .processor = "2 x Halden Core 6214 CPU @ 2.40GHz",
      .memory = "15.7 GiB Memory"}},
};

class HostState : public testing::TestWithParam<HostCase> {};

// A screen of 25 lines has no place for a warning.
TEST_P(HostState, IsShownOnSmallAndLargeScreens) {
  LoadScenario(GetParam().scenario);
  Welcome welcome = GetParam().welcome;
  const std::vector<std::string> warning = std::exchange(welcome.warning, {});
  {
    Terminal terminal;
    terminal.WaitForPicture(WelcomePicture(welcome));
  }
  welcome.warning = warning;
  welcome.columns = 132;
  welcome.rows = 50;
  Terminal terminal({.columns = 132, .rows = 50});
  terminal.WaitForPicture(WelcomePicture(welcome));
}

INSTANTIATE_TEST_SUITE_P(Scenarios, HostState, testing::ValuesIn(HOSTS));

TEST(HostStateWithoutAdapters, IsShownAtEachDrawAndAlertedOnce) {
  LoadScenario("no-adapter");
  Terminal terminal;
  const Welcome welcome{.network = {
                            "No compatible network adapter found. Please consult the",
                            "product's Hardware Compatibility Guide (HCG) for a list of",
                            "supported adapters.",
                        }};
  for (int draw = 0; draw < 3; ++draw) {
    terminal.WaitForPicture(WelcomePicture(welcome));
    terminal.Type(Keys::SPACE);
    terminal.Settle();
  }
  EXPECT_EQ(TraceLines(), std::vector<std::string>{
                              "SystemInfoImpl::SetSystemAlert \"No compatible network adapter "
                              "found.\""});
}

TEST(HostStateWithIpv6, ShowsFiveAddressesOrFourAndDots) {
  std::vector<std::string> four = Network(IPV6_LINES);
  std::vector<std::string> five = four;
  four.emplace_back("...");
  five.insert(five.begin() + 2, "http://[2001:db8:5::9]/");
  // The area has seven rows: a line for the host's name would push the last one out.
  constexpr char NAMELESS[] =
      R"({"network": {"stacks": {"defaultTcpipStack": {"running": {"hostname": ""}}}}})";
  for (const auto& [scenario, lines] : {std::pair("ipv6", five), std::pair("ipv6-many", four)}) {
    LoadScenario(scenario, NAMELESS);
    Terminal terminal({.term = "xterm"});
    terminal.WaitForPicture(WelcomePicture({.network = lines}));
  }
}

TEST(HostThatFails, LeavesWhatStoodThere) {
  LoadScenario("host-fails");
  Terminal terminal;
  // At the first time nothing stood in the upper half.
  Welcome welcome{.network = {}, .machine = "", .processor = "", .memory = ""};
  std::string blank = WelcomePicture(welcome);
  const std::string product = "Ostrel Laboratory Host 8.0.2 (Corelin release Build 24022)";
  blank.replace(blank.find(product), product.size(), product.size(), ' ');
  terminal.WaitForPicture(blank);
  SetState(R"({"faults": []})");
  terminal.Type(Keys::SPACE);
  terminal.WaitForPicture(WelcomePicture({.network = STATIC_NETWORK}));
  SetState(R"({"hardware": {"cpu": {"model": "Another"}},
               "faults": [{"operation": "NetworkInfoImpl::GetPnics", "message": "No."}]})");
  terminal.Type(Keys::SPACE);
  terminal.WaitForPicture(WelcomePicture({.network = {}}));
}

TEST(WelcomeScreenWithFreshFacts, ComesWithAKeyAndWithASignal) {
  LoadScenario("static");
  Terminal terminal;
  Welcome welcome{.network = STATIC_NETWORK};
  terminal.WaitForPicture(WelcomePicture(welcome));
  SetState(R"({"hardware": {"cpu": {"model": "Slower", "packages": 4}}})");
  terminal.Type(Keys::SPACE);
  welcome.processor = "4 x Slower";
  terminal.WaitForPicture(WelcomePicture(welcome));
  SetState(R"({"hardware": {"firmware": {"product": "Halden Systems 9"}}})");
  terminal.Signal(SIGUSR1);
  welcome.machine = "Halden Systems 9";
  terminal.WaitForPicture(WelcomePicture(welcome));
}

TEST(WelcomeMessage, TakesTheWholeScreenAsLongAsItIsThere) {
  LoadScenario(
      "static",
      R"({"host": {"welcomeMessage": "{align:center}Hello from {hostname}{/align}\n{bgcolor:red}!{/bgcolor}"}})");
  Terminal terminal({.columns = 40, .rows = 8});
  const char* const message =
      "+--------------------------------------+\n"
      "|                                      |\n"
      "|     Hello from rack7.example.com     |\n"
      "| !                                    |\n"
      "|                                      |\n"
      "|                                      |\n"
      "|                                      |\n"
      "+--------------------------------------+\n";
  terminal.WaitForPicture(message);
  EXPECT_EQ(terminal.Colours(3), "0/7*2 1/7*1 0/7*37");
  Terminal large;
  large.WaitFor("Hello from rack7");
  SetState(R"({"host": {"welcomeMessage": ""}})");
  large.Type(Keys::SPACE);
  large.WaitForPicture(WelcomePicture({.network = STATIC_NETWORK}));
  EXPECT_EQ(large.Colours(12), "3/7*80");
  SetState(R"({"host": {"welcomeMessage": "Closed"}})");
  large.Type(Keys::SPACE);
  large.WaitFor("| Closed ");
  EXPECT_EQ(large.Row(5), "|" + std::string(78, ' ') + "|");
  EXPECT_EQ(large.Colours(12), "0/7*80");
}

TEST(HostileTexts, DoNotMoveThePicture) {
  LoadScenario("hostile-texts");
  Terminal terminal;
  terminal.WaitFor("<F12> Shut Down/Restart");
  terminal.Settle();
  for (int y = 1; y < 24; ++y) {
    const std::string row = terminal.Row(y);
    EXPECT_EQ(terminal.At(0, y).text, "|") << row;
    EXPECT_EQ(terminal.At(79, y).text, "|") << row;
    EXPECT_EQ(terminal.Colours(y).find("plain"), std::string::npos) << row;
  }
  EXPECT_EQ(terminal.Row(0), "+" + std::string(78, '-') + "+");
  EXPECT_EQ(terminal.Row(24), "+" + std::string(78, '-') + "+");
}

}  // namespace

}  // namespace Tarnel::Testing
