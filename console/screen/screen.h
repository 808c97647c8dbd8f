#pragma once

namespace Tarnel {

// Sends everything that windows have staged to the terminal, in one update, and puts the physical
// cursor where the shared cursor stands.
//
// This is the only place that writes to the terminal while frames run. It is called before each
// wait, at the end of each change of the foreground frame, after progress text, and before each
// call that may block, so that the operator sees the current picture whenever the process waits or
// works.
void UpdateScreen();

}  // namespace Tarnel
