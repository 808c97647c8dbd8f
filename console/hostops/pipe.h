#pragma once

#include <cstdint>

namespace Tarnel {

// Owns one pipe whose descriptors no child inherits by itself. A pipe that could not be created
// has not IsOpened() and both descriptors -1, with errno telling why.
class Pipe {
 public:
  Pipe();
  ~Pipe() { Close(); }
  Pipe(const Pipe&) = delete;
  Pipe& operator=(const Pipe&) = delete;

  bool IsOpened() const { return _opened; }
  // The ends; -1 once closed.
  int32_t ReadEnd() const { return _readEnd; }
  int32_t WriteEnd() const { return _writeEnd; }

  void CloseRead();
  void CloseWrite();
  void Close();

 private:
  int32_t _readEnd = -1;
  int32_t _writeEnd = -1;
  bool _opened = false;
};

}  // namespace Tarnel
