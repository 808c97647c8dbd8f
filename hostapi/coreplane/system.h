#pragma once

#include <memory>
#include <string>
#include <vector>

namespace Coreplane::System {

// A named set of the host's firewall rules, made by the host. Every operation throws
// NodeplaneException when it fails.
class FirewallRuleset {
 public:
  virtual ~FirewallRuleset();
  // The rules are opened and closed together with the service that they are for.
  virtual bool FollowsService() const = 0;
  virtual void Disable() = 0;
  virtual void Enable() = 0;

 protected:
  FirewallRuleset() = default;
};

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

  // The firewall rules of this name; null when the host has none.
  std::unique_ptr<FirewallRuleset> GetFirewallRulesetById(const std::string& id) const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

class KernelOpts {
 public:
  // An option of the kernel as it runs now; false when it has none of this name. Throws
  // NodeplaneException when the host fails.
  static bool GetRuntimeValueBool(const std::string& name);
};

}  // namespace Coreplane::System

namespace Coreplane::Resource {

// What runs on the host. Every operation throws NodeplaneException when the host fails.
class ResourceInfoImpl {
 public:
  ResourceInfoImpl();
  ~ResourceInfoImpl();
  ResourceInfoImpl(ResourceInfoImpl&&) noexcept;
  ResourceInfoImpl& operator=(ResourceInfoImpl&&) noexcept;

  bool HasRunningVirtualMachines() const;

 private:
  struct Data;
  std::unique_ptr<Data> _data;
};

}  // namespace Coreplane::Resource
