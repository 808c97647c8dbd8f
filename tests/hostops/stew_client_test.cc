#include <gtest/gtest.h>

#include <cstring>

#include "hostops/command_runner.h"
#include "shell/frame.h"
#include "tests/hostops/command_run.h"

namespace Tarnel::Testing {
namespace {

using Lines = std::vector<std::string>;

class StewClient : public testing::Test {
 protected:
  static void SetUpTestSuite() { LoadScenario("default"); }

  // How the host's management client is to behave: the list of its rules.
  static void TellStewCmd(const std::string& rules) {
    SetState(R"({"programs": {"/bin/stew-cmd": )" + rules + "}}");
  }
  // The runs of programs since the case began.
  Lines Runs() const {
    const Lines lines = TraceLines();
    return {lines.begin() + static_cast<ptrdiff_t>(_traceStart), lines.end()};
  }

 private:
  size_t _traceStart = TraceLines().size();
};

std::string TraceOf(const char* user, const char* command) {
  return std::string("program /bin/stew-cmd stew-cmd -U ") + user + " " + command;
}

struct RetryCase {
  const char* name;
  const char* rules;
  int32_t code;
  bool retried;
  Lines log;
};

class RunStewCmdTable : public StewClient, public testing::WithParamInterface<RetryCase> {};

constexpr char RETRY_LINE[] =
    "user.info Unable to execute command stew-cmd some/command using user guest. Using user tarnel";

TEST_P(RunStewCmdTable, RunsAgainOnlyWhenTheUserMayNot) {
  TellStewCmd(GetParam().rules);
  const Log log;
  const char* argv[] = {"stew-cmd", "-U", "guest", "some/command", nullptr};
  EXPECT_EQ(RunStewCmd("/bin/stew-cmd", argv, nullptr, nullptr, nullptr, nullptr, nullptr, 0),
            GetParam().code);
  Lines runs = {TraceOf("guest", "some/command")};
  if (GetParam().retried) {
    runs.push_back(TraceOf("tarnel", "some/command"));
  }
  EXPECT_EQ(Runs(), runs);
  EXPECT_EQ(Logged(log), GetParam().log);
  EXPECT_STREQ(argv[2], GetParam().retried ? "tarnel" : "guest");
}

INSTANTIATE_TEST_SUITE_P(
    All, RunStewCmdTable,
    testing::Values(RetryCase{"success", R"([{"exit": 0}])", 0, false, {}},
                    RetryCase{"failure", R"([{"exit": 254}])", 254, false, {}},
                    RetryCase{"guest_may_not",
                              R"([{"user": "guest", "exit": 255}, {"exit": 3}])",
                              3,
                              true,
                              {RETRY_LINE}},
                    RetryCase{"nobody_may", R"([{"exit": 255}])", 255, true, {RETRY_LINE}},
                    RetryCase{"killed",
                              R"([{"signal": 9}])",
                              -1,
                              false,
                              {"user.err Run Command did not terminate normally"}},
                    RetryCase{"killed_at_the_retry",
                              R"([{"user": "guest", "exit": 255}, {"signal": 15}])",
                              -1,
                              true,
                              {RETRY_LINE, "user.err Run Command did not terminate normally"}}),
    [](const auto& row) { return std::string(row.param.name); });

TEST_F(StewClient, TheRetryHasRoomFor256Bytes) {
  TellStewCmd(R"([{"user": "guest", "exit": 255, "stdout": "no", "stderr": "no"},
                  {"exit": 0, "stdout": ")" +
              std::string(300, 'o') + R"(", "stderr": ")" + std::string(300, 'e') + R"("}])");
  const char* argv[] = {"stew-cmd", "-U", "guest", "some/command", nullptr};
  char out[256];
  char err[256];
  int32_t outLength = 1;
  int32_t errLength = 255;
  EXPECT_EQ(RunStewCmd("/bin/stew-cmd", argv, out, &outLength, err, &errLength, nullptr, 0), 0);
  EXPECT_EQ(std::string(out, static_cast<size_t>(outLength)), std::string(256, 'o'));
  EXPECT_EQ(std::string(err, static_cast<size_t>(errLength)), std::string(256, 'e'));
}

struct QueryCase {
  const char* name;
  const char* rule;
  bool answer;
  // What its failure is logged with; null: it counts as no failure.
  const char* failure;
};

class QueryStewBoolTable : public StewClient, public testing::WithParamInterface<QueryCase> {};

TEST_P(QueryStewBoolTable, LooksAtTheFirstFourBytes) {
  const QueryCase& row = GetParam();
  TellStewCmd(std::string("[") + row.rule + "]");
  const Log log;
  EXPECT_EQ(QueryStewBool("some/query"), row.answer);
  const Lines lines = Logged(log);
  ASSERT_FALSE(lines.empty());
  EXPECT_EQ(lines.front(), "user.info stew-cmd invocation: get some/query");
  const std::string prefix = "user.err stew-cmd invocation failure: ";
  if (row.failure == nullptr) {
    EXPECT_EQ(lines.size(), 1U);
  } else {
    EXPECT_EQ(lines.back().substr(0, prefix.size() + strlen(row.failure)), prefix + row.failure);
  }
}

INSTANTIATE_TEST_SUITE_P(
    All, QueryStewBoolTable,
    testing::Values(
        QueryCase{"line", R"({"exit": 0, "stdout": "true\n"})", true, nullptr},
        QueryCase{"bare", R"({"exit": 0, "stdout": "true"})", true, nullptr},
        QueryCase{"longer", R"({"exit": 0, "stdout": "trueish"})", true, nullptr},
        QueryCase{"true_in_failure", R"({"exit": 1, "stdout": "true"})", true, ""},
        QueryCase{"one_short", R"({"exit": 0, "stdout": "tru"})", false, nullptr},
        QueryCase{"capital", R"({"exit": 0, "stdout": "True"})", false, nullptr},
        QueryCase{"blank_first", R"({"exit": 0, "stdout": " true"})", false, nullptr},
        QueryCase{"false_line", R"({"exit": 0, "stdout": "false\n"})", false, nullptr},
        QueryCase{"empty", R"({"exit": 0, "stdout": ""})", false, nullptr},
        QueryCase{"to_stderr", R"({"exit": 0, "stdout": "", "stderr": "true"})", false, nullptr},
        QueryCase{"not_permitted", R"({"exit": 255, "stdout": ""})", false, ""},
        QueryCase{"killed", R"({"signal": 9, "stdout": ""})", false, ""},
        QueryCase{"no_program", R"({"noStart": true})", false, "No such file or directory"}),
    [](const auto& row) { return std::string(row.param.name); });

TEST_F(StewClient, AQueryAsksAsTheFixedUser) {
  TellStewCmd("null");
  EXPECT_FALSE(QueryStewBool("stewsvc/auth/lockdown_is_enabled"));
  EXPECT_TRUE(QueryStewBool("stewsvc/auth/lockdown_is_possible"));
  EXPECT_EQ(Runs(), Lines({TraceOf("tarnel", "stewsvc/auth/lockdown_is_enabled"),
                           TraceOf("tarnel", "stewsvc/auth/lockdown_is_possible")}));
}

TEST_F(StewClient, ARefreshActsForTheOperator) {
  Frame::SetLoginName("root");
  StewRefresh();
  EXPECT_EQ(Runs(), Lines({TraceOf("root", "internalsvc/refresh")}));
}

TEST_F(StewClient, MachinesAreStoppedThenPoweredOff) {
  Frame::SetLoginName("root");
  AutostopAndPowerOffVms(true);
  AutostopAndPowerOffVms(false);
  const std::string autostop = TraceOf("root", "hostsvc/autostartmanager/autostop");
  EXPECT_EQ(Runs(), Lines({autostop, "program /bin/powerOffVms powerOffVms", autostop,
                           "program /bin/powerOffVms powerOffVms --terminate"}));
}

}  // namespace
}  // namespace Tarnel::Testing
