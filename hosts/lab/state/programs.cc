#include "hosts/lab/state/programs.h"

#include <pwd.h>
#include <unistd.h>

#include <algorithm>

#include "hosts/lab/state/faults.h"

namespace Lab {

namespace {

std::string UserOf(const std::vector<std::string>& arguments) {
  const auto option = std::find(arguments.begin(), arguments.end(), "-U");
  if (option != arguments.end() && option + 1 != arguments.end()) return option[1];
  const passwd* user = getpwuid(geteuid());
  return user != nullptr ? user->pw_name : "";
}

// The first rule of the path's list that applies, among those that refuse the start or among the
// others; null when there is none.
const Json* TakeProgramRule(const Json& state, const std::string& path,
                            const std::vector<std::string>& arguments, bool noStart) {
  const auto programs = state.find("programs");
  if (programs == state.end() || !programs->contains(path)) return nullptr;
  for (const Json& rule : programs->at(path)) {
    if (Flag(rule, "/noStart", false) == noStart &&
        (!rule.contains("user") || Text(rule, "/user") == UserOf(arguments)) &&
        TakeRule(path, rule, arguments)) {
      return &rule;
    }
  }
  return nullptr;
}

}  // namespace

ProgramBehaviour TakeProgramBehaviour(const Json& state, const std::string& path,
                                      const std::vector<std::string>& arguments) {
  ProgramBehaviour behaviour;
  const Json* rule = TakeProgramRule(state, path, arguments, false);
  if (rule == nullptr) return behaviour;
  if (rule->contains("exit")) behaviour.exitCode = static_cast<int>(Number(*rule, "/exit"));
  if (rule->contains("signal")) behaviour.signal = static_cast<int>(Number(*rule, "/signal"));
  if (rule->contains("stdout")) behaviour.standardOutput = Text(*rule, "/stdout");
  if (rule->contains("stderr")) behaviour.standardError = Text(*rule, "/stderr");
  behaviour.delayMs = Number(*rule, "/delayMs", 0);
  behaviour.skipEffect = Flag(*rule, "/skipEffect", false);
  return behaviour;
}

bool MayStart(const Json& state, const std::string& path,
              const std::vector<std::string>& arguments) {
  return TakeProgramRule(state, path, arguments, true) == nullptr;
}

}  // namespace Lab
