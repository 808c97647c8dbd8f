#include <gtest/gtest.h>

#include "console/hostops/command_runner.h"
#include "console/screen/frame.h"
#include "tests/hostops/command_run.h"

namespace Tarnel::Testing {
namespace {

using Lines = std::vector<std::string>;

class StewClient : public testing::Test {
 protected:
  static void SetUpTestSuite() { LoadScenario("sample"); }

  // How the host's management client answers a user's command, as members of a JSON object.
  void Answer(const std::string& command, const std::string& user, const std::string& members) {
    _rules += (_rules.empty() ? "" : ",") + (R"({"args": [")" + command) + R"("], "user": ")" +
              user + "\"," + members + "}";
  }
  void TellHost() const { SetState(R"({"programs": {"/bin/stew-cmd": [)" + _rules + "]}}"); }

  // The runs of programs since the case began.
  Lines Runs() const {
    const Lines lines = TraceLines();
    return {lines.begin() + static_cast<ptrdiff_t>(_traceStart), lines.end()};
  }

 private:
  std::string _rules;
  size_t _traceStart = TraceLines().size();
};

std::string TraceOf(const char* user, const char* command) {
  return std::string("program /bin/stew-cmd stew-cmd -U ") + user + " " + command;
}

constexpr char NOT_NORMAL_LINE[] = "user.err Run Command did not terminate normally";

std::string RetryLine(const char* command) {
  return std::string("user.info Unable to execute command stew-cmd ") + command +
         " using user guest. Using user tarnel";
}

TEST_F(StewClient, RunsAgainOnlyWhenTheUserMayNot) {
  const std::string tooMuch = R"("stdout": ")" + std::string(300, 'o') + R"(", "stderr": ")" +
                              std::string(300, 'e') + R"(", "exit": 3)";
  struct {
    const char* command;
    std::string guest;
    std::string tarnel;  // empty: the command is not run again
    int32_t code;
    int32_t stored;  // of each output; where it is 0, only of the standard output
    Lines log;
  } const rows[] = {
      {"fails", tooMuch, "", 3, 100, {}},
      {"killed", R"("signal": 9)", "", -1, 0, {NOT_NORMAL_LINE}},
      // For the second run there is room for 256 bytes.
      {"admin-only", R"("exit": 255)", tooMuch, 3, 256, {RetryLine("admin-only")}},
      {"closed", R"("exit": 255)", R"("exit": 255)", 255, 0, {RetryLine("closed")}},
      {"breaks", R"("exit": 255)", R"("signal": 9)", -1, 0, {RetryLine("breaks"), NOT_NORMAL_LINE}},
  };
  Lines runs;
  for (const auto& row : rows) {
    Answer(row.command, "guest", row.guest);
    runs.push_back(TraceOf("guest", row.command));
    if (row.tarnel.empty()) continue;
    Answer(row.command, "tarnel", row.tarnel);
    runs.push_back(TraceOf("tarnel", row.command));
  }
  TellHost();
  for (const auto& row : rows) {
    const Log log;
    const char* argv[] = {"stew-cmd", "-U", "guest", row.command, nullptr};
    char out[256];
    char err[256];
    int32_t outLength = 100;
    int32_t errLength = 100;
    EXPECT_EQ(RunStewCmd("/bin/stew-cmd", argv, out, &outLength, err, &errLength, nullptr, 0),
              row.code);
    EXPECT_EQ(outLength, row.stored) << row.command;
    if (row.stored > 0) {
      EXPECT_EQ(errLength, row.stored) << row.command;
    }
    EXPECT_EQ(Logged(log), row.log);
  }
  EXPECT_EQ(Runs(), runs);
}

constexpr char ASKED[] = "user.info stew-cmd invocation: get ";
constexpr char FAILED[] = "user.err stew-cmd invocation failure: ";

TEST_F(StewClient, AQueryLooksAtTheFirstFourBytes) {
  struct {
    const char* query;
    const char* reply;
    bool answer;
    std::string lastLine;  // how it begins
  } const rows[] = {
      {"line", R"("exit": 0, "stdout": "true\n")", true, ASKED},
      {"longer", R"("exit": 0, "stdout": "trueish")", true, ASKED},
      {"true-in-failure", R"("exit": 1, "stdout": "true")", true, FAILED},
      {"one-short", R"("exit": 0, "stdout": "tru")", false, ASKED},
      {"capital", R"("exit": 0, "stdout": "True")", false, ASKED},
      {"to-stderr", R"("exit": 0, "stdout": "", "stderr": "true")", false, ASKED},
      {"not-permitted", R"("exit": 255)", false, FAILED},
      {"killed", R"("signal": 9)", false, FAILED},
      {"absent", R"("noStart": true)", false, FAILED + std::string("No such file or directory")},
  };
  for (const auto& row : rows) Answer(row.query, "tarnel", row.reply);
  TellHost();
  for (const auto& row : rows) {
    const Log log;
    EXPECT_EQ(QueryStewBool(row.query), row.answer) << row.query;
    const Lines lines = Logged(log);
    ASSERT_FALSE(lines.empty());
    EXPECT_EQ(lines.front(), std::string(ASKED) + row.query);
    EXPECT_TRUE(lines.back().starts_with(row.lastLine)) << lines.back();
  }
}

TEST_F(StewClient, OtherCommandsActForTheOperator) {
  Frame::SetLoginName("root");
  StewRefresh();
  AutostopAndPowerOffVms(true);
  AutostopAndPowerOffVms(false);
  const std::string autostop = TraceOf("root", "hostsvc/autostartmanager/autostop");
  EXPECT_EQ(Runs(), Lines({TraceOf("root", "internalsvc/refresh"), autostop,
                           "program /bin/powerOffVms powerOffVms", autostop,
                           "program /bin/powerOffVms powerOffVms --terminate"}));
}

}  // namespace
}  // namespace Tarnel::Testing
