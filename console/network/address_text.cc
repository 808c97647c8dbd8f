#include "console/network/address_text.h"

namespace Tarnel {

using Nodeplane::Network::IpAddress;
using Nodeplane::Network::Ipv4Address;
using Nodeplane::Network::Ipv6Address;
using Nodeplane::Network::Ipv6Network;

std::string AddressText(const IpAddress* address) {
  return address != nullptr ? address->GetStringAddress() : "";
}

bool IsSetAddress(const std::string& text) {
  return !text.empty() && text != Ipv4Address().GetStringAddress() &&
         text != Ipv6Address().GetStringAddress();
}

bool IsMixedPair(const IpAddress* first, const IpAddress* second) {
  return first != nullptr && first->GetFamily() == IpAddress::IPV4 && second != nullptr &&
         second->GetFamily() == IpAddress::IPV6;
}

std::unique_ptr<IpAddress> ParseAddress(const std::string& text) {
  if (text.empty()) {
    return nullptr;
  }
  if (Ipv6Address::IsValidAddress(text)) {
    return std::make_unique<Ipv6Address>(text);
  }
  return std::make_unique<Ipv4Address>(text);
}

bool IsValidAddress(const std::string& text) {
  return Ipv4Address::IsValidAddress(text) || Ipv6Address::IsValidAddress(text);
}

bool IsStaticGlobal(const Ipv6Network& network) {
  return network.GetIpv6AddressType() == Ipv6Network::STATIC &&
         network.GetIpv6Scope() != Ipv6Network::LINK_LOCAL;
}

}  // namespace Tarnel
