#pragma once

#include "console/widgets/dialog.h"
#include "hostapi/nodeplane/network_interface.h"

namespace Tarnel {

// Both borrow the management interface. A NodeplaneException of the host passes through them; when
// it comes between the two halves of a restart, the interface stays down.

// Asks whether the management network is to be restarted, and does it. Gives 0 for Esc.
class RestartNetworkDialog : public Dialog {
 public:
  RestartNetworkDialog(Frame* parent, Nodeplane::Network::NetworkInterface* nic);

 protected:
  int Run() override;

 private:
  Nodeplane::Network::NetworkInterface* _mgmtNic;
  TextArea* _text;
};

// Takes the interface down and brings it up again, telling each stage. Gives 1.
class DoRestartNetworkDialog : public Dialog {
 public:
  DoRestartNetworkDialog(Frame* parent, Nodeplane::Network::NetworkInterface* nic);

 protected:
  int Run() override;

 private:
  void Append(int textId, const char* end);
  void ShowIpv4Address();
  void ShowIpv6Addresses(bool usesDhcp);

  Nodeplane::Network::NetworkInterface* _mgmtNic;
  TextArea* _text;
};

}  // namespace Tarnel
