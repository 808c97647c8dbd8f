#pragma once

#include "console/widgets/dialog.h"

namespace Tarnel {

// Tells that nobody may log in at this console. Gives 0.
class LoginDisabledDialog : public Dialog {
 public:
  explicit LoginDisabledDialog(Frame* parent);

 protected:
  int Run() override;
};

}  // namespace Tarnel
