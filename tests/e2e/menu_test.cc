// The menu of an operator who is logged in, and what it opens.

#include <gtest/gtest.h>

#include <csignal>
#include <cstring>

#include "console/screen/colours.h"
#include "tests/support/lab.h"
#include "tests/support/operator.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

struct MenuRow {
  const char* title;
  const char* text;
  const char* hint;
};

// Its title stays when the row of the DriverVM has the focus, whose pane has no hint either.
TEST(Menu, TellsAboutTheFocusedRow) {
  const MenuRow rows[] = {
      {"Configure Password", "Set", "<Enter> Change          <Esc> Log Out"},
      {"Configure Lockdown Mode", "Disabled", "<Enter> Change          <Esc> Log Out"},
      {"Configure Lockdown Mode", "It is possible to use a Linux", ""},
      {"Configure Management Network", "Hostname:", "<Enter> More            <Esc> Log Out"},
      {"Restart Management Network", "Restarting the management network",
       "<Enter> Restart         <Esc> Log Out"},
      {"Test Management Network", "To perform a brief network test,",
       "<Enter> Run Test        <Esc> Log Out"},
      {"Network Restore Options", "To view various network restore",
       "<Enter> Restart         <Esc> Log Out"},
      {"Configure Keyboard", "US Default", "<Enter> More            <Esc> Log Out"},
      {"Troubleshooting Options", "To view various troubleshooting mode",
       "<Enter> More            <Esc> Log Out"},
      {"View System Logs", "<1> Syslog", "<Esc> Log Out"},
      {"View Support Information", "", "<Esc> Log Out"},
      {"Reset System Configuration", "Warning!", "<Enter> Reset           <Esc> Log Out"},
      {"Reset System Configuration", "Warning!", "<Enter> Reset           <Esc> Log Out"},
  };
  LoadScenario("driver-vm");
  Operator terminal;
  EXPECT_EQ(terminal.Colours(4), "3/7*3 0/7*35 3/7*2 6/7*5 6/2*33 6/7*2");
  EXPECT_EQ(terminal.Colours(22), "3/7*2 3/0*9 3/6*7 3/0*21 3/7*1 6/7*8 6/2*7 6/7*15 6/2*8 6/7*2");
  for (const MenuRow& row : rows) {
    SCOPED_TRACE(row.title);
    EXPECT_EQ(terminal.RightPane(1), row.title);
    EXPECT_EQ(terminal.RightPane(4), row.text);
    EXPECT_EQ(terminal.RightPane(22), row.hint);
    terminal.Press({DOWN});
  }
}

struct Offer {
  const char* scenario;
  const char* term;
  const char* greyRows;
};

TEST(Menu, GreysWhatTheHostDoesNotOffer) {
  const Offer offers[] = {
      {"no-management", "linux",
       "Configure Management Network,Restart Management Network,Test Management Network,"},
      {"lockdown-impossible", "linux", "Configure Lockdown Mode,"},
      {"driver-vm-present", "linux", "Configure DriverVM Devices,"},
      {"pxe", "linux", "Reset System Configuration,"},
      {"lockdown-on", "xterm-256color", ""},
  };
  for (const Offer& offer : offers) {
    SCOPED_TRACE(offer.scenario);
    LoadScenario(offer.scenario);
    Operator terminal({.term = offer.term});
    std::string grey;
    for (int y = 4; y < 22; ++y) {
      const std::string row = terminal.Row(y).substr(3, 35);
      if (terminal.At(3, y).fg == DARK_GREY) grey += row.substr(0, row.find("  ")) + ",";
    }
    EXPECT_EQ(grey, offer.greyRows);
    // A terminal that is neither a console of the host nor an X terminal has no keyboard here.
    EXPECT_EQ(terminal.Picture().find("Configure Keyboard") != std::string::npos,
              strcmp(offer.term, "linux") == 0);
  }
}

struct NetworkCase {
  const char* scenario;
  const char* patch;
  const char* text;
};

