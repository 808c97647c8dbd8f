// How the process starts and ends, seen from its terminal, its log and its files.

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>

#include "tests/e2e/welcome_picture.h"
#include "tests/support/lab.h"
#include "tests/support/terminal.h"

namespace Tarnel::Testing {

namespace {

constexpr char PID_FILE[] = "/var/run/tarnel.pid";
constexpr char READY[] = "<F12> Shut Down/Restart";

class Process : public testing::Test {
 protected:
  Process() {
    std::filesystem::remove_all(PID_FILE);
    LoadScenario("static");
  }

  static bool Logged(const Log& log, const std::string& part) {
    for (const LogLine& line : log.Lines()) {
      if (line.text.find(part) != std::string::npos) {
        return true;
      }
    }
    return false;
  }
};

TEST_F(Process, TellsTheLogThatItStarts) {
  const Log log;
  Terminal terminal;
  terminal.WaitFor(READY);
  log.WaitFor({"user.info", "TARNEL: Starting TARNEL"});
  EXPECT_EQ(log.Lines().size(), 1U) << LastLogLines(10);
}

struct SignalCase {
  int signal;
  const char* name;
};

TEST_F(Process, EndsOrderlyByEachSignal) {
  for (const auto& [signal, name] : {SignalCase{SIGTERM, "SIGTERM"}, SignalCase{SIGINT, "SIGINT"},
                                     SignalCase{SIGQUIT, "SIGQUIT"}, SignalCase{SIGUSR2, "SIGUSR2"},
                                     SignalCase{SIGWINCH, "SIGWINCH"}}) {
    Terminal terminal({.term = "xterm-256color"});
    terminal.WaitFor(READY);
    EXPECT_TRUE(terminal.OnAlternateScreen());
    EXPECT_FALSE(terminal.ModesAreRestored());
    terminal.Signal(signal);
    EXPECT_EQ(terminal.WaitForEnd(), 0) << name;
    EXPECT_TRUE(terminal.ModesAreRestored()) << name;
    EXPECT_FALSE(terminal.OnAlternateScreen()) << name;
    EXPECT_TRUE(terminal.CursorVisible()) << name;
    EXPECT_FALSE(terminal.PaletteWasReset()) << name;
  }
}

TEST_F(Process, EndsByTheInterruptKeyAndNotByTheSuspendKey) {
  Terminal terminal;
  terminal.WaitFor(READY);
  terminal.Type("\x1a");
  terminal.Settle();
  SetState(R"({"hardware": {"cpu": {"model": "Still here"}}})");
  terminal.Type(Keys::SPACE);
  terminal.WaitFor("Still here");
  terminal.Type("\x03");
  EXPECT_EQ(terminal.WaitForEnd(), 0);
}

struct ResizeCase {
  int columns;
  int rows;
  bool logged;
};

TEST_F(Process, EndsByAResizeAndTellsTheSize) {
  for (const auto& [columns, rows, logged] :
       {ResizeCase{100, 30, true}, ResizeCase{80, 0, false}, ResizeCase{0, 30, false}}) {
    const Log log;
    Terminal terminal;
    terminal.WaitFor(READY);
    terminal.Resize(columns, rows);
    EXPECT_EQ(terminal.WaitForEnd(), 0);
    EXPECT_EQ(Logged(log, "Resized window to 100x30"), logged);
    EXPECT_EQ(Logged(log, "Resized"), logged);
  }
  Terminal terminal;
  terminal.WaitFor(READY);
  terminal.Type("\x1bR");
  EXPECT_EQ(terminal.WaitForEnd(), 0);
}

TEST_F(Process, EndsWhenItsTerminalIsGone) {
  Terminal terminal;
  terminal.WaitFor(READY);
  terminal.HangUp();
  EXPECT_EQ(terminal.WaitForEnd(), 0);
}

TEST_F(Process, IsAbortedByAHostThatDoesNotAnswer) {
  LoadScenario("host-dead");
  const Log log;
  Terminal terminal({.term = "xterm-256color"});
  EXPECT_EQ(terminal.WaitForEnd(), 0);
  log.WaitFor({"user.err", "TARNEL: TARNEL aborted by exception: The host does not answer."});
  EXPECT_TRUE(terminal.PaletteWasReset());
  EXPECT_TRUE(terminal.ModesAreRestored());
  EXPECT_FALSE(terminal.OnAlternateScreen());
}

struct ArgumentCase {
  const char* argument;
  bool valid;
};

TEST_F(Process, TakesAVirtualTerminalFrom1To63) {
  for (const auto& [argument, valid] :
       {ArgumentCase{"1", true}, ArgumentCase{"63", true}, ArgumentCase{"5abc", true},
        ArgumentCase{"0", false}, ArgumentCase{"64", false}, ArgumentCase{"-1", false},
        ArgumentCase{"abc", false}, ArgumentCase{"", false}, ArgumentCase{"%s%n", false},
        ArgumentCase{"99999999999999999999", false}}) {
    const Log log;
    Terminal terminal({.arguments = {argument, "ignored"}});
    terminal.WaitFor(READY);
    EXPECT_EQ(terminal.Modes().c_cc[VSUSP] == 0, valid) << argument;
    log.WaitFor({"user.info", "TARNEL: Starting TARNEL"});
    const std::string complaint =
        std::string("tarnel: Invalid VT specified for TARNEL: ") + argument;
    // The log takes blanks at the end of a line away.
    const LogLine expected{"user.err", complaint.substr(0, complaint.find_last_not_of(' ') + 1)};
    EXPECT_EQ(Logged(log, "Invalid VT"), !valid) << argument;
    EXPECT_TRUE(valid || log.Contains(expected) || log.Contains({"user.err", complaint}))
        << LastLogLines(3);
  }
}

struct PidCase {
  std::string content;
  bool kept;
};

TEST_F(Process, PutsItsIdIntoTheFileUnlessAnotherLives) {
  for (const PidCase& row :
       {PidCase{"", false}, PidCase{"no number", false}, PidCase{"999999999", false},
        PidCase{"99999999999999999999", false}, PidCase{"-1", false}, PidCase{"0", false},
        PidCase{std::to_string(getpid()), true},
        PidCase{std::to_string(getpid()) + " x\n", true}}) {
    WriteFile(PID_FILE, row.content);
    const Log log;
    Terminal terminal;
    terminal.WaitFor(READY);
    EXPECT_EQ(ReadFile(PID_FILE), row.kept ? row.content : std::to_string(terminal.Pid()));
    EXPECT_EQ(log.Contains({"user.err",
                            "TARNEL: Attempt to run multiple TARNEL instances, not updating "
                            "/var/run/tarnel.pid"}),
              row.kept)
        << row.content;
    terminal.Signal(SIGTERM);
    EXPECT_EQ(terminal.WaitForEnd(), 0);
    EXPECT_TRUE(std::filesystem::exists(PID_FILE));
  }
}

TEST_F(Process, StartsWithoutAPidFileAndBesideAnother) {
  std::filesystem::create_directory(PID_FILE);
  {
    Terminal terminal;
    terminal.WaitFor(READY);
  }
  std::filesystem::remove(PID_FILE);
  Terminal first;
  first.WaitFor(READY);
  Terminal second;
  second.WaitFor(READY);
  EXPECT_EQ(ReadFile(PID_FILE), std::to_string(first.Pid()));
}

TEST_F(Process, EndsWithOneLogLineOnATerminalThatItCannotUse) {
  for (const std::string term : {"", "nosuch", "../linux"}) {
    const Log log;
    Terminal terminal({.term = term});
    EXPECT_NE(terminal.WaitForEnd(), -1);
    log.WaitFor({"user.err", "TARNEL: Terminal type \"" + term + "\" cannot be used"});
    EXPECT_EQ(log.Lines().size(), 2U) << LastLogLines(5);
    EXPECT_TRUE(terminal.ModesAreRestored());
    EXPECT_EQ(terminal.Output(), "");
  }
}

}  // namespace

}  // namespace Tarnel::Testing
