#pragma once

#include <memory>
#include <string>

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

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

}  // namespace Coreplane::System
