#pragma once

#include "console/widgets/dialog.h"
#include "console/widgets/input_item.h"
#include "console/widgets/item_list.h"

namespace Tarnel {

// Sets the password of the operator who is logged in. Gives 1 when it was changed.
class ChangePasswordDialog : public Dialog {
 public:
  explicit ChangePasswordDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  // True when the password was changed.
  bool HandleKey(int key);
  bool Advance(int key);
  bool Submit();
  // The catalogue's number of the text that refuses the new password, or 0.
  int Refusal();
  void Refuse(int bodyId);
  void Edit(int key);
  void CheckOldPassword();
  bool IsSameAndUnwanted();
  bool ChangePassword();
  void ReportChange();

  ItemList* _list;
  InputItem _oldItem;
  InputItem _newItem;
  InputItem _confirmItem;
};

// Asks whether the new password may be the old one. Gives 1 for yes.
class SamePasswordConfirmDialog : public Dialog {
 public:
  explicit SamePasswordConfirmDialog(Frame* parent);

 protected:
  int Run() override;
};

}  // namespace Tarnel
