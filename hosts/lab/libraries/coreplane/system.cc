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

std::vector<std::string> SystemInfoImpl::GetKeyboardLayouts() const {
  return Lab::PerformRead<std::vector<std::string>>(
      {"SystemInfoImpl::GetKeyboardLayouts"}, [](const Lab::Json& state) {
        std::vector<std::string> layouts;
        for (const Lab::Json& layout : Lab::List(state, "/host/keyboard/layouts")) {
          layouts.push_back(Lab::Text(layout, ""));
        }
        return layouts;
      });
}

std::string SystemInfoImpl::GetKeyboardLayout() const {
  return Lab::PerformRead<std::string>(
      {"SystemInfoImpl::GetKeyboardLayout"},
      [](const Lab::Json& state) { return Lab::Text(state, "/host/keyboard/configured"); });
}

void SystemInfoImpl::SetKeyboardLayout(const std::string& layout) const {
  Lab::PerformChange({"SystemInfoImpl::SetKeyboardLayout", "", {layout}}, [&](Lab::Json& state) {
    state["host"]["keyboard"]["configured"] = Lab::TextNode(layout);
  });
}

void SystemInfoImpl::LoadKeyboardMappings(const std::string& layout) const {
  Lab::PerformChange({"SystemInfoImpl::LoadKeyboardMappings", "", {layout}}, [&](Lab::Json& state) {
    state["host"]["keyboard"]["loaded"] = Lab::TextNode(layout);
  });
}

}  // namespace Coreplane::System
