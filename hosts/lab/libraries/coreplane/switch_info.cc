#include "hostapi/coreplane/switch_info.h"

namespace Coreplane::Network {

// Everything is read from the state when it is asked for.
struct VirtualSwitchInfoImpl::Data {};

VirtualSwitchInfoImpl::VirtualSwitchInfoImpl() = default;
VirtualSwitchInfoImpl::~VirtualSwitchInfoImpl() = default;
VirtualSwitchInfoImpl::VirtualSwitchInfoImpl(VirtualSwitchInfoImpl&&) noexcept = default;
VirtualSwitchInfoImpl& VirtualSwitchInfoImpl::operator=(VirtualSwitchInfoImpl&&) noexcept = default;

}  // namespace Coreplane::Network
