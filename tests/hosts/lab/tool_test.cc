#include <cstdio>

#include "hosts/lab/state/faults.h"
#include "tests/hosts/lab/lab_test.h"

namespace {

struct ToolCase {
  const char* command;
  // Both outputs, and the exit code behind them.
  const char* result;
};

class ToolTest : public LabTest, public testing::WithParamInterface<ToolCase> {};

std::string Shell(const std::string& command) {
  FILE* pipe = popen((command + " 2>&1").c_str(), "r");
  std::string output;
  for (int c = fgetc(pipe); c != EOF; c = fgetc(pipe)) output += static_cast<char>(c);
  return output + std::to_string(WEXITSTATUS(pclose(pipe)));
}

TEST_P(ToolTest, ShowsAndChangesTheHost) {
  EXPECT_EQ(Shell(GetParam().command), GetParam().result);
}

constexpr char USAGE[] =
    "usage: lab get [POINTER] | set PATCH | scenario NAME ... | trace [clear]\n2";

INSTANTIATE_TEST_SUITE_P(
    All, ToolTest,
    testing::Values(
        ToolCase{"lab", USAGE}, ToolCase{"lab nothing", USAGE}, ToolCase{"lab set", USAGE},
        ToolCase{"lab get /hardware/bmc", "1.44\n0"},
        ToolCase{"lab get /hardware/cpu/packages", "1\n0"},
        ToolCase{"lab set '{\"host\": {\"auditMode\": true}}' && lab get /host/auditMode",
                 "true\n0"},
        ToolCase{"lab scenario two-sockets audit && lab get /hardware/cpu/packages", "2\n0"},
        ToolCase{"lab scenario two-sockets static && lab get /host/auditMode", "false\n0"},
        ToolCase{"lab set '{'", "lab: patch: not JSON at byte 2\n2"},
        ToolCase{"lab set 7", "lab: patch: not an object\n2"},
        ToolCase{"lab scenario nosuch",
                 "lab: /usr/share/lab/scenarios/nosuch.json: No such file or directory\n2"}));

TEST_F(ToolTest, NewFaultsStartWithNewCounts) {
  const std::string command =
      "lab set '{\"faults\": [{\"operation\": \"o\", \"message\": \"m\", \"times\": 1}]}'";
  for (int i = 0; i < 2; ++i) {
    EXPECT_EQ(Shell(command), "0");
    EXPECT_TRUE(Lab::TakeFault(*Lab::ReadState(), {"o"}));
    EXPECT_FALSE(Lab::TakeFault(*Lab::ReadState(), {"o"}));
  }
}

}  // namespace
