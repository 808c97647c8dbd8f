#pragma once

#include "console/widgets/dialog.h"
#include "console/widgets/input_item.h"
#include "console/widgets/item_list.h"
#include "hostapi/nodeplane/ip_config.h"

namespace Tarnel {

// Chooses how the management interface gets its IPv6 configuration: not at all, dynamically, or
// statically with up to three addresses. Gives 1 when the form was accepted.
class IPv6ConfigurationDialog : public Dialog {
 public:
  // The form opens on the mode that modes has; working is what it edits a copy of.
  IPv6ConfigurationDialog(Frame* parent, bool enabled, const Nodeplane::Network::IpConfig& modes,
                          const Nodeplane::Network::IpConfig& working);

  bool IsEnabled() const { return _enabled; }
  // The configuration with what was accepted. The addresses that the form shows are in it only
  // when they were accepted as static ones.
  const Nodeplane::Network::IpConfig& Config() const { return _config; }
  // A key has reached one of the address fields, whatever came of it.
  bool IsAddressEdited() const { return _addressEdited; }

 protected:
  int Run() override;

 private:
  static constexpr int ADDRESSES = 3;

  void TakeAddresses();
  // Brings the rows in line with the switch and the mode that the flags stand for.
  void ShowMode(const Nodeplane::Network::IpConfig& flags);
  void MoveFocus(int key);
  void ChooseMode();
  void SetFlags(bool dhcp, bool routerAdvertised);
  void Edit(int key);
  bool Accept();
  bool IsAddressGood(int index);
  bool IsGatewayGood();
  void StoreAddresses();
  void StoreGateway();

  bool _enabled;
  // Its flags carry the choice once a mode was marked.
  Nodeplane::Network::IpConfig _config;
  bool _addressEdited = false;
  ItemList* _list;
  RadioItem _disableRadio;
  RadioItem _dynamicRadio;
  CheckItem _dhcp6Check;
  RadioItem _staticRadio;
  LabelItem _blank;
  InputItem _addressInputs[ADDRESSES];
  InputItem _gatewayInput;
};

}  // namespace Tarnel
