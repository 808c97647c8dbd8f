#include "tests/hosts/lab/lab_test.h"

namespace {

using Nodeplane::Misc::StrPrintf;

class ProgramsTest : public LabTest {};

std::string StateAt(const char* pointer) {
  return Lab::ReadState()->at(Lab::Json::json_pointer(pointer)).dump();
}

TEST_F(ProgramsTest, TheAgentAnswersAndActs) {
  struct Row {
    const char* patch;
    const char* command;
    const char* result;
    const char* node;
    const char* value;  // of the node afterwards
  };
  constexpr char LOCKED[] = R"({"agent":{"lockdown":{"on":true}}})";
  const Row rows[] = {
      {"{}", "stewsvc/auth/lockdown_is_enabled", "false\n= 0\n", "/agent/lockdown/on", "false"},
      {LOCKED, "stewsvc/auth/lockdown_is_enabled", "true\n= 0\n", "/agent/lockdown/on", "true"},
      {"{}", "stewsvc/auth/lockdown_is_possible", "true\n= 0\n", "/agent/lockdown/on", "false"},
      {"{}", "stewsvc/auth/lockdown_mode_enter", "= 0\n", "/agent/lockdown/on", "true"},
      {LOCKED, "stewsvc/auth/lockdown_mode_exit", "= 0\n", "/agent/lockdown/on", "false"},
      {"{}", "internalsvc/refresh", "= 0\n", "/agent/refreshes", "1"},
      {R"({"virtualMachines":[{"autostop":true,"running":true},{"running":true}]})",
       "hostsvc/autostartmanager/autostop", "= 0\n", "/virtualMachines",
       R"([{"autostop":true,"running":false},{"running":true}])"},
      {"{}", "no/such", "!stew-cmd: unknown command no/such\n= 1\n", "/agent/refreshes", "0"},
  };
  for (const auto& [patch, command, result, node, value] : rows) {
    Lab::LoadScenario("sample");
    Patch(patch);
    EXPECT_EQ(RunLine(std::string("/bin/stew-cmd -U tarnel ") + command), result) << command;
    EXPECT_EQ(StateAt(node), value) << command;
  }
}

TEST_F(ProgramsTest, ObeyTheScenarioAndLeaveALine) {
  struct Row {
    const char* path;
    const char* arguments;
    const char* told;  // one entry of the path's list
    const char* result;
  };
  const Row rows[] = {
      {"/bin/stew-cmd", " -U root stewsvc/auth/lockdown_mode_enter",
       R"({"exit":255,"stderr":"no\n","skipEffect":true})", "!no\n= 255\n"},
      {"/bin/stew-cmd", " -U root stewsvc/auth/lockdown_is_enabled", R"({"stdout":"true"})",
       "true= 0\n"},
      {"/bin/openssl", " version", R"({"exit":3,"stdout":"?"})", "?= 3\n"},
      {"/usr/lib/halvren/openssh/bin/ssh-keygen", " -l", R"({"stderr":"bad\n","exit":255})",
       "!bad\n= 255\n"},
      {"/sbin/powerOffVms", "", R"({"signal":9})", "!Killed\n= 137\n"},
  };
  for (const auto& [path, arguments, told, result] : rows) {
    Lab::LoadScenario("sample");
    Patch(StrPrintf(R"({"programs": {"%s": [%s]}})", path, told));
    EXPECT_EQ(RunLine(StrPrintf("%s%s", path, arguments)), result);
    EXPECT_EQ(Lab::ReadFile("/etc/halvren/lab/trace"),
              StrPrintf("program %s %s%s\n", path, path, arguments));
    EXPECT_EQ(StateAt("/agent/lockdown/on"), "false") << path;
  }
}

TEST_F(ProgramsTest, RealOnesRunBehindTheirPaths) {
  EXPECT_EQ(RunLine("/bin/openssl x509 -in /etc/halvren/ssl/rui.crt -noout -subject"),
            "subject=CN = lab\n= 0\n");
  EXPECT_EQ(RunLine("echo text | /bin/less -"), "text\n= 0\n");
}

TEST_F(ProgramsTest, CardsAreMovedAndTheConsoleIsTold) {
  struct Row {
    const char* command;
    const char* result;
    const char* slots;
  };
  const Row rows[] = {
      {"insert 1 '' root", "told\n= 0\n", R"([{},{"ids":["","root"]}])"},
      {"insert 0 other", "told\n= 0\n", R"([{"ids":["other"]},{"ids":["","root"]}])"},
      {"pull 1", "told\n= 0\n", R"([{"ids":["other"]},{}])"},
      {"pull 16", "!lab: 16: no slot; they count from 0 to 15\n= 2\n", R"([{"ids":["other"]},{}])"},
      {"insert 0", "!lab: card: insert SLOT ID ... or pull SLOT\n= 2\n",
       R"([{"ids":["other"]},{}])"},
  };
  for (const auto& [command, result, slots] : rows) {
    EXPECT_EQ(RunLine(std::string("trap 'echo told' USR1; echo $$ >/var/run/tarnel.pid; "
                                  "/bin/lab card ") +
                      command),
              result);
    EXPECT_EQ(StateAt("/hardware/cardSlots"), slots) << command;
  }
}

// Else a file that is opened next would become standard output.
TEST_F(ProgramsTest, OpenDescriptorsThatTheyStartWithout) {
  Patch(R"({"programs":{"/bin/stew-cmd":[{"delayMs":20000}]}})");
  EXPECT_EQ(RunLine("/bin/stew-cmd -U root internalsvc/refresh <&- >&- 2>&- &"
                    "until grep -q stew /etc/halvren/lab/trace; do usleep 5000; done;"
                    "for fd in 0 1 2; do readlink /proc/$!/fd/$fd; done; kill $!"),
            "/dev/null\n/dev/null\n/dev/null\n= 0\n");
}

}  // namespace
