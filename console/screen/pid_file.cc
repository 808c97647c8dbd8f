#include "console/screen/pid_file.h"

#include <fcntl.h>
#include <syslog.h>
#include <unistd.h>

#include <algorithm>
#include <climits>
#include <csignal>
#include <cstdio>
#include <cstdlib>

namespace Tarnel {

namespace {

constexpr char PID_FILE[] = "/var/run/tarnel.pid";

// The decimal number that the file begins with; 0 when there is none.
long ReadNumber() {
  const int file = open(PID_FILE, O_RDONLY | O_CLOEXEC);
  if (file < 0) {
    return 0;
  }
  char text[32] = "";
  const ssize_t length = read(file, text, sizeof text - 1);
  close(file);
  return length > 0 ? strtol(text, nullptr, 10) : 0;
}

bool NamesLiveProcess() {
  const long pid = ReadNumber();
  return pid > 0 && pid <= INT_MAX && kill(static_cast<pid_t>(pid), 0) == 0;
}

}  // namespace

void WritePidFile() {
  if (NamesLiveProcess()) {
    syslog(LOG_ERR, "Attempt to run multiple TARNEL instances, not updating %s", PID_FILE);
    return;
  }
  // Cut behind the number: a file that is emptied first costs some file systems a disk access.
  const int file = open(PID_FILE, O_WRONLY | O_CREAT | O_CLOEXEC, 0666);
  if (file >= 0) {
    const int length = dprintf(file, "%d", getpid());
    [[maybe_unused]] const int cut = ftruncate(file, std::max(0, length));
    close(file);
  }
}

}  // namespace Tarnel
