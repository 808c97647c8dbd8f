#pragma once

#include <string>

#include "console/widgets/dialog.h"
#include "hostapi/nodeplane/virtual_switch.h"

namespace Tarnel {

// Asks whether to move the management network onto a standard switch, and has it done. Gives 1
// when that was tried, whatever became of it.
class SafeModeNetworkDialog : public Dialog {
 public:
  explicit SafeModeNetworkDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  TextArea* _questionText;
};

// Moves the management interface and the uplinks of its switch onto a new standard switch with a
// new port group. All other kernel interfaces are down afterwards. A failure is logged and leaves
// the host as the step before left it.
void MoveManagementToNewSwitch();

// Takes the adapter from whatever switch it is on and gives it to the switch of the port group. A
// failure is logged.
void MoveUplinkToNewSwitch(Nodeplane::Network::PortGroup* newPortGroup, const std::string& uplink);

// True when the policy changed. A failure is logged.
bool AddUplinkToNewPolicy(const std::string& uplink, Nodeplane::Network::NicTeamingPolicy& policy);

}  // namespace Tarnel
