// The console on terminals of all types and sizes.

#include <gtest/gtest.h>

#include <chrono>
#include <csignal>
#include <random>

#include "tests/e2e/welcome_picture.h"
#include "tests/support/lab.h"
#include "tests/support/terminal.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

// The colours of rows 1, 12, 13 and 23.
using Look = std::vector<std::string>;
const Look COLOURED = {"6/7*80", "3/7*80", "3/7*8 3/0*64 3/7*8",
                       "3/7*2 3/0*5 3/6*26 3/0*28 3/6*17 3/7*2"};
const Look MONOCHROME = {"standout*80", "plain*80", "plain*80", "plain*80"};
const Look DIMMED = {"0/6*80", "0/6*80", "0/6*80", "0/6*80"};

Look LookOf(const Terminal& terminal) {
  return {terminal.Colours(1), terminal.Colours(12), terminal.Colours(13), terminal.Colours(23)};
}

const std::string PICTURE = WelcomePicture();

// F4, in both of its forms, changes the look where there are colours.
TEST(TerminalType, ShowsTheSamePictureInColourOrWithout) {
  LoadScenario("static");
  const std::pair<const char*, bool> rows[] = {{"linux", true},
                                               {"xterm-256color", true},
                                               {"vt100", false},
                                               {"xterm", false},
                                               {"screen-256color", false}};
  for (const auto& [term, colour] : rows) {
    SCOPED_TRACE(term);
    Terminal terminal({.term = term});
    terminal.WaitForPicture(PICTURE);
    EXPECT_EQ(LookOf(terminal), colour ? COLOURED : MONOCHROME);
    terminal.Type("\0334");
    terminal.Settle();
    EXPECT_EQ(LookOf(terminal), MONOCHROME);
    terminal.Type(F4);
    terminal.Settle();
    EXPECT_EQ(LookOf(terminal), colour ? COLOURED : MONOCHROME);
    EXPECT_EQ(terminal.Picture(), PICTURE);
  }
}

TEST(TerminalSize, IsFilled) {
  LoadScenario("static");
  for (const auto& [columns, rows] : {std::pair(80, 24), std::pair(81, 27)}) {
    Terminal terminal({.columns = columns, .rows = rows});
    terminal.WaitForPicture(WelcomePicture({.columns = columns, .rows = rows}));
  }
}

TEST(TerminalSize, OfFewLinesHasNoPlaceForWarnings) {
  LoadScenario("audit");
  {
    Terminal terminal({.rows = 28});
    terminal.WaitForPicture(WelcomePicture({.rows = 28}));
  }
  Terminal terminal({.rows = 29});
  terminal.WaitFor("Warning: Host is running in audit mode. Your");
  EXPECT_EQ(terminal.Colours(23), "3/7*16 3/6*48 3/7*16");
}

// Parts of the screen have no place, or the terminal can do nothing.
TEST(UnusableTerminal, IsSurvived) {
  LoadScenario("dhcp-waiting");
  for (const Launch& launch :
       {Launch{.term = "dumb"}, Launch{.columns = 40, .rows = 10}, Launch{.columns = 2, .rows = 2},
        Launch{.columns = 1, .rows = 1}, Launch{.columns = 200, .rows = 1},
        Launch{.columns = 300, .rows = 100}}) {
    Terminal terminal(launch);
    terminal.Settle();
    terminal.Type(std::string(SPACE) + F4 + F4);
    terminal.Settle();
    terminal.Signal(SIGTERM);
    EXPECT_EQ(terminal.WaitForEnd(), 0) << launch.columns << "x" << launch.rows;
  }
}

struct EscapeCase {
  Launch launch;
  std::chrono::milliseconds least;
  std::chrono::milliseconds most;
};

// Esc is a key like any other here and has the screen drawn.
TEST(LoneEscape, ActsAtOnceWhereNobodyTypesSequencesByHand) {
  using namespace std::chrono_literals;
  LoadScenario("static");
  const EscapeCase rows[] = {{{.term = "xterm"}, 0ms, 400ms},
                             {{.term = "xterm", .environment = {"ESCDELAY=500"}}, 450ms, 2000ms},
                             {{.term = "vt220"}, 700ms, 2500ms}};
  for (const auto& [launch, least, most] : rows) {
    Terminal terminal(launch);
    terminal.WaitForPicture(PICTURE);
    terminal.Settle();
    const size_t before = terminal.Output().size();
    const auto start = std::chrono::steady_clock::now();
    terminal.Type(ESC);
    terminal.WaitUntil([&] { return terminal.Output().size() > before; }, "the picture");
    const auto time = std::chrono::steady_clock::now() - start;
    EXPECT_GE(time, least) << launch.term;
    EXPECT_LE(time, most) << launch.term;
  }
}

TEST(RandomKeys, AreSurvived) {
  LoadScenario("static");
  std::mt19937 random(20260);
  Terminal terminal;
  terminal.WaitForPicture(PICTURE);
  // Without the keys that end the console, stop its output, or lead to another screen.
  const std::string never = "R\003\021\023\032\0342@N[O";
  for (int i = 0; i < 300; ++i) {
    const auto byte = static_cast<char>(random() % 256);
    if (never.find(byte) == std::string::npos) {
      terminal.Type({byte});
    }
  }
  terminal.Type("   ");
  terminal.Settle();
  EXPECT_EQ(terminal.Picture(), PICTURE);
  EXPECT_FALSE(terminal.HasEnded());
}

TEST(WelcomeScreenThatIsLeftAlone, DimsUntilAKeyComes) {
  LoadScenario("static");
  Terminal terminal({.environment = ClockTimes(200)});
  terminal.WaitForPicture(PICTURE);
  terminal.WaitUntil([&] { return LookOf(terminal) == DIMMED; }, "the dimmed screen");
  EXPECT_EQ(terminal.Picture(), PICTURE);
  // A redraw leaves it dimmed, a key does not.
  SetState(R"({"hardware": {"cpu": {"model": "Fresh"}}})");
  terminal.Signal(SIGUSR1);
  terminal.WaitFor("Fresh");
  terminal.Settle();
  EXPECT_EQ(LookOf(terminal), DIMMED);
  terminal.Type(SPACE);
  terminal.WaitUntil([&] { return LookOf(terminal) == COLOURED; }, "the colours");
}

}  // namespace

}  // namespace Tarnel::Testing
