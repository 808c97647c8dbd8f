#pragma once

#include <array>
#include <memory>
#include <string>
#include <vector>

#include "console/widgets/dialog.h"
#include "console/widgets/input_item.h"
#include "console/widgets/item_list.h"
#include "hostapi/coreplane/ip_services.h"

namespace Tarnel {

// Asks which addresses are to be pinged and which name is to be resolved, and tests them. Gives 1
// when a test was run.
class TestDialog : public Dialog {
 public:
  explicit TestDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  using Addresses = std::array<std::unique_ptr<Nodeplane::Network::IpAddress>, 3>;

  // What is worth testing on this host, the most important first.
  std::vector<std::string> Candidates() const;
  void Edit(int key);
  // False when a field holds no address; the operator has been told then.
  bool ReadAddresses(Addresses& addresses);
  void RunTest(const Addresses& addresses);

  Coreplane::Network::DnsConfigImpl _dnsConfig;
  Coreplane::Network::RoutingInfoImpl _routingInfo;
  ItemList* _list;
  std::array<std::unique_ptr<InputItem>, 3> _addressInputs;
  std::unique_ptr<InputItem> _hostnameInput;
};

}  // namespace Tarnel
