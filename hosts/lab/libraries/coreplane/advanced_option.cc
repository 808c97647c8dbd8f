#include "hostapi/coreplane/advanced_option.h"

#include <algorithm>
#include <utility>

#include "hosts/lab/libraries/perform.h"

namespace {

using Lab::Json;
using Nodeplane::Adv::AdvancedIntegerOption;
using Nodeplane::Adv::AdvancedOption;

// A key of a JSON object as a token of a JSON pointer.
std::string PointerToken(const std::string& key) {
  return (Json::json_pointer() / key).to_string();
}

std::string PointerTo(const std::string& path, const char* field) {
  return "/options/advanced" + PointerToken(path) + field;
}

class LabIntegerOption : public AdvancedIntegerOption {
 public:
  explicit LabIntegerOption(std::string path) : _path(std::move(path)) {}

  int32_t GetValue() const override {
    return Lab::PerformRead<int32_t>(
        {"AdvancedIntegerOption::GetValue", _path}, [this](const Json& state) {
          return static_cast<int32_t>(Lab::Number(state, PointerTo(_path, "/value").c_str()));
        });
  }

  void SetValue(int32_t value) override {
    Lab::PerformChange({"AdvancedIntegerOption::SetValue", _path, {std::to_string(value)}},
                       [&](Json& state) {
                         Lab::Object(state, PointerTo(_path, "").c_str());
                         state[Json::json_pointer(PointerTo(_path, "/value"))] = value;
                       });
  }

 private:
  std::string _path;
};

// An option whose value is no number.
class LabOtherOption : public AdvancedOption {};

}  // namespace

template <>
std::unique_ptr<AdvancedOption> Lab::MakeOtherClass<AdvancedOption>() {
  return std::make_unique<LabOtherOption>();
}

namespace Coreplane::Adv {

std::unique_ptr<AdvancedOption> AdvancedOptionImpl::FindOption(const std::string& path) {
  using Result = std::unique_ptr<AdvancedOption>;
  return Lab::PerformRead<Result>(
      {"AdvancedOptionImpl::FindOption", path}, [&path](const Json& state) -> Result {
        const std::string type = Lab::Text(state, PointerTo(path, "/type").c_str(), "");
        if (type.empty()) return nullptr;
        if (type == "integer") return std::make_unique<LabIntegerOption>(path);
        return std::make_unique<LabOtherOption>();
      });
}

bool UserAdvancedOptionImpl::HasUserOption(const std::string& name) {
  return Lab::PerformRead<bool>(
      {"UserAdvancedOptionImpl::HasUserOption", name}, [&name](const Json& state) {
        const Json& options = Lab::List(state, "/options/user");
        return std::find(options.begin(), options.end(), name) != options.end();
      });
}

}  // namespace Coreplane::Adv
