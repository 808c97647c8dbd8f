// The entry point: everything that has to be true before the first screen exists.

#include <fcntl.h>
#include <sys/resource.h>
#include <syslog.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <cstdlib>
#include <memory>
#include <string>

#include "console/login/welcome_window.h"
#include "console/screen/pid_file.h"
#include "console/screen/terminal.h"
#include "hostapi/nodeplane/exception.h"

namespace {

using namespace Tarnel;

constexpr char NULL_DEVICE[] = "/dev/null";

// Descriptors 0 to 2 are the terminal's places, also when the caller left them closed: what is
// opened later must not land there.
void OccupyStandardDescriptors() {
  int descriptor = 0;
  do {
    descriptor = open(NULL_DEVICE, O_RDWR);
  } while (descriptor >= 0 && descriptor <= STDERR_FILENO);
  if (descriptor >= 0) {
    close(descriptor);
  }
}

// A terminal that hangs up is noticed where it is read, and a pipe without a reader where it is
// written.
void IgnoreHangUp() {
  signal(SIGHUP, SIG_IGN);
  signal(SIGPIPE, SIG_IGN);
}

// The passwords that pass through this process may not end in a file. At a limit of one byte the
// kernel also hands no core to a program, which it does at a limit of 0. A program that the console
// starts may raise the limit again.
void ForbidCoreDumps() {
  rlimit limit{};
  getrlimit(RLIMIT_CORE, &limit);
  limit.rlim_cur = std::min<rlim_t>(1, limit.rlim_max);
  setrlimit(RLIMIT_CORE, &limit);
}

int RequestedVirtualTerminal(int argc, char** argv) {
  if (argc < 2) {
    return NO_VIRTUAL_TERMINAL;
  }
  const long vt = strtol(argv[1], nullptr, 10);
  if (vt < 1 || vt > 63) {
    syslog(LOG_ERR, "%s", (std::string("Invalid VT specified for TARNEL: ") + argv[1]).c_str());
    return NO_VIRTUAL_TERMINAL;
  }
  return static_cast<int>(vt);
}

void SilenceStandardError() {
  const int null = open(NULL_DEVICE, O_WRONLY | O_CLOEXEC);
  if (null >= 0) {
    dup2(null, STDERR_FILENO);
    close(null);
  }
}

void RunConsole() {
  std::unique_ptr<Frame> frame;
  try {
    frame = std::make_unique<WelcomeWindow>();
    frame->Exec();
  } catch (const Nodeplane::Lib::NodeplaneException& exception) {
    const std::string text = std::string("TARNEL aborted by exception: ") + exception.what();
    syslog(LOG_ERR, "%s", text.c_str());
  }
  frame.reset();
  CloseScreen();
}

}  // namespace

int main(int argc, char** argv) {
  OccupyStandardDescriptors();
  IgnoreHangUp();
  ForbidCoreDumps();
  const int vt = RequestedVirtualTerminal(argc, argv);
  Frame::StartSignalThread();
  Frame::LoadIdleTimeout();
  SilenceStandardError();
  ReadTerminal();
  openlog("TARNEL", 0, LOG_USER);
  syslog(LOG_INFO, "Starting TARNEL");
  WritePidFile();
  if (vt != NO_VIRTUAL_TERMINAL) {
    ActivateVirtualTerminal(vt);
    DisableSuspend();
  }
  OpenScreen();
  RunConsole();
  return 0;
}
