#include "hostapi/coreplane/system.h"
#include "hosts/lab/libraries/perform.h"

namespace Coreplane::System {

bool KernelOpts::GetRuntimeValueBool(const std::string& name) {
  return Lab::PerformRead<bool>(
      {"KernelOpts::GetRuntimeValueBool", "", {name}}, [&name](const Lab::Json& state) {
        const auto pointer = Lab::Json::json_pointer("/options/kernel") / name;
        return Lab::Flag(state, pointer.to_string().c_str(), false);
      });
}

}  // namespace Coreplane::System
