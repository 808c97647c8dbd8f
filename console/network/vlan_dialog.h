#pragma once

#include <cstdint>

#include "console/widgets/dialog.h"
#include "console/widgets/input_item.h"
#include "console/widgets/item_list.h"

namespace Tarnel {

// Edits the VLAN id of the management network. Gives 1 when the form was accepted.
class VlanDialog : public Dialog {
 public:
  // 0 means no VLAN and shows as an empty field.
  VlanDialog(Frame* parent, uint16_t vlanId);

  // What the field holds; 0 when it is empty.
  uint16_t GetVlanId() const;

 protected:
  int Run() override;

 private:
  void Edit(int key);
  bool Accept();

  ItemList* _list;
  InputItem _vlanInput;
};

}  // namespace Tarnel
