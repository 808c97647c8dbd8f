#pragma once

#include <memory>
#include <vector>

#include "console/widgets/item.h"
#include "console/widgets/root_window.h"

namespace Tarnel {

// The screen "Network Restore Options": three ways back from a broken management network. Those
// that are about a distributed switch are offered when the management interface hangs on one at
// the time the screen is entered. Gives 1.
class NetworkRestoreWindow : public RootWindow {
 public:
  explicit NetworkRestoreWindow(Frame* parent);

 protected:
  int Run() override;
  void RefreshPanes() override;

 private:
  void AddRow(int id, bool selectable);
  void GreyRow(int id);
  void OpenRow();
  void RestoreStandardSwitch();

  int FocusedRow() const { return _rowIds[static_cast<size_t>(_list->FocusIndex())]; }
  // Tells about the focused row.
  void ShowRightPane();

  std::vector<std::unique_ptr<LabelItem>> _items;
  // The catalogue's number of each row's text, parallel to the items.
  std::vector<int> _rowIds;
};

}  // namespace Tarnel
