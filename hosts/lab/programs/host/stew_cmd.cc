// The management agent's client: stew-cmd -U USER COMMAND.

#include "hosts/lab/programs/host/program.h"
#include "hosts/lab/programs/host/services.h"

namespace Lab::Host {

namespace {

constexpr char LOCKDOWN_ON[] = "/agent/lockdown/on";
constexpr char LOCKDOWN_POSSIBLE[] = "/agent/lockdown/possible";
constexpr char REFRESHES[] = "/agent/refreshes";

Outcome Answer(const char* flag) { return {0, Flag(*ReadState(), flag) ? "true\n" : "false\n"}; }

Outcome LockdownIsEnabled() { return Answer(LOCKDOWN_ON); }

Outcome LockdownIsPossible() { return Answer(LOCKDOWN_POSSIBLE); }

Outcome SetLockdown(bool on) {
  ChangeState([on](Json& state) { state[Json::json_pointer(LOCKDOWN_ON)] = on; });
  return {};
}

Outcome EnterLockdown() {
  if (!Flag(*ReadState(), LOCKDOWN_POSSIBLE)) {
    return {1, "", "Lockdown mode is not possible on this host.\n"};
  }
  return SetLockdown(true);
}

Outcome ExitLockdown() { return SetLockdown(false); }

Outcome Refresh() {
  ChangeState(
      [](Json& state) { state[Json::json_pointer(REFRESHES)] = Number(state, REFRESHES, 0) + 1; });
  return {};
}

Outcome Autostop() {
  StopVirtualMachines([](const Json& machine) { return Flag(machine, "/autostop", false); });
  return {};
}

template <const char* SERVICE, bool RUNNING>
Outcome Switch() {
  SwitchByAgent(SERVICE, RUNNING);
  return {};
}

template <const char* SERVICE, bool ENABLED>
Outcome Configure() {
  SetEnabled(SERVICE, ENABLED);
  return {};
}

struct Command {
  const char* name;
  Outcome (*run)();
};

constexpr Command COMMANDS[] = {
    {"stewsvc/auth/lockdown_is_enabled", LockdownIsEnabled},
    {"stewsvc/auth/lockdown_is_possible", LockdownIsPossible},
    {"stewsvc/auth/lockdown_mode_enter", EnterLockdown},
    {"stewsvc/auth/lockdown_mode_exit", ExitLockdown},
    {"internalsvc/refresh", Refresh},
    {"hostsvc/autostartmanager/autostop", Autostop},
    {"hostsvc/start_ostrel_shell", Switch<SHELL_SERVICE, true>},
    {"hostsvc/stop_ostrel_shell", Switch<SHELL_SERVICE, false>},
    {"hostsvc/enable_ostrel_shell", Configure<SHELL_SERVICE, true>},
    {"hostsvc/disable_ostrel_shell", Configure<SHELL_SERVICE, false>},
    {"hostsvc/start_ssh", Switch<SSH_SERVICE, true>},
    {"hostsvc/stop_ssh", Switch<SSH_SERVICE, false>},
    {"hostsvc/enable_ssh", Configure<SSH_SERVICE, true>},
    {"hostsvc/disable_ssh", Configure<SSH_SERVICE, false>},
};

}  // namespace

Outcome StewCmd(const Words& words) {
  if (words.size() != 4 || words[1] != "-U") {
    return {1, "", "usage: stew-cmd -U USER COMMAND\n"};
  }
  if (!IsRunning(AGENT_SERVICE)) return {1, "", "stew-cmd: the agent does not answer\n"};
  for (const Command& command : COMMANDS) {
    if (words[3] == command.name) return command.run();
  }
  return {1, "", "stew-cmd: unknown command " + words[3] + "\n"};
}

}  // namespace Lab::Host
