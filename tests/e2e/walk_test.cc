// A walk through all that an operator can open, forwards and back: each dialog has its size, its
// two bands and its hint, and in the end the screen is the one of the beginning.

#include <gtest/gtest.h>

#include "tests/support/lab.h"
#include "tests/support/operator.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

using Lines = std::vector<std::string>;

struct Stop {
  // Keys that lead here from the stop before.
  Lines keys;
  // The dialog on top, its upper band and the beginning of its hint.
  int width;
  int height;
  int headerHeight;
  const char* hint;
  // What becomes of the host before the keys.
  const char* patch = "{}";
};

bool IsOnTop(const Terminal& terminal, const Stop& stop) {
  const int x = (80 - stop.width) / 2;
  const int y = (25 - stop.height) / 2;
  const int right = x + stop.width - 1;
  const int bottom = y + stop.height - 1;
  const auto band = [&](int row) { return terminal.At(x + 1, y + row).bg; };
  const auto isCorner = [&](int column, int row) {
    const Cell cell = terminal.At(column, row);
    return cell.line && cell.text == "+";
  };
  return isCorner(x, y) && isCorner(right, y) && isCorner(x, bottom) && isCorner(right, bottom) &&
         band(1) == band(stop.headerHeight - 1) &&
         band(stop.headerHeight) != band(stop.headerHeight - 1) &&
         terminal.Row(bottom - 1).find(stop.hint) != std::string::npos;
}

void Walk(Operator& terminal, const std::vector<Stop>& stops) {
  for (size_t i = 0; i < stops.size(); ++i) {
    SCOPED_TRACE("stop " + std::to_string(i));
    SetState(stops[i].patch);
    for (const std::string& key : stops[i].keys) {
      const size_t before = terminal.Output().size();
      terminal.Press({key});
      // Some screens take a while to open, and none of these keys is without effect.
      terminal.WaitUntil([&] { return terminal.Output().size() > before; }, "what a key does");
      terminal.Settle();
    }
    if (!terminal.WaitUntil([&] { return IsOnTop(terminal, stops[i]); }, "this dialog")) return;
    terminal.Settle();
  }
}

constexpr char OK[] = "<Enter> OK";
constexpr char OK_CANCEL[] = "<Enter> OK  <Esc> Cancel";

TEST(Walk, ThroughTheMenuAndBack) {
  LoadScenario("adapters", R"({"virtualMachines": [{"name": "web", "running": true}]})");
  Operator terminal;
  const std::string first = terminal.Picture();
  Walk(terminal, {{{ENTER}, 60, 14, 6, OK_CANCEL},
                  {{"laboratory\tlaboratory\tlaboratory" + ENTER}, 70, 8, 5, "<Enter> Confirm"},
                  {{ESC, ESC, DOWN, ENTER}, 70, 11, 6, "<Space> Toggle"},
                  {{ESC, DOWN, ENTER, ENTER}, 78, 21, 7, "<D> View Details"},
                  {{"d"}, 70, 13, 5, OK},
                  {{ENTER, DOWN + " ", ENTER}, 60, 11, 6, OK_CANCEL},
                  {{ESC, ESC, DOWN, ENTER}, 70, 12, 6, OK_CANCEL},
                  {{"0" + ENTER}, 70, 10, 7, OK},
                  {{ENTER, "5" + ENTER, DOWN, ENTER}, 78, 19, 7, "<Up/Down> Select  <Space> Mark"},
                  {{ESC, DOWN, ENTER}, 78, 21, 7, "<Up/Down> Select  <Space> Mark"},
                  {{ESC, DOWN, ENTER}, 78, 17, 6, "<Up/Down> Select  <Space> Mark"},
                  {{ESC, DOWN, ENTER}, 70, 13, 8, OK_CANCEL},
                  {{ESC, ESC}, 70, 15, 9, "<Y> Yes  <N> No"},
                  {{"n", DOWN, ENTER}, 70, 12, 7, "<F11> OK  <Esc> Cancel"},
                  {{F11}, 60, 12, 5, OK},
                  {{ENTER, DOWN, ENTER}, 70, 14, 6, "<Up/Down> Select"},
                  {{ENTER}, 75, 13, 5, OK},
                  {{ENTER, DOWN, ENTER, ENTER}, 60, 12, 6, "<F11> Yes, Reset"},
                  {{F11}, 60, 10, 7, "<Enter> Confirm"},
                  {{ESC, ESC, DOWN, ENTER}, 76, 18, 6, "<Up/Down> Select  <Space> Toggle"},
                  {{ESC, DOWN, ENTER, DOWN, DOWN, ENTER}, 70, 21, 15, OK_CANCEL},
                  {{ESC, DOWN, ENTER}, 70, 15, 9, OK_CANCEL},
                  {{ESC, DOWN, ENTER}, 71, 20, 9, "<F11> OK  <Esc> Cancel"},
                  {{F11}, 71, 20, 9, OK},
                  {{ENTER, ESC, DOWN, DOWN, DOWN, ENTER}, 60, 12, 7, "<F11> OK  <Esc> Cancel"}});
  terminal.Press({ESC});
  terminal.PressTimes(UP, 12);
  EXPECT_EQ(terminal.Picture(), first);
  terminal.Press({ESC});
  terminal.WaitFor("<F2> Customize");
}

TEST(Walk, ThroughTheWaysBackOfADistributedSwitch) {
  LoadScenario("lattice-repair", R"({"virtualMachines": [{"name": "web", "running": true}]})");
  Operator terminal;
  terminal.GoTo("Network Restore Options");
  Walk(terminal,
       {{{ENTER, DOWN, ENTER}, 60, 12, 7, "<F11> OK  <Esc> Cancel"},
        {{ESC, DOWN, ENTER}, 78, 15, 6, "<F11> OK  <Esc> Cancel"},
        {{DOWN, ENTER}, 78, 15, 5, "<Space> Toggle"},
        {{ESC, F11}, 60, 10, 5, OK_CANCEL},
        {{ESC, ENTER},
         60,
         10,
         5,
         OK,
         R"({"faults": [{"operation": "LatticePort::GetLatticeSwitch", "returns": null}]})"},
        {{ENTER, ESC, UP, UP, ENTER, F11, ENTER}, 60, 12, 6, OK}});
}

TEST(Walk, ThroughTheDialogsOfTheWelcomeScreen) {
  for (const std::string& way : {F2, F11}) {
    LoadScenario("host-stays-up");
    Operator terminal;
    terminal.Press({ESC});
    LoadScenario("login-disabled");
    Walk(terminal, {{{F2}, 60, 9, 6, OK}});
    LoadScenario("host-stays-up");
    Walk(terminal,
         {{{ENTER, F2}, 60, 13, 6, OK_CANCEL},
          {{ESC, F12, "root\tlaboratory" + ENTER}, 60, 19, 13, "<F2> Shut Down  <F11> Res"},
          {{way}, 70, 10, 7, ""}});
  }
}

TEST(Walk, ThroughTheDevicesOfTheDriverVM) {
  LoadScenario("driver-vm-devices");
  Operator terminal;
  Walk(terminal, {{{DOWN, DOWN, ENTER}, 78, 21, 7, "<D> View Details"}, {{"d"}, 70, 13, 5, OK}});
}

}  // namespace

}  // namespace Tarnel::Testing
