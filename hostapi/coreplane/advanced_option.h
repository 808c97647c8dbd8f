#pragma once

#include <cstdint>
#include <memory>
#include <string>

namespace Nodeplane::Adv {

// An advanced option of the host, of any type.
class AdvancedOption {
 public:
  virtual ~AdvancedOption();
};

// An advanced option that holds a whole number. Both operations throw NodeplaneException when the
// host fails or refuses the value.
class AdvancedIntegerOption : public AdvancedOption {
 public:
  ~AdvancedIntegerOption() override;
  virtual int32_t GetValue() const = 0;
  virtual void SetValue(int32_t value) = 0;
};

}  // namespace Nodeplane::Adv

namespace Coreplane::Adv {

class AdvancedOptionImpl {
 public:
  // The option at a path such as "/UserVars/TarnelTimeOut"; null when the host has none there.
  // Throws NodeplaneException when the host fails.
  static std::unique_ptr<Nodeplane::Adv::AdvancedOption> FindOption(const std::string& path);
};

class UserAdvancedOptionImpl {
 public:
  // The host has a user option of this name, whatever its value. Throws NodeplaneException when
  // the host fails.
  static bool HasUserOption(const std::string& name);
};

}  // namespace Coreplane::Adv
