#pragma once

#include "console/widgets/dialog.h"

namespace Tarnel {

// Asks whether the pending changes of the management network are to be applied. Gives 0 for Esc,
// 1 for an answer.
class ApplyChangesDialog : public Dialog {
 public:
  // rebootNeeded: what is pending takes a restart of the host.
  ApplyChangesDialog(Frame* parent, bool rebootNeeded);

  bool IsYes() const { return _yes; }

 protected:
  int Run() override;

 private:
  TextArea* _question;
  bool _yes = false;
  bool _rebootNeeded;
};

}  // namespace Tarnel
