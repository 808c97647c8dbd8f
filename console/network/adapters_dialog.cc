#include "console/network/adapters_dialog.h"

#include <syslog.h>

#include <algorithm>

#include "console/hostops/command_runner.h"
#include "console/network/adapter_row.h"
#include "console/screen/key_map.h"
#include "console/screen/screen.h"
#include "console/widgets/hints.h"
#include "hostapi/coreplane/network_info.h"
#include "hostapi/coreplane/switch_info.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

using Coreplane::Network::NetworkInfoImpl;
using Coreplane::Network::PnicImpl;
using Coreplane::Network::VirtualSwitchInfoImpl;
using Nodeplane::Lib::NodeplaneException;

namespace {

constexpr int WIDTH = 78;
constexpr int HEIGHT = 21;
constexpr int HEADER_HEIGHT = 7;

constexpr int TEXT_TITLE = 77;
constexpr int TEXT_BODY = 78;
constexpr int TEXT_USED_TITLE = 79;
constexpr int TEXT_USED_BODY = 80;
constexpr int TEXT_USED_QUESTION = 81;

// The blanks stand above the check boxes.
constexpr char COLUMNS[] =
    "    {align:padding:13}Device Name{/align}"
    "{align:padding:30}Hardware Label (MAC Address){/align}Status";

template <class Work>
bool Attempt(const char* failure, Work work) {
  try {
    work();
    return true;
  } catch (const NodeplaneException& e) {
    syslog(LOG_ERR, "%s%s", failure, e.what());
    return false;
  }
}

// Empty when the adapter has no device or the device does not tell its name.
std::string DeviceName(const PnicImpl& pnic) {
  try {
    const auto device = pnic.GetPciDevice();
    return device == nullptr ? "" : CollapseWhitespace(device->GetName());
  } catch (const NodeplaneException&) {
    return "";
  }
}

}  // namespace

AdaptersDialog::AdaptersDialog(Frame* parent, const std::vector<std::string>& selected,
                               int maxActiveUplinks, const std::string& switchName)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT),
      _list(_content->Add<ItemList>(0, 0, _content->Width(), _content->Height())),
      _columns(COLUMNS, false),
      _selected(selected),
      _maxActiveUplinks(maxActiveUplinks),
      _switchName(switchName) {}

int AdaptersDialog::Run() {
  if (!ReadNames() || !ScanVirtualSwitches() || !ScanLatticeSwitches()) {
    return 0;
  }
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  SetFooter(HINT_DETAILS);
  // The adapters are read one by one, which may take its time.
  Activate(true);
  UpdateScreen();
  ReadAdapters();
  ShowRows();
  return HandleKeys();
}

bool AdaptersDialog::ReadNames() {
  return Attempt("Getting physical nics failed: ", [this] {
    _adapters.clear();
    for (const auto& pnic : NetworkInfoImpl().GetPnics()) {
      Adapter adapter;
      adapter.name = pnic->GetName();
      _adapters.push_back(adapter);
    }
    // Stable: names with the same number stay in the host's order.
    std::stable_sort(_adapters.begin(), _adapters.end(), [](const Adapter& a, const Adapter& b) {
      return ComparePnicNames(a.name, b.name);
    });
  });
}

bool AdaptersDialog::ScanVirtualSwitches() {
  return Attempt("Scanning virtual switches failed: ", [this] {
    for (const auto& virtualSwitch : VirtualSwitchInfoImpl().GetVirtualSwitches()) {
      for (const std::string& uplink : virtualSwitch->GetUplinks()) {
        SetUsedBy(uplink, virtualSwitch->GetName());
      }
    }
  });
}

bool AdaptersDialog::ScanLatticeSwitches() {
  return Attempt("Scanning latticeswitches failed: ", [this] {
    for (const auto& lattice : VirtualSwitchInfoImpl().GetLatticeSwitches()) {
      for (const auto& [uplink, port] : lattice->GetUplinkPorts()) {
        SetUsedBy(uplink, lattice->GetName());
      }
    }
  });
}

void AdaptersDialog::ReadAdapters() {
  for (Adapter& adapter : _adapters) {
    const PnicImpl pnic(adapter.name);
    adapter.label = DeviceName(pnic);
    if (adapter.label.empty()) {
      adapter.label = "N/A";
    }
    adapter.mac = pnic.GetMacAddress().GetStringAddress();
    adapter.status = pnic.IsLinkUp() ? "Connected" : "Disconnected";
  }
}

