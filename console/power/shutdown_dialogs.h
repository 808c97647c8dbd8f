#pragma once

#include "console/widgets/dialog.h"
#include "console/widgets/item.h"
#include "console/widgets/item_list.h"

namespace Tarnel {

// Shuts the host down or restarts it. Gives 0 when the operator backed out.
class ShutdownDialog : public Dialog {
 public:
  explicit ShutdownDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  void ShutDown();
  void Restart();

  ItemList* _list;
  CheckItem _forceItem;
};

// Stops the virtual machines, by force unless gracefully, and has the host go down. Comes back,
// with 0, only when the host's command could not be started.
class ShutdownConfirmDialog : public Dialog {
 public:
  ShutdownConfirmDialog(Frame* parent, bool graceful);

 protected:
  int Run() override;

 private:
  bool _graceful;
};

// The same for a restart of the host.
class RebootConfirmDialog : public Dialog {
 public:
  RebootConfirmDialog(Frame* parent, bool graceful);

 protected:
  int Run() override;

 private:
  bool _graceful;
};

// Asks whether to go on although virtual machines run. Gives 1 for yes.
class RunningVMsWarningDialog : public Dialog {
 public:
  explicit RunningVMsWarningDialog(Frame* parent);

 protected:
  int Run() override;
};

}  // namespace Tarnel
