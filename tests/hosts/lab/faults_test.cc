#include "hosts/lab/state/faults.h"

#include <vector>

#include "hostapi/coreplane/ip_services.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/coreplane/system.h"
#include "hosts/lab/state/programs.h"
#include "tests/hosts/lab/lab_test.h"

namespace {

using Coreplane::Network::DnsConfigImpl;
using Coreplane::Network::NetworkInfoImpl;
using Coreplane::System::SystemInfoImpl;

class FaultTest : public LabTest {
 protected:
  static void SetFault(const std::string& operation, const std::string& rest) {
    Patch(R"({"faults": [{"operation": ")" + operation + "\", " + rest + "}]}");
  }
};

void GetHostname() { DnsConfigImpl("defaultTcpipStack").GetHostname(); }

TEST_F(FaultTest, HoldsForItsCallsAlone) {
  // Each letter stands for a call: X failed.
  const std::vector<std::pair<std::string, std::string>> rows = {
      {R"("times": 0)", "....."},
      {R"("times": 2)", "XX..."},
      {R"("fromCall": 3)", "..XXX"},
      {R"("fromCall": 2, "times": 1)", ".X..."},
      {R"("object": "defaultTcpipStack")", "XXXXX"},
      {R"("object": "another")", "....."},
      {R"("args": ["any"])", "....."},
  };
  for (const auto& [bounds, calls] : rows) {
    SetFault("DnsConfigImpl::GetHostname", R"("message": "told", )" + bounds);
    std::string made;
    for (int i = 0; i < 5; ++i) made += Thrown(GetHostname) == "told" ? 'X' : '.';
    EXPECT_EQ(made, calls) << bounds;
  }
}

TEST_F(FaultTest, CountsOutliveTheProcessUntilTheNextScenario) {
  for (int i = 0; i < 2; ++i) {
    Lab::LoadScenario("sample");
    SetFault("DnsConfigImpl::GetHostname", R"("message": "told", "fromCall": 2)");
    EXPECT_EQ(ExitCode(StartProcess(GetHostname)), 0);
    EXPECT_EQ(ExitCode(StartProcess(GetHostname)), 1);
  }
}

TEST_F(FaultTest, ComesBeforeOrAfterTheEffect) {
  for (const std::string when : {"before", "after"}) {
    SetFault("SystemInfoImpl::SetSystemAlert", R"("message": "told", "when": ")" + when + '"');
    EXPECT_EQ(Thrown([] { SystemInfoImpl().SetSystemAlert("low"); }), "told");
    EXPECT_EQ(Lab::Text(*Lab::ReadState(), "/host/systemAlert"), when == "after" ? "low" : "");
  }
}

TEST_F(FaultTest, ReturnsStandInPlaceOfTheResult) {
  const auto management = [] { return NetworkInfoImpl().GetManagementInterface(); };
  const std::string operation = "NetworkInfoImpl::GetManagementInterface";
  SetFault(operation, R"("returns": null)");
  EXPECT_EQ(management(), nullptr);
  SetFault(operation, R"("returns": "otherClass")");
  EXPECT_EQ(management()->GetName(), "core0");
  EXPECT_EQ(dynamic_cast<Nodeplane::Network::CoreNic*>(management().get()), nullptr);
  SetFault(operation, R"("returns": 7)");
  EXPECT_EQ(Thrown(management), operation + ": returns: neither null nor \"otherClass\"");
  SetFault("NetworkInfoImpl::GetPnics", R"("returns": [])");
  EXPECT_TRUE(NetworkInfoImpl().GetPnics().empty());
  SetFault("SystemInfoImpl::GetWelcomeMessage", R"("returns": {"bytes": "ff"})");
  EXPECT_EQ(SystemInfoImpl().GetWelcomeMessage(), "\xff");
}

// The exit code, "-" where the program goes its own way, "!" for a refused start.
std::string RunOnce(const std::vector<std::string>& arguments) {
  const auto state = Lab::ReadState();
  if (!Lab::MayStart(*state, "/bin/p", arguments)) return "! ";
  const auto exitCode = Lab::TakeProgramBehaviour(*state, "/bin/p", arguments).exitCode;
  return exitCode ? std::to_string(*exitCode) + " " : "- ";
}

TEST_F(FaultTest, AProgramTakesTheFirstRuleThatApplies) {
  struct Row {
    std::string rules;
    std::vector<std::string> arguments;
    std::string runs;
  };
  const std::vector<Row> rows = {
      {R"([{"exit": 3, "times": 1}, {"exit": 4, "times": 1}])", {}, "3 4 - "},
      {R"([{"exit": 3, "args": ["a", "c"]}])", {"a", "b", "c"}, "3 3 3 "},
      {R"([{"exit": 3, "args": ["c", "a"]}])", {"a", "b", "c"}, "- - - "},
      {R"([{"exit": 3, "args": ["a", "a"]}])", {"a"}, "- - - "},
      {R"([{"exit": 9, "user": "ann"}])", {"-U", "ann", "x"}, "9 9 9 "},
      {R"([{"exit": 9, "user": "ann"}])", {"-U", "bob", "x"}, "- - - "},
      {R"([{"noStart": true, "times": 2}, {"exit": 1}])", {}, "! ! 1 "},
  };
  for (const auto& [rules, arguments, runs] : rows) {
    Patch(R"({"programs": {"/bin/p": )" + rules + "}}");
    std::string made;
    for (int i = 0; i < 3; ++i) made += RunOnce(arguments);
    EXPECT_EQ(made, runs) << rules;
  }
}

}  // namespace
