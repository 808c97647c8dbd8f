// An operator looks for a way back from a broken management network.

#include <gtest/gtest.h>

#include <optional>
#include <regex>

#include "console/screen/colours.h"
#include "tests/support/lab.h"
#include "tests/support/operator.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

using Lines = std::vector<std::string>;

constexpr char LATTICE[] = "lattice-repair";
constexpr char RESTART_HINT[] = "<Enter> Restart         <Esc> Log Out";
constexpr char RESTORE_HINT[] = "<Enter> Restore         <Esc> Log Out";
constexpr char CHANGE_HINT[] = "<Enter> Change             <Esc> Exit";

// The screen, opened anew for each case by one operator.
class RecoveryTest : public testing::Test {
 protected:
  RecoveryTest() {
    LoadScenario("sample");
    _operator.emplace();
    _operator->GoTo("Network Restore Options");
  }

  void Open(const std::string& scenario, const std::string& patch = "") {
    LoadScenario(scenario, patch);
    _log.emplace();
    _operator->Press({ENTER});
    _operator->WaitFor("Restore Network Settings");
    _operator->Settle();
  }

  // Only after a moment the console knows that no sequence follows.
  void Back(const std::string& text) {
    _operator->Press({ESC});
    _operator->WaitFor(text);
    _operator->Settle();
  }

  void Close() {
    Back("System Customization");
    EXPECT_EQ(_operator->RightPane(1), "Network Restore Options");
  }

  bool Shows(const std::string& text) const {
    return _operator->Picture().find(text) != std::string::npos;
  }

  // The rows of the left pane, with ! before a grey one and > before the one with the focus.
  std::string List() const {
    std::string list;
    for (int y = 4; y < 7; ++y) {
      const Cell first = _operator->At(3, y);
      const std::string row = _operator->Row(y).substr(3, 30);
      list += first.bg == BLACK ? ">" : first.fg == DARK_GREY ? "!" : "";
      list += row.substr(0, row.find("  ")) + ",";
    }
    return list;
  }

  // What the console has logged since the screen was opened, but for the size of screens.
  Lines Logged() const {
    Lines lines;
    for (const LogLine& line : _log->Lines()) {
      if (line.text.starts_with("TARNEL: ") && !line.text.starts_with("TARNEL: COLS=")) {
        lines.push_back(line.level.substr(5) + " " + line.text.substr(8));
      }
    }
    return lines;
  }

  void ExpectLogged(const Lines& lines) {
    _operator->WaitUntil([&] { return Logged().size() >= lines.size(); }, "the log");
    EXPECT_EQ(Logged(), lines);
  }

  std::optional<Operator> _operator;
  std::optional<Log> _log;
};

struct Look {
  std::string key;
  const char* list;
  const char* text;  // the first line of the explanation
  const char* hint;
};

constexpr char ONE_ROW[] = ">Restore Network Settings,!Restore Standard Switch,!Restore Lattice,";
constexpr char FIRST[] = ">Restore Network Settings,Restore Standard Switch,Restore Lattice,";
constexpr char SECOND[] = "Restore Network Settings,>Restore Standard Switch,Restore Lattice,";
constexpr char THIRD[] = "Restore Network Settings,Restore Standard Switch,>Restore Lattice,";
constexpr char SECOND_IS_GREY[] =
    "Restore Network Settings,!Restore Standard Switch,>Restore Lattice,";
constexpr char SETTINGS_TEXT[] = "Restoring the network settings will";