TEST(Menu, OutlivesAHostThatFailsMeanwhile) {
  LoadScenario("sample");
  Operator terminal;
  LoadScenario("sample", R"({"faults": [
      {"operation": "NetworkInfoImpl::IsCoreIpv6Enabled", "message": "Gone."}]})");
  terminal.GoTo("Configure Management Network");
  EXPECT_EQ(terminal.RightPane(10), "IPv6 Addresses:");
  EXPECT_EQ(terminal.RightPane(11), "Unknown");
}

TEST(Menu, TellsTheNetworkInBrief) {
  const NetworkCase cases[] = {
      {"dhcp", "",
       "rack7||IPv4 Address:|192.0.2.77||Network identity acquired from DHCP|server 192.0.2.2||"},
      {"ipv4-none", "", "rack7||IPv4 Address:|Not set||To view or modify this host's|"},
      {"network-unknown", "",
       "Unknown||IPv4 Address:|Unknown||IPv6 Addresses:|Unknown||To view or modify this host's|"},
      {"ipv6-many", "",
       "|192.0.2.20||IPv6 Addresses:|2001:db8::20/64|2001:db8:0:1:fc:ff:fe00:1/64|...||To view"},
      {"ipv6-many",
       R"({"network": {"kernelNics": {"core0": {"running": {"ipv6": [
           {"address": "2001:db8::1/64"}, {"address": "2001:db8::2/64"},
           {"address": "2001:db8::3/64"}]}}}}})",
       "|IPv6 Addresses:|2001:db8::1/64|2001:db8::2/64|2001:db8::3/64||To view"},
  };
  for (const NetworkCase& network : cases) {
    SCOPED_TRACE(network.text);
    LoadScenario(network.scenario, network.patch);
    Operator terminal;
    terminal.GoTo("Configure Management Network");
    std::string text;
    for (int y = 5; y < 22; ++y) text += terminal.RightPane(y) + "|";
    EXPECT_NE(text.find(network.text), std::string::npos) << text;
  }
}

TEST(SupportPages, AreLeafed) {
  const std::pair<std::string, const char*> keys[] = {
      {"", "1/3 6/2*16 6/7*3 6/7*16 Halden Systems support"},
      {PAGE_UP, "1/3 6/2*16 6/7*3 6/7*16 Halden Systems support"},
      {PAGE_DOWN, "2/3 6/7*16 6/7*3 6/7*16 BIOS: HBIOS"},
      {PAGE_DOWN, "3/3 6/7*16 6/7*3 6/2*16  # This line is no comment."},
      {PAGE_DOWN, "3/3 6/7*16 6/7*3 6/2*16  # This line is no comment."},
      {PAGE_UP, "2/3 6/7*16 6/7*3 6/7*16 BIOS: HBIOS"},
  };
  LoadScenario("support-pages");
  Operator terminal;
  terminal.GoTo("View Support Information");
  const auto colour = [&](int x) {
    const Cell cell = terminal.At(x, 4);
    return std::to_string(cell.bg) + "/" + std::to_string(cell.fg) + "*16 ";
  };
  for (const auto& [key, shown] : keys) {
    SCOPED_TRACE(shown);
    if (!key.empty()) terminal.Press({key});
    EXPECT_EQ(terminal.Row(4).substr(42, 35),
              "<Page Up>       " + std::string(shown, 3) + "     <Page Down>");
    const std::string first = terminal.Row(5).substr(42, 36);
    EXPECT_EQ((std::string(shown, 3) + " " + colour(42) + "6/7*3 " + colour(66) + first)
                  .substr(0, strlen(shown)),
              shown);
  }
  terminal.Press({UP});
  terminal.Press({DOWN});
  EXPECT_NE(terminal.Row(4).find("1/3"), std::string::npos);
}

TEST(SupportPages, EndWithWhatWasGathered) {
  const std::pair<const char*, const char*> files[] = {
      {"", "1/1"}, {"#\n$ a\n\n$\n", "1/3"}, {"a\n$\nlast", "1/2"}};
  for (const auto& [content, header] : files) {
    SCOPED_TRACE(content);
    LoadScenario("support-pages");
    WriteFile("/etc/halvren/support", content);
    Operator terminal;
    terminal.GoTo("View Support Information");
    EXPECT_EQ(terminal.Row(4).substr(58, 3), header);
  }
}

