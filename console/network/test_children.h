#pragma once

#include <sys/types.h>

#include <string>

namespace Tarnel {

// The child processes of the network test. Each exits with 0 when its step was successful. Both
// functions give the child's process id, -1 when there is none, and expect SIGCHLD to be blocked.

// Pings an address with the host's tool, from that interface unless its name is empty.
pid_t StartPing(const std::string& address, const std::string& interface);

// Looks a name up. The host's own file of names must not answer, so it lacks the name meanwhile.
pid_t StartResolve(const std::string& hostname);

}  // namespace Tarnel
