#include "hosts/lab/programs/host/program.h"

namespace Lab::Host {

void StopVirtualMachines(bool (*choice)(const Json& machine)) {
  ChangeState([choice](Json& state) {
    for (Json& machine : state["virtualMachines"]) {
      if (choice(machine)) machine["running"] = false;
    }
  });
}

// Machines of a lab hold nothing that could be lost: to terminate them or to shut them down is one.
Outcome PowerOffVms(const Words& words) {
  if (words.size() > 2 || (words.size() == 2 && words[1] != "--terminate")) {
    return {1, "", "usage: powerOffVms [--terminate]\n"};
  }
  StopVirtualMachines([](const Json&) { return true; });
  return {};
}

}  // namespace Lab::Host
