#pragma once

#include <sys/types.h>
#include <termios.h>

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "tests/support/cell.h"

namespace Tarnel::Testing {

// What a key sends, whatever the terminal type.
namespace Keys {
inline constexpr char F2[] = "\x1b[12~";
inline constexpr char F4[] = "\x1b[14~";
inline constexpr char F12[] = "\x1b[24~";
inline constexpr char ESC[] = "\x1b";
inline constexpr char SPACE[] = " ";
}  // namespace Keys

// How long a test waits for what must come before it fails.
inline constexpr std::chrono::milliseconds PATIENCE{10000};

struct Launch {
  std::string program = "/bin/tarnel";
  std::vector<std::string> arguments = {};
  std::string term = "linux";  // empty: no TERM in the environment
  int columns = 80;
  int rows = 25;
  std::vector<std::string> environment = {};  // "NAME=value", besides TERM and PATH
};

// A program on a pseudo-terminal that it controls, and the operator in front of it: an emulated
// terminal shows what the program writes. Every wait has a deadline; one that fails is a test
// failure that tells the screen, the last keys and the last log lines.
class Terminal {
 public:
  using Condition = std::function<bool()>;

  explicit Terminal(const Launch& launch = {});
  // Ends a program that still runs, by a signal.
  ~Terminal();

  // Another time for all waits than the usual one.
  void SetPatience(std::chrono::milliseconds patience);
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

  // What the terminal shows; all output that has come is taken in first.
  Cell At(int x, int y);
  std::string Row(int y);
  std::string Picture();
  // As RowColours() writes them.
  std::string Colours(int y);
  bool CursorVisible();
  int CursorX();
  int CursorY();
  // The screen that programs take over and give back, where the terminal type has one.
  bool OnAlternateScreen();

  // All bytes that the program has written.
  const std::string& Output();
  // The palette was reset, which is the last thing that the console does.
  bool PaletteWasReset();
  termios Modes() const;
  // The modes are those from before the start.
  bool ModesAreRestored() const;
  pid_t Pid() const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

// Waits until a condition holds; false when it does not within the time.
bool WaitUntil(const std::function<bool()>& condition, std::chrono::milliseconds time = PATIENCE);

}  // namespace Tarnel::Testing
