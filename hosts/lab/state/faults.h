#pragma once

#include <optional>
#include <string>
#include <vector>

#include "hosts/lab/state/host_state.h"

namespace Lab {

// One call of a host operation.
struct Call {
  // Class and operation, such as "NetworkInfoImpl::GetPnics".
  std::string operation;
  // Name of the object that it is called on, empty where there is only one.
  std::string object = {};
  std::vector<std::string> arguments = {};
};

// What a scenario says of one call that fails or lies.
struct Fault {
  // The operation takes effect before it fails.
  bool afterEffect = false;
  // Text of the exception to throw.
  std::optional<std::string> message;
  // What to return in place of the result.
  std::optional<Json> returns;
  int64_t delayMs = 0;
};

// The fault that the state's list "faults" holds for this call. An entry of that list reads
//   {operation, object, args[], fromCall, times, when, message, returns, delayMs}
// and holds for each call of "operation" whose object is "object" and among whose arguments "args"
// occur in this order (absent: any), from the call number "fromCall" (1) on, "times" calls long
// (absent: for ever). "when" is "before" or "after". Calls are counted until the next scenario.
std::optional<Fault> TakeFault(const Json& state, const Call& call);

// True when entry, a rule of the state with args[], fromCall and times, applies to a call with
// these arguments. Counts the call. The name tells rules of several lists apart.
bool TakeRule(const std::string& name, const Json& entry,
              const std::vector<std::string>& arguments);

// Forgets all counts.
void ClearCounts();

}  // namespace Lab
