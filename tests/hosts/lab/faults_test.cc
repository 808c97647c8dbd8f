#include <chrono>

#include "hostapi/coreplane/advanced_option.h"
#include "hostapi/coreplane/ip_services.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/coreplane/system.h"
#include "hosts/lab/state/faults.h"
#include "hosts/lab/state/programs.h"
#include "tests/hosts/lab/lab_test.h"

namespace {

using Coreplane::Network::DnsConfigImpl;
using Coreplane::Network::NetworkInfoImpl;
using Coreplane::System::SystemInfoImpl;
using Lab::Json;

class FaultTest : public LabTest {
 protected:
  static void SetFault(const std::string& fault) { Patch("{\"faults\": [" + fault + "]}"); }
  static std::string Hostname() { return DnsConfigImpl("defaultTcpipStack").GetHostname(); }
};

struct WindowCase {
  const char* bounds;
  // One letter for each call: X failed.
  const char* calls;
};

class FaultWindowTest : public FaultTest, public testing::WithParamInterface<WindowCase> {};

TEST_P(FaultWindowTest, HoldsForItsCallsAlone) {
  SetFault(std::string(R"({"operation": "DnsConfigImpl::GetHostname", "message": "told")") +
           GetParam().bounds + "}");
  std::string calls;
  for (int i = 0; i < 5; ++i) calls += Thrown(Hostname) == "told" ? 'X' : '.';
  EXPECT_EQ(calls, GetParam().calls);
}

INSTANTIATE_TEST_SUITE_P(All, FaultWindowTest,
                         testing::Values(WindowCase{"", "XXXXX"},
                                         WindowCase{R"(, "times": 0)", "....."},
                                         WindowCase{R"(, "times": 2)", "XX..."},
                                         WindowCase{R"(, "fromCall": 3)", "..XXX"},
                                         WindowCase{R"(, "fromCall": 2, "times": 1)", ".X..."},
                                         WindowCase{R"(, "fromCall": 6, "times": 1)", "....."},
                                         WindowCase{R"(, "object": "defaultTcpipStack")", "XXXXX"},
                                         WindowCase{R"(, "object": "another")", "....."},
                                         WindowCase{R"(, "args": ["any"])", "....."}));

TEST_F(FaultTest, CountsOutliveTheProcessUntilTheNextScenario) {
  const char* fault =
      R"({"operation": "DnsConfigImpl::GetHostname", "message": "told", "fromCall": 2})";
  SetFault(fault);
  EXPECT_EQ(ExitCode(StartProcess(Hostname)), 0);
  EXPECT_EQ(ExitCode(StartProcess(Hostname)), 1);
  Lab::LoadScenario("sample");
  SetFault(fault);
  EXPECT_EQ(Thrown(Hostname), "none");
  EXPECT_EQ(Thrown(Hostname), "told");
}

TEST_F(FaultTest, ComesBeforeOrAfterTheEffect) {
  const auto alert = [] { SystemInfoImpl().SetSystemAlert("low"); };
  SetFault(R"({"operation": "SystemInfoImpl::SetSystemAlert", "message": "told"})");
  EXPECT_EQ(Thrown(alert), "told");
  EXPECT_EQ(Lab::Text(*Lab::ReadState(), "/host/systemAlert"), "");
  SetFault(
      R"({"operation": "SystemInfoImpl::SetSystemAlert", "message": "told", "when": "after"})");
  EXPECT_EQ(Thrown(alert), "told");
  EXPECT_EQ(Lab::Text(*Lab::ReadState(), "/host/systemAlert"), "low");
}

TEST_F(FaultTest, ADelayAloneLetsTheCallSucceed) {
  SetFault(R"({"operation": "DnsConfigImpl::GetHostname", "delayMs": 40})");
  const auto start = std::chrono::steady_clock::now();
  EXPECT_EQ(Hostname(), "rack7");
  EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(40));
}

struct ReturnCase {
  const char* operation;
  const char* returns;
  std::string (*call)();
  const char* result;
};

std::string ManagementClass() {
  const auto nic = NetworkInfoImpl().GetManagementInterface();
  if (nic == nullptr) return "null";
  return dynamic_cast<Nodeplane::Network::CoreNic*>(nic.get()) ? "CoreNic" : "plain";
}

std::string OptionClass() {
  const auto option = Coreplane::Adv::AdvancedOptionImpl::FindOption("/UserVars/TarnelTimeOut");
  if (option == nullptr) return "null";
  return dynamic_cast<Nodeplane::Adv::AdvancedIntegerOption*>(option.get()) ? "integer" : "other";
}

std::string Ipv6Enabled() { return NetworkInfoImpl().IsCoreIpv6Enabled() ? "true" : "false"; }
std::string PnicCount() { return std::to_string(NetworkInfoImpl().GetPnics().size()); }
std::string Welcome() { return SystemInfoImpl().GetWelcomeMessage(); }

