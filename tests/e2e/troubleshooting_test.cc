// An operator switches the shell and SSH, sets the timeouts and restarts the agents.

#include <gtest/gtest.h>
#include <sys/resource.h>

#include <fstream>
#include <optional>

#include "tests/support/lab.h"
#include "tests/support/terminal.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

using std::string;

constexpr char TITLE[] = "Troubleshooting Mode Options";
constexpr char CHANGE_HINT[] = "<Enter> Change";
constexpr char CANCEL[] = "<Esc> Cancel";
constexpr char RESTART_HINT[] = "<Enter> Restart";
constexpr char INVALID[] = "Timeout value must be between 0 (disabled) and 1440 minutes";

void Erase(string& text, const string& part) {
  if (const size_t place = text.find(part); place != string::npos) text.erase(place, part.size());
}

// One login and one console for all cases of a test; each case starts on a host of its own.
class TroubleshootingTest : public testing::Test {
 protected:
  TroubleshootingTest() {
    LoadScenario("sample");
    // Else a key that comes soon after Esc belongs to it.
    _terminal.emplace(Launch{.environment = {"ESCDELAY=20"}});
    Screen().WaitFor("Halden Core 6214 CPU");
    Press({F2, "root", "\tlaboratory\r"});
    Screen().WaitFor("System Customization");
    Screen().Settle();
    Press({DOWN + DOWN + DOWN + DOWN + DOWN + DOWN + DOWN});
    Screen().WaitFor("To view various troubleshooting");
  }

  void Open(const string& scenario, const string& patch) {
    LoadScenario(scenario, patch);
    _log.emplace();
    Press({ENTER});
    Screen().WaitFor(TITLE);
    Screen().Settle();
    _traceStart = TraceLines().size();
  }

  // A frame that comes drops the keys that were typed before.
  void Press(const std::vector<string>& keys) {
    for (const string& key : keys) {
      Screen().Type(key);
      Screen().Settle();
    }
  }

  // Presses a key that leaves the window with this text.
  void Leave(const string& key, const string& text) {
    Screen().Type(key);
    Screen().WaitUntil([&] { return Screen().Picture().find(text) == string::npos; },
                       "the end of \"" + text + "\"");
    Screen().Settle();
  }

  // What happened to the host since the screen was opened: programs without their paths, each line
  // without what goes without saying.
  string Trace() const {
    string trace;
    const std::vector<string> lines = TraceLines();
    for (size_t i = _traceStart; i < lines.size(); ++i) {
      string line = lines[i];
      if (line.starts_with("program ")) line.erase(0, line.find(' ', sizeof "program ") + 1);
      for (const char* part : {"/etc/init.d/", "/sbin/", "stew-cmd -U ", "hostsvc/", "/UserVars/",
                               " system settings advanced set -o"}) {
        Erase(line, part);
      }
      trace += line + "\n";
    }
    return trace;
  }

  // The console's lines since the screen was opened, with their levels.
  string LogLines() const {
    string text;
    for (const LogLine& line : _log->Lines()) {
      if (line.text.starts_with("TARNEL: ") && line.text.find("COLS=") == string::npos) {
        text += line.level.substr(line.level.find('.') + 1) + line.text.substr(7) + "\n";
      }
    }
    return text;
  }

  // Leaves the screen when the host saw and heard this.
  void ExpectAndClose(const string& trace, const string& log) {
    EXPECT_EQ(Trace(), trace);
    Screen().WaitUntil([&] { return LogLines() == log; }, "these log lines:\n" + log);
    EXPECT_EQ(LogLines(), log);
    EXPECT_FALSE(Screen().CursorVisible());
    Leave(ESC, TITLE);
  }

  Terminal& Screen() { return *_terminal; }

 private:
  std::optional<Terminal> _terminal;
  std::optional<Log> _log;
  size_t _traceStart = 0;
};

struct Case {
  const char* scenario;
  const char* patch;
  string keys;
  string trace;
  string log;
};

constexpr char REFUSED[] = "info Unable to execute command stew-cmd hostsvc/";
constexpr char BY_TARNEL[] = " using user root. Using user tarnel\n";
constexpr char START_FAILED[] = "warn Unable to run stew-cmd to start/stop ";
constexpr char ENABLE_FAILED[] = "warn Unable to run stew-cmd to enable/disable ";
constexpr char SSH_FAILED[] =
    "warn Unable to run stew-cmd to start/stop ssh\n"
    "warn Unable to run stew-cmd to enable/disable ssh\n";

