#pragma once

#include "console/widgets/dialog.h"
#include "console/widgets/item.h"
#include "console/widgets/item_list.h"

namespace Tarnel {

// Asks the management agent to switch lockdown mode. Gives 1 for Enter, whatever became of it.
class LockdownDialog : public Dialog {
 public:
  explicit LockdownDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  void Apply();

  ItemList* _list;
  bool _wasEnabled;
  CheckItem _enableItem;
};

}  // namespace Tarnel
