#include <bit>
#include <optional>
#include <string_view>

#include "hostapi/nodeplane/exception.h"
#include "hostapi/nodeplane/ip_address.h"
#include "hosts/common/parsing.h"

namespace Nodeplane::Network {

namespace {

std::optional<uint32_t> ParseIpv4(std::string_view text) {
  uint32_t address = 0;
  for (int octet = 0; octet < 4; ++octet) {
    const bool last = octet == 3;
    const size_t end = last ? text.size() : text.find('.');
    if (end == std::string_view::npos) return std::nullopt;
    const std::optional<int> value = ParseShortNumber(text.substr(0, end));
    if (!value || *value > 255) return std::nullopt;
    address = address << 8 | static_cast<uint32_t>(*value);
    if (!last) text.remove_prefix(end + 1);
  }
  return address;
}

}  // namespace

IpAddress::~IpAddress() = default;

Ipv4Address::Ipv4Address() = default;

Ipv4Address::Ipv4Address(const std::string& text) {
  const std::optional<uint32_t> address = ParseIpv4(text);
  if (!address) throw Lib::NodeplaneException("Invalid IPv4 address: " + text);
  _address = *address;
}

bool Ipv4Address::IsValidAddress(const std::string& text) { return ParseIpv4(text).has_value(); }

uint32_t Ipv4Address::GetBinaryAddress() const { return _address; }

bool Ipv4Address::IsValidNetmask() const {
  const int ones = std::countl_one(_address);
  return ones > 0 && std::popcount(_address) == ones;
}

std::string Ipv4Address::GetStringAddress() const {
  return Misc::StrPrintf("%u.%u.%u.%u", _address >> 24, _address >> 16 & 0xff, _address >> 8 & 0xff,
                         _address & 0xff);
}

int Ipv4Address::GetFamily() const { return IPV4; }

bool operator==(const Ipv4Address& left, const Ipv4Address& right) {
  return left.GetBinaryAddress() == right.GetBinaryAddress();
}

}  // namespace Nodeplane::Network
