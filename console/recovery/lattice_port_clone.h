#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "hostapi/nodeplane/lattice.h"

namespace Tarnel {

// What the operator wants of the new port.
struct LatticePortChoice {
  // Else the new port is blocked when the old one is.
  bool unblock = false;
  std::vector<std::string> uplinks;
};

// A host-local port's key has the form "hlp-", any text, "#", a number. Made from such a key, the
// new one differs in its number only; made from another one, it carries that between the two.
std::string MakeHostLocalKey(const std::string& oldKey, const std::string& suffix);

// "#" and a random number below 100000.
std::string DrawKeySuffix();

// The number in a VLAN field as the host keeps it, in 16 bits.
uint16_t ParseVlanId(const std::string& text);

// Makes the port that the parameters describe, as a copy of the old one with the operator's
// choice, and attaches the management interface to it. Throws NodeplaneException on failure; the
// new port is gone again then.
void MoveManagementToNewPort(const Nodeplane::Network::LatticePort& oldPort,
                             const Nodeplane::Network::LatticePortParam& param,
                             const LatticePortChoice& choice);

}  // namespace Tarnel
