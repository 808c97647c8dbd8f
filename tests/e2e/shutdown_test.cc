// An operator shuts the host down, restarts it, and resets it. The lab's host stays up for it.

#include <gtest/gtest.h>

#include <csignal>

#include "tests/support/lab.h"
#include "tests/support/terminal.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

constexpr char DIALOG[] = "[ ] Forcefully terminate running VMs";
constexpr char EVENT[] = "NotaryUserLib_AddEvent \"@&!*@*@(notary.user.tarnel.";

void LogIn(Terminal& terminal, const std::string& key) {
  terminal.WaitFor("Halden Core 6214 CPU");
  terminal.Type(key);
  terminal.WaitFor("<Esc> Cancel");
  terminal.Settle();
  terminal.Type("root\tlaboratory\r");
}

struct Way {
  std::string keys;
  const char* screen;
  const char* event;
  const char* powerOff;
  const char* command;
};

TEST(ShutdownDialog, StopsTheMachinesAndThenTheHost) {
  const Way ways[] = {
      {F2, "Shutdown in progress...", "shutdown.host)Shutting down host\"", "powerOffVms",
       "program /sbin/poweroff poweroff"},
      {std::string(SPACE) + F11, "Restart in progress...", "reboot.host)Rebooting host\"",
       "powerOffVms --terminate", "program /sbin/reboot reboot"},
  };
  for (const auto& [keys, screen, event, powerOff, command] : ways) {
    LoadScenario("host-stays-up");
    Terminal terminal;
    LogIn(terminal, F12);
    terminal.WaitFor(DIALOG);
    terminal.Type(ENTER);  // means nothing here
    terminal.Settle();
    terminal.Type(keys);
    terminal.WaitFor(screen);
    const std::vector<std::string> trace = {
        std::string(EVENT) + event,
        "program /bin/stew-cmd stew-cmd -U root hostsvc/autostartmanager/autostop",
        std::string("program /bin/powerOffVms ") + powerOff, command};
    terminal.WaitUntil([&] { return TraceLines() == trace; }, command);
    terminal.Type(std::string(ESC) + ENTER);
    terminal.Settle();
    terminal.WaitFor(screen);
  }
}

TEST(ShutdownDialog, ComesBackWhenNothingCanBeStarted) {
  LoadScenario("no-shell", R"({"notary": {"init": 5}})");
  const Log log;
  Terminal terminal;
  LogIn(terminal, F12);
  terminal.WaitFor(DIALOG);
  terminal.Type(std::string(SPACE) + F2);
  log.WaitFor(
      {"user.err", "TARNEL: Unable to initialize notaryuser library from TARNEL. Error code: 5"});
  terminal.WaitUntil([] { return GetState("/virtualMachines/1/running") == "false\n"; },
                     "no machine");
  terminal.Settle();
  terminal.WaitFor("[X] Forcefully terminate running VMs");
  terminal.WaitFor("<F11> Restart");
  const std::vector<LogLine> lines = log.Lines();
  EXPECT_EQ(lines[lines.size() - 3], (LogLine{"user.info", "TARNEL: Shutting down host"}));
  terminal.Type(ESC);
  terminal.WaitFor("Halden Core 6214 CPU");
}

TEST(RestoreDialog, ResetsTheHostAndRestartsItAtEnter) {
  LoadScenario("host-stays-up", R"({"hardware": {"cpu": {"packages": 4}}})");
  const Log log;
  Terminal terminal;
  LogIn(terminal, F2);
  terminal.WaitFor("<Up/Down> Select");
  for (int row = 0; row < 12; ++row) terminal.Type(DOWN);
  terminal.WaitFor("revert");
  terminal.Type(ENTER);
  terminal.WaitFor("Reset System Configuration now?");
  terminal.Type(ENTER);  // F11 alone confirms
  terminal.Settle();
  terminal.Type(F11);
  terminal.WaitFor("Default settings are restored.");
  terminal.Type(std::string(ESC) + F11);
  terminal.Settle();
  EXPECT_EQ(terminal.Picture().find("Reset System Configuration now?"), std::string::npos);
  EXPECT_EQ(GetState("/hardware/cpu/packages"), "1\n");
  EXPECT_EQ(TraceLines().back(),
            "program /sbin/firmwareConfig.sh /sbin/firmwareConfig.sh --reset-only");
  terminal.Type(ENTER);
  terminal.WaitUntil([] { return TraceLines().back() == "program /sbin/reboot reboot -f"; },
                     "the restart");
  terminal.Signal(SIGKILL);  // it waits for nothing else now
  EXPECT_TRUE(log.Contains({"user.info", "TARNEL: Restoring factory defaults"}));
}

}  // namespace

}  // namespace Tarnel::Testing
