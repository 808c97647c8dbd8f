#pragma once

#include <memory>
#include <string>
#include <vector>

#include "console/widgets/dialog.h"
#include "console/widgets/item.h"
#include "console/widgets/item_list.h"
#include "hostapi/nodeplane/lattice.h"

namespace Tarnel {

// Chooses among the uplinks of a distributed switch. Gives 1 for Enter; without a port it gives 0
// at once.
class UplinksDialog : public Dialog {
 public:
  UplinksDialog(Frame* parent, Nodeplane::Network::LatticePort* port,
                const std::vector<std::string>& selected, const std::vector<std::string>& uplinks);

  // The choice, in the order of marking.
  const std::vector<std::string>& Selected() const { return _selected; }

 protected:
  int Run() override;

 private:
  void AddRows();
  void ToggleFocused();

  ItemList* _list;
  // The heading, then one for each uplink.
  std::vector<std::unique_ptr<Item>> _items;
  std::vector<CheckItem*> _checkItems;
  Nodeplane::Network::LatticePort* _port;
  std::vector<std::string> _selected;
  std::vector<std::string> _uplinks;
};

// Asks whether to go on without any uplink. Gives 1 for yes.
class UsedUplinksDialog : public Dialog {
 public:
  explicit UsedUplinksDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  TextArea* _questionText;
};

// Says that there is no uplink to choose. Gives 1 for Enter and 0 for Esc.
class NoUplinksDialog : public Dialog {
 public:
  explicit NoUplinksDialog(Frame* parent);

 protected:
  int Run() override;
};

}  // namespace Tarnel
