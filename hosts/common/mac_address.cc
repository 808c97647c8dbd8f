#include <optional>
#include <string_view>

#include "hostapi/nodeplane/exception.h"
#include "hostapi/nodeplane/ip_address.h"
#include "hosts/common/parsing.h"

namespace Nodeplane::Network {

namespace {

using MacBytes = std::array<uint8_t, 6>;
constexpr size_t TEXT_LENGTH = 17;

std::optional<MacBytes> ParseMac(std::string_view text) {
  if (text.size() != TEXT_LENGTH) return std::nullopt;
  MacBytes bytes{};
  for (size_t i = 0; i < bytes.size(); ++i) {
    const size_t at = 3 * i;
    const std::optional<int> high = ParseHexDigit(text[at]);
    const std::optional<int> low = ParseHexDigit(text[at + 1]);
    const bool separated = at + 2 == TEXT_LENGTH || text[at + 2] == ':';
    if (!high || !low || !separated) return std::nullopt;
    bytes[i] = static_cast<uint8_t>(*high << 4 | *low);
  }
  return bytes;
}

}  // namespace

MacAddress::MacAddress() = default;

MacAddress::MacAddress(const std::string& text) {
  const std::optional<MacBytes> bytes = ParseMac(text);
  if (!bytes) throw Lib::NodeplaneException("Invalid MAC address: " + text);
  _address = *bytes;
}

bool MacAddress::IsValidAddress(const std::string& text) { return ParseMac(text).has_value(); }

std::string MacAddress::GetStringAddress() const {
  return Misc::StrPrintf("%02x:%02x:%02x:%02x:%02x:%02x", _address[0], _address[1], _address[2],
                         _address[3], _address[4], _address[5]);
}

bool operator==(const MacAddress& left, const MacAddress& right) {
  return left.GetStringAddress() == right.GetStringAddress();
}

}  // namespace Nodeplane::Network
