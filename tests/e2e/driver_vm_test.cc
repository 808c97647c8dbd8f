// An operator gives devices to the DriverVM and takes them back.

#include <gtest/gtest.h>

#include <optional>

#include "tests/support/lab.h"
#include "tests/support/operator.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

using Lines = std::vector<std::string>;

constexpr char SCENARIO[] = "driver-vm-devices";
constexpr char OTHERS_MOVE[] = "Device Assignment Warning";

// The dialog, opened anew for each case by one operator.
class DriverVMTest : public testing::Test {
 protected:
  DriverVMTest() {
    LoadScenario(SCENARIO);
    _operator.emplace();
    // The row's pane has no title of its own.
    _operator->Press({DOWN, DOWN});
  }

  void Open(const std::string& patch) {
    LoadScenario(SCENARIO, patch);
    _log.emplace();
    _operator->Press({ENTER});
    _operator->WaitFor("DriverVM Configuration");
    _operator->Settle();
  }

  void Close(const std::string& key) {
    _operator->Press({key});
    _operator->WaitFor("Configure Password");
    _operator->Settle();
  }

  // The rows of the list, without the blanks at their ends.
  Lines Rows() const {
    Lines rows;
    for (int y = 10; y < 20; ++y) {
      std::string row = _operator->Row(y).substr(4, 71);
      row.erase(row.find_last_not_of(' ') + 1);
      if (!row.empty()) rows.push_back(row);
    }
    return rows;
  }

  // What is checked, as "X" and ".".
  std::string Marks() const {
    std::string marks;
    for (const std::string& row : Rows()) {
      if (row[0] == '[') marks += row[1] == 'X' ? 'X' : '.';
    }
    return marks;
  }

  Lines Errors() const {
    Lines errors;
    for (const LogLine& line : _log->Lines()) {
      if (line.level == "user.err") errors.push_back(line.text);
    }
    return errors;
  }

  std::optional<Operator> _operator;
  std::optional<Log> _log;
};

constexpr char HEADING[] = "    PCI Device   Vendor                      Device";
constexpr char NATIVE[] = "[ ] 0000:02:00.0 Halden Systems          Gigabit Network Adapter";
constexpr char WIRELESS[] = "[ ] 0000:03:00.0 Halden Systems          Wireless Adapter 7";
constexpr char STORAGE[] = "[ ] 0000:04:00.0 Nordmark Storage Co...  Nordmark SAS Controller N...";
constexpr char PORT[] = "[ ] 0000:04:00.1 Nordmark Storage Co...  Management Port";
constexpr char OLD[] = "[ ] 0000:05:00.0 Halden Systems          Old SCSI Host";
constexpr char FLASH[] = "[X] 0000:08:00.0 Halden Systems          Flash Drive";
constexpr char NONE[] = "There are no available devices";

struct Listing {
  const char* patch;
  Lines rows;
  const char* error;
};

TEST_F(DriverVMTest, ListsWhatQualifies) {
  constexpr char NO_DEPENDENT[] = "TARNEL: Error: no dependent for device";
  const Listing listings[] = {
      {"", {HEADING, WIRELESS, STORAGE, PORT, OLD, FLASH}, NO_DEPENDENT},
      {R"({"options": {"kernel": {"driverVMAllowDevicesWithDrivers": true}}})",
       {HEADING, NATIVE, WIRELESS, STORAGE, PORT, OLD, FLASH},
       NO_DEPENDENT},
      {R"({"hardware": {"pci": []}})", {HEADING, NONE}, ""},
      {R"({"faults": [{"operation": "PciDevice::IsPassthruCapable", "message": "told"}]})",
       {HEADING, NONE},
       "TARNEL: Getting devices for DriverVM failed: told"},
      {R"({"faults": [{"operation": "PciDevice::GetAddress", "object": "0000:08:00.0",
                       "message": "told", "fromCall": 1}]})",
       {HEADING, WIRELESS, STORAGE, PORT, OLD,
        "[X]              Halden Systems          Flash Drive"},
       "TARNEL: Error: exception getting PCI string for device"},
  };
  for (const Listing& listing : listings) {
    SCOPED_TRACE(listing.patch);
    Open(listing.patch);
    EXPECT_EQ(Rows(), listing.rows);
    if (*listing.error != '\0') {
      _log->WaitFor({"user.err", listing.error});
    } else {
      EXPECT_EQ(Errors(), Lines());
    }
    // Without a device these do nothing.
    if (listing.rows.back() == NONE) {
      const std::string picture = _operator->Picture();
      _operator->Press({SPACE, "d"});
      EXPECT_EQ(_operator->Picture(), picture);
    }
    Close(listing.rows.back() == NONE ? ESC : ENTER);
  }
}

