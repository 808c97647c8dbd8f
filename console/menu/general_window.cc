#include "console/menu/general_window.h"

#include <sys/ioctl.h>
#include <unistd.h>

#include <cstdlib>

#include "console/hostops/command_runner.h"
#include "console/login/change_password_dialog.h"
#include "console/menu/driver_vm_dialog.h"
#include "console/menu/keyboard_dialog.h"
#include "console/menu/lockdown_dialog.h"
#include "console/menu/log_viewer.h"
#include "console/menu/menu_rows.h"
#include "console/menu/support_pages.h"
#include "console/network/network_window.h"
#include "console/network/restart_network_dialogs.h"
#include "console/network/test_dialog.h"
#include "console/power/restore_dialog.h"
#include "console/recovery/network_restore_window.h"
#include "console/screen/key_map.h"
#include "console/screen/terminal.h"
#include "console/troubleshooting/troubleshooting_window.h"
#include "console/widgets/message_dialog.h"
#include "hostapi/coreplane/advanced_option.h"
#include "hostapi/nodeplane/exception.h"
#include "hostapi/nodeplane/host.h"

namespace Tarnel {

namespace {

constexpr char LOCKDOWN_IS_ENABLED[] = "stewsvc/auth/lockdown_is_enabled";
constexpr char LOCKDOWN_IS_POSSIBLE[] = "stewsvc/auth/lockdown_is_possible";

bool TerminalHasAnotherSize() {
  winsize size{};
  return ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_row != 0 && size.ws_col != 0 &&
         (size.ws_row != LINES || size.ws_col != COLS);
}

}  // namespace

GeneralWindow::GeneralWindow(Frame* parent, bool hasPassword)
    : RootWindow(parent), _hasPassword(hasPassword) {
  AddRows();
  _lockdownEnabled = QueryStewBool(LOCKDOWN_IS_ENABLED);
  _supportPages = LoadSupportPages();
}

bool GeneralWindow::IsLockdownOffered() const {
  return QueryStewBool(LOCKDOWN_IS_ENABLED) || QueryStewBool(LOCKDOWN_IS_POSSIBLE);
}

bool GeneralWindow::IsNetworkOffered() {
  const auto nic = LookupManagementInterface();
  return nic != nullptr && nic->IsConfigurable();
}

// The order in which the host is asked is part of what its trace shows.
void GeneralWindow::AddRows() {
  using namespace Nodeplane::System;
  const bool lockdown = IsLockdownOffered();
  const auto host = Nodeplane::HostFactory::GetHost();
  const HostSystem& system = host->GetSystem();
  const bool network = IsNetworkOffered();
  const bool pxe = Coreplane::Adv::UserAdvancedOptionImpl::HasUserOption("PXEBootEnabled");
  const int driverVm = system.GetDriverVMState();
  AddRow(ROW_PASSWORD, true);
  AddRow(ROW_LOCKDOWN, lockdown);
  AddRow(ROW_BLANK, false);
  if (driverVm == DRIVER_VM_PRESENT || driverVm == DRIVER_VM_CONFIGURABLE) {
    AddRow(ROW_DRIVER_VM, driverVm == DRIVER_VM_CONFIGURABLE);
  }
  for (const int row : {ROW_NETWORK, ROW_RESTART_NETWORK, ROW_TEST_NETWORK}) {
    AddRow(row, network);
  }
  AddRow(ROW_RESTORE_NETWORK, true);
  AddRow(ROW_BLANK, false);
  if (!runningOverSerial) {
    AddRow(ROW_KEYBOARD, true);
  }
  AddRow(ROW_TROUBLESHOOTING, true);
  for (const int row : {ROW_LOGS, ROW_SUPPORT}) {
    AddRow(ROW_BLANK, false);
    AddRow(row, true);
  }
  AddRow(ROW_BLANK, false);
  AddRow(ROW_RESET, !pxe);
  _list->SetItems(_rowItems);
  for (size_t row = 0; row < _rowIds.size(); ++row) {
    if (_rowIds[row] != ROW_BLANK && !_rowItems[row]->IsSelectable()) {
      DisableRow(_rowIds[row]);
    }
  }
}

void GeneralWindow::AddRow(int id, bool selectable) {
  _rowIds.push_back(id);
  _rowItems.push_back(std::make_unique<LabelItem>(Text(id), selectable));
}

void GeneralWindow::DisableRow(int id) {
  for (size_t row = 0; row < _rowIds.size(); ++row) {
    if (_rowIds[row] == id) {
      _rowItems[row]->SetSelectable(false);
      _rowItems[row]->SetLabel("{color:dark-grey}" + Text(id) + "{/color}");
    }
  }
}

int GeneralWindow::Run() {
  ShowScreen();
  for (;;) {
    const int key = WaitKey(true);
    if (key == ESC_KEY) {
      return 1;
    }
    HandleKey(key);
  }
}

void GeneralWindow::Redraw() { ShowRightPane(); }

void GeneralWindow::HandleKey(int key) {
  switch (key) {
    case KEY_DOWN:
      LeaveRow();
      _list->MoveDown();
      ShowRightPane();
      break;
    case KEY_UP:
      LeaveRow();
      _list->MoveUp();
      ShowRightPane();
      break;
    case KEY_NPAGE:
    case KEY_PPAGE:
      TurnPage(key);
      break;
    case ENTER_KEY:
      OpenRow();
      break;
    default:
      if (key >= '0' && key <= '9' && FocusedRow() == ROW_LOGS) {
        ViewLog(key - '0');
      }
  }
}

// The next visit of the support pages starts on the first one.
void GeneralWindow::LeaveRow() {
  if (FocusedRow() == ROW_SUPPORT) {
    _supportPage = 0;
  }
}

void GeneralWindow::TurnPage(int key) {
  if (FocusedRow() != ROW_SUPPORT) {
    return;
  }
  if (key == KEY_NPAGE && _supportPage + 1 < _supportPages.size()) {
    ++_supportPage;
    ShowRightPane();
  } else if (key == KEY_PPAGE && _supportPage != 0) {
    --_supportPage;
    ShowRightPane();
  }
}

void GeneralWindow::OpenRow() {
  switch (FocusedRow()) {
    case ROW_PASSWORD:
      ChangePassword();
      break;
    case ROW_LOCKDOWN:
      ChangeLockdown();
      break;
    case ROW_DRIVER_VM:
      DriverVMDialog(this).Exec();
      ShowScreen();
      break;
    case ROW_RESTORE_NETWORK:
      NetworkRestoreWindow(this).Exec();
      ShowScreen();
      break;
    case ROW_KEYBOARD:
      KeyboardDialog(this).Exec();
      ShowScreen();
      break;
    case ROW_TROUBLESHOOTING:
      TroubleShootingWindow(this).Exec();
      ShowScreen();
      break;
    case ROW_RESET:
      ResetHost();
      break;
    case ROW_NETWORK:
      NetworkWindow(this).Exec();
      ShowScreen();
      break;
    case ROW_RESTART_NETWORK:
      RestartNetwork();
      break;
    case ROW_TEST_NETWORK:
      TestDialog(this).Exec();
      break;
    default:
      break;
  }
}

void GeneralWindow::ChangePassword() {
  if (ChangePasswordDialog(this).Exec() != 0) {
    _recheckPassword = true;
  }
  ShowScreen();
}

void GeneralWindow::ChangeLockdown() {
  if (LockdownDialog(this).Exec() != 0) {
    _lockdownEnabled = QueryStewBool(LOCKDOWN_IS_ENABLED);
  }
  ShowScreen();
}

void GeneralWindow::RestartNetwork() {
  constexpr int TEXT_ERROR_TITLE = 17;
  constexpr int TEXT_NO_INTERFACE = 20;
  constexpr int TEXT_FAILED = 21;
  try {
    const auto nic = LookupManagementInterface();
    if (nic == nullptr) {
      MessageDialog(this, TEXT_ERROR_TITLE, TEXT_NO_INTERFACE).Exec();
    } else {
      RestartNetworkDialog(this, nic.get()).Exec();
    }
  } catch (const Nodeplane::Lib::NodeplaneException&) {
    MessageDialog(this, TEXT_ERROR_TITLE, TEXT_FAILED).Exec();
  }
  ShowScreen();
}

void GeneralWindow::ResetHost() {
  if (RestoreDialog(this).Exec() != 0) {
    _recheckPassword = true;
  }
}

// While the pager has the terminal, no frame is in the foreground and no key is waited for.
void GeneralWindow::ViewLog(int number) {
  const char* const path = FindLog(number);
  if (path == nullptr) {
    return;
  }
  fgFrame = nullptr;
  RunPager(path);
  if (TerminalHasAnotherSize()) {
    HandleResize();
    exit(0);
  }
  keypad(stdscr, FALSE);
  keypad(stdscr, TRUE);
  Activate(false);
  Activate(true);
  fgFrame = this;
  clearok(curscr, TRUE);
  Refresh();
}

}  // namespace Tarnel
