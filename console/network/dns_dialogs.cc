#include "console/network/dns_dialogs.h"

#include <cctype>

#include "console/network/address_text.h"
#include "console/screen/key_map.h"
#include "console/widgets/form_fields.h"
#include "console/widgets/hints.h"

namespace Tarnel {

using Nodeplane::Network::IpAddress;

namespace {

constexpr int DNS_WIDTH = 78;
constexpr int DNS_HEIGHT = 17;
constexpr int DNS_HEADER_HEIGHT = 6;
constexpr int DNS_FIELD_WIDTH = 44;
constexpr int SUFFIXES_WIDTH = 70;
constexpr int SUFFIXES_HEIGHT = 13;
constexpr int SUFFIXES_HEADER_HEIGHT = 8;
constexpr int SUFFIXES_FIELD_WIDTH = 40;

// What SelectionIndex() gives for each row.
constexpr int AUTO_ROW = 0;
constexpr int MANUAL_ROW = 1;
constexpr int PRIMARY_ROW = 2;
constexpr int ALTERNATE_ROW = 3;
constexpr int HOSTNAME_ROW = 4;

// So short a text is no IPv6 address any more, but for "::".
constexpr size_t SHORT_TEXT = 2;

constexpr int TEXT_HOSTNAME = 42;
constexpr int TEXT_PRIMARY = 43;
constexpr int TEXT_ALTERNATE = 44;
constexpr int TEXT_IPV6_SERVER = 45;
constexpr int TEXT_SUFFIXES_TITLE = 55;
constexpr int TEXT_INVALID_SERVER = 94;
constexpr int TEXT_REENTER_SERVER = 95;
constexpr int TEXT_DNS_TITLE = 124;
constexpr int TEXT_DNS_BODY = 125;
constexpr int TEXT_AUTO = 126;
constexpr int TEXT_MANUAL = 127;
constexpr int TEXT_SUFFIXES_BODY = 128;
constexpr int TEXT_SUFFIXES = 129;

bool IsGoodServer(const std::string& text) { return text.empty() || IsValidAddress(text); }

}  // namespace

DNSConfigurationDialog::DNSConfigurationDialog(Frame* parent, bool dhcpDns, bool usingDhcp,
                                               const IpAddress* primary, const IpAddress* alternate,
                                               const std::string& hostname)
    : Dialog(parent, DNS_WIDTH, DNS_HEIGHT, DNS_HEADER_HEIGHT),
      _dhcpDns(dhcpDns),
      _primaryDns(ParseAddress(AddressText(primary))),
      _alternateDns(ParseAddress(AddressText(alternate))),
      _hostname(hostname),
      _list(_content->Add<ItemList>(0, 0, _content->Width(), _content->Height())),
      _autoRadio(Text(TEXT_AUTO), false),
      _manualRadio(Text(TEXT_MANUAL), false),
      _blank("", false),
      _primaryInput(Text(TEXT_PRIMARY), AddressText(primary), DNS_FIELD_WIDTH),
      _alternateInput(Text(IsMixedPair(primary, alternate) ? TEXT_IPV6_SERVER : TEXT_ALTERNATE),
                      AddressText(alternate), DNS_FIELD_WIDTH),
      _hostnameInput(Text(TEXT_HOSTNAME), hostname, DNS_FIELD_WIDTH) {
  _autoRadio.SetEnabled(usingDhcp);
  _manualRadio.SetEnabled(usingDhcp);
  ShowMode();
}

int DNSConfigurationDialog::Run() {
  SetTitle(Text(TEXT_DNS_TITLE));
  SetBody(Text(TEXT_DNS_BODY));
  SetFooter(HINT_MARK);
  _list->SetItems(
      {&_autoRadio, &_manualRadio, &_blank, &_primaryInput, &_alternateInput, &_hostnameInput});
  _list->Repaint();
  SetCursorVisible(IsInputFocused());
  for (;;) {
    switch (const int key = WaitKey(true); key) {
      case KEY_DOWN:
      case KEY_UP:
        MoveFocus(key);
        break;
      case ENTER_KEY:
        if (Accept()) {
          return 1;
        }
        break;
      case ESC_KEY:
        return 0;
      default:
        HandleOtherKey(key);
    }
  }
}

void DNSConfigurationDialog::ShowMode() {
  _autoRadio.SetChecked(_dhcpDns);
  _manualRadio.SetChecked(!_dhcpDns);
  _primaryInput.SetEnabled(!_dhcpDns);
  _alternateInput.SetEnabled(!_dhcpDns);
  _hostnameInput.SetEnabled(!_dhcpDns);
}

void DNSConfigurationDialog::MoveFocus(int key) {
  if (key == KEY_DOWN) {
    _list->MoveDown();
  } else {
    _list->MoveUp();
  }
  SetCursorVisible(IsInputFocused());
}

// With every row disabled the selection index is behind the last one, and no row has the keyboard.
bool DNSConfigurationDialog::IsInputFocused() const {
  return _list->SelectionIndex() >= PRIMARY_ROW && _list->SelectionIndex() <= HOSTNAME_ROW;
}

void DNSConfigurationDialog::HandleOtherKey(int key) {
  const int row = _list->SelectionIndex();
  if (key == SPACE_KEY && row <= MANUAL_ROW) {
    _dhcpDns = row == AUTO_ROW;
    ShowMode();
  } else {
    Edit(key);
  }
  _list->Repaint();
}

void DNSConfigurationDialog::Edit(int key) {
  const int row = _list->SelectionIndex();
  const bool isAddressKey = IsFieldKey(key, isxdigit, ":.");
  if (row == PRIMARY_ROW && isAddressKey) {
    _primaryInput.HandleKey(key);
  } else if (row == ALTERNATE_ROW && isAddressKey) {
    _alternateInput.HandleKey(key);
    if (_alternateInput.Value().size() <= SHORT_TEXT) {
      _alternateInput.SetLabel(Text(TEXT_ALTERNATE));
    }
  } else if (row == HOSTNAME_ROW && IsFieldKey(key, isalnum, "-.")) {
    _hostnameInput.HandleKey(key);
  }
}

bool DNSConfigurationDialog::Accept() {
  if (_dhcpDns) {
    return true;
  }
  if (!AreServersGood()) {
    return false;
  }
  _primaryDns = ParseAddress(_primaryInput.Value());
  _alternateDns = ParseAddress(_alternateInput.Value());
  _hostname = _hostnameInput.Value();
  return true;
}

bool DNSConfigurationDialog::AreServersGood() {
  const bool primaryGood = IsGoodServer(_primaryInput.Value());
  if (primaryGood && IsGoodServer(_alternateInput.Value())) {
    return true;
  }
  RefuseField(this, _list, primaryGood ? ALTERNATE_ROW : PRIMARY_ROW,
              primaryGood ? _alternateInput : _primaryInput, TEXT_INVALID_SERVER,
              TEXT_REENTER_SERVER);
  return false;
}

SuffixesDialog::SuffixesDialog(Frame* parent, const std::string& suffixes)
    : Dialog(parent, SUFFIXES_WIDTH, SUFFIXES_HEIGHT, SUFFIXES_HEADER_HEIGHT),
      _list(_content->Add<ItemList>(0, 0, _content->Width(), 1)),
      _suffixesInput(Text(TEXT_SUFFIXES), suffixes, SUFFIXES_FIELD_WIDTH) {
  _list->SetItems({&_suffixesInput});
}

int SuffixesDialog::Run() {
  SetTitle(Text(TEXT_SUFFIXES_TITLE));
  SetBody(Text(TEXT_SUFFIXES_BODY));
  SetFooter(HINT_OK_CANCEL);
  SetCursorVisible(true);
  _list->Repaint();
  for (;;) {
    const int key = WaitKey(true);
    if (key == ENTER_KEY || key == ESC_KEY) {
      SetCursorVisible(false);
      return key == ENTER_KEY ? 1 : 0;
    }
    if (IsFieldKey(key, isalnum, ". ,-")) {
      _suffixesInput.HandleKey(key);
      _list->Repaint();
    }
  }
}

}  // namespace Tarnel
