#pragma once

#include <sys/types.h>
#include <termios.h>

#include <chrono>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "tests/support/descriptor.h"
#include "tests/support/emulator.h"
#include "tests/support/keys.h"
#include "tests/support/wait.h"

namespace Tarnel::Testing {

struct Launch {
  std::string program = "/bin/tarnel";
  std::vector<std::string> arguments = {};
  std::string term = "linux";  // empty: no TERM in the environment
  int columns = 80;
  int rows = 25;
  std::vector<std::string> environment = {};  // "NAME=value", besides TERM and PATH
};

// Environment of a program whose clock runs so many times faster.
std::vector<std::string> ClockTimes(int factor);

// A program on a pseudo-terminal that it controls, and the operator in front of it: the terminal
// shows what the program had written when the last wait ended. Every wait has a deadline; one that
// fails is a test failure that tells the screen, the last keys and the last log lines.
class Terminal : public Emulator {
 public:
  using Condition = std::function<bool()>;

  explicit Terminal(const Launch& launch = {});
  // Ends a program that still runs, by a signal.
  ~Terminal() override;

  // Another time for all waits than the usual one.
  void SetPatience(std::chrono::milliseconds patience) { _patience = patience; }
  void Type(const std::string& keys);
  void Resize(int columns, int rows);
  void Signal(int signal) const;
  // The operator's terminal goes away.
  void HangUp();

  // Waits until the screen shows a text somewhere, or a whole picture.
  bool WaitFor(const std::string& text);
  bool WaitForPicture(const std::string& picture);
  // Waits for anything else; what says what, for the failure.
  bool WaitUntil(const Condition& condition, const std::string& what);
  // Waits until the program sleeps and has written nothing for a moment.
  void Settle();
  // Waits for the program's end and gives its exit status; 256 and more is the signal that killed
  // it, plus 256. A program that does not end is a test failure and gives -1.
  int WaitForEnd();
  bool HasEnded();

  // All bytes that the program has written.
  const std::string& Output() const { return _output; }
  termios Modes() const;
  // The modes are those from before the start.
  bool ModesAreRestored() const;
  pid_t Pid() const { return _pid; }

 private:
  // Takes output in for at most so long, or until some has come; false when none came.
  bool TakeOutput(std::chrono::milliseconds time);
  void TakeAllOutput();
  std::string Describe() const;

  Descriptor _master;
  termios _modes{};  // as they were before the start
  pid_t _pid = -1;
  std::optional<int> _status;
  std::string _output;
  std::string _keys;
  std::chrono::milliseconds _patience = PATIENCE;
};

}  // namespace Tarnel::Testing
