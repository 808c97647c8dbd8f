#pragma once

#include <string>
#include <vector>

#include "hosts/lab/state/host_state.h"

namespace Lab {

// Where a lab's scenarios are, below its own root.
inline constexpr char SCENARIO_DIRECTORY[] = "/usr/share/lab/scenarios";

// A scenario is a JSON merge patch over the default host. "description" says in one line what is
// special about it; "over" names another scenario that is merged before it, unless it already was.
// The result lists what was merged in "scenarios".
//
// base with the scenario merged over it. A scenario is a path, when it has a slash in it, or a
// name below directory. Throws StateError when one cannot be read.
Json MergeScenario(Json base, const std::string& scenario, const std::string& directory);

// Writes the files that the state lists: files{PATH{content, absent, mode}}, with paths below root
// and the mode in octal ("0600").
void ApplyFiles(const Json& state, const std::string& root);

// Writes etc/hosts and etc/hostname as the state has names and addresses.
void WriteNames(const Json& state, const std::string& root);

// Inside a lab: the default host with these scenarios merged over it becomes the state, their
// files are written, counts and trace are emptied.
void LoadScenarios(const std::vector<std::string>& scenarios);
void LoadScenario(const std::string& scenario);

// Inside a lab: what was to take effect at the next start of the host takes effect, its machines
// have stopped, and what lives only while the host runs is gone.
void StartAfresh();

}  // namespace Lab
