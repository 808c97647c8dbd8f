#include <gtest/gtest.h>

#include "hostapi/nodeplane/exception.h"
#include "hostops/command_runner.h"
#include "tests/support/lab.h"

namespace Tarnel::Testing {
namespace {

TEST(CollapseWhitespace, LeavesOneBlankBetweenWords) {
  const std::pair<const char*, const char*> rows[] = {
      {"", ""},
      {" \t\n\v\f\r", ""},
      {"a", "a"},
      {"  a \t b\n", "a b"},
      {"a\r\nb", "a b"},
      {"one  two   three", "one two three"},
      // Bytes above 127 are part of words, the second byte of a no-break space among them.
      {"\xc3\xa4 \xc2\xa0 \xff", "\xc3\xa4 \xc2\xa0 \xff"},
  };
  for (const auto& [text, collapsed] : rows) {
    EXPECT_EQ(CollapseWhitespace(text), collapsed) << '"' << text << '"';
  }
  EXPECT_EQ(CollapseWhitespace(std::string(" a\0 b ", 6)), std::string("a\0 b", 4));
}

struct TimeoutCase {
  const char* name;
  const char* patch;
  int32_t read;
  // What a read gives after 90 has been stored.
  int32_t readAfterStore;
};

class TarnelTimeoutValueTable : public testing::TestWithParam<TimeoutCase> {};

TEST_P(TarnelTimeoutValueTable, FallsBackTo600AndFailsSilently) {
  LoadScenario("default", GetParam().patch);
  EXPECT_EQ(GetTarnelTimeoutValue(), GetParam().read);
  SetTarnelTimeoutValue(90);
  EXPECT_EQ(GetTarnelTimeoutValue(), GetParam().readAfterStore);
}

INSTANTIATE_TEST_SUITE_P(
    All, TarnelTimeoutValueTable,
    testing::Values(
        TimeoutCase{"stored", R"({"options": {"advanced": {"/UserVars/TarnelTimeOut":
                                  {"value": 61}}}})",
                    61, 90},
        TimeoutCase{"zero", R"({"options": {"advanced": {"/UserVars/TarnelTimeOut":
                                {"value": 0}}}})",
                    0, 90},
        TimeoutCase{"missing", R"({"options": {"advanced": {"/UserVars/TarnelTimeOut": null}}})",
                    600, 600},
        TimeoutCase{"text", R"({"options": {"advanced": {"/UserVars/TarnelTimeOut":
                                {"type": "text", "value": "61"}}}})",
                    600, 600},
        TimeoutCase{"search_fails", R"({"faults": [{"operation": "AdvancedOptionImpl::FindOption",
                                        "message": "no options"}]})",
                    600, 600},
        TimeoutCase{"read_fails", R"({"faults": [{"operation": "AdvancedIntegerOption::GetValue",
                                      "message": "no value", "times": 1}]})",
                    600, 90},
        TimeoutCase{"store_fails", R"({"options": {"advanced": {"/UserVars/TarnelTimeOut":
                                       {"value": 61}}},
                                       "faults": [{"operation": "AdvancedIntegerOption::SetValue",
                                       "message": "read only"}]})",
                    61, 61}),
    [](const auto& row) { return std::string(row.param.name); });

TEST(LookupManagementInterface, SeesTheHostAsItIsNow) {
  LoadScenario("static");
  const auto interface = LookupManagementInterface();
  ASSERT_NE(interface, nullptr);
  EXPECT_EQ(interface->GetName() + "\n", GetState("/network/management"));

  LoadScenario("no-management");
  EXPECT_EQ(LookupManagementInterface(), nullptr);

  for (const char* operation :
       {"NetworkInfoImpl::UpdateManagementInterface", "NetworkInfoImpl::GetManagementInterface"}) {
    LoadScenario("static", std::string(R"({"faults": [{"message": "down", "operation": ")") +
                               operation + R"("}]})");
    EXPECT_THROW(LookupManagementInterface(), Nodeplane::Lib::NodeplaneException) << operation;
  }
}

}  // namespace
}  // namespace Tarnel::Testing
