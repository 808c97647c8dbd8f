#include <sstream>
#include <vector>

#include "hostapi/coreplane/advanced_option.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/coreplane/system.h"
#include "hosts/lab/state/trace.h"
#include "tests/hosts/lab/lab_test.h"

namespace {

class TraceTest : public LabTest {};

TEST_F(TraceTest, HoldsChangesAndProgramsInTheirOrder) {
  Coreplane::System::SystemInfoImpl().SetSystemAlert("two words\n\"\t\xff");
  Lab::TraceProgram("/bin/stew-cmd", {"stew-cmd", "-U", "tarnel", "", "a b"});
  Coreplane::Network::NetworkInfoImpl().GetPnics();
  const auto option = Coreplane::Adv::AdvancedOptionImpl::FindOption("/UserVars/TarnelTimeOut");
  dynamic_cast<Nodeplane::Adv::AdvancedIntegerOption&>(*option).SetValue(30);
  EXPECT_EQ(TraceText(),
            "SystemInfoImpl::SetSystemAlert \"two words\\n\\\"\\t\xef\xbf\xbd\"\n"
            "program /bin/stew-cmd stew-cmd -U tarnel \"\" \"a b\"\n"
            "AdvancedIntegerOption::SetValue /UserVars/TarnelTimeOut \"30\"\n");
}

TEST_F(TraceTest, HoldsReadsWhenAScenarioAsksForThem) {
  Patch(R"({"trace": {"reads": true}})");
  Coreplane::Network::NetworkInfoImpl().GetPnics();
  Coreplane::Network::PnicImpl("corenic0").IsLinkUp();
  EXPECT_EQ(TraceText(), "read NetworkInfoImpl::GetPnics\nread PnicImpl::IsLinkUp corenic0\n");
}

TEST_F(TraceTest, LinesOfSeveralProcessesNeverMix) {
  const std::string lines[] = {std::string(300, 'a'), std::string(700, 'b')};
  std::vector<pid_t> writers;
  for (const std::string& line : lines) {
    writers.push_back(StartProcess([&line] {
      for (int i = 0; i < 200; ++i) Lab::TraceLine(line);
    }));
  }
  for (const pid_t writer : writers) EXPECT_EQ(ExitCode(writer), 0);
  std::istringstream trace(TraceText());
  int count = 0;
  for (std::string line; std::getline(trace, line); ++count) {
    ASSERT_TRUE(line == lines[0] || line == lines[1]);
  }
  EXPECT_EQ(count, 400);
}

}  // namespace
