#include "hostapi/coreplane/system.h"

#include "hosts/lab/libraries/perform.h"

namespace Coreplane::System {

// Every setting is read from the state when it is asked for.
struct SystemInfoImpl::Data {};

SystemInfoImpl::SystemInfoImpl() = default;
SystemInfoImpl::~SystemInfoImpl() = default;
SystemInfoImpl::SystemInfoImpl(SystemInfoImpl&&) noexcept = default;
SystemInfoImpl& SystemInfoImpl::operator=(SystemInfoImpl&&) noexcept = default;

std::string SystemInfoImpl::GetWelcomeMessage() const {
  return Lab::PerformRead<std::string>(
      {"SystemInfoImpl::GetWelcomeMessage"},
      [](const Lab::Json& state) { return Lab::Text(state, "/host/welcomeMessage"); });
}

void SystemInfoImpl::SetSystemAlert(const std::string& alert) const {
  Lab::PerformChange({"SystemInfoImpl::SetSystemAlert", "", {alert}}, [&](Lab::Json& state) {
    state["host"]["systemAlert"] = Lab::TextNode(alert);
  });
}

}  // namespace Coreplane::System