TEST(Menu, IsRefreshedByItsSignal) {
  LoadScenario("static");
  Operator terminal;
  terminal.GoTo("Configure Keyboard");
  SetState(R"({"host": {"keyboard": {"configured": "Greek"}}})");
  terminal.Signal(SIGUSR1);
  terminal.WaitUntil([&] { return terminal.RightPane(4) == "Greek"; }, "the new layout");
}

// The digits follow the list on the screen, in which the log that does not exist has no number.
TEST(LogViewer, HandsTheTerminalToThePager) {
  LoadScenario("logs");
  Operator terminal({.term = "xterm-256color"});
  const std::string password = terminal.Picture();
  terminal.Press({"6"});
  EXPECT_EQ(terminal.Picture(), password);
  terminal.GoTo("View System Logs");
  const std::string menu = terminal.Picture();
  const termios modes = terminal.Modes();
  for (const char* const ignored : {"0", "7", "8", "9"}) terminal.Press({ignored});
  EXPECT_EQ(terminal.Picture(), menu);
  terminal.Type("6");
  terminal.WaitFor("<Q> Quit </> RegExp Search <H> Help");
  EXPECT_NE(terminal.Row(0).find("notaryd: line 1 of this log"), std::string::npos);
  // The console gets neither of these.
  terminal.Type("F");
  terminal.WaitFor("Waiting for data");
  terminal.Type("\x03");
  terminal.WaitFor("<Q> Quit");
  terminal.Signal(SIGUSR1);
  terminal.Type("Q");
  terminal.WaitForPicture(menu);
  terminal.Settle();
  EXPECT_EQ(terminal.Colours(4), "3/7*3 3/0*35 3/7*2 6/7*6 6/2*32 6/7*2");
  EXPECT_FALSE(terminal.CursorVisible());
  EXPECT_TRUE(terminal.OnAlternateScreen());
  const termios after = terminal.Modes();
  EXPECT_EQ(after.c_iflag, modes.c_iflag);
  EXPECT_EQ(after.c_oflag, modes.c_oflag);
  EXPECT_EQ(after.c_lflag, modes.c_lflag);
  terminal.Press({DOWN});
  EXPECT_EQ(terminal.RightPane(1), "View Support Information");
}

TEST(LogViewer, ComesBackWhenThePagerCannotStart) {
  LoadScenario("pager-fails");
  Operator terminal;
  terminal.GoTo("View System Logs");
  const std::string menu = terminal.Picture();
  terminal.Press({"1"});
  terminal.WaitForPicture(menu);
  EXPECT_FALSE(terminal.HasEnded());
}

// What the pager was told reaches the console when it is over.
TEST(LogViewer, ActsOnWhatCameMeanwhile) {
  const std::pair<std::function<void(Terminal&)>, const char*> events[] = {
      {[](Terminal& terminal) { terminal.Resize(100, 30); }, "TARNEL: Resized window to 100x30"},
      {[](Terminal& terminal) { terminal.Signal(SIGTERM); }, ""},
  };
  LoadScenario("logs");
  for (const auto& [event, line] : events) {
    SCOPED_TRACE(line);
    Operator terminal;
    const Log log;
    terminal.GoTo("View System Logs");
    terminal.Type("2");
    terminal.WaitFor("<Q> Quit");
    event(terminal);
    terminal.Settle();
    EXPECT_FALSE(terminal.HasEnded());
    EXPECT_TRUE(log.Lines().empty());
    terminal.Type("Q");
    EXPECT_EQ(terminal.WaitForEnd(), 0);
    EXPECT_TRUE(terminal.ModesAreRestored());
    if (*line != '\0') {
      EXPECT_EQ(log.Lines(), std::vector<LogLine>({{"user.info", line}}));
    }
  }
}

struct DialogCase {
  const char* scenario;
  const char* keys;
  const char* pane;  // the right pane afterwards
  const char* level;
  const char* line;         // what is logged, if anything
  const char* lastInTrace;  // what was done to the host at last
};

