#pragma once

#include <memory>
#include <string>

#include "hostapi/nodeplane/network_interface.h"
#include "hosts/lab/libraries/perform.h"

namespace Lab {

// The kernel interface of that name; null for the empty name.
std::unique_ptr<Nodeplane::Network::NetworkInterface> MakeKernelNic(const Json& state,
                                                                    const std::string& name);

// An interface that is no CoreNic, under the name of the management interface.
template <>
std::unique_ptr<Nodeplane::Network::NetworkInterface>
MakeOtherClass<Nodeplane::Network::NetworkInterface>();

}  // namespace Lab
