#pragma once

namespace Tarnel {

// Puts the process id into "/var/run/tarnel.pid", unless the file names a live process. The file
// stays when the process ends; one that cannot be written is left alone.
void WritePidFile();

}  // namespace Tarnel
