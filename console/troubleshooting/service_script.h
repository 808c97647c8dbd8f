#pragma once

#include <cstdint>

namespace Tarnel {

// The scripts that start and stop the host's local shell and its SSH service.
inline constexpr char SHELL_SCRIPT[] = "/etc/init.d/OstrelShell";
inline constexpr char SSH_SCRIPT[] = "/etc/init.d/SSH";

// Runs a service's script with one of "start", "stop", "restart" and "status" and gives its result
// as RunCommand() does.
int32_t RunServiceScript(const char* script, const char* action);

bool IsServiceRunning(const char* script);

}  // namespace Tarnel
