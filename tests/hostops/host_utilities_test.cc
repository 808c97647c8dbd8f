#include <gtest/gtest.h>

#include "console/hostops/command_runner.h"
#include "hostapi/nodeplane/exception.h"
#include "tests/support/lab.h"

namespace Tarnel::Testing {
namespace {

TEST(CollapseWhitespace, LeavesOneBlankBetweenWords) {
  const std::pair<std::string, std::string> rows[] = {
      {"", ""},
      {" \t\n\v\f\r", ""},
      {"  a \t b\n", "a b"},
      {"one  two   three", "one two three"},
      // Bytes above 127 are part of words, the second byte of a no-break space among them.
      {"\xc3\xa4 \xc2\xa0 \xff", "\xc3\xa4 \xc2\xa0 \xff"},
      {std::string(" a\0 b ", 6), std::string("a\0 b", 4)},
  };
  for (const auto& [text, collapsed] : rows) {
    EXPECT_EQ(CollapseWhitespace(text), collapsed) << '"' << text << '"';
  }
}

TEST(TarnelTimeoutValue, FallsBackTo600AndFailsSilently) {
  LoadScenario("sample", R"({
      "options": {"advanced": {"/UserVars/TarnelTimeOut": {"value": 0}}},
      "faults": [
          {"operation": "AdvancedOptionImpl::FindOption", "message": "no", "times": 2},
          {"operation": "AdvancedIntegerOption::GetValue", "message": "no", "times": 1},
          {"operation": "AdvancedIntegerOption::SetValue", "message": "no", "times": 1}]})");
  SetTarnelTimeoutValue(90);
  EXPECT_EQ(GetTarnelTimeoutValue(), 600) << "the search fails";
  EXPECT_EQ(GetTarnelTimeoutValue(), 600) << "the read fails";
  SetTarnelTimeoutValue(90);
  EXPECT_EQ(GetTarnelTimeoutValue(), 0) << "the store has failed";
  SetTarnelTimeoutValue(90);
  EXPECT_EQ(GetTarnelTimeoutValue(), 90);
  for (const char* option : {R"({"type": "text", "value": "61"})", "null"}) {
    SetState(std::string(R"({"options": {"advanced": {"/UserVars/TarnelTimeOut": )") + option +
             "}}}");
    SetTarnelTimeoutValue(90);
    EXPECT_EQ(GetTarnelTimeoutValue(), 600) << option;
  }
}

TEST(LookupManagementInterface, SeesTheHostAsItIsNow) {
  LoadScenario("static");
  const auto interface = LookupManagementInterface();
  ASSERT_NE(interface, nullptr);
  EXPECT_EQ(interface->GetName() + "\n", GetState("/network/management"));
  SetState(R"({"network": {"management": null}, "faults": [
      {"operation": "NetworkInfoImpl::UpdateManagementInterface", "message": "no", "times": 1},
      {"operation": "NetworkInfoImpl::GetManagementInterface", "message": "no", "times": 1}]})");
  for (const char* failing : {"Update", "Get"}) {
    EXPECT_THROW(LookupManagementInterface(), Nodeplane::Lib::NodeplaneException) << failing;
  }
  EXPECT_EQ(LookupManagementInterface(), nullptr);
}

}  // namespace
}  // namespace Tarnel::Testing
