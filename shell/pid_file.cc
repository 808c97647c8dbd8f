#include "shell/pid_file.h"

#include <syslog.h>
#include <unistd.h>

#include <csignal>
#include <fstream>

namespace Tarnel {

namespace {

constexpr char PID_FILE[] = "/var/run/tarnel.pid";

bool NamesLiveProcess() {
  int pid = 0;
  return std::ifstream(PID_FILE) >> pid && pid > 0 && kill(pid, 0) == 0;
}

}  // namespace

void WritePidFile() {
  if (NamesLiveProcess()) {
    syslog(LOG_ERR, "Attempt to run multiple TARNEL instances, not updating %s", PID_FILE);
    return;
  }
  std::ofstream(PID_FILE, std::ios::trunc) << getpid();
}

}  // namespace Tarnel
