#pragma once

#include <optional>
#include <string_view>

namespace Nodeplane::Network {

// One to three decimal digits and nothing else; leading zeros do not make a number octal.
std::optional<int> ParseShortNumber(std::string_view text);

// The value of a hexadecimal digit.
std::optional<int> ParseHexDigit(char digit);

}  // namespace Nodeplane::Network
