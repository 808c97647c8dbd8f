#pragma once

#include <string>
#include <vector>

#include "console/screen/frame.h"
#include "console/widgets/item_list.h"
#include "console/widgets/text_area.h"
#include "hostapi/coreplane/ip_services.h"
#include "hostapi/coreplane/switch_info.h"

namespace Tarnel {

// The full-screen layout of the menu screens: on the left a title, a list of rows and a key hint,
// on the right what there is to know about the focused row, at the bottom the host's version.
class RootWindow : public Frame {
 public:
  explicit RootWindow(Frame* parent);

 protected:
  // Shows the whole screen anew; called at the start of Run() and after each child frame.
  void ShowScreen();
  // Repaints what depends on the host: the list, both hints, the right pane.
  virtual void RefreshPanes() = 0;

  // Each address on a line of its own; of more than three, two and a line that says so.
  static std::string Ipv6Lines(const std::vector<Nodeplane::Network::Ipv6Network>& networks);

  void SetLeftTitle(const std::string& title);
  void SetRightTitle(const std::string& title);
  void SetLeftHint(const std::string& hint);
  void SetRightHint(const std::string& hint);

  Window* _statusLine;
  Window* _frameArea;
  Window* _rightPane;
  Window* _leftPane;
  TextArea* _rightTitle;
  TextArea* _leftTitle;
  TextArea* _leftHint;
  TextArea* _rightHint;
  ItemList* _list;
  TextArea* _rightText;
  Coreplane::Network::DnsConfigImpl _dnsConfig;
  Coreplane::Network::RoutingInfoImpl _routingInfo;
  Coreplane::Network::VirtualSwitchInfoImpl _switchInfo;
};

}  // namespace Tarnel
