#pragma once

#include "hosts/lab/state/host_state.h"
#include "hosts/machine/facts.h"

namespace Lab {

// Name of the kernel interface that stands for the one through which the machine is reached.
inline constexpr char DEFAULT_NIC[] = "core0";

// The state of a host that shows this machine: its facts where there are any, else plain values.
Json DefaultHost(const Machine::Facts& facts);

}  // namespace Lab
