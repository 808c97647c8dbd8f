#pragma once

#include <optional>
#include <string>
#include <vector>

#include "hosts/lab/state/host_state.h"

namespace Lab {

// What a scenario tells one run of a program to do.
struct ProgramBehaviour {
  // Exit code in place of the program's own.
  std::optional<int> exitCode;
  // Signal to die of.
  std::optional<int> signal;
  // Texts to write in place of the program's own output.
  std::optional<std::string> standardOutput;
  std::optional<std::string> standardError;
  // To wait before anything else.
  int64_t delayMs = 0;
  // The program leaves the host as it is.
  bool skipEffect = false;
};

// What the state's table "programs" says of this run. It holds for each path a list of
//   {args[], user, fromCall, times, exit, signal, noStart, stdout, stderr, delayMs, skipEffect}
// The first entry that applies is taken and its run is counted. "args" and the counts are as in a
// fault; "user" is the one behind "-U" among the arguments, else the user of this process.
// arguments are those behind argument 0.
ProgramBehaviour TakeProgramBehaviour(const Json& state, const std::string& path,
                                      const std::vector<std::string>& arguments);

// False when an entry with "noStart" applies to this run.
bool MayStart(const Json& state, const std::string& path,
              const std::vector<std::string>& arguments);

}  // namespace Lab
