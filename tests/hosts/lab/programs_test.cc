#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <vector>

#include "tests/support/lab.h"

namespace Tarnel::Testing {

namespace {

// What a shell command line printed, with "!" before the lines of standard error, and its status.
std::string RunLine(const std::string& command) {
  FILE* pipe = popen(
      ("{ " + command + "; } 2>/tmp/errors; end=$?; sed 's/^/!/' /tmp/errors; echo \"= $end\"")
          .c_str(),
      "re");
  std::string output;
  for (int c = 0; (c = fgetc(pipe)) != EOF;) output += static_cast<char>(c);
  pclose(pipe);
  return output;
}

struct AgentCase {
  std::string patch;
  std::string command;
  std::string result;
  std::string agent;  // afterwards
};

class Agent : public testing::TestWithParam<AgentCase> {};

TEST_P(Agent, AnswersAndActs) {
  LoadScenario("sample", GetParam().patch);
  EXPECT_EQ(RunLine("/bin/stew-cmd " + GetParam().command), GetParam().result);
  EXPECT_EQ(RunLine("lab get /agent/lockdown/on; lab get /agent/refreshes"),
            GetParam().agent + "= 0\n");
}

constexpr char IMPOSSIBLE[] = R"({"agent":{"lockdown":{"possible":false}}})";
constexpr char LOCKED[] = R"({"agent":{"lockdown":{"on":true}}})";

INSTANTIATE_TEST_SUITE_P(
    Commands, Agent,
    testing::Values(
        AgentCase{"", "-U tarnel stewsvc/auth/lockdown_is_enabled", "false\n= 0\n", "false\n0\n"},
        AgentCase{LOCKED, "-U root stewsvc/auth/lockdown_is_enabled", "true\n= 0\n", "true\n0\n"},
        AgentCase{"", "-U tarnel stewsvc/auth/lockdown_is_possible", "true\n= 0\n", "false\n0\n"},
        AgentCase{IMPOSSIBLE, "-U tarnel stewsvc/auth/lockdown_is_possible", "false\n= 0\n",
                  "false\n0\n"},
        AgentCase{"", "-U tarnel stewsvc/auth/lockdown_mode_enter", "= 0\n", "true\n0\n"},
        AgentCase{LOCKED, "-U tarnel stewsvc/auth/lockdown_mode_exit", "= 0\n", "false\n0\n"},
        AgentCase{IMPOSSIBLE, "-U tarnel stewsvc/auth/lockdown_mode_enter",
                  "!Lockdown mode is not possible on this host.\n= 1\n", "false\n0\n"},
        AgentCase{"", "-U root internalsvc/refresh", "= 0\n", "false\n1\n"},
        AgentCase{"", "-U root no/such", "!stew-cmd: unknown command no/such\n= 1\n", "false\n0\n"},
        AgentCase{"", "internalsvc/refresh", "!usage: stew-cmd -U USER COMMAND\n= 1\n",
                  "false\n0\n"}));

struct ToldCase {
  std::string path;
  std::string arguments;
  std::string told;  // one entry of the path's list
  std::string result;
};

class Told : public testing::TestWithParam<ToldCase> {};

// The scenario speaks for one run; the next is the program's own.
TEST_P(Told, ObeysTheScenarioAndLeavesALine) {
  const auto& [path, arguments, told, result] = GetParam();
  LoadScenario("sample", R"({"programs":{")" + path + R"(":[)" + told + "]}}");
  EXPECT_EQ(RunLine(path + " " + arguments), result);
  EXPECT_EQ(TraceLines().at(0),
            "program " + path + " " + path + (arguments.empty() ? "" : " " + arguments));
  EXPECT_EQ(GetState("/agent/lockdown/on"), "false\n");
}

constexpr char KEYGEN[] = "/usr/lib/halvren/openssh/bin/ssh-keygen";

INSTANTIATE_TEST_SUITE_P(
    Programs, Told,
    testing::Values(ToldCase{"/bin/stew-cmd", "-U root stewsvc/auth/lockdown_mode_enter",
                             R"({"exit":255,"stderr":"no\n","skipEffect":true})", "!no\n= 255\n"},
                    ToldCase{"/bin/stew-cmd", "-U root stewsvc/auth/lockdown_is_enabled",
                             R"({"stdout":"true"})", "true= 0\n"},
                    ToldCase{"/bin/stew-cmd", "-U root stewsvc/auth/lockdown_is_enabled",
                             R"({"user":"tarnel","exit":9})", "false\n= 0\n"},
                    ToldCase{"/bin/openssl", "version", R"({"exit":3,"stdout":"?"})", "?= 3\n"},
                    ToldCase{KEYGEN, "-l", R"({"stderr":"bad key\n","exit":255})",
                             "!bad key\n= 255\n"},
                    ToldCase{"/sbin/powerOffVms", "", R"({"signal":9})", "!Killed\n= 137\n"}));

TEST(Programs, RealOnesRunBehindTheirPaths) {
  LoadScenario("sample");
  EXPECT_EQ(RunLine("/bin/openssl x509 -in /etc/halvren/ssl/rui.crt -noout -subject"),
            "subject=CN = lab\n= 0\n");
  EXPECT_EQ(RunLine(std::string(KEYGEN) + " -l -f /etc/ssh/ssh_host_rsa_key" + " >/dev/null"),
            "= 0\n");
  EXPECT_EQ(RunLine("echo text | /bin/less -"), "text\n= 0\n");
}

TEST(Programs, BothPathsOfPowerOffStopTheMachines) {
  for (const std::string path : {"/bin/powerOffVms", "/sbin/powerOffVms --terminate"}) {
    LoadScenario("sample", R"({"virtualMachines":[{"name":"a","running":true}]})");
    EXPECT_EQ(RunLine(path), "= 0\n");
    EXPECT_EQ(GetState("/virtualMachines/0/running"), "false\n");
  }
}

TEST(Programs, AutostopLeavesMachinesThatHaveNone) {
  LoadScenario("sample", R"({"virtualMachines":[{"name":"a","running":true,"autostop":true},
                                                {"name":"b","running":true}]})");
  EXPECT_EQ(RunLine("/bin/stew-cmd -U root hostsvc/autostartmanager/autostop"), "= 0\n");
  EXPECT_EQ(GetState("/virtualMachines/0/running"), "false\n");
  EXPECT_EQ(GetState("/virtualMachines/1/running"), "true\n");
}

// Else a file that is opened next would become standard output.
TEST(Programs, OpenDescriptorsThatTheyStartWithout) {
  LoadScenario("sample", R"({"programs":{"/bin/stew-cmd":[{"delayMs":20000}]}})");
  EXPECT_EQ(RunLine("/bin/stew-cmd -U root internalsvc/refresh <&- >&- 2>&- &"
                    "until grep -q stew /etc/halvren/lab/trace; do usleep 5000; done;"
                    "for fd in 0 1 2; do readlink /proc/$!/fd/$fd; done; kill $!"),
            "/dev/null\n/dev/null\n/dev/null\n= 0\n");
}

}  // namespace

}  // namespace Tarnel::Testing
