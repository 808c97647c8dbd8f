#include "console/network/run_test_dialog.h"

#include <sys/wait.h>

#include <cerrno>

#include "console/network/test_children.h"
#include "console/screen/colours.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"
#include "hostapi/coreplane/network_info.h"

namespace Tarnel {

namespace {

using Nodeplane::Network::IpAddress;
using Nodeplane::Network::Ipv6Address;

constexpr int TEXT_TITLE = 219;
constexpr int TEXT_BODY = 220;
constexpr int TEXT_PINGING = 221;
constexpr int TEXT_RESOLVING = 222;
constexpr int TEXT_FAILED = 223;
constexpr int TEXT_OK = 224;

// What a step that could not be started, or whose child is lost, counts as.
constexpr int STATUS_FAILED = 1;

std::string ManagementInterfaceName() {
  const auto nic = Coreplane::Network::NetworkInfoImpl().GetManagementInterface();
  return nic != nullptr ? nic->GetName() : "";
}

// An address that only means something together with an interface.
bool NeedsScope(const IpAddress& address) {
  const auto* const ipv6 = dynamic_cast<const Ipv6Address*>(&address);
  return ipv6 != nullptr && ipv6->IsLinkLocal();
}

}  // namespace

RunTestDialog* RunTestDialog::_current = nullptr;

RunTestDialog::RunTestDialog(Frame* parent, IpAddress* first, IpAddress* second, IpAddress* third,
                             const std::string& hostname)
    : Dialog(parent, 75, 13, 5), _addresses{first, second, third}, _hostname(hostname) {
  _text = _content->Add<TextArea>(0, 0, _content->Width(), _content->Height(), PARENT_COLOUR);
}

RunTestDialog::~RunTestDialog() {
  RemoveChildEndHandler();
  _current = nullptr;
}

int RunTestDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  _stepDone = false;
  _current = this;
  SetFooter(HINT_CANCEL);
  InstallChildEndHandler();
  const bool finished = RunSteps();
  RemoveChildEndHandler();
  if (!finished) {
    return 0;
  }
  SetFooter(HINT_OK);
  WaitForEnter();
  return 1;
}

bool RunTestDialog::RunSteps() {
  for (size_t i = 0; i < _addresses.size(); ++i) {
    if (_addresses[i] != nullptr && !Ping(*_addresses[i], static_cast<int>(i) + 1)) {
      return false;
    }
  }
  return _hostname.empty() || Resolve();
}

bool RunTestDialog::Ping(const IpAddress& target, int number) {
  const std::string address = target.GetStringAddress();
  const std::string interface = ManagementInterfaceName();
  const std::string scope = NeedsScope(target) && !interface.empty() ? "%" + interface : "";
  _text->AppendText(Text(TEXT_PINGING) + " #" + std::to_string(number) + " (" + address + scope +
                    ").");
  _childPid = StartPing(address, interface);
  return WaitForChild();
}

bool RunTestDialog::Resolve() {
  _text->AppendText(Text(TEXT_RESOLVING) + " (" + _hostname + ").");
  _childPid = StartResolve(_hostname);
  return WaitForChild();
}

// The idle limit does not run here. A child that the operator does not want to wait for goes on
// alone.
bool RunTestDialog::WaitForChild() {
  if (_childPid < 0) {
    Report(STATUS_FAILED);
  }
  while (!_stepDone) {
    if (WaitKeyOrChild() == ESC_KEY) {
      return false;
    }
    if (_childEnded != 0) {
      _childEnded = 0;
      Report(_childStatus);
    }
  }
  _stepDone = false;
  return true;
}

void RunTestDialog::Report(int status) {
  _text->AppendText("{align:right}" + Text(status == 0 ? TEXT_OK : TEXT_FAILED) + "{/align}\n");
  _stepDone = true;
  _childPid = -1;
}

void RunTestDialog::InstallChildEndHandler() {
  struct sigaction action {};
  action.sa_handler = &RunTestDialog::HandleChildEnd;
  sigemptyset(&action.sa_mask);
  sigaction(SIGCHLD, &action, nullptr);
}

void RunTestDialog::RemoveChildEndHandler() { signal(SIGCHLD, SIG_DFL); }

// A child of somebody else may have ended: this one may still run.
void RunTestDialog::HandleChildEnd(int) {
  RunTestDialog* const dialog = _current;
  if (dialog == nullptr || dialog->_childPid < 0) {
    return;
  }
  const int savedError = errno;
  int status = 0;
  pid_t pid = 0;
  do {
    pid = waitpid(dialog->_childPid, &status, WNOHANG);
  } while (pid < 0 && errno == EINTR);
  if (pid != 0) {
    dialog->_childStatus = pid == dialog->_childPid ? status : STATUS_FAILED;
    dialog->_childEnded = 1;
  }
  errno = savedError;
}

}  // namespace Tarnel
