#pragma once

#include "console/login/host_summary.h"
#include "console/screen/frame.h"
#include "console/widgets/text_area.h"
#include "hostapi/coreplane/hardware.h"
#include "hostapi/coreplane/ip_services.h"
#include "hostapi/coreplane/system.h"

namespace Tarnel {

// The screen that stands while nobody is logged in: what this host is, where it can be reached,
// and the two ways in. Its Run() is the outermost loop of the process and never returns.
class WelcomeWindow : public Frame {
 public:
  WelcomeWindow();

  void Redraw() override;

 protected:
  int Run() override;

 private:
  // Chooses the layout and fills it with facts that are read anew.
  void Draw();
  void HandleKey(int key);
  // Logs an operator in and starts what the key stands for.
  void LogInFor(int key);
  bool LogIn();
  void Customize();

  void BuildDefaultLayout();
  void FillDefaultLayout();
  void BuildHostTexts();
  void ShowHost(bool ipv6Enabled);
  ManagementAddresses ReadAddresses();
  void WarnInAuditMode();
  void ShowAddresses(const std::string& addresses);
  void ShowMachine();

  void DrawCustomLayout();
  void ForgetChildren();

  Window* _topHalf = nullptr;
  Window* _bottomHalf = nullptr;
  TextArea* _productText = nullptr;
  TextArea* _hostText = nullptr;
  TextArea* _hardwareText = nullptr;
  TextArea* _networkText = nullptr;
  TextArea* _warningText = nullptr;
  TextArea* _footerText = nullptr;
  TextArea* _customText = nullptr;
  Coreplane::Network::DnsConfigImpl _dnsConfig;
  Coreplane::System::SystemInfoImpl _systemInfo;
};

}  // namespace Tarnel