TEST_F(TroubleshootingTest, SwitchesServicesByTheAgentElseByTheirScripts) {
  const Case cases[] = {
      {"sample", "{}", ENTER, "root start_ostrel_shell\nroot enable_ostrel_shell\n",
       "info User root enabled Ostrel Shell\n"},
      {"ssh-on", "{}", DOWN + ENTER, "root stop_ssh\nroot disable_ssh\n",
       "info User root disabled SSH\n"},
      {"stewcmd-255", "{}", ENTER,
       "root start_ostrel_shell\ntarnel start_ostrel_shell\n"
       "root enable_ostrel_shell\ntarnel enable_ostrel_shell\n",
       string(REFUSED) + "start_ostrel_shell" + BY_TARNEL + REFUSED + "enable_ostrel_shell" +
           BY_TARNEL + "info User root enabled Ostrel Shell\n"},
      {"agent-refuses", R"({"services": {"OstrelShell": {"running": true}}})", ENTER,
       "root stop_ostrel_shell\nOstrelShell stop\nroot disable_ostrel_shell\n",
       string(START_FAILED) + "Ostrel Shell\n" + ENABLE_FAILED +
           "Ostrel Shell\ninfo User root disabled Ostrel Shell\n"},
      {"agent-refuses", "{}", DOWN + ENTER,
       "root start_ssh\nSSH start\nFirewallRuleset::Enable sshServer\nroot enable_ssh\n",
       string(SSH_FAILED) + "info User root enabled SSH\n"},
      {"agent-refuses",
       R"({"services": {"SSH": {"running": true}},
           "programs": {"/etc/init.d/SSH": [{"args": ["stop"], "exit": 1}]},
           "faults": [{"operation": "FirewallRuleset::Disable", "message": "rules are locked"}]})",
       DOWN + ENTER,
       "root stop_ssh\nSSH stop\nFirewallRuleset::Disable sshServer\nroot disable_ssh\n",
       string(START_FAILED) +
           "ssh\nwarn Failed to update firewall sshServer ruleset status: rules are locked\n" +
           ENABLE_FAILED + "ssh\ninfo User root disabled SSH\n"},
      {"agent-refuses", R"({"network": {"rulesets": {"sshServer": {"follows": false}}}})",
       DOWN + ENTER, "root start_ssh\nSSH start\nroot enable_ssh\n",
       string(SSH_FAILED) + "info User root enabled SSH\n"},
      {"agent-refuses", R"({"network": {"rulesets": {"sshServer": null}}})", DOWN + ENTER,
       "root start_ssh\nSSH start\nroot enable_ssh\n",
       string(SSH_FAILED) + "info User root enabled SSH\n"},
  };
  for (const auto& [scenario, patch, keys, trace, log] : cases) {
    SCOPED_TRACE(scenario + (patch + keys));
    Open(scenario, patch);
    Press({keys});
    const bool on = log.find(" enabled ") != string::npos;
    const string service = log.find("SSH") != string::npos ? "SSH" : "Ostrel Shell";
    Screen().WaitFor((on ? "Disable " : "Enable ") + service);
    Screen().WaitFor(service + (on ? " is Enabled" : " is Disabled"));
    ExpectAndClose(trace, log);
  }
}

TEST_F(TroubleshootingTest, OffersTheTimeoutsWhileBothServicesAreOff) {
  struct Offer {
    const char* scenario;
    std::vector<string> keys;
    bool offered;
  };
  constexpr int ROW = 6;
  constexpr int DARK_GREY = 6;
  const Offer cases[] = {
      {"shell-on", {}, false},
      {"shell-on", {ENTER}, true},
      {"shell-on", {ENTER, DOWN + ENTER}, false},
      {"ssh-on", {ENTER}, false},
      {"ssh-on", {ENTER, DOWN + ENTER}, true},
  };
  for (const auto& [scenario, keys, offered] : cases) {
    SCOPED_TRACE(scenario + std::to_string(keys.size()));
    Open(scenario, R"({"services": {"OstrelShell": {"running": true}}})");
    for (const string& key : keys) {
      const size_t before = LogLines().size();
      Screen().Type(key);
      Screen().WaitUntil([&] { return LogLines().size() > before; }, "the switch");
      Screen().Settle();
    }
    EXPECT_EQ(Screen().At(5, ROW).fg != DARK_GREY, offered) << Screen().Picture();
    Leave(ESC, TITLE);
  }
}

