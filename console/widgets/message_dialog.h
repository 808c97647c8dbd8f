#pragma once

#include <string>

#include "console/widgets/dialog.h"

namespace Tarnel {

// A message that stands until the operator has confirmed it with Enter. Gives 1.
class MessageDialog : public Dialog {
 public:
  // Title and body are texts of the catalogue.
  MessageDialog(Frame* parent, int titleId, int bodyId);
  MessageDialog(Frame* parent, int titleId, const std::string& body);

 protected:
  int Run() override;

 private:
  int _titleId;
  std::string _body;
};

}  // namespace Tarnel
