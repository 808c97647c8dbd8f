#pragma once

#include "console/widgets/dialog.h"
#include "console/widgets/input_item.h"
#include "console/widgets/item_list.h"
#include "hostapi/nodeplane/ip_config.h"

namespace Tarnel {

// Chooses between no IPv4, DHCP and a static address for the management interface. Gives 1 when the
// form was accepted.
class IPConfigurationDialog : public Dialog {
 public:
  // The mode counts, not what the configuration says of it.
  IPConfigurationDialog(Frame* parent, bool useNone, bool useDhcp,
                        const Nodeplane::Network::IpConfig& config);

  // The configuration with what was accepted; without a static address it has no gateway.
  const Nodeplane::Network::IpConfig& Config() const { return _config; }

 protected:
  int Run() override;

 private:
  // Brings the rows in line with the mode.
  void ShowMode();
  void MoveFocus(int key);
  void ChooseMode();
  void Edit(int key);
  // The field in focus; null on a button.
  InputItem* FocusedInput();
  bool Accept();
  bool AreAddressesGood();
  void StoreAddresses();

  Nodeplane::Network::IpConfig _config;
  // Exactly one is true.
  bool _useNone;
  bool _useDhcp;
  bool _useStatic;
  ItemList* _list;
  RadioItem _noneRadio;
  RadioItem _dhcpRadio;
  RadioItem _staticRadio;
  LabelItem _blank;
  InputItem _addressInput;
  InputItem _netmaskInput;
  InputItem _gatewayInput;
};

}  // namespace Tarnel
