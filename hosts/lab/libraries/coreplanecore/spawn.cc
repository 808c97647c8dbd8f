#include <fcntl.h>
#include <spawn.h>

#include <cerrno>
#include <csignal>
#include <string>
#include <vector>

#include "hosts/lab/libraries/coreplanecore/spawn.h"
#include "hosts/lab/state/descriptor.h"
#include "hosts/lab/state/programs.h"
#include "hosts/lab/state/trace.h"

namespace {

// Attributes and file actions of one posix_spawn.
class Spawn {
 public:
  Spawn() {
    posix_spawnattr_init(&_attributes);
    posix_spawn_file_actions_init(&_actions);
  }
  ~Spawn() {
    posix_spawn_file_actions_destroy(&_actions);
    posix_spawnattr_destroy(&_attributes);
  }
  Spawn(const Spawn&) = delete;
  Spawn& operator=(const Spawn&) = delete;

  void ResetSignals() {
    sigset_t set;
    sigemptyset(&set);
    posix_spawnattr_setsigmask(&_attributes, &set);
    sigfillset(&set);
    posix_spawnattr_setsigdefault(&_attributes, &set);
    AddFlags(POSIX_SPAWN_SETSIGMASK | POSIX_SPAWN_SETSIGDEF);
  }

  void LeadGroup() { AddFlags(POSIX_SPAWN_SETPGROUP); }

  // Before the descriptors are passed, which may take the terminal's place.
  void TakeForeground(int32_t terminal) {
    LeadGroup();
    posix_spawn_file_actions_addtcsetpgrp_np(&_actions, terminal);
  }

  // A descriptor that another one is to replace is moved out of the way first.
  void PassDescriptors(const int32_t* descriptors, int32_t count) {
    for (int target = 0; target < count; ++target) {
      int fd = descriptors[target];
      if (fd < count && fd != target) {
        fd = _moved.emplace_back(fcntl(fd, F_DUPFD_CLOEXEC, count)).Get();
      }
      if (_error == 0) _error = posix_spawn_file_actions_adddup2(&_actions, fd, target);
    }
    posix_spawn_file_actions_addclosefrom_np(&_actions, count);
  }

  // 0 or an errno value.
  int Start(const SpawnRequest& request, pid_t* pid) const {
    if (_error != 0) return _error;
    return posix_spawn(pid, request.path, &_actions, &_attributes,
                       const_cast<char* const*>(request.argv),
                       const_cast<char* const*>(request.envp));
  }

 private:
  void AddFlags(int flags) {
    short present = 0;
    posix_spawnattr_getflags(&_attributes, &present);
    posix_spawnattr_setflags(&_attributes, static_cast<short>(present | flags));
  }

  posix_spawnattr_t _attributes;
  posix_spawn_file_actions_t _actions;
  std::vector<Lab::Descriptor> _moved;
  // A descriptor that cannot be one.
  int _error = 0;
};

std::vector<std::string> Arguments(const SpawnRequest& request) {
  std::vector<std::string> arguments;
  for (const char* const* word = request.argv; *word != nullptr; ++word) {
    arguments.emplace_back(*word);
  }
  return arguments;
}

// False when the lab is told to refuse the start. Without a readable state everything starts.
bool LabAllows(const SpawnRequest& request) {
  try {
    const auto state = Lab::ReadState();
    if (!state->contains("programs")) return true;
    std::vector<std::string> arguments = Arguments(request);
    const std::vector<std::string> behindName(arguments.begin() + !arguments.empty(),
                                              arguments.end());
    if (Lab::MayStart(*state, request.path, behindName)) return true;
    Lab::TraceProgram(request.path, arguments);
    return false;
  } catch (const Lab::StateError&) {
    return true;
  }
}

}  // namespace

SpawnResult Lab::SpawnProgram(const SpawnRequest& request, bool ownGroup) {
  if (!LabAllows(request)) return {-1, -ENOENT, -1};
  Spawn spawn;
  spawn.ResetSignals();
  if (ownGroup) spawn.LeadGroup();
  if (request.terminal >= 0) spawn.TakeForeground(request.terminal);
  spawn.PassDescriptors(request.descriptors, request.descriptorCount);
  pid_t pid = -1;
  const int error = spawn.Start(request, &pid);
  return {error == 0 ? 0 : -1, -error, pid};
}

SpawnResult Kernel_Spawn(const SpawnRequest& request) { return Lab::SpawnProgram(request, false); }
