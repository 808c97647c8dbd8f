#pragma once

#include "console/widgets/dialog.h"

namespace Tarnel {

// Asks whether to throw the host's network configuration away, and has it done. Gives 0 when the
// operator backed out here, 1 otherwise, whatever became of the reset.
class RestoreNetworkDialog : public Dialog {
 public:
  explicit RestoreNetworkDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  bool IsConfirmed();

  TextArea* _questionText;
};

// Stops the virtual machines, after a warning, resets the network and shows what happened. Gives 0
// when the operator backed out at the warning, with nothing touched.
class DoRestoreNetworkDialog : public Dialog {
 public:
  explicit DoRestoreNetworkDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  // False when the program failed.
  bool PowerOffVms();
  void RestoreNetwork(bool machinesAreOff);

  TextArea* _progressText;
};

}  // namespace Tarnel
