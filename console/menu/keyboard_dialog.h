#pragma once

#include <memory>
#include <string>
#include <vector>

#include "console/widgets/dialog.h"
#include "console/widgets/item.h"
#include "console/widgets/item_list.h"
#include "hostapi/coreplane/system.h"

namespace Tarnel {

// Chooses the console's keyboard layout. Gives 1 when a layout was applied. Exceptions of the host
// pass to the caller.
class KeyboardDialog : public Dialog {
 public:
  explicit KeyboardDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  void SelectFocused();
  void Apply();

  ItemList* _list;
  Coreplane::System::SystemInfoImpl _systemInfo;
  std::vector<std::string> _layouts;
  // One for each layout, in the same order.
  std::vector<std::unique_ptr<RadioItem>> _items;
  // The button that is on.
  int _selected = 0;
};

}  // namespace Tarnel
