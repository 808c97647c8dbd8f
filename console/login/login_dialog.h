#pragma once

#include <string>

#include "console/screen/terminal.h"
#include "console/widgets/dialog.h"
#include "console/widgets/input_item.h"
#include "console/widgets/item_list.h"
#include "hostapi/coreplane/system.h"

namespace Tarnel {

// The gate in front of everything that changes the host: asks for a name and a password, or for a
// smart card's PIN, until PAM accepts them. Gives 1 then, and Frame::LoginName() is who it was.
class LoginDialog : public Dialog {
 public:
  explicit LoginDialog(Frame* parent);

  // The host's management stack allows logins at the console.
  static bool IsLoginEnabled();
  // The empty password of this user is refused.
  static bool HasPassword(const std::string& user);
  // A smart card with a user id was there at the last poll.
  static bool HasSmartCardLogin();

 protected:
  int Run() override;

 private:
  int LoginRow() const { return runningOverSerial ? 0 : 1; }
  int PasswordRow() const { return LoginRow() + 1; }
  void ShowMode(bool pin);
  void ShowKeyboardNote();
  // Each is true when the login has succeeded.
  bool HandleKey(int key);
  bool Advance(int key);
  bool Submit();
  void Edit(int key);
  void ChooseKeyboard();
  void Refuse(int result);

  ItemList* _list;
  Coreplane::System::SystemInfoImpl _systemInfo;
  LabelItem _keyboardNote;
  InputItem _loginItem;
  InputItem _passwordItem;
  std::string _userName;
  bool _pinMode;
};

}  // namespace Tarnel
