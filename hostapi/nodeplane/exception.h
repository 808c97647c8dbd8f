#pragma once

#include <exception>
#include <string>

namespace Nodeplane::Lib {

// Thrown by every host operation that fails.
class NodeplaneException : public std::exception {
 public:
  explicit NodeplaneException(std::string message);
  NodeplaneException(const NodeplaneException&);
  NodeplaneException& operator=(const NodeplaneException&);
  ~NodeplaneException() override;

  const char* what() const noexcept override;

 private:
  std::string _message;
};

}  // namespace Nodeplane::Lib

namespace Nodeplane::Misc {

// printf into a string of any length.
std::string StrPrintf(const char* format, ...) __attribute__((format(printf, 1, 2)));

}  // namespace Nodeplane::Misc
