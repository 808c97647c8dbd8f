#include "console/troubleshooting/service_script.h"

#include "console/hostops/command_runner.h"

namespace Tarnel {

int32_t RunServiceScript(const char* script, const char* action) {
  const char* argv[] = {"sh", script, action, nullptr};
  return RunCommand("/bin/sh", argv, nullptr, nullptr, nullptr, nullptr, nullptr, 0, 0);
}

bool IsServiceRunning(const char* script) { return RunServiceScript(script, "status") == 0; }

}  // namespace Tarnel