TEST_F(DriverVMTest, ShowsTheNamesInFull) {
  Open("");
  _operator->Press({DOWN, "D"});
  _operator->WaitFor("Device Details");
  EXPECT_NE(_operator->Picture().find("Vendor: Nordmark Storage Components Device: Nordmark SAS"),
            std::string::npos);
  _operator->WaitFor("PCI Device: 0000:04:00.0");
  _operator->Press({ESC});
  _operator->WaitFor("Device Details");
  _operator->Press({ENTER});
  EXPECT_EQ(Rows().size(), 6U);
}

struct Toggle {
  const char* patch;
  int row;
  int times;
  bool warns;
  const char* marks;
  Lines trace;
  const char* error;
};

constexpr char NO_CHILDREN[] = R"({"faults": [{"operation": "PassthruDevice::GetPassthruChildren",
                                               "returns": []}]})";
constexpr char SET_3[] = R"(PassthruDevice::SetPassthruState wlan0 "3")";
constexpr char SET_2[] = R"(PassthruDevice::SetPassthruState wlan0 "2")";
constexpr char OWN[] = R"(PciDevice::SetOwner 0000:03:00.0 "Halvren")";
constexpr char DISOWN[] = R"(PciDevice::SetOwner 0000:03:00.0 "")";
constexpr char SET_GROUP_3[] = R"(PassthruDevice::SetPassthruState sas0 "3")";
constexpr char SET_GROUP_2[] = R"(PassthruDevice::SetPassthruState sas0 "2")";
constexpr char OWN_GROUP[] = R"(PciDevice::SetOwner 0000:04:00.0 "Halvren")";

const Toggle TOGGLES[] = {
    {"", 0, 1, false, "X...X", {SET_3, OWN}, ""},
    {"", 0, 2, false, "....X", {SET_3, OWN, SET_2, DISOWN}, ""},
    {"", 1, 1, true, ".XX.X", {SET_GROUP_3, OWN_GROUP}, ""},
    // Whatever the DriverVM still owns goes back with a group.
    {"",
     1,
     2,
     true,
     ".....",
     {SET_GROUP_3, OWN_GROUP, SET_GROUP_2, DISOWN, R"(PciDevice::SetOwner 0000:04:00.0 "")",
      R"(PciDevice::SetOwner 0000:04:00.1 "")", R"(PciDevice::SetOwner 0000:08:00.0 "")"},
     ""},
    {"",
     3,
     1,
     false,
     "....X",
     {},
     "TARNEL: Error.. did not find dependent device for a device which should be passthru capable"},
    {NO_CHILDREN,
     0,
     1,
     false,
     "....X",
     {SET_3, OWN},
     "TARNEL: Error: dependent devicewlan0has no passthru children"},
    {NO_CHILDREN,
     4,
     1,
     false,
     "....X",
     {R"(PassthruDevice::SetPassthruState flash0 "2")"},
     "TARNEL: Error: dependent deviceflash0has no passthru children"},
};

TEST_F(DriverVMTest, MovesADeviceAndAllThatShareItsFate) {
  for (const Toggle& toggle : TOGGLES) {
    SCOPED_TRACE(std::to_string(toggle.row) + " " + toggle.marks + toggle.error);
    Open(toggle.patch);
    _operator->Press(Lines(static_cast<size_t>(toggle.row), DOWN));
    for (int i = 0; i < toggle.times; ++i) {
      _operator->Press({SPACE});
      EXPECT_EQ(_operator->Picture().find(OTHERS_MOVE) != std::string::npos, toggle.warns);
      if (toggle.warns) _operator->Press({ENTER});
    }
    EXPECT_EQ(Marks(), toggle.marks);
    EXPECT_EQ(TraceLines(), toggle.trace);
    if (*toggle.error != '\0') _log->WaitFor({"user.err", toggle.error});
    // What was done stays done.
    Close(ESC);
    EXPECT_EQ(TraceLines(), toggle.trace);
  }
}

}  // namespace

}  // namespace Tarnel::Testing