TEST_F(RecoveryTest, OffersWhatCanHelp) {
  const std::pair<const char*, std::vector<Look>> visits[] = {
      {"sample",
       {{"", ONE_ROW, SETTINGS_TEXT, CHANGE_HINT},
        {DOWN, ONE_ROW, SETTINGS_TEXT, RESTART_HINT},
        {UP, ONE_ROW, SETTINGS_TEXT, RESTART_HINT}}},
      {LATTICE,
       {{"", FIRST, SETTINGS_TEXT, CHANGE_HINT},
        {DOWN, SECOND, "All management network and", RESTORE_HINT},
        {DOWN, THIRD, "Reconfigure properties of", RESTORE_HINT},
        {DOWN, THIRD, "Reconfigure properties of", RESTORE_HINT}}},
  };
  for (const auto& [scenario, looks] : visits) {
    Open(scenario);
    for (const Look& look : looks) {
      SCOPED_TRACE(std::string(scenario) + " " + look.list);
      if (!look.key.empty()) _operator->Press({look.key});
      EXPECT_EQ(List(), look.list);
      EXPECT_EQ(_operator->RightPane(4), look.text);
      EXPECT_EQ(_operator->RightPane(22), look.hint);
    }
    Close();
  }
}

struct Reset {
  const char* scenario;
  const char* patch;
  Lines keys;
  const char* progress;
  Lines trace;
  Lines log;
};

constexpr char POWER_OFF[] = "program /sbin/powerOffVms powerOffVms";
constexpr char DUMPER[] = "NetworkInfoImpl::DisableNetDumper";
constexpr char CLEAR[] = "NetworkInfoImpl::ClearNetworkConfig";
constexpr char CONFIGURE[] = "NetworkInfoImpl::AutoConfigNetwork";
constexpr char CLEARING[] = "info Clearing Network Config";
constexpr char CONFIGURING[] = "info Auto-Configuring Network";
constexpr char RESTORING[] = "info Restoring factory network settings";
constexpr char NOTARY[] = "info Initializing notaryuser library";
constexpr char RESET_FAILED[] = "err Error auto-configuring network";

const Reset RESETS[] = {
    {"sample",
     "",
     {},
     "Auto-configuring network. Done.",
     {DUMPER, CLEAR, CONFIGURE},
     {CLEARING, CONFIGURING, RESTORING, NOTARY}},
    {"virtual-machines",
     "",
     {ENTER},
     "Powering Off VMs. Done.|Auto-configuring network. Done.",
     {POWER_OFF, DUMPER, CLEAR, CONFIGURE},
     {CLEARING, CONFIGURING, RESTORING, NOTARY}},
    {"virtual-machines", "", {ESC}, nullptr, {}, {RESTORING, NOTARY}},
    {"power-off-fails",
     "",
     {ENTER},
     "Powering Off VMs. Failed.",
     {POWER_OFF, DUMPER},
     {"err Error powering off VMs", RESTORING, NOTARY}},
    {"power-off-fails",
     R"({"faults": [{"operation": "NetworkInfoImpl::DisableNetDumper", "message": "told"}]})",
     {ENTER},
     "Powering Off VMs. Failed.",
     {POWER_OFF, DUMPER},
     {RESET_FAILED, RESTORING, NOTARY}},
    {"sample",
     R"({"faults": [{"operation": "NetworkInfoImpl::ClearNetworkConfig", "message": "told"}]})",
     {},
     "Auto-configuring network. Failed.",
     {DUMPER, CLEAR},
     {CLEARING, RESET_FAILED, RESTORING, NOTARY}},
    {"sample",
     R"({"faults": [{"operation": "NetworkInfoImpl::AutoConfigNetwork", "message": "told"}]})",
     {},
     "Auto-configuring network. Failed.",
     {DUMPER, CLEAR, CONFIGURE},
     {CLEARING, CONFIGURING, RESET_FAILED, RESTORING, NOTARY}},
};

Lines HostChanges() {
  Lines lines;
  for (const std::string& line : TraceLines()) {
    if (!line.starts_with("NotaryUserLib_")) lines.push_back(line);
  }
  return lines;
}

