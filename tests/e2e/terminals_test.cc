// The console on terminals of all types and sizes.

#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <csignal>
#include <random>
#include <sstream>

#include "tests/e2e/welcome_picture.h"
#include "tests/support/lab.h"
#include "tests/support/terminal.h"

namespace Tarnel::Testing {

namespace {

using std::chrono::milliseconds;
using std::chrono::steady_clock;

struct TypeCase {
  const char* term;
  bool colour;
};

void PrintTo(const TypeCase& row, std::ostream* out) { *out << row.term; }

class TerminalType : public testing::TestWithParam<TypeCase> {
 protected:
  static void ExpectLook(Terminal& terminal, bool colour) {
    EXPECT_EQ(terminal.Colours(1), colour ? "6/7*80" : "standout*80");
    EXPECT_EQ(terminal.Colours(5), colour ? "6/7*80" : "standout*80");
    EXPECT_EQ(terminal.Colours(12), colour ? "3/7*80" : "plain*80");
    EXPECT_EQ(terminal.Colours(13), colour ? "3/7*8 3/0*64 3/7*8" : "plain*80");
    EXPECT_EQ(terminal.Colours(22), colour ? "3/7*80" : "plain*80");
    EXPECT_EQ(terminal.Colours(23), colour ? "3/7*2 3/0*5 3/6*26 3/0*28 3/6*17 3/7*2" : "plain*80");
  }
};

TEST_P(TerminalType, ShowsTheSamePictureInColourOrWithout) {
  LoadScenario("static");
  const auto& [term, colour] = GetParam();
  Terminal terminal({.term = term});
  const std::string picture = WelcomePicture({.network = STATIC_NETWORK});
  terminal.WaitForPicture(picture);
  terminal.Settle();
  ExpectLook(terminal, colour);
  // F4 changes the look where there are colours.
  terminal.Type(
      "\x1b"
      "4");
  terminal.Settle();
  EXPECT_EQ(terminal.Picture(), picture);
  ExpectLook(terminal, false);
  terminal.Type(Keys::F4);
  terminal.Settle();
  EXPECT_EQ(terminal.Picture(), picture);
  ExpectLook(terminal, colour);
}

INSTANTIATE_TEST_SUITE_P(Types, TerminalType,
                         testing::Values(TypeCase{"linux", true}, TypeCase{"xterm-256color", true},
                                         TypeCase{"vt100", false}, TypeCase{"vt220", false},
                                         TypeCase{"xterm", false},
                                         TypeCase{"screen-256color", false}));

TEST(DumbTerminal, IsSurvived) {
  LoadScenario("static");
  Terminal terminal({.term = "dumb"});
  terminal.Settle();
  terminal.Type(Keys::SPACE);
  terminal.Settle();
  EXPECT_FALSE(terminal.HasEnded());
  terminal.Signal(SIGTERM);
  EXPECT_EQ(terminal.WaitForEnd(), 0);
}

struct SizeCase {
  int columns;
  int rows;
};

TEST(TerminalSize, IsFilledOrSurvived) {
  LoadScenario("dhcp-waiting");
  Welcome welcome{.network = {"Download tools to manage this host from:", "http://rack7/",
                              "http://169.254.17.4/ (Waiting for DHCP...)"}};
  for (const auto& [columns, rows] : {SizeCase{80, 24}, SizeCase{80, 28}, SizeCase{81, 27}}) {
    welcome.columns = columns;
    welcome.rows = rows;
    Terminal terminal({.columns = columns, .rows = rows});
    terminal.WaitForPicture(WelcomePicture(welcome));
  }
  // Below these sizes parts of the screen have no place.
  for (const auto& [columns, rows] : {SizeCase{40, 10}, SizeCase{2, 2}, SizeCase{1, 1},
                                      SizeCase{200, 1}, SizeCase{1, 60}, SizeCase{300, 100}}) {
    Terminal terminal({.columns = columns, .rows = rows});
    terminal.Settle();
    terminal.Type(std::string(Keys::SPACE) + Keys::F4 + Keys::F4);
    terminal.Settle();
    EXPECT_FALSE(terminal.HasEnded()) << columns << "x" << rows;
  }
}

TEST(TerminalOf29Lines, HasAPlaceForWarnings) {
  LoadScenario("audit");
  Terminal terminal({.columns = 80, .rows = 29});
  terminal.WaitFor("Warning: Host is running in audit mode. Your");
  EXPECT_EQ(terminal.Colours(23), "3/7*16 3/6*48 3/7*16");
}

struct EscapeCase {
  const char* term;
  std::vector<std::string> environment;
  milliseconds least;
  milliseconds most;
};

// Esc is a key like any other here and has the screen drawn.
TEST(LoneEscape, ActsAtOnceWhereNobodyTypesSequencesByHand) {
  using namespace std::chrono_literals;
  LoadScenario("static");
  for (const EscapeCase& row :
       {EscapeCase{"linux", {}, 0ms, 400ms}, EscapeCase{"xterm", {}, 0ms, 400ms},
        EscapeCase{"xterm", {"ESCDELAY=700"}, 600ms, 2000ms},
        EscapeCase{"vt220", {}, 700ms, 2500ms}}) {
    Terminal terminal({.term = row.term, .environment = row.environment});
    terminal.WaitForPicture(WelcomePicture({.network = STATIC_NETWORK}));
    terminal.Settle();
    const size_t before = terminal.Output().size();
    const auto start = steady_clock::now();
    terminal.Type(Keys::ESC);
    terminal.WaitUntil([&] { return terminal.Output().size() > before; }, "the picture");
    const auto time = steady_clock::now() - start;
    EXPECT_GE(time, row.least) << row.term;
    EXPECT_LE(time, row.most) << row.term;
  }
}

TEST(RandomKeys, AreSurvived) {
  LoadScenario("static");
  constexpr unsigned SEED = 20260;
  std::mt19937 random(SEED);
  Terminal terminal;
  terminal.WaitForPicture(WelcomePicture({.network = STATIC_NETWORK}));
  // Without the keys that end the console, stop its output, or lead to another screen.
  const std::string never =
      "R\x03\x11\x13\x1a\x1c"
      "2@N[O";
  for (int i = 0; i < 300; ++i) {
    const auto byte = static_cast<char>(random() % 256);
    if (never.find(byte) == std::string::npos) {
      terminal.Type({byte});
    }
  }
  terminal.Type("   ");
  terminal.Settle();
  EXPECT_FALSE(terminal.HasEnded());
  terminal.WaitForPicture(WelcomePicture({.network = STATIC_NETWORK}));
}

// The console on a clock that runs two hundred times faster.
class FastClock : public testing::Test {
 protected:
  static std::vector<std::string> Environment() {
    return {"LD_PRELOAD=/usr/lib/x86_64-linux-gnu/faketime/libfaketime.so.1", "FAKETIME=+0 x200",
            "ASAN_OPTIONS=verify_asan_link_order=0"};
  }

