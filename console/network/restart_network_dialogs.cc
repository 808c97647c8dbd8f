#include "console/network/restart_network_dialogs.h"

#include <syslog.h>

#include "console/hostops/event_reporting.h"
#include "console/network/address_text.h"
#include "console/screen/colours.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"

namespace Tarnel {

namespace {

using Nodeplane::Network::Ipv6Network;
using Nodeplane::Network::NetworkInterface;

constexpr int TEXT_DONE = 123;
constexpr int TEXT_CONFIRM_TITLE = 130;
constexpr int TEXT_CONFIRM_BODY = 131;
constexpr int TEXT_QUESTION = 132;
constexpr int TEXT_TITLE = 133;
constexpr int TEXT_BODY = 134;
constexpr int TEXT_STOPPING = 135;
constexpr int TEXT_STARTING = 136;
constexpr int TEXT_ADDRESS = 137;

constexpr char INDENT[] = "   ";

}  // namespace

RestartNetworkDialog::RestartNetworkDialog(Frame* parent, NetworkInterface* nic)
    : Dialog(parent, 70, 12, 7),
      _mgmtNic(nic),
      _text(_content->Add<TextArea>(0, 0, _content->Width(), _content->Height(), PARENT_COLOUR)) {}

int RestartNetworkDialog::Run() {
  SetTitle(Text(TEXT_CONFIRM_TITLE));
  SetBody(Text(TEXT_CONFIRM_BODY));
  SetFooter(HINT_F11_OK);
  _text->SetText(Text(TEXT_QUESTION));
  if (!IsAccepted(F11_KEY)) {
    return 0;
  }
  DoRestartNetworkDialog(this, _mgmtNic).Exec();
  return 1;
}

DoRestartNetworkDialog::DoRestartNetworkDialog(Frame* parent, NetworkInterface* nic)
    : Dialog(parent, 60, 12, 5),
      _mgmtNic(nic),
      _text(_content->Add<TextArea>(0, 0, _content->Width(), _content->Height(), PARENT_COLOUR)) {}

int DoRestartNetworkDialog::Run() {
  const bool usesDhcp = _mgmtNic->GetIpConfig().GetUseDhcp();
  const std::string name = _mgmtNic->GetName();
  syslog(LOG_INFO, "%s", ("Restarting " + name).c_str());
  PostEvent(NOTARY_NETWORK_RESTART, name.c_str());
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  Append(TEXT_STOPPING, " ");
  _mgmtNic->Disable();
  _mgmtNic->Refresh();
  Append(TEXT_DONE, "\n");
  _mgmtNic->Enable();
  Append(TEXT_STARTING, " ");
  if (!usesDhcp) {
    ShowIpv4Address();
  }
  ShowIpv6Addresses(usesDhcp);
  Append(TEXT_DONE, "");
  SetFooter(HINT_OK2);
  WaitForEnter();
  return 1;
}

void DoRestartNetworkDialog::Append(int textId, const char* end) {
  _text->AppendText(Text(textId) + end);
}

void DoRestartNetworkDialog::ShowIpv4Address() {
  const std::string address = _mgmtNic->GetRunningIpConfig().GetIpv4Address().GetStringAddress();
  _text->AppendText(std::string("\n") + INDENT + Text(TEXT_ADDRESS) + " " + address + "\n");
}

// Three lines at most: when they do not hold all, the last one says so.
void DoRestartNetworkDialog::ShowIpv6Addresses(bool usesDhcp) {
  constexpr size_t MAX_LINES = 3;
  const auto networks = _mgmtNic->GetRunningIpConfig().GetIpv6Network();
  if (networks.empty()) {
    return;
  }
  std::string lines = usesDhcp ? "\n" : "";
  size_t shown = 0;
  for (const Ipv6Network& network : networks) {
    if (shown == MAX_LINES - 1 && networks.size() != MAX_LINES) {
      lines += std::string(INDENT) + "...\n";
      break;
    }
    if (IsStaticGlobal(network)) {
      lines += INDENT + Text(TEXT_ADDRESS) + " " + network.GetStringAddress() + "\n";
      ++shown;
    }
  }
  _text->AppendText(lines);
}

}  // namespace Tarnel
