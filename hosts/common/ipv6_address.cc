#include <arpa/inet.h>
#include <net/if.h>

#include <algorithm>
#include <optional>
#include <string_view>

#include "hostapi/nodeplane/exception.h"
#include "hostapi/nodeplane/ip_address.h"

namespace Nodeplane::Network {

namespace {

std::optional<Ipv6Address::Bytes> ParseBytes(std::string_view text) {
  // inet_pton would stop at an embedded NUL and take what stands before it.
  if (text.find('\0') != std::string_view::npos) return std::nullopt;
  Ipv6Address::Bytes bytes{};
  if (inet_pton(AF_INET6, std::string(text).c_str(), bytes.data()) != 1) return std::nullopt;
  return bytes;
}

// A scope is the name or the number of an interface.
bool IsScope(std::string_view text) {
  const auto isScopeCharacter = [](char c) { return c > ' ' && c <= '~' && c != '/' && c != '%'; };
  return !text.empty() && text.size() < IF_NAMESIZE &&
         std::all_of(text.begin(), text.end(), isScopeCharacter);
}

struct ScopedBytes {
  Ipv6Address::Bytes bytes;
  std::string_view scope;
};

std::optional<ScopedBytes> ParseIpv6(std::string_view text) {
  const size_t percent = text.find('%');
  const bool scoped = percent != std::string_view::npos;
  const std::optional<Ipv6Address::Bytes> bytes = ParseBytes(text.substr(0, percent));
  if (!bytes) return std::nullopt;
  const std::string_view scope = scoped ? text.substr(percent + 1) : std::string_view();
  if (scoped && !IsScope(scope)) return std::nullopt;
  return ScopedBytes{*bytes, scope};
}

}  // namespace

Ipv6Address::Ipv6Address() = default;

Ipv6Address::Ipv6Address(const std::string& text) {
  const std::optional<ScopedBytes> parsed = ParseIpv6(text);
  if (!parsed) throw Lib::NodeplaneException("Invalid IPv6 address: " + text);
  _address = parsed->bytes;
  _scope = parsed->scope;
}

bool Ipv6Address::IsValidAddress(const std::string& text) { return ParseIpv6(text).has_value(); }

const Ipv6Address::Bytes& Ipv6Address::GetBinaryAddress() const { return _address; }

bool Ipv6Address::IsLinkLocal() const {
  return _address[0] == 0xfe && (_address[1] & 0xc0) == 0x80;
}

std::string Ipv6Address::GetStringAddress() const {
  char text[INET6_ADDRSTRLEN] = "";
  inet_ntop(AF_INET6, _address.data(), text, sizeof text);
  return text;
}

std::string Ipv6Address::GetScopedStringAddress() const {
  return _scope.empty() ? GetStringAddress() : GetStringAddress() + "%" + _scope;
}

int Ipv6Address::GetFamily() const { return IPV6; }

bool operator==(const Ipv6Address& left, const Ipv6Address& right) {
  return left.GetBinaryAddress() == right.GetBinaryAddress();
}

}  // namespace Nodeplane::Network
