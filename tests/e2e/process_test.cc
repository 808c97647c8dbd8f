// How the process starts and ends, seen from its terminal, its log and its files.

#include <gtest/gtest.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>

#include "tests/support/lab.h"
#include "tests/support/terminal.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

constexpr char PID_FILE[] = "/var/run/tarnel.pid";
constexpr char READY[] = "<F12> Shut Down/Restart";
const LogLine STARTING = {"user.info", "TARNEL: Starting TARNEL"};

class Process : public testing::Test {
 protected:
  static void SetUpTestSuite() { LoadScenario("static"); }

  Process() { std::filesystem::remove_all(PID_FILE); }

  // The log has these lines since then and no other.
  static void ExpectLog(const Log& log, const std::vector<LogLine>& lines) {
    log.WaitFor(lines.back());
    EXPECT_EQ(log.Lines(), lines) << LastLogLines(5);
  }
};

struct Ending {
  const char* name;
  std::function<void(Terminal&)> cause;
  const char* size;  // what is logged, if anything
};

const Ending ENDINGS[] = {
    {"SIGTERM", [](Terminal& terminal) { terminal.Signal(SIGTERM); }, ""},
    {"SIGUSR2", [](Terminal& terminal) { terminal.Signal(SIGUSR2); }, ""},
    {"SIGWINCH", [](Terminal& terminal) { terminal.Signal(SIGWINCH); }, "80x25"},
    {"a new size", [](Terminal& terminal) { terminal.Resize(100, 30); }, "100x30"},
    {"no columns", [](Terminal& terminal) { terminal.Resize(0, 30); }, ""},
    {"no rows", [](Terminal& terminal) { terminal.Resize(80, 0); }, ""},
    {"the resize key", [](Terminal& terminal) { terminal.Type("\033R"); }, "80x25"},
    {"the interrupt key", [](Terminal& terminal) { terminal.Type("\x03"); }, ""},
};

TEST_F(Process, EndsOrderly) {
  for (const auto& [name, cause, size] : ENDINGS) {
    SCOPED_TRACE(name);
    const Log log;
    Terminal terminal({.term = "xterm-256color"});
    terminal.WaitFor(READY);
    EXPECT_TRUE(terminal.OnAlternateScreen());
    EXPECT_FALSE(terminal.ModesAreRestored());
    cause(terminal);
    EXPECT_EQ(terminal.WaitForEnd(), 0);
    EXPECT_TRUE(terminal.ModesAreRestored());
    EXPECT_FALSE(terminal.OnAlternateScreen());
    EXPECT_TRUE(terminal.CursorVisible());
    EXPECT_FALSE(terminal.PaletteWasReset());
    std::vector<LogLine> lines = {STARTING};
    if (*size != '\0') {
      lines.push_back({"user.info", std::string("TARNEL: Resized window to ") + size});
    }
    ExpectLog(log, lines);
  }
}

TEST_F(Process, EndsWhenItsTerminalIsGone) {
  Terminal terminal;
  terminal.WaitFor(READY);
  terminal.HangUp();
  EXPECT_EQ(terminal.WaitForEnd(), 0);
}

TEST_F(Process, IsNotStoppedByTheSuspendKey) {
  Terminal terminal;
  terminal.WaitFor(READY);
  terminal.Settle();
  const size_t before = terminal.Output().size();
  terminal.Type("\x1a");
  terminal.Settle();
  EXPECT_EQ(terminal.Output().size(), before);
  terminal.Type(SPACE);
  terminal.WaitUntil([&] { return terminal.Output().size() > before; }, "the picture");
}

TEST_F(Process, TakesAVirtualTerminalFrom1To63) {
  const std::pair<std::string, bool> rows[] = {
      {"1", true},   {"63", true},  {"5abc", true},  {"0", false},
      {"64", false}, {"-1", false}, {"%s%n", false}, {"99999999999999999999", false}};
  for (const auto& [argument, valid] : rows) {
    SCOPED_TRACE(argument);
    const Log log;
    Terminal terminal({.arguments = {argument, "ignored"}});
    terminal.WaitFor(READY);
    EXPECT_EQ(terminal.Modes().c_cc[VSUSP] == 0, valid);
    std::vector<LogLine> lines = {STARTING};
    if (!valid) {
      lines.insert(lines.begin(),
                   {"user.err", "tarnel: Invalid VT specified for TARNEL: " + argument});
    }
    ExpectLog(log, lines);
  }
}

TEST_F(Process, PutsItsIdIntoTheFileUnlessAnotherLives) {
  const std::pair<std::string, bool> rows[] = {
      {"no number", false}, {"999999999", false}, {"99999999999999999999", false},
      {"-1", false},        {"0", false},         {std::to_string(getpid()) + " x\n", true}};
  for (const auto& [content, kept] : rows) {
    SCOPED_TRACE(content);
    WriteFile(PID_FILE, content);
    const Log log;
    {
      Terminal terminal;
      terminal.WaitFor(READY);
      EXPECT_EQ(ReadFile(PID_FILE), kept ? content : std::to_string(terminal.Pid()));
    }
    EXPECT_TRUE(std::filesystem::exists(PID_FILE));
    EXPECT_EQ(log.Contains({"user.err",
                            "TARNEL: Attempt to run multiple TARNEL instances, not updating "
                            "/var/run/tarnel.pid"}),
              kept);
  }
}

TEST_F(Process, StartsWithoutAPidFile) {
  std::filesystem::create_directory(PID_FILE);
  Terminal terminal;
  terminal.WaitFor(READY);
}

TEST_F(Process, EndsWithOneLogLineOnATerminalThatItCannotUse) {
  for (const std::string term : {"", "nosuch", "../linux"}) {
    const Log log;
    Terminal terminal({.term = term});
    EXPECT_EQ(terminal.WaitForEnd(), 1);
    ExpectLog(log,
              {STARTING, {"user.err", "TARNEL: Terminal type \"" + term + "\" cannot be used"}});
    EXPECT_TRUE(terminal.ModesAreRestored());
    EXPECT_EQ(terminal.Output(), "");
  }
}

TEST(ProcessOnAHostThatDoesNotAnswer, IsAborted) {
  LoadScenario("host-dead");
  const Log log;
  Terminal terminal({.term = "xterm-256color"});
  EXPECT_EQ(terminal.WaitForEnd(), 0);
  log.WaitFor({"user.err", "TARNEL: TARNEL aborted by exception: The host does not answer."});
  EXPECT_TRUE(terminal.PaletteWasReset());
  EXPECT_TRUE(terminal.ModesAreRestored());
  EXPECT_FALSE(terminal.OnAlternateScreen());
}

}  // namespace

}  // namespace Tarnel::Testing