void ExpectDialogCase(const char* title, const DialogCase& dialog) {
  SCOPED_TRACE(std::string(dialog.scenario) + " " + dialog.line);
  LoadScenario(dialog.scenario);
  Operator terminal;
  terminal.GoTo(title);
  const Log log;
  terminal.Type(ENTER);
  terminal.WaitFor("Toggle Selected");
  terminal.Settle();
  for (const char* key = dialog.keys; *key != '\0'; ++key) {
    terminal.Press({*key == 'v' ? DOWN : std::string(1, *key)});
  }
  terminal.WaitUntil([&] { return terminal.At(42, 4).fg == WHITE; }, "the menu");
  terminal.WaitUntil(
      [&] { return TraceLines().back().find(dialog.lastInTrace) != std::string::npos; },
      dialog.lastInTrace);
  terminal.WaitUntil([&] { return terminal.RightPane(4) == dialog.pane; }, dialog.pane);
  EXPECT_EQ(terminal.RightPane(1), title);
  for (const LogLine& line : log.Lines()) {
    const bool known = line.text.find("stew-cmd invocation") != std::string::npos ||
                       line == LogLine{dialog.level, dialog.line};
    EXPECT_TRUE(known) << line.text;
  }
  EXPECT_EQ(log.Contains({dialog.level, dialog.line}), *dialog.line != '\0');
}

TEST(Lockdown, IsAskedOfTheAgent) {
  constexpr char IS_ENABLED[] = "lockdown_is_enabled";
  const DialogCase cases[] = {
      {"static", " \r", "Enabled", "user.info", "TARNEL: Lockdown mode enabled", IS_ENABLED},
      {"lockdown-on", " \r", "Disabled", "user.info", "TARNEL: Lockdown mode disabled", IS_ENABLED},
      {"static", " \x1b", "Disabled", "", "", IS_ENABLED},
      {"lockdown-on", "  \r", "Enabled", "", "", IS_ENABLED},
      {"agent-fails", " \r", "Disabled", "user.err",
       "TARNEL: Enabling lockdown mode failed with error: The agent is busy.", IS_ENABLED},
  };
  for (const DialogCase& dialog : cases) ExpectDialogCase("Configure Lockdown Mode", dialog);
}

TEST(Keyboard, IsTheButtonThatIsOn) {
  const DialogCase cases[] = {
      {"static", "v \r", "Brazilian", "user.info", "TARNEL: Keyboard Layout changed to Brazilian",
       "LoadKeyboardMappings \"Brazilian\""},
      {"static", "vv\r", "US Default", "user.info", "TARNEL: Keyboard Layout changed to US Default",
       "LoadKeyboardMappings \"US Default\""},
      {"no-layout-match", "v\r", "Belgian", "user.info",
       "TARNEL: Keyboard Layout changed to Belgian", "LoadKeyboardMappings \"Belgian\""},
      {"static", "v \x1b", "US Default", "", "", "stew-cmd"},
  };
  for (const DialogCase& dialog : cases) ExpectDialogCase("Configure Keyboard", dialog);
}

TEST(Keyboard, EndsTheConsoleWhenTheHostFails) {
  LoadScenario("keyboard-fails");
  Operator terminal;
  terminal.GoTo("Configure Keyboard");
  const Log log;
  terminal.Press({ENTER});
  terminal.Type(ENTER);
  terminal.WaitForEnd();
  log.WaitFor({"user.err", "TARNEL: TARNEL aborted by exception: The layout cannot be stored."});
}

TEST(Timeout, LogsOutOfEveryDepth) {
  LoadScenario("static");
  for (const char* const keys : {"", "\r", "\rx\r"}) {
    SCOPED_TRACE(keys);
    Operator terminal({.environment = ClockTimes(200)});
    const Log log;
    for (const char* key = keys; *key != '\0'; ++key) terminal.Press({std::string(1, *key)});
    terminal.WaitUntil([&] { return terminal.Colours(1) == "0/6*80"; }, "the dimmed screen");
    terminal.WaitFor("<F2> Customize");
    terminal.WaitUntil([&] { return terminal.At(1, 1).bg == DARK_GREY; }, "the colours");
    EXPECT_FALSE(terminal.CursorVisible());
    EXPECT_FALSE(log.Contains({"user.info", "TARNEL: User root logged out."}));
    // Nobody is logged in any more.
    terminal.Signal(SIGUSR2);
    EXPECT_EQ(terminal.WaitForEnd(), 0);
  }
}

}  // namespace

}  // namespace Tarnel::Testing
