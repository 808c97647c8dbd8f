// The two lookups that turn the cards in the host's readers into a user id. A failing reader looks
// like no card.

#include <syslog.h>

#include <algorithm>
#include <functional>

#include "console/screen/frame.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

namespace {

using Coreplane::Hardware::SmartCardInfoImpl;
using UserIds = std::vector<std::string>;

// The first user id on any card, in the order of the slots, that is wanted; else an empty string.
std::string FindUserId(const SmartCardInfoImpl& cards,
                       const std::function<bool(const std::string&)>& wanted) {
  for (const Nodeplane::Hardware::SmartCardSlot& slot : cards.GetAllSlots()) {
    Nodeplane::Hardware::SmartCardToken token;
    if (!cards.GetToken(slot, token)) {
      continue;
    }
    const UserIds& ids = token.userIds;
    const auto found = std::find_if(ids.begin(), ids.end(), wanted);
    if (found != ids.end()) {
      return *found;
    }
  }
  return "";
}

void LogLookupError() { syslog(LOG_ERR, "Error trying to lookup smart card tokens."); }

}  // namespace

std::string Frame::FindSmartCardLoginId() {
  try {
    return FindUserId(_cardInfo, [](const std::string& id) { return !id.empty(); });
  } catch (const Nodeplane::Lib::NodeplaneException&) {
    LogLookupError();
    return "";
  }
}

bool Frame::IsSmartCardPresent(const std::string& user) {
  bool present = false;
  try {
    FindUserId(_cardInfo, [&](const std::string& id) { return present = id == user; });
  } catch (const Nodeplane::Lib::NodeplaneException&) {
    LogLookupError();
    return false;
  }
  return present;
}

}  // namespace Tarnel
