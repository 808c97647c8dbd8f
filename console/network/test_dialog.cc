#include "console/network/test_dialog.h"

#include <cctype>

#include "console/network/address_text.h"
#include "console/network/run_test_dialog.h"
#include "console/screen/key_map.h"
#include "console/widgets/form_fields.h"
#include "console/widgets/hints.h"
#include "hostapi/coreplane/network_info.h"

namespace Tarnel {

namespace {

constexpr int TEXT_BAD_ADDRESS_TITLE = 82;
constexpr int TEXT_BAD_ADDRESS = 85;
constexpr int TEXT_TITLE = 215;
constexpr int TEXT_BODY = 216;
constexpr int TEXT_PING_ADDRESS = 217;
constexpr int TEXT_RESOLVE_HOSTNAME = 218;

constexpr int FIELD_WIDTH = 30;

}  // namespace

TestDialog::TestDialog(Frame* parent)
    : Dialog(parent, 70, 14, 6),
      _dnsConfig(Coreplane::Network::DEFAULT_STACK),
      _routingInfo(Coreplane::Network::DEFAULT_STACK) {
  std::vector<std::string> candidates = Candidates();
  std::erase_if(candidates, [](const std::string& text) { return !IsSetAddress(text); });
  candidates.resize(_addressInputs.size());
  std::vector<Item*> items;
  for (size_t i = 0; i < _addressInputs.size(); ++i) {
    const std::string label = Text(TEXT_PING_ADDRESS) + " #" + std::to_string(i) + ":";
    _addressInputs[i] = std::make_unique<InputItem>(label, candidates[i], FIELD_WIDTH);
    items.push_back(_addressInputs[i].get());
  }
  const std::string domain = _dnsConfig.GetDomain();
  _hostnameInput = std::make_unique<InputItem>(
      Text(TEXT_RESOLVE_HOSTNAME), _dnsConfig.GetHostname() + (domain.empty() ? "" : "." + domain),
      FIELD_WIDTH);
  items.push_back(_hostnameInput.get());
  _list = _content->Add<ItemList>(0, 0, _content->Width(), _content->Height());
  _list->SetItems(items);
}

std::vector<std::string> TestDialog::Candidates() const {
  auto servers4 = _dnsConfig.GetNameServers();
  auto servers6 = _dnsConfig.GetIpv6NameServers(false);
  servers4.resize(2);
  servers6.resize(2);
  const bool ipv6 = Coreplane::Network::NetworkInfoImpl().IsCoreIpv6Enabled();
  return {_routingInfo.GetCorelinDefaultGateway().GetStringAddress(),
          ipv6 ? _routingInfo.GetIpv6CorelinDefaultGateway().GetStringAddress() : "",
          servers4[0].GetStringAddress(),
          servers6[0].GetStringAddress(),
          servers4[1].GetStringAddress(),
          servers6[1].GetStringAddress()};
}

int TestDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  SetFooter(HINT_SELECT);
  SetCursorVisible(true);
  _list->Repaint();
  for (;;) {
    const int key = WaitKey(true);
    Addresses addresses;
    switch (key) {
      case ESC_KEY:
        SetCursorVisible(false);
        return 0;
      case KEY_DOWN:
        _list->MoveDown();
        break;
      case KEY_UP:
        _list->MoveUp();
        break;
      case ENTER_KEY:
        if (ReadAddresses(addresses)) {
          RunTest(addresses);
          SetCursorVisible(false);
          return 1;
        }
        break;
      default:
        Edit(key);
    }
  }
}

void TestDialog::Edit(int key) {
  const auto row = static_cast<size_t>(_list->SelectionIndex());
  if (row < _addressInputs.size() && IsFieldKey(key, isxdigit, ".:")) {
    _addressInputs[row]->HandleKey(key);
    _list->Repaint();
  } else if (row == _addressInputs.size() &&
             (IsEditingKey(key) || (IsPrintableKey(key) && key != SPACE_KEY))) {
    _hostnameInput->HandleKey(key);
    _list->Repaint();
  }
}

bool TestDialog::ReadAddresses(Addresses& addresses) {
  for (size_t i = 0; i < _addressInputs.size(); ++i) {
    const std::string& text = _addressInputs[i]->Value();
    if (!text.empty() && !IsValidAddress(text)) {
      RefuseField(this, _list, static_cast<int>(i), *_addressInputs[i], TEXT_BAD_ADDRESS_TITLE,
                  TEXT_BAD_ADDRESS);
      return false;
    }
    addresses[i] = ParseAddress(text);
  }
  return true;
}

void TestDialog::RunTest(const Addresses& addresses) {
  RunTestDialog(this, addresses[0].get(), addresses[1].get(), addresses[2].get(),
                _hostnameInput->Value())
      .Exec();
}

}  // namespace Tarnel
