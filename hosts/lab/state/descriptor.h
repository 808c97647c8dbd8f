#pragma once

#include <fcntl.h>
#include <unistd.h>

#include <string>
#include <utility>

namespace Lab {

// Owns a file descriptor; -1 when there is none.
class Descriptor {
 public:
  Descriptor() = default;
  explicit Descriptor(int fd) : _fd(fd) {}
  // Opens a file for this process alone. Get() is -1, with errno set, when that fails.
  Descriptor(const std::string& path, int flags, mode_t mode = 0)
      : _fd(open(path.c_str(), flags | O_CLOEXEC, mode)) {}
  Descriptor(Descriptor&& other) noexcept : _fd(std::exchange(other._fd, -1)) {}
  Descriptor& operator=(Descriptor&& other) noexcept {
    std::swap(_fd, other._fd);
    return *this;
  }
  ~Descriptor() {
    if (_fd >= 0) close(_fd);
  }

  int Get() const { return _fd; }

 private:
  int _fd = -1;
};

}  // namespace Lab
