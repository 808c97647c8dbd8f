#pragma once

#include <memory>
#include <string>
#include <vector>

namespace Coreplane::System {

// Settings of the host as a whole. Every operation throws NodeplaneException when the host fails.
class SystemInfoImpl {
 public:
  SystemInfoImpl();
  ~SystemInfoImpl();
  SystemInfoImpl(SystemInfoImpl&&) noexcept;
  SystemInfoImpl& operator=(SystemInfoImpl&&) noexcept;

  // What an administrator wants the welcome screen to show, empty when nothing is configured.
  std::string GetWelcomeMessage() const;
  // Puts a message into the host's alerts.
  void SetSystemAlert(const std::string& alert) const;

  // Names of all keyboard layouts that the host has, in the host's order.
  std::vector<std::string> GetKeyboardLayouts() const;
  // Name of the configured layout.
  std::string GetKeyboardLayout() const;
  // Stores the layout for later starts of the host.
  void SetKeyboardLayout(const std::string& layout) const;
  // Has the console's keyboard follow the layout from now on.
  void LoadKeyboardMappings(const std::string& layout) const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

}  // namespace Coreplane::System
