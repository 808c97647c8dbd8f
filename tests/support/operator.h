#pragma once

#include <string>
#include <vector>

#include "tests/support/terminal.h"

namespace Tarnel::Testing {

// The console with an operator who is logged in and sees the menu.
class Operator : public Terminal {
 public:
  explicit Operator(const Launch& launch = {});

  // Types each and waits until the screen has settled: a frame that opens drops what was typed
  // ahead of it.
  void Press(const std::vector<std::string>& keys);
  void PressTimes(const std::string& key, int times);
  // Goes down to the row whose pane has this title.
  void GoTo(const std::string& title);
  // A row of the right pane without the blanks around it.
  std::string RightPane(int y) const;
};

}  // namespace Tarnel::Testing
