#pragma once

#include "console/widgets/dialog.h"

namespace Tarnel {

// Puts the whole host back to its defaults and restarts it. Gives 0 when the operator backed out or
// a command could not be started; else it does not come back.
class RestoreDialog : public Dialog {
 public:
  explicit RestoreDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  bool IsConfirmed();
  bool Restore();

  TextArea* _questionText;
};

}  // namespace Tarnel
