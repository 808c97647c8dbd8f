#include "console/network/ipv6_configuration_dialog.h"

#include <cctype>
#include <vector>

#include "console/network/address_text.h"
#include "console/screen/key_map.h"
#include "console/widgets/form_fields.h"
#include "console/widgets/hints.h"

namespace Tarnel {

using Nodeplane::Network::IpConfig;
using Nodeplane::Network::Ipv6Address;
using Nodeplane::Network::Ipv6Network;

namespace {

constexpr int WIDTH = 78;
constexpr int HEIGHT = 21;
constexpr int HEADER_HEIGHT = 7;
constexpr int FIELD_WIDTH = 42;
constexpr int CHECK_INDENT = 4;

// What SelectionIndex() gives for each row.
constexpr int DISABLE_ROW = 0;
constexpr int DYNAMIC_ROW = 1;
constexpr int DHCP6_ROW = 2;
constexpr int STATIC_ROW = 3;
constexpr int FIRST_ADDRESS_ROW = 4;
constexpr int GATEWAY_ROW = 7;

constexpr int TEXT_INVALID_ADDRESS = 82;
constexpr int TEXT_REENTER_ADDRESS = 84;
constexpr int TEXT_INVALID_SCOPE = 88;
constexpr int TEXT_LINK_LOCAL = 89;
constexpr int TEXT_INVALID_GATEWAY = 90;
constexpr int TEXT_REENTER_GATEWAY = 92;
constexpr int TEXT_TITLE = 106;
constexpr int TEXT_BODY = 107;
constexpr int TEXT_DISABLE = 108;
constexpr int TEXT_DYNAMIC = 109;
constexpr int TEXT_DHCP6 = 110;
constexpr int TEXT_STATIC = 111;
constexpr int TEXT_ADDRESS = 112;
constexpr int TEXT_GATEWAY = 113;

bool IsDynamic(const IpConfig& config) {
  return config.GetUseIpv6Dhcp() || config.GetUseIpv6RouterAdvertised();
}

std::string AddressLabel(StringFactory& strings, int number) {
  return std::string(strings.GetString(TEXT_ADDRESS)) + " #" + std::to_string(number);
}

// With the scope, which an untouched form would lose otherwise.
std::string GatewayText(const IpConfig& config) {
  const std::string text = config.GetIpv6Gateway().GetScopedStringAddress();
  return text == "::" ? "" : text;
}

}  // namespace

IPv6ConfigurationDialog::IPv6ConfigurationDialog(Frame* parent, bool enabled, const IpConfig& modes,
                                                 const IpConfig& working)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT),
      _enabled(enabled),
      _config(working),
      _list(_content->Add<ItemList>(0, 0, _content->Width(), _content->Height())),
      _disableRadio(Text(TEXT_DISABLE), false),
      _dynamicRadio(Text(TEXT_DYNAMIC), false),
      _dhcp6Check(Text(TEXT_DHCP6), false, CHECK_INDENT),
      _staticRadio(Text(TEXT_STATIC), false),
      _blank("", false),
      _addressInputs{{AddressLabel(*_strings, 1), "", FIELD_WIDTH},
                     {AddressLabel(*_strings, 2), "", FIELD_WIDTH},
                     {AddressLabel(*_strings, 3), "", FIELD_WIDTH}},
      _gatewayInput(Text(TEXT_GATEWAY), GatewayText(working), FIELD_WIDTH) {
  TakeAddresses();
  ShowMode(modes);
}

// From here on the fields are the only place where the shown addresses live: what is not accepted
// in the end is gone.
void IPv6ConfigurationDialog::TakeAddresses() {
  int shown = 0;
  const std::vector<Ipv6Network> networks = _config.GetIpv6Network();
  for (const Ipv6Network& network : networks) {
    if (shown < ADDRESSES && IsStaticGlobal(network)) {
      _addressInputs[shown++].SetValue(network.GetStringAddress());
      _config.RemoveIpv6Network(network);
    }
  }
}

int IPv6ConfigurationDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  SetFooter(HINT_MARK);
  _list->SetItems({&_disableRadio, &_dynamicRadio, &_dhcp6Check, &_staticRadio, &_blank,
                   &_addressInputs[0], &_addressInputs[1], &_addressInputs[2], &_gatewayInput});
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

