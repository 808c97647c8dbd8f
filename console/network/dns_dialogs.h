#pragma once

#include <memory>
#include <string>

#include "console/widgets/dialog.h"
#include "console/widgets/input_item.h"
#include "console/widgets/item_list.h"
#include "hostapi/nodeplane/ip_address.h"

namespace Tarnel {

// Edits the name servers and the host name, or leaves them to DHCP. Gives 1 when the form was
// accepted.
class DNSConfigurationDialog : public Dialog {
 public:
  // Without DHCP there is no choice. The addresses may be null; the form keeps copies of them.
  DNSConfigurationDialog(Frame* parent, bool dhcpDns, bool usingDhcp,
                         const Nodeplane::Network::IpAddress* primary,
                         const Nodeplane::Network::IpAddress* alternate,
                         const std::string& hostname);

  // What was accepted. With IsDhcpDns() the rest is as it was given. An address may be null; a
  // taken one is.
  bool IsDhcpDns() const { return _dhcpDns; }
  const Nodeplane::Network::IpAddress* PrimaryDns() const { return _primaryDns.get(); }
  const Nodeplane::Network::IpAddress* AlternateDns() const { return _alternateDns.get(); }
  std::unique_ptr<Nodeplane::Network::IpAddress> TakePrimaryDns() { return std::move(_primaryDns); }
  std::unique_ptr<Nodeplane::Network::IpAddress> TakeAlternateDns() {
    return std::move(_alternateDns);
  }
  const std::string& Hostname() const { return _hostname; }

 protected:
  int Run() override;

 private:
  // Brings the rows in line with the choice.
  void ShowMode();
  void MoveFocus(int key);
  void HandleOtherKey(int key);
  void Edit(int key);
  bool IsInputFocused() const;
  bool Accept();
  bool AreServersGood();

  bool _dhcpDns;
  std::unique_ptr<Nodeplane::Network::IpAddress> _primaryDns;
  std::unique_ptr<Nodeplane::Network::IpAddress> _alternateDns;
  std::string _hostname;
  ItemList* _list;
  RadioItem _autoRadio;
  RadioItem _manualRadio;
  LabelItem _blank;
  InputItem _primaryInput;
  InputItem _alternateInput;
  InputItem _hostnameInput;
};

// Edits the search suffixes as one free text. Gives 1 when the form was accepted.
class SuffixesDialog : public Dialog {
 public:
  SuffixesDialog(Frame* parent, const std::string& suffixes);

  // The text as it was typed.
  const std::string& Suffixes() const { return _suffixesInput.Value(); }

 protected:
  int Run() override;

 private:
  ItemList* _list;
  InputItem _suffixesInput;
};

}  // namespace Tarnel