TEST_F(TroubleshootingTest, ActsByThePlaceOfARow) {
  Open("ssh-on", "{}");
  Press({DOWN + DOWN + ENTER});
  Screen().WaitFor("Set idle timeout for TARNEL access");
  Leave(ESC, CANCEL);
  Press({DOWN});
  Screen().WaitFor(RESTART_HINT);
  Press({ENTER});
  Screen().WaitFor("Restart Management Agents: Confirm");
  Press({" "});
  Leave(ESC, CANCEL);
  // The hint of a screen that was drawn anew stands until the focus moves.
  Screen().WaitFor(CHANGE_HINT);
  Press({DOWN});
  Screen().WaitFor(RESTART_HINT);
  ExpectAndClose("", "");
}

constexpr char TEN_AND_TWO_MINUTES[] =
    R"({"options": {"advanced": {"/UserVars/OstrelShellTimeOut": {"value": 600},
                                 "/UserVars/OstrelShellInteractiveTimeOut": {"value": 120}}}})";

TEST_F(TroubleshootingTest, SetsTheTimeouts) {
  const string read =
      "ostrelcfg-advcfg -q -g OstrelShellTimeOut\n"
      "ostrelcfg-advcfg -q -g OstrelShellInteractiveTimeOut\n";
  const string status = "OstrelShell status\nSSH status\n";
  const string shell = DOWN + DOWN + ENTER;
  const string own = DOWN + DOWN + DOWN + ENTER;
  const string setOwn = "AdvancedIntegerOption::SetValue TarnelTimeOut ";
  // Started behind the window's back.
  const char* const sshStarted =
      R"({"programs": {"/etc/init.d/SSH": [{"args": ["status"], "fromCall": 2, "exit": 0}]}})";
  const char* const negative =
      R"({"options": {"advanced": {"/UserVars/OstrelShellTimeOut": {"value": -60}}}})";
  const Case cases[] = {
      {"sample", TEN_AND_TWO_MINUTES, shell, read, ""},
      {"sample", negative, shell, read, ""},
      {"sample", TEN_AND_TWO_MINUTES, shell + "\x7f", read, ""},
      {"sample", TEN_AND_TWO_MINUTES, shell + "10" + DOWN + "2", read, ""},
      {"sample", TEN_AND_TWO_MINUTES, shell + "1440",
       read + "ostrelcli OstrelShellTimeOut -i 86400\n" + status,
       "info Modified Shell timeout to 1440 minutes\n"},
      {"sample", TEN_AND_TWO_MINUTES, shell + "1441" + DOWN + "x3",
       read + "ostrelcli OstrelShellInteractiveTimeOut -i 180\n",
       "info Modified shell interactive timeout to 3 minutes\n"},
      {"sample", TEN_AND_TWO_MINUTES, shell + "99999999999999999999", read, ""},
      {"cli-fails", TEN_AND_TWO_MINUTES, shell + "0" + DOWN + "0",
       read + "ostrelcli OstrelShellTimeOut -i 0\nnodecli OstrelShellTimeOut -i 0\n" + status +
           "ostrelcli OstrelShellInteractiveTimeOut -i 0\n"
           "nodecli OstrelShellInteractiveTimeOut -i 0\n",
       "info Disabled Shell timeout\ninfo Disabled shell interactive timeout\n"},
      {"sample", sshStarted, shell + "5",
       read + "ostrelcli OstrelShellTimeOut -i 300\n" + status + "SSH restart\n",
       "info Modified Shell timeout to 5 minutes\n"},
      {"sample", "{}", own, "", ""},
      {"sample", "{}", own + "\x7f", "", ""},
      {"sample", "{}", own + "1441", "", ""},
      {"sample", "{}", own + "1440", setOwn + "\"86400\"\n",
       "info Modified Tarnel timeout to 1440 minutes\n"},
      {"idle-90-seconds", "{}", own, setOwn + "\"60\"\n",
       "info Modified Tarnel timeout to 1 minutes\n"},
      {"sample", "{}", own + "0", setOwn + "\"0\"\n", "info Disabled Tarnel timeout\n"},
  };
  for (const auto& [scenario, patch, keys, trace, log] : cases) {
    SCOPED_TRACE(scenario + (patch + keys));
    Open(scenario, patch);
    const size_t opened = keys.find(ENTER) + 1;
    Press({keys.substr(0, opened)});
    Screen().WaitFor(CANCEL);
    Screen().Settle();
    Press({keys.substr(opened)});
    if (keys.find("1441") != string::npos || keys.find("99") != string::npos) {
      Press({ENTER});
      Screen().WaitFor(INVALID);
      Screen().Settle();
    }
    Leave(ENTER, CANCEL);
    ExpectAndClose(trace, log);
  }
}

