#include <algorithm>

#include "hostapi/coreplane/system.h"
#include "hosts/lab/libraries/perform.h"

namespace Coreplane::Resource {

// The machines are read from the state when they are asked for.
struct ResourceInfoImpl::Data {};

ResourceInfoImpl::ResourceInfoImpl() = default;
ResourceInfoImpl::~ResourceInfoImpl() = default;
ResourceInfoImpl::ResourceInfoImpl(ResourceInfoImpl&&) noexcept = default;
ResourceInfoImpl& ResourceInfoImpl::operator=(ResourceInfoImpl&&) noexcept = default;

bool ResourceInfoImpl::HasRunningVirtualMachines() const {
  return Lab::PerformRead<bool>(
      {"ResourceInfoImpl::HasRunningVirtualMachines"}, [](const Lab::Json& state) {
        const Lab::Json& machines = Lab::List(state, "/virtualMachines");
        return std::any_of(machines.begin(), machines.end(), [](const Lab::Json& machine) {
          return Lab::Flag(machine, "/running", false);
        });
      });
}

}  // namespace Coreplane::Resource
