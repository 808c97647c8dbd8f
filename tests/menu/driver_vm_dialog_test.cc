#include "console/menu/driver_vm_dialog.h"

#include <gtest/gtest.h>

namespace Tarnel {

namespace {

std::string Row(const std::string& address, const std::string& vendor, const std::string& device) {
  return "{align:padding:13}" + address + "{/align}{align:padding:24}" + vendor +
         "{/align}{align:padding:30}" + device + "{/align}";
}

TEST(FormatDeviceRow, ShortensWhatIsTooLong) {
  const auto of = [](size_t length) { return std::string(length, 'x'); };
  EXPECT_EQ(FormatDeviceRow("", "", ""), Row("", "", ""));
  EXPECT_EQ(FormatDeviceRow(of(15), of(22), of(28)), Row(of(15), of(22), of(28)));
  EXPECT_EQ(FormatDeviceRow(of(16), of(23), of(29)),
            Row(of(12) + "...", of(19) + "...", of(25) + "..."));
}

}  // namespace

}  // namespace Tarnel