void IPv6ConfigurationDialog::ShowMode(const IpConfig& flags) {
  const bool dynamic = _enabled && IsDynamic(flags);
  const bool fixed = _enabled && !dynamic;
  _disableRadio.SetChecked(!_enabled);
  _dynamicRadio.SetChecked(dynamic);
  _dhcp6Check.SetChecked(flags.GetUseIpv6Dhcp());
  _dhcp6Check.SetEnabled(dynamic);
  _staticRadio.SetChecked(fixed);
  for (InputItem& field : _addressInputs) {
    field.SetEnabled(fixed);
  }
  _gatewayInput.SetEnabled(fixed);
}

void IPv6ConfigurationDialog::MoveFocus(int key) {
  if (key == KEY_DOWN) {
    _list->MoveDown();
  } else {
    _list->MoveUp();
  }
  SetCursorVisible(_list->SelectionIndex() >= FIRST_ADDRESS_ROW);
}

// Switching IPv6 off keeps the flags, so that the way back is to the same mode.
void IPv6ConfigurationDialog::ChooseMode() {
  const bool dhcp = _dhcp6Check.IsChecked();
  switch (_list->SelectionIndex()) {
    case DISABLE_ROW:
      _enabled = false;
      break;
    case DYNAMIC_ROW:
      _enabled = true;
      SetFlags(dhcp, !dhcp);
      break;
    case DHCP6_ROW:
      SetFlags(!dhcp, dhcp);
      break;
    case STATIC_ROW:
      _enabled = true;
      SetFlags(false, false);
      break;
    default:
      break;
  }
  ShowMode(_config);
  _list->Repaint();
}

void IPv6ConfigurationDialog::SetFlags(bool dhcp, bool routerAdvertised) {
  _config.SetUseIpv6Dhcp(dhcp);
  _config.SetUseIpv6RouterAdvertised(routerAdvertised);
}

void IPv6ConfigurationDialog::Edit(int key) {
  if (!IsFieldKey(key, isalnum, ":/%")) {
    return;
  }
  const int row = _list->SelectionIndex();
  if (row == GATEWAY_ROW) {
    _gatewayInput.HandleKey(key);
  } else if (row >= FIRST_ADDRESS_ROW) {
    _addressInputs[row - FIRST_ADDRESS_ROW].HandleKey(key);
    _addressEdited = true;
  }
  _list->Repaint();
}

bool IPv6ConfigurationDialog::Accept() {
  if (!_enabled || IsDynamic(_config)) {
    return true;
  }
  for (int index = 0; index < ADDRESSES; ++index) {
    if (!IsAddressGood(index)) {
      return false;
    }
  }
  if (!IsGatewayGood()) {
    return false;
  }
  StoreAddresses();
  StoreGateway();
  return true;
}

bool IPv6ConfigurationDialog::IsAddressGood(int index) {
  InputItem& field = _addressInputs[index];
  const int row = FIRST_ADDRESS_ROW + index;
  const std::string& text = field.Value();
  if (text.empty()) {
    return true;
  }
  if (!Ipv6Network::IsValidAddressAndNetmask(text)) {
    RefuseField(this, _list, row, field, TEXT_INVALID_ADDRESS, TEXT_REENTER_ADDRESS);
    return false;
  }
  if (Ipv6Network(text).GetAddress().IsLinkLocal()) {
    RefuseField(this, _list, row, field, TEXT_INVALID_SCOPE, TEXT_LINK_LOCAL);
    return false;
  }
  return true;
}

// A gateway may be link-local; routers usually are.
bool IPv6ConfigurationDialog::IsGatewayGood() {
  const std::string& text = _gatewayInput.Value();
  if (text.empty() || Ipv6Address::IsValidAddress(text)) {
    return true;
  }
  RefuseField(this, _list, GATEWAY_ROW, _gatewayInput, TEXT_INVALID_GATEWAY, TEXT_REENTER_GATEWAY);
  return false;
}

void IPv6ConfigurationDialog::StoreAddresses() {
  for (const InputItem& field : _addressInputs) {
    if (!field.Value().empty()) {
      Ipv6Network network(field.Value());
      network.SetIpv6AddressType(Ipv6Network::STATIC);
      network.SetIpv6Scope(Ipv6Network::GLOBAL);
      _config.AddIpv6Network(network);
    }
  }
}

void IPv6ConfigurationDialog::StoreGateway() {
  const std::string& text = _gatewayInput.Value();
  if (text != _config.GetIpv6Gateway().GetScopedStringAddress()) {
    _config.SetIpv6Gateway(text.empty() ? Ipv6Address() : Ipv6Address(text));
  }
}

}  // namespace Tarnel
