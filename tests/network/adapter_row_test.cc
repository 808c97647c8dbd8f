#include "console/network/adapter_row.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

namespace Tarnel {

namespace {

TEST(ComparePnicNames, SortsByNumberWhereThereIsOne) {
  const std::vector<std::string> sorted = {"Upnic3",  "corenic0", "corenic10", "corenic2", "eth",
                                           "eth0",    "upni",     "upnic",     "upnic-1",  "upnic2",
                                           "upnic9z", "upnic10",  "upnic_1",   "upnix1"};
  for (size_t a = 0; a < sorted.size(); ++a) {
    for (size_t b = 0; b < sorted.size(); ++b) {
      EXPECT_EQ(ComparePnicNames(sorted[a], sorted[b]), a < b) << sorted[a] << " " << sorted[b];
    }
  }
  EXPECT_FALSE(ComparePnicNames("upnic1a", "upnic01") || ComparePnicNames("upnic01", "upnic1a"));
}

struct RowCase {
  const char* name;
  const char* label;
  const char* shownName;
  const char* shownRest;
};

TEST(FormatAdapterRow, CutsWhatIsTooLong) {
  const std::string mac = "02:fc:00:00:00:1a";
  const RowCase cases[] = {
      {"", "", "", " (02:fc:00:00:00:1a)"},
      {"upnic123456", "12345678", "upnic123456", "12345678 (02:fc:00:00:00:1a)"},
      {"upnic1234567", "123456789", "upnic123...", "123456789 (...c:00:00:00:1a)"},
      {"u", "12345678901234", "u", "12345678901234 (...00:00:1a)"},
      {"u", "123456789012345", "u", "12345678901... (...00:00:1a)"},
  };
  for (const auto& [name, label, shownName, shownRest] : cases) {
    const std::string columns = "{align:padding:13}" + std::string(shownName) +
                                "{/align}{align:padding:30}" + shownRest + "{/align}";
    EXPECT_EQ(FormatAdapterRow(name, label, mac, "Connected", ""), columns + "Connected ");
    EXPECT_EQ(FormatAdapterRow(name, label, mac, "Disconnected", "softSwitch0"),
              columns + "Disconnected (...)");
  }
}

}  // namespace

}  // namespace Tarnel
