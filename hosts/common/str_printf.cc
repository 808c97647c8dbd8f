#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <memory>

#include "hostapi/nodeplane/exception.h"

namespace Nodeplane::Misc {

std::string StrPrintf(const char* format, ...) {
  va_list arguments;
  va_start(arguments, format);
  char* printed = nullptr;
  const int length = vasprintf(&printed, format, arguments);
  va_end(arguments);
  if (length < 0) return {};
  const std::unique_ptr<char, decltype(&free)> owner(printed, free);
  return {printed, static_cast<size_t>(length)};
}

}  // namespace Nodeplane::Misc
