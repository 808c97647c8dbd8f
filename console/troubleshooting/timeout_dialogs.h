#pragma once

#include <cstdint>

#include "console/widgets/dialog.h"
#include "console/widgets/input_item.h"
#include "console/widgets/item_list.h"

namespace Tarnel {

// Both forms take whole minutes and close on Enter, with 1, also when a value was invalid: that
// one is told of and left as it was.

// Sets for how long the local shell and SSH take new sessions, and when an idle session ends.
class ShellTimeoutDialog : public Dialog {
 public:
  explicit ShellTimeoutDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  bool IsConfirmed();
  InputItem& FocusedItem();
  void ApplyAvailability();
  void ApplyIdle();

  ItemList* _list;
  int32_t _availabilityMinutes;
  int32_t _idleMinutes;
  InputItem _availabilityItem;
  InputItem _idleItem;
};

// Sets the idle limit of this console.
class TarnelTimeoutDialog : public Dialog {
 public:
  explicit TarnelTimeoutDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  bool IsConfirmed();
  void Apply();

  ItemList* _list;
  int32_t _oldSeconds;
  InputItem _timeoutItem;
};

}  // namespace Tarnel
