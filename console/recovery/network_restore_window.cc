#include "console/recovery/network_restore_window.h"

#include <string>

#include "console/network/switch_operations.h"
#include "console/recovery/restore_lattice_dialog.h"
#include "console/recovery/restore_network_dialogs.h"
#include "console/recovery/safe_mode_network.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"

namespace Tarnel {

namespace {

constexpr int TEXT_TITLE = 66;

// The rows, by the numbers of their texts.
enum Row : int { ROW_SETTINGS = 67, ROW_STANDARD_SWITCH = 68, ROW_LATTICE = 69 };

// The number of a row's explanation.
constexpr int ExplanationOf(int row) { return row + 3; }

constexpr char HINT_RESTORE[] =
    "{color:white}<Enter>{/color}{color:light-grey} Restore{/color}{align:right}"
    "{color:white}<Esc>{/color}{color:light-grey} Log Out{/color}{/align}";

}  // namespace

NetworkRestoreWindow::NetworkRestoreWindow(Frame* parent) : RootWindow(parent) {
  const bool onLattice = IsManagementOnLattice();
  AddRow(ROW_SETTINGS, true);
  AddRow(ROW_STANDARD_SWITCH, onLattice);
  AddRow(ROW_LATTICE, onLattice);
  _list->SetItems(_items);
  if (!onLattice) {
    GreyRow(ROW_STANDARD_SWITCH);
    GreyRow(ROW_LATTICE);
  }
}

void NetworkRestoreWindow::AddRow(int id, bool selectable) {
  _rowIds.push_back(id);
  _items.push_back(std::make_unique<LabelItem>(Text(id), selectable));
}

void NetworkRestoreWindow::GreyRow(int id) {
  for (size_t row = 0; row < _rowIds.size(); ++row) {
    if (_rowIds[row] == id) {
      _items[row]->SetSelectable(false);
      _items[row]->SetLabel("{color:dark-grey}" + Text(id) + "{/color}");
    }
  }
}

int NetworkRestoreWindow::Run() {
  ShowScreen();
  SetLeftTitle(Text(TEXT_TITLE));
  for (;;) {
    switch (WaitKey(true)) {
      case ESC_KEY:
        return 1;
      case KEY_DOWN:
        _list->MoveDown();
        ShowRightPane();
        break;
      case KEY_UP:
        _list->MoveUp();
        ShowRightPane();
        break;
      case ENTER_KEY:
        OpenRow();
        break;
      default:
        break;
    }
  }
}

// The right hint stands until the focus moves.
void NetworkRestoreWindow::RefreshPanes() {
  _list->Repaint();
  ShowRightPane();
  SetLeftHint(HINT_SELECT_ROW);
  SetRightHint(HINT_CHANGE_OR_EXIT);
}

void NetworkRestoreWindow::ShowRightPane() {
  const int row = FocusedRow();
  _rightText->SetText("");
  SetRightTitle(Text(row));
  _rightText->SetText(Text(ExplanationOf(row)));
  SetRightHint(row == ROW_SETTINGS ? HINT_RESTART_OR_LOG_OUT : HINT_RESTORE);
}

void NetworkRestoreWindow::OpenRow() {
  switch (FocusedRow()) {
    case ROW_SETTINGS:
      RestoreNetworkDialog(this).Exec();
      break;
    case ROW_STANDARD_SWITCH:
      RestoreStandardSwitch();
      break;
    case ROW_LATTICE:
      RestoreLatticeDialog(this).Exec();
      break;
    default:
      break;
  }
  ShowScreen();
}

// Whatever became of the move, it is not offered again during this visit.
void NetworkRestoreWindow::RestoreStandardSwitch() {
  SafeModeNetworkDialog dialog(this);
  if (dialog.Exec() != 0) {
    GreyRow(ROW_STANDARD_SWITCH);
    _list->MoveDown();
  }
}

}  // namespace Tarnel
