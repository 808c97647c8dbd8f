#pragma once

#include <gtest/gtest.h>

#include <functional>
#include <string>

#include "console/screen/frame.h"
#include "tests/support/curses_screen.h"
#include "tests/support/fake_time.h"
#include "tests/support/keys.h"
#include "tests/support/signal_thread.h"

namespace Tarnel::Testing {

// Forms on a screen in process, and the operator in front of them, who types each key only when
// the last one has been dealt with.
class FormPlayer : public testing::Test {
 protected:
  using Opening = std::function<int(Frame*)>;

  // Opens a form, types the keys and gives the form's result. A form that ends before the last key
  // is a test failure, one that waits for more ends with TarnelTimeout.
  int Play(const std::string& keys, const Opening& open);

  bool HasShown(const std::string& text) const { return _seen.find(text) != std::string::npos; }

  // Of all screens that a key was typed on: their text, and '|' for a visible cursor or '.' for
  // none.
  std::string _seen;
  std::string _cursors;

 private:
  void LookAndType(const std::string& key);

  SignalThread _signalThread;

 protected:
  CursesScreen _screen{80, 25};
};

}  // namespace Tarnel::Testing
