#include "console/network/vlan_dialog.h"

#include <cctype>
#include <cstdlib>

#include "console/screen/key_map.h"
#include "console/widgets/form_fields.h"
#include "console/widgets/hints.h"
#include "console/widgets/message_dialog.h"

namespace Tarnel {

namespace {

constexpr int WIDTH = 70;
constexpr int HEIGHT = 12;
constexpr int HEADER_HEIGHT = 6;
constexpr int FIELD_WIDTH = 5;

constexpr int TEXT_TITLE = 49;
constexpr int TEXT_INVALID = 96;
constexpr int TEXT_REENTER = 97;
constexpr int TEXT_ALL_VLANS = 98;
constexpr int TEXT_BODY = 99;
constexpr int TEXT_LABEL = 100;
constexpr int TEXT_WARNING = 114;

// A port group with this id sees the frames of every VLAN.
constexpr long ALL_VLANS = 4095;

std::string FieldText(uint16_t vlanId) { return vlanId == 0 ? "" : std::to_string(vlanId); }

}  // namespace

VlanDialog::VlanDialog(Frame* parent, uint16_t vlanId)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT),
      _list(_content->Add<ItemList>(0, 0, _content->Width(), 1)),
      _vlanInput(Text(TEXT_LABEL), FieldText(vlanId), FIELD_WIDTH) {
  _list->SetItems({&_vlanInput});
}

uint16_t VlanDialog::GetVlanId() const {
  return static_cast<uint16_t>(strtol(_vlanInput.Value().c_str(), nullptr, 10));
}

int VlanDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  SetFooter(HINT_OK_CANCEL);
  SetCursorVisible(true);
  _list->Repaint();
  for (;;) {
    const int key = WaitKey(true);
    if (key == ESC_KEY || (key == ENTER_KEY && Accept())) {
      SetCursorVisible(false);
      return key == ENTER_KEY ? 1 : 0;
    }
    Edit(key);
  }
}

void VlanDialog::Edit(int key) {
  if (IsFieldKey(key, isdigit, "")) {
    _vlanInput.HandleKey(key);
    _list->Repaint();
  }
}

// The warning does not ask: the id stands.
bool VlanDialog::Accept() {
  if (_vlanInput.Value().empty()) {
    return true;
  }
  // Not by way of GetVlanId(), which keeps 16 bits of a larger number.
  const long id = strtol(_vlanInput.Value().c_str(), nullptr, 10);
  if (id < 1 || id > ALL_VLANS) {
    RefuseField(this, _list, 0, _vlanInput, TEXT_INVALID, TEXT_REENTER);
    return false;
  }
  if (id == ALL_VLANS) {
    MessageDialog(this, TEXT_WARNING, TEXT_ALL_VLANS).Exec();
  }
  return true;
}

}  // namespace Tarnel