TEST_F(RecoveryTest, ResetsTheNetwork) {
  for (const Reset& reset : RESETS) {
    SCOPED_TRACE(std::string(reset.scenario) + reset.patch + (reset.progress ? "" : " backed out"));
    Open(reset.scenario, reset.patch);
    // Enter is no answer here.
    _operator->Press({ENTER, ENTER});
    EXPECT_TRUE(Shows("Are you sure you want to reset the host network"));
    _operator->Press({F11});
    EXPECT_EQ(Shows("Warning: VMs running on the host"), !reset.keys.empty());
    _operator->Press(reset.keys);
    _operator->WaitFor(reset.progress != nullptr ? "<Enter> OK" : "<Esc> Exit");
    _operator->Settle();
    if (reset.progress != nullptr) {
      const std::string first = _operator->Row(13).substr(12);
      const std::string second = _operator->Row(14).substr(12);
      const std::string all = first.substr(0, first.find('.', first.find('.') + 1) + 1) +
                              (second[0] == ' ' ? "" : "|" + second.substr(0, 31));
      EXPECT_EQ(all, reset.progress);
      _operator->Press({ESC, F11});
      EXPECT_TRUE(Shows("<Enter> OK"));
      _operator->Press({ENTER});
    }
    EXPECT_EQ(_operator->RightPane(22), CHANGE_HINT);
    EXPECT_EQ(HostChanges(), reset.trace);
    ExpectLogged(reset.log);
    Close();
  }
}

TEST_F(RecoveryTest, MovesToAStandardSwitchOncePerVisit) {
  const char* const patches[] = {
      "", R"({"faults": [{"operation": "VirtualSwitchInfoImpl::AddVirtualSwitch",
                          "message": "told"}]})"};
  for (const std::string patch : patches) {
    Open(LATTICE, patch);
    _operator->Press({DOWN, ENTER, ENTER});
    EXPECT_TRUE(Shows("Move the management network onto a standard switch?"));
    Back("<Esc> Exit");
    EXPECT_EQ(List(), SECOND);
    _operator->Press({ENTER, F11});
    EXPECT_EQ(List(), SECOND_IS_GREY);
    EXPECT_EQ(_operator->RightPane(22), CHANGE_HINT);
    _operator->Press({UP});
    EXPECT_EQ(_operator->RightPane(1), "Restore Network Settings");
    Lines log = {
        "info Enabling safe mode networking by moving all uplinks to a new management softSwitch"};
    if (!patch.empty())
      log.insert(log.begin(), "err Changing to legacy virtual switch failed: told");
    ExpectLogged(log);
    Close();
  }
}

// The form in one line for each row, the boxes of its own frame left out.
std::string Form(const Operator& terminal) {
  std::string form;
  for (int y = 12; y < 17; ++y) {
    std::string row = terminal.Row(y).substr(4, 71);
    row.erase(row.find_last_not_of(' ') + 1);
    form += row + "\n";
  }
  return form;
}

const std::string FIELD_GAP(23, ' ');

TEST_F(RecoveryTest, RepairsTheLatticePort) {
  Open(LATTICE);
  _operator->Press({DOWN, DOWN, ENTER});
  EXPECT_EQ(Form(*_operator),
            "Management Interface - core0\nCurrent LatticePort - 100\n"
            "[ ] Restore to default blocked setting (unblocked)\nSelect Lattice uplinks\n"
            "Please enter a valid VLAN ID (1-4094)." +
                FIELD_GAP + " [ 4095  ]\n");
  // No uplink is chosen yet; Enter has no meaning on the first row.
  _operator->Press({ENTER, F11});
  EXPECT_TRUE(Shows("No uplinks were selected."));
  Back("Select Lattice uplinks");
  _operator->Press({SPACE, DOWN, SPACE, ENTER});
  EXPECT_TRUE(Shows("    Uplink Name"));
  // Marked, both, taken back, marked again: it goes last.
  _operator->Press({SPACE, DOWN, SPACE, UP, SPACE, SPACE});
  EXPECT_TRUE(Shows("[X] Uplink 1"));
  EXPECT_TRUE(Shows("[X] Uplink 2"));
  _operator->Press({ENTER});
  EXPECT_FALSE(_operator->CursorVisible());
  _operator->Press({DOWN});
  EXPECT_TRUE(_operator->CursorVisible());
  _operator->Press({"x", "4", "3", "\b", "2"});
  EXPECT_TRUE(Shows("[X] Restore to default blocked setting (unblocked)"));
  EXPECT_TRUE(Shows("[ 42    ]"));
  _operator->Press({F11});
  EXPECT_FALSE(_operator->CursorVisible());
  EXPECT_EQ(_operator->RightPane(22), CHANGE_HINT);
  const Lines trace = TraceLines();
  ASSERT_EQ(trace.size(), 20U);
  const std::regex created(
      R"(LatticePortImpl::CreateLatticePort hlp-100#\d{1,5} "50 2a 11" "kind 1" "vlan 42")");
  EXPECT_TRUE(std::regex_match(trace[0], created)) << trace[0];
  EXPECT_NE(trace[18].find("active:[Uplink 2,Uplink 1]"), std::string::npos) << trace[18];
  EXPECT_NE(trace[17].find("SetBlocked"), std::string::npos) << trace[17];
  EXPECT_EQ(Logged(), Lines());
  Close();
}

