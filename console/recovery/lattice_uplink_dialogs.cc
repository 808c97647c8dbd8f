#include "console/recovery/lattice_uplink_dialogs.h"

#include <syslog.h>

#include <algorithm>

#include "console/screen/colours.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"

namespace Tarnel {

using Nodeplane::Network::LatticePort;

namespace {

constexpr int TEXT_TITLE = 200;
constexpr int TEXT_BODY = 201;
constexpr int TEXT_NONE_SELECTED_TITLE = 202;
constexpr int TEXT_NONE_SELECTED = 203;
constexpr int TEXT_CONTINUE = 204;
constexpr int TEXT_NONE_TITLE = 205;
constexpr int TEXT_NONE = 206;

}  // namespace

UplinksDialog::UplinksDialog(Frame* parent, LatticePort* port,
                             const std::vector<std::string>& selected,
                             const std::vector<std::string>& uplinks)
    : Dialog(parent, 78, 15, 5), _port(port), _selected(selected), _uplinks(uplinks) {
  _list = _content->Add<ItemList>(0, 0, _content->Width(), _content->Height());
}

int UplinksDialog::Run() {
  if (_port == nullptr) {
    syslog(LOG_ERR, "Unable to get Lattice");
    return 0;
  }
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  SetFooter(HINT_TOGGLE);
  Activate(true);
  Refresh();
  AddRows();
  _list->Repaint();
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
        _list->Repaint();
        break;
      case ENTER_KEY:
        return 1;
      case ESC_KEY:
        return 0;
      default:
        break;
    }
  }
}

void UplinksDialog::AddRows() {
  _items.push_back(std::make_unique<LabelItem>("    {align:padding:20}Uplink Name{/align}", false));
  for (const std::string& uplink : _uplinks) {
    const bool marked = std::find(_selected.begin(), _selected.end(), uplink) != _selected.end();
    auto item = std::make_unique<CheckItem>(uplink, marked, 0);
    _checkItems.push_back(item.get());
    _items.push_back(std::move(item));
  }
  _list->SetItems(_items);
}

void UplinksDialog::ToggleFocused() {
  const auto index = static_cast<size_t>(_list->SelectionIndex());
  if (index >= _checkItems.size()) {
    return;
  }
  CheckItem* const item = _checkItems[index];
  if (item->IsChecked()) {
    std::erase(_selected, _uplinks[index]);
  } else {
    _selected.push_back(_uplinks[index]);
  }
  item->SetChecked(!item->IsChecked());
}

UsedUplinksDialog::UsedUplinksDialog(Frame* parent)
    : Dialog(parent, 60, 10, 5),
      _questionText(
          _content->Add<TextArea>(0, 0, _content->Width(), _content->Height(), PARENT_COLOUR)) {}

int UsedUplinksDialog::Run() {
  SetTitle(Text(TEXT_NONE_SELECTED_TITLE));
  SetBody(Text(TEXT_NONE_SELECTED));
  _questionText->SetText(Text(TEXT_CONTINUE));
  SetFooter(HINT_OK_CANCEL);
  return IsAccepted(ENTER_KEY) ? 1 : 0;
}

NoUplinksDialog::NoUplinksDialog(Frame* parent) : Dialog(parent, 60, 10, 5) {}

int NoUplinksDialog::Run() {
  SetTitle(Text(TEXT_NONE_TITLE));
  SetBody(Text(TEXT_NONE));
  SetFooter(HINT_OK);
  return IsAccepted(ENTER_KEY) ? 1 : 0;
}

}  // namespace Tarnel
