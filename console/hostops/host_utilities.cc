#include <cctype>

#include "console/hostops/command_runner.h"
#include "hostapi/coreplane/advanced_option.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {
namespace {

constexpr int32_t DEFAULT_TIMEOUT_SECONDS = 600;

bool IsSpace(char character) { return isspace(static_cast<unsigned char>(character)) != 0; }

}  // namespace

const std::string TARNEL_TIMEOUT_VAR = "/UserVars/TarnelTimeOut";

int32_t GetTarnelTimeoutValue() {
  try {
    const auto option = Coreplane::Adv::AdvancedOptionImpl::FindOption(TARNEL_TIMEOUT_VAR);
    const auto* number = dynamic_cast<Nodeplane::Adv::AdvancedIntegerOption*>(option.get());
    return number == nullptr ? DEFAULT_TIMEOUT_SECONDS : number->GetValue();
  } catch (const Nodeplane::Lib::NodeplaneException&) {
    return DEFAULT_TIMEOUT_SECONDS;
  }
}

void SetTarnelTimeoutValue(int32_t seconds) {
  try {
    const auto option = Coreplane::Adv::AdvancedOptionImpl::FindOption(TARNEL_TIMEOUT_VAR);
    auto* number = dynamic_cast<Nodeplane::Adv::AdvancedIntegerOption*>(option.get());
    if (number != nullptr) {
      number->SetValue(seconds);
    }
  } catch (const Nodeplane::Lib::NodeplaneException&) {
    // The limit then stays as it was, which the next visit of the screen shows.
  }
}

std::string CollapseWhitespace(const std::string& text) {
  std::string collapsed;
  bool gap = false;
  for (const char character : text) {
    if (IsSpace(character)) {
      gap = !collapsed.empty();
      continue;
    }
    if (gap) {
      collapsed += ' ';
      gap = false;
    }
    collapsed += character;
  }
  return collapsed;
}

std::unique_ptr<Nodeplane::Network::NetworkInterface> LookupManagementInterface() {
  Coreplane::Network::NetworkInfoImpl info;
  info.UpdateManagementInterface();
  return info.GetManagementInterface();
}

}  // namespace Tarnel
