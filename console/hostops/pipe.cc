#include "console/hostops/pipe.h"

#include <fcntl.h>
#include <unistd.h>

namespace Tarnel {
namespace {

void CloseOnce(int32_t& descriptor) {
  if (descriptor == -1) {
    return;
  }
  close(descriptor);
  descriptor = -1;
}

}  // namespace

Pipe::Pipe() {
  int ends[2];
  if (pipe2(ends, O_CLOEXEC) != 0) {
    return;
  }
  _readEnd = ends[0];
  _writeEnd = ends[1];
  _opened = true;
}

void Pipe::CloseRead() { CloseOnce(_readEnd); }

void Pipe::CloseWrite() { CloseOnce(_writeEnd); }

void Pipe::Close() {
  CloseRead();
  CloseWrite();
}

}  // namespace Tarnel
