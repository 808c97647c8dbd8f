#pragma once

#include <memory>
#include <string>
#include <vector>

#include "console/widgets/item.h"
#include "console/widgets/root_window.h"

namespace Tarnel {

// The menu "System Customization" of an operator who is logged in: the hub of the console. Leaving
// it is the log out. Gives 1.
class GeneralWindow : public RootWindow {
 public:
  GeneralWindow(Frame* parent, bool hasPassword);

  void Redraw() override;

 protected:
  int Run() override;
  void RefreshPanes() override;

 private:
  void AddRow(int id, bool selectable);
  // Greys every row of this id.
  void DisableRow(int id);
  void AddRows();
  bool IsLockdownOffered() const;
  static bool IsNetworkOffered();

  int FocusedRow() const { return _rowIds[static_cast<size_t>(_list->FocusIndex())]; }
  void HandleKey(int key);
  void LeaveRow();
  void TurnPage(int key);
  void OpenRow();
  void ChangePassword();
  void ChangeLockdown();
  void RestartNetwork();
  void ResetHost();
  void ViewLog(int number);

  // Tells about the focused row.
  void ShowRightPane();
  std::string RightText(int row);
  std::string PasswordText();
  std::string LockdownText();
  std::string KeyboardText() const;
  std::string NetworkText() const;
  std::string ConfiguredAddressText() const;
  std::string Ipv6Text() const;

  std::vector<std::string> _supportPages;
  size_t _supportPage = 0;
  std::vector<std::unique_ptr<LabelItem>> _rowItems;
  bool _lockdownEnabled = false;
  bool _hasPassword;
  // A dialog may have changed the password since it was asked for.
  bool _recheckPassword = false;
  // The catalogue's number of each row, parallel to the items.
  std::vector<int> _rowIds;
};

}  // namespace Tarnel
