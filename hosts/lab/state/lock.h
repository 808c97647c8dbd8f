#pragma once

#include "hosts/lab/state/descriptor.h"

namespace Lab {

// The lab's lock, held while the object lives. It holds against other processes and against other
// threads of this one. One thread must not take it twice.
class Lock {
 public:
  // Waits until the lock is free. Throws StateError when there is no lab.
  Lock();

 private:
  Descriptor _file;
};

}  // namespace Lab
