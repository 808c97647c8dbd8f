// What the welcome screen shows of each state of the host.

#include <gtest/gtest-spi.h>
#include <gtest/gtest.h>

#include <chrono>

#include "tests/e2e/welcome_picture.h"
#include "tests/support/lab.h"
#include "tests/support/terminal.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

TEST(WelcomeScreen, ShowsTheWholePictureAndAWrongOneIsNoticed) {
  const std::string picture =
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
      "+------------------------------------------------------------------------------+\n";
  EXPECT_EQ(WelcomePicture(), picture);
  LoadScenario("static");
  Terminal terminal;
  terminal.WaitForPicture(picture);
  EXPECT_FALSE(terminal.CursorVisible());

  terminal.SetPatience(std::chrono::milliseconds(50));
  std::string wrong = picture;
  wrong[wrong.find("16 GiB")] = '7';
  EXPECT_NONFATAL_FAILURE(terminal.WaitForPicture(wrong), "this picture");
  EXPECT_NONFATAL_FAILURE(terminal.WaitFor("17 GiB"), "17 GiB");
  terminal.SetPatience(PATIENCE);
}

// On 132 columns.
const std::vector<std::string> DHCP_WARNING = {
    "Warning: DHCP lookup failed. You may be unable to access this system until you customize its "
    "network",
    "configuration."};
const std::vector<std::string> AUDIT_WARNING = {
    "Warning: Host is running in audit mode. Your configuration will not be persistent across "
    "reboots.",
    "Please contact support."};

constexpr char NAME[] = "http://rack7/";
constexpr char STATIC_ADDRESS[] = "http://192.0.2.20/ (STATIC)";
constexpr char WAITING[] = "http://169.254.17.4/ (Waiting for DHCP...)";

struct HostCase {
  const char* scenario;
  std::vector<std::string> addresses;
  std::vector<std::string> warning = {};
};

const HostCase HOSTS[] = {
    {"dhcp-waiting", {NAME, WAITING}, DHCP_WARNING},
    {"dhcp", {NAME, "http://192.0.2.77/ (DHCP)"}},
    {"audit", {NAME, STATIC_ADDRESS}, AUDIT_WARNING},
    {"dhcp-zero", {NAME, "http://0.0.0.0/"}},
    {"audit-dhcp", {NAME, WAITING}, AUDIT_WARNING},
    {"ipv4-none", {NAME}},
    {"no-management", {NAME, "http://0.0.0.0/ (STATIC)"}},
    {"localhost-name", {STATIC_ADDRESS}},
    // The area has seven rows, which five addresses and a name fill.
    {"ipv6-many",
     {NAME, STATIC_ADDRESS, "http://[2001:db8::20]/ (STATIC)", "http://[2001:db8::d:77]/ (DHCP)",
      "http://[fe80::fc:ff:fe00:1]/ (AUTOCONF)", "http://[2001:db8:0:1:fc:ff:fe00:1]/ (AUTOCONF)"}},
    {"ipv6",
     {NAME, STATIC_ADDRESS, "http://[2001:db8:5::9]/", "http://[2001:db8::20]/ (STATIC)",
      "http://[2001:db8::d:77]/ (DHCP)", "http://[fe80::fc:ff:fe00:1]/ (AUTOCONF)"}},
};

// Each state gives way to the next, also its warning.
TEST(HostState, IsShownAtAKey) {
  LoadScenario("static");
  Terminal terminal({.columns = 132, .rows = 50});
  Welcome welcome{.columns = 132, .rows = 50};
  terminal.WaitForPicture(WelcomePicture(welcome));
  for (const auto& [scenario, addresses, warning] : HOSTS) {
    SCOPED_TRACE(scenario);
    LoadScenario(scenario);
    terminal.Type(SPACE);
    welcome.network = {STATIC_NETWORK.front()};
    welcome.network.insert(welcome.network.end(), addresses.begin(), addresses.end());
    welcome.warning = warning;
    terminal.WaitForPicture(WelcomePicture(welcome));
  }
  LoadScenario("static", R"({"hardware": {"cpu": {"model": "Slower", "packages": 4},
                                          "firmware": {"product": "Halden Systems 9"}}})");
  terminal.Type(SPACE);
  terminal.WaitForPicture(WelcomePicture(
      {.machine = "Halden Systems 9", .processor = "4 x Slower", .columns = 132, .rows = 50}));
}

TEST(HostStateWithoutAdapters, IsShownAtEachDrawAndAlertedOnce) {
  LoadScenario("no-adapter");
  Terminal terminal;
  for (int draw = 0; draw < 2; ++draw) {
    terminal.WaitForPicture(
        WelcomePicture({.network = {"No compatible network adapter found. Please consult the",
                                    "product's Hardware Compatibility Guide (HCG) for a list of",
                                    "supported adapters."}}));
    terminal.Type(SPACE);
    terminal.Settle();
  }
  EXPECT_EQ(TraceLines(),
            std::vector<std::string>{"SystemInfoImpl::SetSystemAlert \"No compatible network "
                                     "adapter found.\""});
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
  terminal.Type(SPACE);
  terminal.WaitForPicture(WelcomePicture());
  SetState(R"({"hardware": {"cpu": {"model": "Another"}},
               "faults": [{"operation": "NetworkInfoImpl::GetPnics", "message": "No."}]})");
  terminal.Type(SPACE);
  terminal.WaitForPicture(WelcomePicture({.network = {}}));
}

TEST(WelcomeMessage, TakesTheWholeScreenAsLongAsItIsThere) {
  LoadScenario("static");
  Terminal terminal;
  for (int round = 0; round < 2; ++round) {
    terminal.WaitForPicture(WelcomePicture());
    EXPECT_EQ(terminal.Colours(12), "3/7*80");
    SetState(R"({"host": {"welcomeMessage": "{align:center}Hello{/align}\n{bgcolor:red}!"}})");
    terminal.Type(SPACE);
    terminal.WaitFor("Hello");
    terminal.Settle();
    EXPECT_EQ(terminal.Row(2), "|" + std::string(36, ' ') + "Hello" + std::string(37, ' ') + "|");
    EXPECT_EQ(terminal.Colours(3), "0/7*2 1/7*1 0/7*77");
    for (int y = 4; y < 24; ++y) {
      EXPECT_EQ(terminal.Row(y), "|" + std::string(78, ' ') + "|");
    }
    EXPECT_EQ(terminal.Colours(12), "0/7*80");
    SetState(R"({"host": {"welcomeMessage": ""}})");
    terminal.Type(SPACE);
  }
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
