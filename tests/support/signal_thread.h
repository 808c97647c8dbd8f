#pragma once

#include "console/screen/frame.h"

namespace Tarnel::Testing {

// The console starts its signal thread once, before any other thread, and so does a test program:
// this is the first member of a fixture.
struct SignalThread {
  SignalThread() {
    [[maybe_unused]] static const bool STARTED = (Frame::StartSignalThread(), true);
  }
};

}  // namespace Tarnel::Testing
