#include "hosts/lab/state/lock.h"

#include <sys/file.h>

#include <cerrno>
#include <cstring>
#include <string>

#include "hosts/lab/state/host_state.h"

namespace Lab {

// Each lock opens the file anew: flock() then parts threads of one process as it parts processes,
// and a forked child does not share what its parent takes later.
Lock::Lock() : _file(std::string(LAB_DIRECTORY) + "/lock", O_RDONLY | O_CREAT, 0644) {
  if (_file.Get() < 0) throw StateError(std::string(LAB_DIRECTORY) + "/lock: " + strerror(errno));
  while (flock(_file.Get(), LOCK_EX) != 0) {
    if (errno != EINTR) throw StateError(std::string("lock: ") + strerror(errno));
  }
}

}  // namespace Lab
