#pragma once

#include <memory>
#include <string>

#include "hostapi/nodeplane/ip_address.h"

namespace Tarnel {

// The address as text, empty for null.
std::string AddressText(const Nodeplane::Network::IpAddress* address);
// Not empty, and not the unset address of either family.
bool IsSetAddress(const std::string& text);
// An IPv4 address first and an IPv6 address second.
bool IsMixedPair(const Nodeplane::Network::IpAddress* first,
                 const Nodeplane::Network::IpAddress* second);
// The address that the text is, of the family that it fits; null for an empty text. The text is
// valid for one of the two.
std::unique_ptr<Nodeplane::Network::IpAddress> ParseAddress(const std::string& text);
// The text is an address of either family.
bool IsValidAddress(const std::string& text);
// Set by hand, and good beyond its own link.
bool IsStaticGlobal(const Nodeplane::Network::Ipv6Network& network);

}  // namespace Tarnel