void AdaptersDialog::ShowRows() {
  _items.clear();
  std::vector<Item*> rows{&_columns};
  for (const Adapter& adapter : _adapters) {
    _items.push_back(std::make_unique<CheckItem>(
        FormatAdapterRow(adapter.name, adapter.label, adapter.mac, adapter.status, adapter.usedBy),
        IsSelected(adapter.name), 0));
    rows.push_back(_items.back().get());
  }
  _list->SetItems(rows);
  _list->Repaint();
}

int AdaptersDialog::HandleKeys() {
  for (;;) {
    switch (WaitKey(true)) {
      case KEY_DOWN:
        _list->MoveDown();
        break;
      case KEY_UP:
        _list->MoveUp();
        break;
      case SPACE_KEY:
        ToggleFocused();
        break;
      case 'D':
      case 'd':
        ShowDetails();
        break;
      case ENTER_KEY:
        if (AreAdaptersFree()) {
          return 1;
        }
        break;
      case ESC_KEY:
        return 0;
      default:
        break;
    }
  }
}

// The order of choosing is the teaming order, so an adapter that comes back goes to the end.
void AdaptersDialog::ToggleFocused() {
  if (_adapters.empty()) {
    return;
  }
  const auto row = static_cast<size_t>(_list->SelectionIndex());
  CheckItem& item = *_items[row];
  if (item.IsChecked()) {
    std::erase(_selected, _adapters[row].name);
  } else {
    _selected.push_back(_adapters[row].name);
  }
  item.SetChecked(!item.IsChecked());
  _list->Repaint();
}

void AdaptersDialog::ShowDetails() {
  if (_adapters.empty()) {
    return;
  }
  const Adapter& adapter = _adapters[static_cast<size_t>(_list->SelectionIndex())];
  AdapterInfoDialog(this, adapter.name, adapter.label, adapter.mac, adapter.status, adapter.usedBy)
      .Exec();
}

// One question covers all adapters that are used elsewhere.
bool AdaptersDialog::AreAdaptersFree() {
  const bool usedElsewhere =
      std::any_of(_selected.begin(), _selected.end(),
                  [this](const std::string& name) { return IsUsedElsewhere(name); });
  return !usedElsewhere || UsedAdaptersDialog(this).Exec() == 1;
}

bool AdaptersDialog::IsSelected(const std::string& name) const {
  return std::find(_selected.begin(), _selected.end(), name) != _selected.end();
}

bool AdaptersDialog::IsUsedElsewhere(const std::string& name) {
  const Adapter* const adapter = Find(name);
  return adapter != nullptr && !adapter->usedBy.empty() && adapter->usedBy != _switchName;
}

AdaptersDialog::Adapter* AdaptersDialog::Find(const std::string& name) {
  const auto found = std::find_if(_adapters.begin(), _adapters.end(),
                                  [&name](const Adapter& adapter) { return adapter.name == name; });
  return found == _adapters.end() ? nullptr : &*found;
}

// When several switches claim an adapter, the last one stays.
void AdaptersDialog::SetUsedBy(const std::string& name, const std::string& switchName) {
  if (Adapter* const adapter = Find(name); adapter != nullptr) {
    adapter->usedBy = switchName;
  }
}

UsedAdaptersDialog::UsedAdaptersDialog(Frame* parent)
    : Dialog(parent, 60, 11, 6),
      _question(
          _content->Add<TextArea>(0, 0, _content->Width(), _content->Height(), PARENT_COLOUR)) {}

int UsedAdaptersDialog::Run() {
  SetTitle(Text(TEXT_USED_TITLE));
  SetBody(Text(TEXT_USED_BODY));
  _question->SetText(Text(TEXT_USED_QUESTION));
  SetFooter(HINT_OK_CANCEL);
  return IsAccepted(ENTER_KEY) ? 1 : 0;
}

AdapterInfoDialog::AdapterInfoDialog(Frame* parent, const std::string& name,
                                     const std::string& label, const std::string& mac,
                                     const std::string& status, const std::string& usedBy)
    : Dialog(parent, 70, 13, 5),
      _name(name),
      _label(label),
      _mac(mac),
      _status(status),
      _usedBy(usedBy),
      _details(
          _content->Add<TextArea>(0, 0, _content->Width(), _content->Height(), PARENT_COLOUR)) {}

int AdapterInfoDialog::Run() {
  SetTitle("Adapter Details");
  SetBody("Device Name: " + _name);
  _details->SetText("Hardware Label: " + _label + "\nMAC Address: " + _mac +
                    "\nConnection Status: " + _status +
                    "\nUsed By: " + (_usedBy.empty() ? "None" : _usedBy));
  SetFooter(HINT_OK);
  WaitForEnter();
  return 1;
}

}  // namespace Tarnel
