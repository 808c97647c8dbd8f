#pragma once

#include <string>
#include <vector>

#include "hosts/lab/state/host_state.h"

// The programs of the laboratory host. One executable stands at the path of each of them.
namespace Lab::Host {

// Arguments, beginning with argument 0.
using Words = std::vector<std::string>;

// What a program that has come to its end leaves behind.
struct Outcome {
  int exitCode = 0;
  std::string standardOutput = {};
  std::string standardError = {};
  // Unless 0, the signal that it dies of.
  int signal = 0;
};

// Each acts on the host's state as its name says.
Outcome StewCmd(const Words& words);
Outcome PowerOffVms(const Words& words);
Outcome PowerOff(const Words& words);
Outcome Reboot(const Words& words);
Outcome FirmwareConfig(const Words& words);
Outcome Backup(const Words& words);
Outcome ServiceScript(const Words& words);
Outcome AgentsScript(const Words& words);
Outcome AdvancedConfig(const Words& words);
Outcome SettingsTool(const Words& words);
Outcome CoreBacktrace(const Words& words);
Outcome Coreping(const Words& words);

// Stops the virtual machines for which the choice is true.
void StopVirtualMachines(bool (*choice)(const Json& machine));

}  // namespace Lab::Host