class ReturnTest : public FaultTest, public testing::WithParamInterface<ReturnCase> {};

TEST_P(ReturnTest, StandsInPlaceOfTheResult) {
  SetFault(std::string(R"({"operation": ")") + GetParam().operation + R"(", "returns": )" +
           GetParam().returns + "}");
  std::string result;
  try {
    result = GetParam().call();
  } catch (const Nodeplane::Lib::NodeplaneException& error) {
    result = std::string("! ") + error.what();
  }
  EXPECT_EQ(result, GetParam().result);
}

constexpr char MANAGEMENT[] = "NetworkInfoImpl::GetManagementInterface";
constexpr char FIND_OPTION[] = "AdvancedOptionImpl::FindOption";

INSTANTIATE_TEST_SUITE_P(
    All, ReturnTest,
    testing::Values(ReturnCase{"no such operation", "1", ManagementClass, "CoreNic"},
                    ReturnCase{MANAGEMENT, "null", ManagementClass, "null"},
                    ReturnCase{MANAGEMENT, R"("otherClass")", ManagementClass, "plain"},
                    ReturnCase{"no such operation", "1", OptionClass, "integer"},
                    ReturnCase{FIND_OPTION, "null", OptionClass, "null"},
                    ReturnCase{FIND_OPTION, R"("otherClass")", OptionClass, "other"},
                    ReturnCase{"NetworkInfoImpl::IsCoreIpv6Enabled", "true", Ipv6Enabled, "true"},
                    ReturnCase{"NetworkInfoImpl::GetPnics", "[]", PnicCount, "0"},
                    ReturnCase{"SystemInfoImpl::GetWelcomeMessage", R"({"bytes": "ff"})", Welcome,
                               "\xff"},
                    ReturnCase{MANAGEMENT, "7", ManagementClass,
                               "! NetworkInfoImpl::GetManagementInterface: returns: neither null "
                               "nor \"otherClass\""}));

struct ProgramCase {
  const char* rules;
  std::vector<std::string> arguments;
  // Exit codes of three runs, "-" where the program goes its own way; "!" for a refused start.
  const char* runs;
};

std::string RunOnce(const std::vector<std::string>& arguments) {
  const auto state = Lab::ReadState();
  if (!Lab::MayStart(*state, "/bin/p", arguments)) return "! ";
  const auto behaviour = Lab::TakeProgramBehaviour(*state, "/bin/p", arguments);
  return behaviour.exitCode ? std::to_string(*behaviour.exitCode) + " " : "- ";
}

class ProgramTest : public LabTest, public testing::WithParamInterface<ProgramCase> {};

TEST_P(ProgramTest, TakesTheFirstRuleThatApplies) {
  Patch(std::string(R"({"programs": {"/bin/p": )") + GetParam().rules + "}}");
  std::string runs;
  for (int i = 0; i < 3; ++i) runs += RunOnce(GetParam().arguments);
  EXPECT_EQ(runs, GetParam().runs);
}

INSTANTIATE_TEST_SUITE_P(
    All, ProgramTest,
    testing::Values(ProgramCase{"[]", {}, "- - - "},
                    ProgramCase{R"([{"exit": 3}])", {"a"}, "3 3 3 "},
                    ProgramCase{
                        R"([{"exit": 3, "times": 1}, {"exit": 4, "times": 1}])", {}, "3 4 - "},
                    ProgramCase{R"([{"exit": 3, "args": ["a", "c"]}])", {"a", "b", "c"}, "3 3 3 "},
                    ProgramCase{R"([{"exit": 3, "args": ["c", "a"]}])", {"a", "b", "c"}, "- - - "},
                    ProgramCase{R"([{"exit": 3, "args": ["a", "a"]}])", {"a"}, "- - - "},
                    ProgramCase{R"([{"exit": 9, "user": "ann"}])", {"-U", "ann", "x"}, "9 9 9 "},
                    ProgramCase{R"([{"exit": 9, "user": "ann"}])", {"-U", "bob", "x"}, "- - - "},
                    ProgramCase{R"([{"noStart": true, "times": 2}, {"exit": 1}])", {}, "! ! 1 "}));

TEST_F(LabTest, AProgramRuleSaysAllThatTheProgramDoes) {
  Patch(R"({"programs": {"/bin/p": [{"signal": 9, "stdout": "out", "stderr": {"bytes": "ff"},
                                     "delayMs": 5, "skipEffect": true}]}})");
  const auto told = Lab::TakeProgramBehaviour(*Lab::ReadState(), "/bin/p", {});
  EXPECT_FALSE(told.exitCode);
  EXPECT_EQ(told.signal, 9);
  EXPECT_EQ(told.standardOutput, "out");
  EXPECT_EQ(told.standardError, "\xff");
  EXPECT_EQ(told.delayMs, 5);
  EXPECT_TRUE(told.skipEffect);
}

}  // namespace
