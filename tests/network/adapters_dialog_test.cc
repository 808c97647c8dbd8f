#include "console/network/adapters_dialog.h"

#include <syslog.h>

#include "tests/network/form_player.h"
#include "tests/support/lab.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

// Sorted: corenic0, which the management network has; upnic2 on another standard switch; upnic10 on
// a distributed one; upnic11 on none.
constexpr char HOST[] = R"({"network": {
    "pnics": [{"name": "upnic11", "mac": "02:fc:00:00:00:11", "linkUp": true},
              {"name": "upnic10", "mac": "02:fc:00:00:00:10", "linkUp": true},
              {"name": "upnic2", "mac": "02:fc:00:00:00:02", "linkUp": false},
              {"name": "corenic0", "mac": "02:fc:00:00:00:01", "linkUp": true,
               "pci": "0000:02:00.0"}],
    "switches": {"softSwitch7": {"ports": 128, "uplinks": ["upnic2", "gone"],
                                 "teaming": {"mask": 0, "order": [], "max": 0},
                                 "portGroups": {}}},
    "lattices": {"50 2f": {"name": "latticeSwitch0", "native": true, "uplinks": ["upnic10"],
                           "uplinkPorts": {"upnic10": "8"}, "ports": {}}}}})";

class Adapters : public FormPlayer {
 protected:
  // The accepted names; "refused" when none were.
  std::string PlayForm(const std::vector<std::string>& selected, const std::string& keys) {
    std::string words;
    Play(keys, [&](Frame* parent) {
      AdaptersDialog form(parent, selected, 3, "softSwitch0");
      const int answer = form.Exec();
      EXPECT_EQ(form.MaxActiveUplinks(), 3);
      for (const std::string& name : form.Selected()) words += name + " ";
      if (answer == 0) words = "refused";
      return answer;
    });
    return words;
  }
};

TEST_F(Adapters, AreChosenInTheOrderOfChoosing) {
  LoadScenario("static", HOST);
  struct Case {
    std::vector<std::string> selected;
    std::string keys;
    const char* shown;
    const char* after;
  };
  const std::string down = DOWN;
  const char* const question = "Remove these adapters from their current connections?";
  const Case cases[] = {
      {{"corenic0"}, "\r", " [X] corenic0     ", "corenic0 "},
      {{"corenic0"}, "\r", "(02:fc:00:00:00:02)       Disconnected (...)", "corenic0 "},
      {{"corenic0"}, "\r", "[ ] upnic11      N/A (02:fc:00:00:00:11)       Connected", "corenic0 "},
      {{"corenic0", "upnic11"}, "  \r", "[ ] corenic0", "upnic11 corenic0 "},
      {{"corenic0"}, " \r", "[ ] corenic0", ""},
      {{"gone"}, "\r", "[ ] corenic0", "gone "},
      {{"corenic0"}, down + " \rx\r", question, "corenic0 upnic2 "},
      {{"corenic0", "upnic10"}, "\r" + std::string(ESC) + ESC, question, "refused"},
      {{}, down + down + " \r" + ESC + " \r", "[X] upnic10", ""},
      {{}, "d\r" + down + "D" + ESC + "\r\r", "Used By: softSwitch7", ""},
      {{}, down + down + down + "d\r\r", "Used By: None", ""},
  };
  for (const Case& tried : cases) {
    SCOPED_TRACE(tried.keys);
    EXPECT_EQ(PlayForm(tried.selected, tried.keys), tried.after);
    EXPECT_TRUE(HasShown(tried.shown)) << _seen;
  }
}

TEST_F(Adapters, NeedNotBeThere) {
  LoadScenario("static", R"({"network": {"pnics": [], "switches": {}}})");
  EXPECT_EQ(PlayForm({"corenic0"}, " dD" + std::string(DOWN) + "\r"), "corenic0 ");
  EXPECT_TRUE(HasShown("     Device Name  Hardware Label (MAC Address)  Status")) << _seen;
}

TEST_F(Adapters, AreNotShownWhenTheHostFails) {
  const std::pair<const char*, const char*> cases[] = {
      {"NetworkInfoImpl::GetPnics", "Getting physical nics failed: "},
      {"VirtualSwitchInfoImpl::GetVirtualSwitches", "Scanning virtual switches failed: "},
      {"VirtualSwitchInfoImpl::GetLatticeSwitches", "Scanning latticeswitches failed: "},
  };
  openlog("TARNEL", 0, LOG_USER);
  for (const auto& [operation, words] : cases) {
    const Log log;
    LoadScenario("static", R"({"faults": [{"operation": ")" + std::string(operation) +
                               R"(", "message": "no %s"}]})");
    EXPECT_EQ(PlayForm({"corenic0"}, ""), "refused");
    log.WaitFor({"user.err", "TARNEL: " + std::string(words) + "no %s"});
  }
}

TEST_F(Adapters, HaveNoLabelWhenTheirDeviceCannotBeRead) {
  LoadScenario("static", R"({"faults": [{"operation": "PciDevice::GetName", "message": "x"}]})");
  EXPECT_EQ(PlayForm({}, "\r"), "");
  EXPECT_TRUE(HasShown("corenic0     N/A (02:fc:00:00:00:01)")) << _seen;
}

}  // namespace

}  // namespace Tarnel::Testing
