#include "console/widgets/root_window.h"

#include <syslog.h>

#include "console/screen/colours.h"

namespace Tarnel {

namespace {

constexpr int TEXT_PRODUCT = 2;

}  // namespace

// The panes share the cells of the frame area, so the box and the rule that are drawn after them
// stay on top of both.
RootWindow::RootWindow(Frame* parent)
    : Frame(parent, 0, 0, COLS, LINES, BLACK, WHITE),
      _dnsConfig(Coreplane::Network::DEFAULT_STACK),
      _routingInfo(Coreplane::Network::DEFAULT_STACK) {
  const int half = COLS / 2;
  const int height = LINES - 1;
  _frameArea = CreateChild(0, 0, COLS, height, LIGHT_GREY, WHITE);
  _statusLine = CreateChild(0, height, COLS, 1, BLACK, LIGHT_GREY);
  _leftPane = _frameArea->CreateChild(0, 0, half, height, YELLOW, WHITE);
  _rightPane = _frameArea->CreateChild(half, 0, half, height, DARK_GREY, WHITE);
  _frameArea->DrawBox();
  _frameArea->DrawRule(1, 2, COLS - 2);
  syslog(LOG_INFO, "COLS=%d, LINES=%d", COLS, LINES);
  _list = _leftPane->Add<ItemList>(2, 4, half - 2, LINES - 6);
  _rightText = _rightPane->Add<TextArea>(2, 4, half - 4, LINES - 6, LIGHT_GREY);
  _leftTitle = _leftPane->Add<TextArea>(3, 1, half - 6, 1, BLACK);
  _rightTitle = _rightPane->Add<TextArea>(2, 1, half - 6, 1, WHITE);
  _leftHint = _leftPane->Add<TextArea>(2, LINES - 3, half - 3, 1, BLACK);
  _rightHint = _rightPane->Add<TextArea>(1, LINES - 3, half - 3, 1, WHITE);
}

void RootWindow::ShowScreen() {
  Activate(true);
  const std::string product = Text(TEXT_PRODUCT);
  _statusLine->PutText(_statusLine->Width() / 2 - static_cast<int>(product.size()) / 2, 0, product);
  RefreshPanes();
  Refresh();
}

std::string RootWindow::Ipv6Lines(const std::vector<Nodeplane::Network::Ipv6Network>& networks) {
  constexpr size_t MAX_LINES = 3;
  const bool all = networks.size() <= MAX_LINES;
  std::string lines;
  for (size_t i = 0; i < (all ? networks.size() : MAX_LINES - 1); ++i) {
    lines += networks[i].GetStringAddress() + "\n";
  }
  return all ? lines : lines + "...\n";
}

void RootWindow::SetLeftTitle(const std::string& title) { _leftTitle->SetText(title); }

void RootWindow::SetRightTitle(const std::string& title) { _rightTitle->SetText(title); }

void RootWindow::SetLeftHint(const std::string& hint) { _leftHint->SetText(hint); }

void RootWindow::SetRightHint(const std::string& hint) { _rightHint->SetText(hint); }

}  // namespace Tarnel
