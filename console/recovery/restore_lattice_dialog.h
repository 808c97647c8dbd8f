#pragma once

#include <memory>
#include <string>
#include <vector>

#include "console/recovery/lattice_port_clone.h"
#include "console/widgets/dialog.h"
#include "console/widgets/input_item.h"
#include "console/widgets/item.h"
#include "console/widgets/item_list.h"
#include "hostapi/nodeplane/lattice.h"

namespace Tarnel {

// Repairs the management network's port on a distributed switch: moves the management interface
// to a new port of this host alone, like the old one but for what the operator sets here. Gives 1
// when that was tried, whatever became of it.
class RestoreLatticeDialog : public Dialog {
 public:
  explicit RestoreLatticeDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  // What the form shows of the port as it is.
  struct Present {
    std::string nicName;
    std::string portKey;
    uint16_t vlanId = 0;
  };

  // Finds the port too.
  Present ReadPresent();
  void AddRows(const Present& present);

  void HandleKey(int key);
  // False when the operator had second thoughts.
  bool ConfirmUplinks();
  void ChooseUplinks();
  std::vector<std::string> CollectUplinks();
  void RestoreLatticePort();

  // Null when the management interface is on no such port.
  std::unique_ptr<Nodeplane::Network::LatticePort> _port;
  ItemList* _list;
  std::vector<std::unique_ptr<Item>> _items;
  std::vector<std::string> _selectedUplinks;
  CheckItem* _unblockItem = nullptr;
  InputItem* _vlanItem = nullptr;
  bool _unblock = false;
};

}  // namespace Tarnel
