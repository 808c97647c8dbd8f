#pragma once

#include <string_view>

namespace Machine {

// "0000:00:03.0": domain (four digits or more), bus, device and function, all hexadecimal.
bool IsPciAddress(std::string_view text);

}  // namespace Machine
