#pragma once

namespace Tarnel {

// The rows of the menu, by the numbers of their texts in the catalogue.
enum MenuRow : int {
  ROW_BLANK = 3,
  ROW_PASSWORD = 5,
  ROW_LOCKDOWN = 6,
  ROW_DRIVER_VM = 7,
  ROW_NETWORK = 8,
  ROW_RESTART_NETWORK = 9,
  ROW_TEST_NETWORK = 10,
  ROW_RESTORE_NETWORK = 11,
  ROW_SUPPORT = 12,
  ROW_LOGS = 13,
  ROW_TROUBLESHOOTING = 14,
  ROW_RESET = 15,
  ROW_KEYBOARD = 16,
};

}  // namespace Tarnel
