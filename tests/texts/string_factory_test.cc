#include "console/texts/string_factory.h"

#include <gtest/gtest.h>

#include <climits>

#include "hostapi/nodeplane/exception.h"
#include "tests/support/lab.h"

namespace Tarnel::Testing {
namespace {

constexpr int FIRST_UNUSED = 274;
constexpr int PRODUCT_LINE = 2;

TEST(StringFactory, IsOneForTheProcess) {
  EXPECT_EQ(StringFactory::ForLocale("de_DE"), nullptr);
  StringFactory* const english = StringFactory::ForLocale("en_US");
  ASSERT_NE(english, nullptr);
  EXPECT_EQ(StringFactory::ForLocale("de_DE"), english);
}

TEST(StringFactory, HasATextForEachIdAndNoOther) {
  StringFactory& strings = *StringFactory::ForLocale("en_US");
  EXPECT_STREQ(strings.GetString(0), "Customize System/View Logs");
  EXPECT_STREQ(strings.GetString(FIRST_UNUSED - 1), "TARNEL idle timeout");
  for (int id = 4; id < FIRST_UNUSED; ++id) EXPECT_STRNE(strings.GetString(id), "") << id;
  for (const int id : {3, FIRST_UNUSED, INT_MAX, -1, INT_MIN}) {
    EXPECT_STREQ(strings.GetString(id), "") << id;
  }
  // A value is put behind these, so their last blank counts.
  for (const int id : {137, 145, 146, 148}) {
    EXPECT_EQ(std::string(strings.GetString(id)).back(), ' ') << id;
  }
}

TEST(StringFactory, ReadsTheProductLineUntilItHasIt) {
  LoadScenario("sample", R"({
    "trace": {"reads": true},
    "faults": [{"operation": "SysinfoUtil::SysinfoGet", "times": 1, "message": "no record"}]})");
  StringFactory& strings = *StringFactory::ForLocale("en_US");
  EXPECT_THROW(strings.GetString(PRODUCT_LINE), Nodeplane::Lib::NodeplaneException);
  const char* const line = strings.GetString(PRODUCT_LINE);
  EXPECT_EQ(strings.GetString(PRODUCT_LINE), line);
  EXPECT_STREQ(line, "Ostrel Laboratory Host 8.0.2 (Corelin release Build 24022)");
  EXPECT_EQ(TraceLines().size(), 2U) << "reads of the kernel";
}

}  // namespace
}  // namespace Tarnel::Testing
