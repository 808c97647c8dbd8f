#include "hostapi/coreplane/system.h"
#include "hostapi/kernel.h"
#include "tests/hosts/lab/lab_test.h"

namespace {

class ServicesTest : public LabTest {};

std::string StateAt(const std::string& pointer) {
  return Lab::ReadState()->at(Lab::Json::json_pointer(pointer)).dump();
}

int Execute(const std::string& line) {
  return Coreplane::Util::Coreplane_Exec(line, false, true, false);
}

TEST_F(ServicesTest, CommandLinesActOnTheHost) {
  struct Row {
    const char* command;
    int result;
    const char* node;
    const char* value;  // of the node afterwards
  };
  const Row rows[] = {
      {"/bin/sh /etc/init.d/SSH status", 3, "/services/SSH/running", "false"},
      {"/bin/sh /etc/init.d/SSH start", 0, "/services/SSH/running", "true"},
      {"/bin/sh /etc/init.d/SSH status", 0, "/network/rulesets/sshServer/on", "false"},
      {"/bin/stew-cmd -U root hostsvc/start_ssh", 0, "/network/rulesets/sshServer/on", "true"},
      {"/bin/stew-cmd -U root hostsvc/enable_ssh", 0, "/services/SSH/enabled", "true"},
      {"/bin/stew-cmd -U root hostsvc/stop_ssh", 0, "/network/rulesets/sshServer/on", "false"},
      {"/bin/sh /etc/init.d/OstrelShell restart", 0, "/services/OstrelShell/running", "true"},
      {"/bin/stew-cmd -U root hostsvc/disable_ostrel_shell", 0, "/services/OstrelShell/enabled",
       "false"},
      {"/sbin/ostrelcli system settings advanced set -o /UserVars/OstrelShellTimeOut -i 86400", 0,
       "/options/advanced/~1UserVars~1OstrelShellTimeOut/value", "86400"},
      {"/sbin/nodecli system settings advanced set -o /UserVars/OstrelShellTimeOut -i 5m", 1,
       "/options/advanced/~1UserVars~1OstrelShellTimeOut/value", "86400"},
      {"/sbin/nodecli system settings advanced set -o /UserVars/None -i 5", 1, "/agent/refreshes",
       "0"},
      {"/bin/sh /sbin/services.sh stop", 0, "/services/stewardd/running", "false"},
      {"/bin/stew-cmd -U root internalsvc/refresh", 1, "/agent/refreshes", "0"},
      {"/sbin/corebacktrace -w -n stewardd -o core% -d /var/tmp/", 1, "/agent/refreshes", "0"},
      {"/bin/sh /sbin/services.sh start", 0, "/services/stewardd/running", "true"},
      {"/sbin/corebacktrace -w -n stewardd -o core% -d /var/tmp/", 0, "/agent/refreshes", "0"},
  };
  for (const auto& [command, result, node, value] : rows) {
    EXPECT_EQ(Execute(command), result) << command;
    EXPECT_EQ(StateAt(node), value) << command;
  }
  EXPECT_NE(Lab::ReadFile("/var/tmp/core1"), "");
}

TEST_F(ServicesTest, ACommandLineRunsToItsEnd) {
  EXPECT_EQ(Execute("  /bin/sh\t/sbin/services.sh   nonsense "), 1);
  Patch(R"({"programs": {"/sbin/services.sh": [{"signal": 9}],
                         "/bin/false": [{"noStart": true}]}})");
  EXPECT_EQ(Execute("/bin/sh /sbin/services.sh start"), 137);
  EXPECT_EQ(Thrown([] { Execute("/bin/false"); }), "/bin/false: No such file or directory");
  EXPECT_EQ(Thrown([] { Execute(" "); }), "nothing to run");
}

TEST_F(ServicesTest, AStartOfTheHostBringsUpWhatIsEnabled) {
  Patch(R"({"services": {"SSH": {"enabled": true}, "OstrelShell": {"running": true}}})");
  Lab::StartAfresh();
  EXPECT_EQ(StateAt("/services/SSH/running"), "true");
  EXPECT_EQ(StateAt("/services/OstrelShell/running"), "false");
}

TEST_F(ServicesTest, RulesetsAndKernelOptionsAreThoseOfTheState) {
  const Coreplane::System::SystemInfoImpl system;
  EXPECT_EQ(system.GetFirewallRulesetById("none"), nullptr);
  const auto ruleset = system.GetFirewallRulesetById("sshServer");
  EXPECT_TRUE(ruleset->FollowsService());
  ruleset->Enable();
  EXPECT_EQ(StateAt("/network/rulesets/sshServer/on"), "true");
  ruleset->Disable();
  EXPECT_EQ(StateAt("/network/rulesets/sshServer/on"), "false");
  Patch(R"({"options": {"kernel": {"set": true, "clear": false}}})");
  EXPECT_TRUE(Coreplane::System::KernelOpts::GetRuntimeValueBool("set"));
  EXPECT_FALSE(Coreplane::System::KernelOpts::GetRuntimeValueBool("clear"));
  EXPECT_FALSE(Coreplane::System::KernelOpts::GetRuntimeValueBool("none"));
}

}  // namespace
