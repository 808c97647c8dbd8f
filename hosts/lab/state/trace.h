#pragma once

#include <string>
#include <vector>

#include "hosts/lab/state/faults.h"

// The lab's record of what happened to the host, in order, one line each:
//   SystemInfoImpl::SetSystemAlert "No compatible network adapter found."
//   program /bin/stew-cmd stew-cmd -U tarnel stewsvc/auth/lockdown_is_enabled
// A trace that cannot be written is no error.
namespace Lab {

// A call that changes the host.
void TraceChange(const Call& call);
// A call that only reads. It leaves a line, with "read " before it, when the state's
// "/trace/reads" is true.
void TraceRead(const Json& state, const Call& call);
// A program of the lab that runs; each one says so itself. arguments begin with argument 0.
void TraceProgram(const std::string& path, const std::vector<std::string>& arguments);
// Any other line.
void TraceLine(const std::string& line);

// Empties the trace.
void ClearTrace();

}  // namespace Lab
