#include <gtest/gtest.h>

#include "console/network/error_text.h"

namespace Tarnel {

namespace {

struct ErrorText {
  const char* exception;
  const char* shown;
};

TEST(ErrorText, IsWhatStandsBetweenTheFirstEqualsSignAndTheLastSemicolon) {
  const ErrorText cases[] = {
      {"Status = not found;", " not found"},
      {"a=b=c;d;e", "b=c;d"},
      {"no equals sign; and more", "no equals sign"},
      {"Status = no semicolon", ""},
      {"wrong; order = to the end", " to the end"},
      {"=;", ""},
      {";=", ""},
      {"", ""},
  };
  for (const auto& [exception, shown] : cases) {
    EXPECT_EQ(ExtractErrorText(Nodeplane::Lib::NodeplaneException(exception)), shown) << exception;
  }
}

}  // namespace

}  // namespace Tarnel
