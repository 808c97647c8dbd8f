#pragma once

namespace Tarnel {

// The rows of the network screen that can be selected, by their number among those.
enum NetworkRow : int {
  NETWORK_ROW_ADAPTERS,
  NETWORK_ROW_VLAN,
  NETWORK_ROW_IPV4,
  NETWORK_ROW_IPV6,
  NETWORK_ROW_DNS,
  NETWORK_ROW_SUFFIXES,
};

// Their texts by the catalogue's numbers.
inline constexpr int NETWORK_ROW_TEXTS[] = {48, 49, 50, 51, 54, 55};

}  // namespace Tarnel
