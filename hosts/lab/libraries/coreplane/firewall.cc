#include <utility>

#include "hostapi/coreplane/system.h"
#include "hosts/lab/libraries/perform.h"

namespace Coreplane::System {

FirewallRuleset::~FirewallRuleset() = default;

namespace {

using Lab::Json;

// A JSON pointer to a ruleset of the state, or to a field of it.
std::string PointerTo(const std::string& id, const char* field) {
  return (Json::json_pointer("/network/rulesets") / id).to_string() + field;
}

class LabRuleset : public FirewallRuleset {
 public:
  explicit LabRuleset(std::string id) : _id(std::move(id)) {}

  bool FollowsService() const override {
    return Lab::PerformRead<bool>(
        {"FirewallRuleset::FollowsService", _id}, [this](const Json& state) {
          return Lab::Flag(state, PointerTo(_id, "/follows").c_str(), false);
        });
  }

  void Disable() override { Switch("FirewallRuleset::Disable", false); }

  void Enable() override { Switch("FirewallRuleset::Enable", true); }

 private:
  void Switch(const char* operation, bool on) {
    Lab::PerformChange({operation, _id}, [&](Json& state) {
      Lab::Object(state, PointerTo(_id, "").c_str());
      state[Json::json_pointer(PointerTo(_id, "/on"))] = on;
    });
  }

  std::string _id;
};

}  // namespace

std::unique_ptr<FirewallRuleset> SystemInfoImpl::GetFirewallRulesetById(
    const std::string& id) const {
  using Result = std::unique_ptr<FirewallRuleset>;
  return Lab::PerformRead<Result>({"SystemInfoImpl::GetFirewallRulesetById", "", {id}},
                                  [&id](const Json& state) -> Result {
                                    if (!state.contains(Json::json_pointer(PointerTo(id, "")))) {
                                      return nullptr;
                                    }
                                    return std::make_unique<LabRuleset>(id);
                                  });
}

}  // namespace Coreplane::System
