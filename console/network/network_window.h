#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "console/widgets/item.h"
#include "console/widgets/root_window.h"
#include "hostapi/nodeplane/network_interface.h"

namespace Tarnel {

// The screen "Configure Management Network". Its fields are the whole pending configuration of the
// management network: they are read from the host at the start, edited by the dialogs of the rows,
// and written to the host in one go when the operator leaves and says yes. Gives 0 when the screen
// could not be opened, else 1.
class NetworkWindow : public RootWindow {
 public:
  explicit NetworkWindow(Frame* parent);

 protected:
  int Run() override;
  void RefreshPanes() override;

 private:
  // What the steps of ApplyChanges() tell one another.
  struct ApplyFlags {
    // The port group has another VLAN: the interface has to be restarted.
    bool vlanChanged = false;
    // A static configuration, or none, is being written.
    bool ipv4Rewritten = false;
    // The uplinks changed: a lease may have to be renewed.
    bool renewDhcp4 = false;
    bool renewDhcp6 = false;
  };

  // Read the host into the fields, in this order. Those that give a bool decide whether the screen
  // can be opened.
  void ReadIpv6Switch();
  bool FindInterface();
  bool ReadUplinksAndVlan();
  void ReadServices();
  void ReadNameServers();

  // False when the operator left the screen.
  bool HandleKey(int key);
  bool Leave();
  bool HasPendingChanges() const;
  void OpenRow();
  void EditAdapters();
  void EditVlan();
  void EditIpv4();
  void EditIpv6();
  void EditDns();
  void EditSuffixes();

  // Tells about the focused row.
  void ShowRightPane();
  std::string RightText(int row) const;
  std::string AdaptersText() const;
  std::string Ipv4Text() const;
  std::string Ipv6Text() const;
  std::string DnsText() const;
  // The text itself, or that it is not set.
  std::string OrNotSet(const std::string& text) const;

  // Writes the pending configuration to the host. What has been done stays done, whatever fails
  // after it. Gives 1.
  int ApplyChanges();
  void ApplyUplinks(ApplyFlags& flags);
  void MoveUplinks(const std::vector<std::string>& present, ApplyFlags& flags);
  void TakeMacAddress(const std::vector<std::string>& present);
  void ApplyVlan(ApplyFlags& flags);
  void ApplyIpConfiguration(ApplyFlags& flags);
  void ChooseIpv4(ApplyFlags& flags);
  void RewriteIpv4(bool none, ApplyFlags& flags);
  void SwitchIpv6(ApplyFlags& flags);
  void ChooseDnsMode();
  void WriteIpConfiguration(const ApplyFlags& flags);
  void WriteIpv4Gateway(const ApplyFlags& flags);
  void WriteIpv6Gateway();
  void RenewLeases(const ApplyFlags& flags);
  void RestartForVlan(const ApplyFlags& flags);
  void WriteHostnameAndNameServers();
  void WriteSuffixes();
  // Runs one guarded step; what fails in it is told to the log and to the operator.
  template <class Step>
  bool Guard(const char* prefix, Step step);
  void TellFailure(const std::string& text);

  std::vector<std::unique_ptr<LabelItem>> _menuItems;
  // The rows that are greyed out on a distributed switch.
  LabelItem* _adaptersItem = nullptr;
  LabelItem* _vlanItem = nullptr;
  std::unique_ptr<Nodeplane::Network::NetworkInterface> _mgmtNic;
  // The addresses as they are in effect; the object that the host is given in the end.
  Nodeplane::Network::IpConfig _workingConfig;
  // The modes as they are stored; only its flags count.
  Nodeplane::Network::IpConfig _modeConfig;
  // In teaming order: the first one gives the interface its MAC address.
  std::vector<std::string> _adapters;
  int32_t _maxActiveUplinks = 0;
  // 0 means none.
  uint16_t _vlanId = 0;
  std::string _hostname;
  // As they were at the start; the operator edits the suffixes.
  std::vector<std::string> _searchDomains;
  std::unique_ptr<Nodeplane::Network::IpAddress> _primaryDns;
  std::unique_ptr<Nodeplane::Network::IpAddress> _alternateDns;
  std::string _suffixes;
  bool _changed = false;
  bool _ipv6GatewayChanged = false;
  bool _ipv6Enabled = false;
  bool _ipv6EnabledAtEntry = false;
};

}  // namespace Tarnel
