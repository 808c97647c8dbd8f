#include "hosts/machine/pci_address.h"

#include <algorithm>
#include <cctype>

namespace Machine {

bool IsPciAddress(std::string_view text) {
  constexpr std::string_view PATTERN = "xxxx:xx:xx.x";
  const auto matches = [](char c, char p) {
    return p == 'x' ? isxdigit(static_cast<unsigned char>(c)) != 0 : c == p;
  };
  if (text.size() > PATTERN.size() && text.size() <= PATTERN.size() + 4) {
    text.remove_prefix(text.size() - PATTERN.size());
  }
  return std::equal(text.begin(), text.end(), PATTERN.begin(), PATTERN.end(), matches);
}

}  // namespace Machine
