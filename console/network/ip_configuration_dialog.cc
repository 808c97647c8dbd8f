#include "console/network/ip_configuration_dialog.h"

#include <cctype>

#include "console/screen/key_map.h"
#include "console/widgets/form_fields.h"
#include "console/widgets/hints.h"

namespace Tarnel {

using Nodeplane::Network::IpConfig;
using Nodeplane::Network::Ipv4Address;

namespace {

constexpr int WIDTH = 78;
constexpr int HEIGHT = 19;
constexpr int HEADER_HEIGHT = 7;
constexpr int FIELD_WIDTH = 16;

// What SelectionIndex() gives for each row.
constexpr int NONE_ROW = 0;
constexpr int DHCP_ROW = 1;
constexpr int STATIC_ROW = 2;
constexpr int ADDRESS_ROW = 3;
constexpr int NETMASK_ROW = 4;
constexpr int GATEWAY_ROW = 5;

constexpr int TEXT_ADDRESS = 37;
constexpr int TEXT_GATEWAY = 40;
constexpr int TEXT_NETMASK = 41;
constexpr int TEXT_INVALID_ADDRESS = 82;
constexpr int TEXT_REENTER_ADDRESS = 83;
constexpr int TEXT_INVALID_NETMASK = 86;
constexpr int TEXT_REENTER_NETMASK = 87;
constexpr int TEXT_INVALID_GATEWAY = 90;
constexpr int TEXT_REENTER_GATEWAY = 91;
constexpr int TEXT_TITLE = 101;
constexpr int TEXT_BODY = 102;
constexpr int TEXT_NONE = 103;
constexpr int TEXT_DHCP = 104;
constexpr int TEXT_STATIC = 105;

bool IsNetmask(const std::string& text) {
  return Ipv4Address::IsValidAddress(text) && Ipv4Address(text).IsValidNetmask();
}

}  // namespace

IPConfigurationDialog::IPConfigurationDialog(Frame* parent, bool useNone, bool useDhcp,
                                             const IpConfig& config)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT),
      _config(config),
      _useNone(useNone && !useDhcp),
      _useDhcp(useDhcp),
      _useStatic(!useNone && !useDhcp),
      _list(_content->Add<ItemList>(0, 0, _content->Width(), _content->Height())),
      _noneRadio(Text(TEXT_NONE), false),
      _dhcpRadio(Text(TEXT_DHCP), false),
      _staticRadio(Text(TEXT_STATIC), false),
      _blank("", false),
      _addressInput(Text(TEXT_ADDRESS), config.GetIpv4Address().GetStringAddress(), FIELD_WIDTH),
      _netmaskInput(Text(TEXT_NETMASK), config.GetIpv4Netmask().GetStringAddress(), FIELD_WIDTH),
      _gatewayInput(Text(TEXT_GATEWAY), config.GetIpv4Gateway().GetStringAddress(), FIELD_WIDTH) {
  ShowMode();
}

int IPConfigurationDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  SetFooter(HINT_MARK);
  _list->SetItems({&_noneRadio, &_dhcpRadio, &_staticRadio, &_blank, &_addressInput, &_netmaskInput,
                   &_gatewayInput});
  _list->Repaint();
  for (;;) {
    switch (const int key = WaitKey(true); key) {
      case KEY_DOWN:
      case KEY_UP:
        MoveFocus(key);
        break;
      case SPACE_KEY:
        ChooseMode();
        break;
      case ENTER_KEY:
        if (Accept()) {
          return 1;
        }
        break;
      case ESC_KEY:
        return 0;
      default:
        Edit(key);
    }
  }
}

void IPConfigurationDialog::ShowMode() {
  _noneRadio.SetChecked(_useNone);
  _dhcpRadio.SetChecked(_useDhcp);
  _staticRadio.SetChecked(_useStatic);
  _addressInput.SetEnabled(_useStatic);
  _netmaskInput.SetEnabled(_useStatic);
  _gatewayInput.SetEnabled(_useStatic);
}

void IPConfigurationDialog::MoveFocus(int key) {
  if (key == KEY_DOWN) {
    _list->MoveDown();
  } else {
    _list->MoveUp();
  }
  SetCursorVisible(FocusedInput() != nullptr);
}

void IPConfigurationDialog::ChooseMode() {
  const int row = _list->SelectionIndex();
  if (row <= STATIC_ROW) {
    _useNone = row == NONE_ROW;
    _useDhcp = row == DHCP_ROW;
    _useStatic = row == STATIC_ROW;
    ShowMode();
  }
  _list->Repaint();
}

void IPConfigurationDialog::Edit(int key) {
  InputItem* const field = FocusedInput();
  if (field != nullptr && IsFieldKey(key, isdigit, ".")) {
    field->HandleKey(key);
    _list->Repaint();
  }
}

InputItem* IPConfigurationDialog::FocusedInput() {
  switch (_list->SelectionIndex()) {
    case ADDRESS_ROW:
      return &_addressInput;
    case NETMASK_ROW:
      return &_netmaskInput;
    case GATEWAY_ROW:
      return &_gatewayInput;
    default:
      return nullptr;
  }
}

bool IPConfigurationDialog::Accept() {
  _config.SetUseDhcp(_useDhcp);
  if (_useNone) {
    _config.SetIpv4UseNone();
  }
  if (!_useStatic) {
    _config.SetIpv4Gateway(Ipv4Address());
    return true;
  }
  if (!AreAddressesGood()) {
    return false;
  }
  StoreAddresses();
  return true;
}

// Whether the three fit together is left to the host.
bool IPConfigurationDialog::AreAddressesGood() {
  if (!Ipv4Address::IsValidAddress(_addressInput.Value())) {
    RefuseField(this, _list, ADDRESS_ROW, _addressInput, TEXT_INVALID_ADDRESS,
                TEXT_REENTER_ADDRESS);
  } else if (!IsNetmask(_netmaskInput.Value())) {
    RefuseField(this, _list, NETMASK_ROW, _netmaskInput, TEXT_INVALID_NETMASK,
                TEXT_REENTER_NETMASK);
  } else if (!Ipv4Address::IsValidAddress(_gatewayInput.Value())) {
    RefuseField(this, _list, GATEWAY_ROW, _gatewayInput, TEXT_INVALID_GATEWAY,
                TEXT_REENTER_GATEWAY);
  } else {
    return true;
  }
  return false;
}

void IPConfigurationDialog::StoreAddresses() {
  _config.SetIpv4Address(Ipv4Address(_addressInput.Value()));
  _config.SetIpv4Netmask(Ipv4Address(_netmaskInput.Value()));
  _config.SetIpv4Gateway(Ipv4Address(_gatewayInput.Value()));
}

}  // namespace Tarnel
