#include "hosts/common/parsing.h"

#include <cctype>
#include <charconv>

namespace Nodeplane::Network {

std::optional<int> ParseShortNumber(std::string_view text) {
  if (text.size() > 3 || text.starts_with('-')) return std::nullopt;
  int value = 0;
  const char* end = text.data() + text.size();
  const auto result = std::from_chars(text.data(), end, value);
  if (result.ec != std::errc() || result.ptr != end) return std::nullopt;
  return value;
}

std::optional<int> ParseHexDigit(char digit) {
  if (digit >= '0' && digit <= '9') return digit - '0';
  if (digit >= 'a' && digit <= 'f') return digit - 'a' + 10;
  if (digit >= 'A' && digit <= 'F') return digit - 'A' + 10;
  return std::nullopt;
}

}  // namespace Nodeplane::Network