struct Repair {
  const char* patch;
  Lines keys;
  Lines messages;  // each is shown after the keys and closed with Enter
  Lines log;
  size_t changes;
};

constexpr char FOREIGN[] = "performed on 3rd party Lattice.";
constexpr char FAILED[] = "Unable to restore Lattice. Check logs for details.";
constexpr char NO_UPLINKS[] = "No uplinks are configured on the host for this";
constexpr char FOREIGN_PATCH[] = R"({"network": {"lattices": {"50 2a 11": {"native": false}}}})";
constexpr char STANDARD_PATCH[] = R"({"network": {"kernelNics": {"core0": {"connection": {
    "type": 1, "portGroup": "Management Network", "lattice": null, "port": null}}}}})";

const Repair REPAIRS[] = {
    {"",
     {F11, ENTER},
     {FAILED},
     {"err Unable to create Host Local Port: Invalid LatticePort vlan specified. Valid range is "
      "0-4094."},
     0},
    {"", {DOWN, DOWN, "\b", F11, ENTER}, {}, {}, 19},
    {R"({"faults": [{"operation": "NetworkInterface::SetConnectionPoint", "message": "told"}]})",
     {DOWN, DOWN, "1", F11, ENTER},
     {FAILED},
     {"err Unable to create Host Local Port: told"},
     20},
    {FOREIGN_PATCH, {F11, ENTER}, {FOREIGN}, {}, 0},
    {FOREIGN_PATCH, {DOWN, ENTER}, {FOREIGN, NO_UPLINKS, ""}, {}, 0},
    {R"({"network": {"lattices": {"50 2a 11": {"uplinkPorts": {"corenic0": "77",
                                                               "corenic1": null}}}}})",
     {DOWN, ENTER},
     {NO_UPLINKS, ""},
     {},
     0},
    {STANDARD_PATCH,
     {F11, ENTER},
     {},
     {"err Failed to get Management Interface: Unable to find lattice",
      "err Unable to get Lattice"},
     0},
    {R"({"network": {"management": null}})",
     {DOWN, ENTER},
     {NO_UPLINKS, ""},
     {"err Failed to get Management Interface: Could not find the management network"},
     0},
};

TEST_F(RecoveryTest, TellsWhyALatticeCannotBeRepaired) {
  for (const Repair& repair : REPAIRS) {
    SCOPED_TRACE(std::string(repair.patch) + std::to_string(&repair - REPAIRS));
    Open(LATTICE);
    SetState(repair.patch[0] == '\0' ? "{}" : repair.patch);
    _operator->Press({DOWN, DOWN, ENTER});
    _operator->Press(repair.keys);
    for (const std::string& message : repair.messages) {
      EXPECT_TRUE(Shows(message.empty() ? "Select Lattice uplinks" : message)) << message;
      if (message.empty()) {
        Back("<Esc> Exit");
      } else {
        _operator->Press({ENTER});
      }
    }
    EXPECT_EQ(_operator->RightPane(22), CHANGE_HINT);
    EXPECT_EQ(TraceLines().size(), repair.changes);
    ExpectLogged(repair.log);
    Close();
  }
}

}  // namespace

}  // namespace Tarnel::Testing
