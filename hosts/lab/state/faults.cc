#include "hosts/lab/state/faults.h"

#include <algorithm>
#include <limits>

#include "hosts/lab/state/files.h"
#include "hosts/lab/state/lock.h"

namespace Lab {

namespace {

std::string CountsPath() { return std::string(LAB_DIRECTORY) + "/counts"; }

// Whether the rule's arguments occur among these, in their order.
bool HasArguments(const Json& rule, const std::vector<std::string>& arguments) {
  if (!rule.contains("args")) return true;
  auto place = arguments.begin();
  for (const Json& wanted : List(rule, "/args")) {
    place = std::find(place, arguments.end(), wanted);
    if (place == arguments.end()) return false;
    ++place;
  }
  return true;
}

// The number of this call among those that the rule has met, from 1 on.
int64_t Count(const std::string& key) {
  const Lock lock;
  Json counts = Json::object();
  if (access(CountsPath().c_str(), F_OK) == 0) counts = ReadDocument(CountsPath());
  const int64_t number = counts.value(key, int64_t{0}) + 1;
  counts[key] = number;
  ReplaceFile(CountsPath(), counts.dump());
  return number;
}

Fault ReadFault(const Json& rule) {
  Fault fault;
  fault.afterEffect = Text(rule, "/when", "before") == "after";
  if (rule.contains("message")) fault.message = Text(rule, "/message");
  if (rule.contains("returns")) fault.returns = rule["returns"];
  fault.delayMs = Number(rule, "/delayMs", 0);
  return fault;
}

}  // namespace

bool TakeRule(const std::string& name, const Json& rule,
              const std::vector<std::string>& arguments) {
  if (!HasArguments(rule, arguments)) return false;
  const int64_t first = Number(rule, "/fromCall", 1);
  const int64_t times = Number(rule, "/times", std::numeric_limits<int64_t>::max());
  const bool always = first <= 1 && !rule.contains("times");
  // Nothing depends on the count of a rule without bounds.
  if (always) return true;
  const int64_t number = Count(name + " " + rule.dump());
  return number >= first && number - first < times;
}

std::optional<Fault> TakeFault(const Json& state, const Call& call) {
  const auto faults = state.find("faults");
  if (faults == state.end()) return std::nullopt;
  for (const Json& rule : *faults) {
    if (Text(rule, "/operation") == call.operation &&
        Text(rule, "/object", call.object) == call.object &&
        TakeRule("faults", rule, call.arguments)) {
      return ReadFault(rule);
    }
  }
  return std::nullopt;
}

void ClearCounts() { unlink(CountsPath().c_str()); }

}  // namespace Lab
