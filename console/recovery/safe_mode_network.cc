#include "console/recovery/safe_mode_network.h"

#include <syslog.h>

#include <memory>
#include <vector>

#include "console/hostops/command_runner.h"
#include "console/network/switch_operations.h"
#include "console/screen/colours.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/coreplane/switch_info.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

using Nodeplane::Lib::NodeplaneException;
using Nodeplane::Network::NetworkInterface;
using Nodeplane::Network::NicTeamingPolicy;
using Nodeplane::Network::PortGroup;

namespace {

constexpr int WIDTH = 60;
constexpr int HEIGHT = 12;
constexpr int HEADER_HEIGHT = 7;

constexpr int TEXT_TITLE = 138;
constexpr int TEXT_BODY = 139;
constexpr int TEXT_QUESTION = 140;

// A host that gives no object has failed like one that throws.
template <class T>
std::unique_ptr<T> Given(std::unique_ptr<T> object) {
  if (object == nullptr) {
    throw NodeplaneException("The host gave no object");
  }
  return object;
}

std::vector<std::string> ReadUplinks(const NetworkInterface& nic) {
  const auto portset = Given(Given(nic.GetConnectionPoint())->GetPortset());
  return portset->GetUplinks();
}

// The prefix with the lowest number for which the host has nothing of that name. No host has as
// many as are tried.
std::string FindFreeName(const std::string& prefix, bool (*isTaken)(const std::string& name)) {
  constexpr int MOST = 10000;
  for (int number = 0; number < MOST; ++number) {
    std::string name = prefix + std::to_string(number);
    if (!isTaken(name)) {
      return name;
    }
  }
  throw NodeplaneException("The host says that every name is taken");
}

std::unique_ptr<PortGroup> MakePortGroupOnNewSwitch() {
  using namespace Coreplane::Network;
  const std::string switchName = FindFreeName("softSwitch", PortsetImpl::IsValidVirtualSwitch);
  const auto newSwitch = Given(VirtualSwitchInfoImpl().AddVirtualSwitch(
      switchName, Nodeplane::Network::Portset::DEF_NUM_PORTS));
  const std::string name = FindFreeName("Management Network", PortGroupImpl::IsValidPortGroup);
  return Given(newSwitch->AddPortGroup(name));
}

void DisableAllInterfaces() {
  for (const auto& nic : Coreplane::Network::CorelinNicInfoImpl().GetCorelinNics()) {
    nic->Disable();
  }
}

void AddToSwitch(const PortGroup& portGroup, const std::string& uplink) {
  const auto newSwitch = Given(portGroup.GetVirtualSwitch());
  NicTeamingPolicy policy = newSwitch->GetTeamingPolicy();
  newSwitch->AddUplink(uplink);
  if (AddUplinkToNewPolicy(uplink, policy)) {
    newSwitch->SetTeamingPolicy(policy);
  }
}

}  // namespace

SafeModeNetworkDialog::SafeModeNetworkDialog(Frame* parent)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT),
      _questionText(
          _content->Add<TextArea>(0, 0, _content->Width(), _content->Height(), PARENT_COLOUR)) {}

int SafeModeNetworkDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  _questionText->SetText(Text(TEXT_QUESTION));
  SetFooter(HINT_F11_OK);
  if (!IsAccepted(F11_KEY)) {
    return 0;
  }
  MoveManagementToNewSwitch();
  syslog(LOG_INFO, "%s",
         "Enabling safe mode networking by moving all uplinks to a new management softSwitch");
  return 1;
}

// The interfaces go down before anything moves, and the management interface comes up when its
// uplinks are in place.
void MoveManagementToNewSwitch() {
  try {
    const auto management = LookupManagementInterface();
    if (management == nullptr) {
      syslog(LOG_ERR, "Could not find the management network");
      return;
    }
    const std::vector<std::string> uplinks = ReadUplinks(*management);
    const auto newPortGroup = MakePortGroupOnNewSwitch();
    DisableAllInterfaces();
    management->SetConnectionPoint(newPortGroup.get(), false);
    for (const std::string& uplink : uplinks) {
      MoveUplinkToNewSwitch(newPortGroup.get(), uplink);
    }
    management->Enable();
  } catch (const NodeplaneException& error) {
    syslog(LOG_ERR, "Changing to legacy virtual switch failed: %s", error.what());
  }
}

void MoveUplinkToNewSwitch(PortGroup* newPortGroup, const std::string& uplink) {
  try {
    DetachUplink(uplink);
    AddToSwitch(*newPortGroup, uplink);
  } catch (const NodeplaneException& error) {
    syslog(LOG_ERR, "Moving uplink %s failed: %s", uplink.c_str(), error.what());
  }
}

bool AddUplinkToNewPolicy(const std::string& uplink, NicTeamingPolicy& policy) {
  try {
    return AppendUplink(uplink, policy);
  } catch (const NodeplaneException& error) {
    syslog(LOG_ERR, "VS: add uplink to teaming policy failed: %s", error.what());
    return false;
  }
}

}  // namespace Tarnel
