#include <optional>
#include <string_view>

#include "hostapi/nodeplane/exception.h"
#include "hostapi/nodeplane/ip_address.h"
#include "hosts/common/parsing.h"

namespace Nodeplane::Network {

namespace {

struct NetworkText {
  std::string address;
  int prefix;
};

std::optional<NetworkText> SplitNetwork(std::string_view text) {
  const size_t slash = text.find('/');
  if (slash == std::string_view::npos) return std::nullopt;
  const std::optional<int> prefix = ParseShortNumber(text.substr(slash + 1));
  if (!prefix || *prefix < 1 || *prefix > 128) return std::nullopt;
  return NetworkText{std::string(text.substr(0, slash)), *prefix};
}

}  // namespace

Ipv6Network::Ipv6Network(const std::string& text) {
  const std::optional<NetworkText> parts = SplitNetwork(text);
  if (!parts) throw Lib::NodeplaneException("Invalid IPv6 network: " + text);
  _address = Ipv6Address(parts->address);
  _prefix = parts->prefix;
  _scope = _address.IsLinkLocal() ? LINK_LOCAL : GLOBAL;
}

bool Ipv6Network::IsValidAddressAndNetmask(const std::string& text) {
  const std::optional<NetworkText> parts = SplitNetwork(text);
  return parts && Ipv6Address::IsValidAddress(parts->address);
}

const Ipv6Address& Ipv6Network::GetAddress() const { return _address; }
int Ipv6Network::GetPrefix() const { return _prefix; }

std::string Ipv6Network::GetStringAddress() const {
  return _address.GetStringAddress() + "/" + std::to_string(_prefix);
}

int Ipv6Network::GetIpv6AddressType() const { return _type; }
void Ipv6Network::SetIpv6AddressType(int type) { _type = type; }
int Ipv6Network::GetIpv6Scope() const { return _scope; }
void Ipv6Network::SetIpv6Scope(int scope) { _scope = scope; }

bool operator==(const Ipv6Network& left, const Ipv6Network& right) {
  return left.GetAddress() == right.GetAddress() && left.GetPrefix() == right.GetPrefix();
}

}  // namespace Nodeplane::Network