  static std::string ContextSwitches(const Terminal& terminal) {
    std::istringstream status(ReadFile("/proc/" + std::to_string(terminal.Pid()) + "/status"));
    for (std::string line; std::getline(status, line);) {
      if (line.starts_with("voluntary_ctxt_switches")) {
        return line;
      }
    }
    return "";
  }
};

TEST_F(FastClock, DimsTheWelcomeScreenThatThenSleepsUntilAKeyComes) {
  LoadScenario("static");
  Terminal terminal({.environment = Environment()});
  const std::string picture = WelcomePicture({.network = STATIC_NETWORK});
  terminal.WaitForPicture(picture);
  terminal.WaitUntil([&] { return terminal.Colours(12) == "0/6*80"; }, "the dimmed screen");
  terminal.Settle();
  for (const int y : {0, 5, 13, 23}) {
    EXPECT_EQ(terminal.Colours(y), "0/6*80");
  }
  EXPECT_EQ(terminal.Picture(), picture);
  EXPECT_FALSE(terminal.CursorVisible());

  // Five minutes pass and nothing wakes it.
  const std::string switches = ContextSwitches(terminal);
  EXPECT_FALSE(
      WaitUntil([&] { return ContextSwitches(terminal) != switches; }, milliseconds(1500)));

  // A redraw leaves it dimmed, a key does not.
  SetState(R"({"hardware": {"cpu": {"model": "Fresh"}}})");
  terminal.Signal(SIGUSR1);
  terminal.WaitFor("Fresh");
  terminal.Settle();
  EXPECT_EQ(terminal.Colours(5), "0/6*80");
  terminal.Type(Keys::SPACE);
  terminal.WaitUntil([&] { return terminal.Colours(12) == "3/7*80"; }, "the colours");
}

}  // namespace

}  // namespace Tarnel::Testing
