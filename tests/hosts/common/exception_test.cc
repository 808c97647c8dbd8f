#include "hostapi/nodeplane/exception.h"

#include <gtest/gtest.h>

#include <string>

namespace Nodeplane {
namespace {

TEST(NodeplaneException, KeepsItsTextThroughCopies) {
  Lib::NodeplaneException kept("");
  try {
    throw Lib::NodeplaneException(std::string(1000, 'x'));
  } catch (const std::exception& caught) {
    kept = dynamic_cast<const Lib::NodeplaneException&>(caught);
  }
  EXPECT_EQ(std::string(kept.what()), std::string(1000, 'x'));
}

TEST(StrPrintf, TakesAnyLength) {
  EXPECT_EQ(Misc::StrPrintf("%s", ""), "");
  EXPECT_EQ(Misc::StrPrintf("%d%% of \"%s\"", 50, "all"), "50% of \"all\"");
  const std::string longText(1 << 20, 'y');
  EXPECT_EQ(Misc::StrPrintf("<%s|%s>", longText.c_str(), longText.c_str()),
            "<" + longText + "|" + longText + ">");
}

}  // namespace
}  // namespace Nodeplane
