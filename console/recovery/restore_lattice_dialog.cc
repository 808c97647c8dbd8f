#include "console/recovery/restore_lattice_dialog.h"

#include <syslog.h>

#include <cctype>

#include "console/hostops/command_runner.h"
#include "console/recovery/lattice_uplink_dialogs.h"
#include "console/screen/key_map.h"
#include "console/widgets/form_fields.h"
#include "console/widgets/hints.h"
#include "console/widgets/message_dialog.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

using Nodeplane::Lib::NodeplaneException;
using Nodeplane::Network::LatticePort;
using Nodeplane::Network::LatticePortParam;
using Nodeplane::Network::LatticeSwitch;

namespace {

constexpr int WIDTH = 78;
constexpr int HEIGHT = 15;
constexpr int HEADER_HEIGHT = 6;

constexpr int TEXT_UNBLOCK = 192;
constexpr int TEXT_UPLINKS = 193;
constexpr int TEXT_VLAN = 194;
constexpr int TEXT_TITLE = 195;
constexpr int TEXT_BODY = 196;
constexpr int TEXT_ERROR_TITLE = 197;
constexpr int TEXT_FAILED = 198;
constexpr int TEXT_FOREIGN = 199;

constexpr int VLAN_FIELD_WIDTH = 5;

// The selectable rows.
enum Field : int { FIELD_UNBLOCK, FIELD_UPLINKS, FIELD_VLAN };

// Only a switch that is there can be another vendor's.
bool IsForeign(const LatticeSwitch* lattice) {
  return lattice != nullptr && !lattice->IsNativeSwitch();
}

}  // namespace

RestoreLatticeDialog::RestoreLatticeDialog(Frame* parent)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT) {
  _list = _content->Add<ItemList>(0, 0, _content->Width(), _content->Height());
  Present present;
  try {
    present = ReadPresent();
  } catch (const NodeplaneException& error) {
    syslog(LOG_ERR, "Failed to get Management Interface: %s", error.what());
  }
  AddRows(present);
}

RestoreLatticeDialog::Present RestoreLatticeDialog::ReadPresent() {
  const auto management = LookupManagementInterface();
  if (management == nullptr) {
    throw NodeplaneException("Could not find the management network");
  }
  auto point = management->GetConnectionPoint();
  auto* const port = dynamic_cast<LatticePort*>(point.get());
  if (port == nullptr) {
    throw NodeplaneException("Unable to find lattice");
  }
  static_cast<void>(point.release());
  _port.reset(port);
  return {management->GetName(), port->GetKey(), port->GetVlan().vlanId};
}

void RestoreLatticeDialog::AddRows(const Present& present) {
  _items.push_back(std::make_unique<LabelItem>("Management Interface - " + present.nicName, false));
  _items.push_back(std::make_unique<LabelItem>("Current LatticePort - " + present.portKey, false));
  auto unblock = std::make_unique<CheckItem>(Text(TEXT_UNBLOCK), false, 0);
  auto uplinks = std::make_unique<LabelItem>(Text(TEXT_UPLINKS), true);
  auto vlan = std::make_unique<InputItem>(Text(TEXT_VLAN), std::to_string(present.vlanId),
                                          VLAN_FIELD_WIDTH);
  _unblockItem = unblock.get();
  _vlanItem = vlan.get();
  _items.push_back(std::move(unblock));
  _items.push_back(std::move(uplinks));
  _items.push_back(std::move(vlan));
}

int RestoreLatticeDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  _list->SetItems(_items);
  _list->Repaint();
  SetFooter(HINT_F11_OK);
  for (;;) {
    const int key = WaitKey(true);
    if (key == ESC_KEY) {
      SetCursorVisible(false);
      return 0;
    }
    if (key == F11_KEY && ConfirmUplinks()) {
      RestoreLatticePort();
      SetCursorVisible(false);
      return 1;
    }
    HandleKey(key);
    _list->Repaint();
  }
}

void RestoreLatticeDialog::HandleKey(int key) {
  const int field = _list->SelectionIndex();
  if (key == KEY_UP) {
    _list->MoveUp();
    if (_list->SelectionIndex() < FIELD_VLAN) {
      SetCursorVisible(false);
    }
  } else if (key == KEY_DOWN) {
    _list->MoveDown();
    if (_list->SelectionIndex() > FIELD_UPLINKS) {
      SetCursorVisible(true);
    }
  } else if (key == SPACE_KEY && field == FIELD_UNBLOCK) {
    _unblock = !_unblock;
    _unblockItem->SetChecked(_unblock);
  } else if (key == ENTER_KEY && field == FIELD_UPLINKS) {
    ChooseUplinks();
  } else if (field == FIELD_VLAN && IsFieldKey(key, isdigit, "")) {
    _vlanItem->HandleKey(key);
  }
}

bool RestoreLatticeDialog::ConfirmUplinks() {
  return !_selectedUplinks.empty() || UsedUplinksDialog(this).Exec() != 0;
}

void RestoreLatticeDialog::ChooseUplinks() {
  const std::vector<std::string> uplinks = CollectUplinks();
  if (uplinks.empty()) {
    NoUplinksDialog(this).Exec();
    return;
  }
  UplinksDialog dialog(this, _port.get(), _selectedUplinks, uplinks);
  if (dialog.Exec() == 1) {
    _selectedUplinks = dialog.Selected();
  }
}

std::vector<std::string> RestoreLatticeDialog::CollectUplinks() {
  std::vector<std::string> names;
  const auto lattice = _port == nullptr ? nullptr : _port->GetLatticeSwitch();
  if (IsForeign(lattice.get())) {
    MessageDialog(this, TEXT_ERROR_TITLE, TEXT_FOREIGN).Exec();
  } else if (lattice != nullptr) {
    for (const auto& [adapter, param] : lattice->GetUplinkPorts()) {
      const auto port = lattice->GetPort(param.portKey);
      if (port != nullptr) {
        names.push_back(port->GetName());
      }
    }
  }
  return names;
}

void RestoreLatticeDialog::RestoreLatticePort() {
  if (_port == nullptr) {
    syslog(LOG_ERR, "Unable to get Lattice");
    return;
  }
  if (IsForeign(_port->GetLatticeSwitch().get())) {
    MessageDialog(this, TEXT_ERROR_TITLE, TEXT_FOREIGN).Exec();
    return;
  }
  LatticePortParam param;
  param.portKey = MakeHostLocalKey(_port->GetKey(), DrawKeySuffix());
  param.switchId = _port->GetSwitchId();
  param.kind = LatticePortParam::HOST_LOCAL;
  param.vlan.vlanId = ParseVlanId(_vlanItem->Value());
  try {
    MoveManagementToNewPort(*_port, param, {_unblock, _selectedUplinks});
  } catch (const NodeplaneException& error) {
    syslog(LOG_ERR, "Unable to create Host Local Port: %s", error.what());
    MessageDialog(this, TEXT_ERROR_TITLE, TEXT_FAILED).Exec();
  }
}

}  // namespace Tarnel
