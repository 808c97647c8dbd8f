// How the host goes down and what a reset puts back. The lab's first process does the rest; nothing
// reaches the machine outside.

#include <signal.h>

#include <cstdlib>

#include "hosts/lab/programs/host/program.h"
#include "hosts/lab/state/files.h"
#include "hosts/lab/state/scenario.h"

namespace Lab::Host {

namespace {

constexpr char SUPERVISOR_FILE[] = "/var/run/lab-supervisor.pid";
constexpr char FIRST_SHADOW[] = "/usr/share/lab/shadow";
constexpr char BACKUPS[] = "/host/backups";

Outcome TellSupervisor(int signal) {
  const pid_t supervisor = atoi(ReadFile(SUPERVISOR_FILE).c_str());
  if (supervisor <= 0 || kill(supervisor, signal) != 0) {
    return {1, "", "The host does not listen.\n"};
  }
  return {};
}

// The host as its scenarios have it, with what they told of failures so far.
Json FirstState(const Json& state) {
  Json first = ReadDocument(std::string(LAB_DIRECTORY) + "/default.json");
  for (const Json& scenario : List(state, "/scenarios")) {
    first = MergeScenario(std::move(first), Text(scenario, ""), SCENARIO_DIRECTORY);
  }
  return first;
}

}  // namespace

Outcome PowerOff(const Words& words) {
  if (words.size() != 1) return {1, "", "usage: poweroff\n"};
  return TellSupervisor(SIGUSR1);
}

Outcome Reboot(const Words& words) {
  if (words.size() > 2 || (words.size() == 2 && words[1] != "-f")) {
    return {1, "", "usage: reboot [-f]\n"};
  }
  return TellSupervisor(SIGUSR2);
}

Outcome FirmwareConfig(const Words& words) {
  if (words.size() != 2 || words[1] != "--reset-only") {
    return {1, "", "usage: firmwareConfig.sh --reset-only\n"};
  }
  ChangeState([](Json& state) { state = FirstState(state); });
  ReplaceFile("/etc/shadow", ReadFile(FIRST_SHADOW), 0600);
  return {};
}

Outcome Backup(const Words&) {
  ChangeState(
      [](Json& state) { state[Json::json_pointer(BACKUPS)] = Number(state, BACKUPS, 0) + 1; });
  return {};
}

}  // namespace Lab::Host