TEST_F(TroubleshootingTest, ShowsNoMinutesWhenTheyCannotBeRead) {
  Open("advcfg-fails", TEN_AND_TWO_MINUTES);
  Press({DOWN + DOWN + ENTER});
  Screen().WaitFor("[ 0     ]");
  EXPECT_TRUE(Screen().CursorVisible());
}

void LimitMemory(pid_t process, rlim_t bytes) {
  const rlimit limit = {bytes, RLIM_INFINITY};
  ASSERT_EQ(prlimit(process, RLIMIT_AS, &limit, nullptr), 0);
}

// The stack of one more thread does not fit, what a child needs does.
void ForbidThreads(pid_t process) {
  std::ifstream file("/proc/" + std::to_string(process) + "/statm");
  rlim_t pages = 0;
  file >> pages;
  LimitMemory(process, pages * static_cast<rlim_t>(getpagesize()) + (rlim_t{2} << 20));
}

TEST_F(TroubleshootingTest, RestartsTheAgents) {
  const char* const noThread = "no thread";
  const char* const coreCannotStart =
      R"({"programs": {"/sbin/corebacktrace": [{"noStart": true}]}})";
  // The agents stop only after the core was taken.
  const char* const slowStop =
      R"({"programs": {"/sbin/services.sh": [{"args": ["stop"], "delayMs": 1500}]}})";
  const string event =
      "NotaryUserLib_AddEvent \"@&!*@*@(notary.user.tarnel.restarting.hostagents)Restarting host "
      "agents\"\n";
  const string agents = "services.sh stop\nservices.sh start\n";
  const string core = "corebacktrace -w -n stewardd -o stewardd-restart% -d /var/log/\n";
  const string alert = "SystemInfoImpl::SetSystemAlert \"Stewardd core dump completed\"\n";
  const string begun = "info Restarting host agents\ninfo Initializing notaryuser library\n";
  const string executing = "info Executing corebacktrace -c against stewardd\n";
  // The trace is that of the core, whose lines may come at any place among the others.
  const Case cases[] = {
      {"sample", "{}", "  ", "", begun},
      {"sample", slowStop, " ", core + alert, begun + executing},
      {"core-fails", slowStop, " ", core,
       begun + executing + "err corebacktrace failed, probably stewardd was down\n"},
      {"sample", coreCannotStart, " ", core,
       begun + executing + "err /sbin/corebacktrace: No such file or directory\n"},
      {"sample", noThread, " ", "",
       begun +
           "err failed to create live core generation thread: Resource temporarily unavailable\n"},
  };
  for (const auto& [scenario, patch, keys, trace, log] : cases) {
    SCOPED_TRACE(scenario + string(patch));
    Open(scenario, patch == noThread ? "{}" : patch);
    Press({DOWN + DOWN + DOWN + DOWN + ENTER, ENTER + keys});
    Screen().WaitFor("Restart management agents now?");
    if (patch == noThread) ForbidThreads(Screen().Pid());
    Press({F11});
    Screen().WaitFor("<Enter> OK");
    LimitMemory(Screen().Pid(), RLIM_INFINITY);
    Press({ESC});
    Screen().WaitFor("Starting management agents. Done.");
    Screen().WaitFor("Stopping management agents. Done.");
    const bool started = log.find(executing) != string::npos;
    EXPECT_EQ(Screen().Picture().find("live core information. Done.") != string::npos, started);
    const string wanted = trace;
    Screen().WaitUntil([&] { return Trace().size() == (event + agents + wanted).size(); },
                       "the end of the core");
    string others = Trace();
    if (trace.find(core) != string::npos) Erase(others, core);
    if (trace.find(alert) != string::npos) Erase(others, alert);
    EXPECT_EQ(others, event + agents);
    Leave(ENTER, "management agents. Done.");
    Screen().WaitFor(CHANGE_HINT);
    ExpectAndClose(Trace(), log);
  }
}

}  // namespace

}  // namespace Tarnel::Testing
