#pragma once

#include <sys/types.h>

#include <array>
#include <csignal>
#include <string>

#include "console/widgets/dialog.h"
#include "hostapi/nodeplane/ip_address.h"

namespace Tarnel {

// Pings up to three addresses and resolves a name, each in a child process, so that Esc can end the
// test at any moment. Addresses are borrowed and may be null; an empty name is not resolved. Gives
// 1 when the test ran to its end.
class RunTestDialog : public Dialog {
 public:
  RunTestDialog(Frame* parent, Nodeplane::Network::IpAddress* first,
                Nodeplane::Network::IpAddress* second, Nodeplane::Network::IpAddress* third,
                const std::string& hostname);
  ~RunTestDialog() override;

 protected:
  int Run() override;

 private:
  // False when Esc ended the test.
  bool RunSteps();
  bool Ping(const Nodeplane::Network::IpAddress& target, int number);
  bool Resolve();
  bool WaitForChild();
  void Report(int status);

  static void InstallChildEndHandler();
  static void RemoveChildEndHandler();
  // Runs in the main thread alone, and there only while it waits for a step.
  static void HandleChildEnd(int signal);

  TextArea* _text;
  std::array<Nodeplane::Network::IpAddress*, 3> _addresses;
  std::string _hostname;
  // -1: none.
  volatile pid_t _childPid = -1;
  // What the handler has collected of the child, valid with _childEnded.
  volatile sig_atomic_t _childStatus = 0;
  volatile sig_atomic_t _childEnded = 0;
  bool _stepDone = false;

  // The dialog whose step runs.
  static RunTestDialog* _current;
};

}  // namespace Tarnel
