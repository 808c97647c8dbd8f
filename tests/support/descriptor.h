#pragma once

#include <unistd.h>

#include <utility>

namespace Tarnel::Testing {

// Owns a file descriptor; -1 is none.
class Descriptor {
 public:
  Descriptor() = default;
  explicit Descriptor(int fd) : _fd(fd) {}
  Descriptor(Descriptor&& other) noexcept : _fd(std::exchange(other._fd, -1)) {}
  Descriptor& operator=(Descriptor&& other) noexcept {
    Reset(std::exchange(other._fd, -1));
    return *this;
  }
  ~Descriptor() { Reset(); }

  int Get() const { return _fd; }
  void Reset(int fd = -1) {
    if (_fd >= 0) {
      close(_fd);
    }
    _fd = fd;
  }

 private:
  int _fd = -1;
};

}  // namespace Tarnel::Testing
