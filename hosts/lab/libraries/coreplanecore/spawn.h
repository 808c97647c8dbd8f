#pragma once

#include "hostapi/kernel.h"

namespace Lab {

// What Kernel_Spawn does; with ownGroup the child leads a process group of its own, which is not
// its terminal's foreground group.
SpawnResult SpawnProgram(const SpawnRequest& request, bool ownGroup);

}  // namespace Lab
