#include "console/login/login_dialog.h"

#include <security/pam_appl.h>
#include <syslog.h>
#include <unistd.h>

#include "console/hostops/command_runner.h"
#include "console/hostops/event_reporting.h"
#include "console/menu/keyboard_dialog.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"
#include "console/widgets/message_dialog.h"

namespace Tarnel {

namespace {

constexpr int WIDTH = 60;
constexpr int HEIGHT = 13;
constexpr int HEADER_HEIGHT = 6;
constexpr int FIELD_WIDTH = 30;

constexpr int TEXT_TITLE = 144;
constexpr int TEXT_ENTER_PASSWORD = 145;
constexpr int TEXT_ENTER_PIN = 146;
constexpr int TEXT_LOGIN_NAME = 149;
constexpr int TEXT_LOGIN_ID = 150;
constexpr int TEXT_PASSWORD = 151;
constexpr int TEXT_PIN = 152;
constexpr int TEXT_FAILED = 153;
constexpr int TEXT_INVALID = 154;
constexpr int TEXT_NO_PERMISSION = 155;

constexpr char DEFAULT_USER[] = "root";
// Kept by the host's management stack; the console only looks for it.
constexpr char ENABLED_MARK[] = "/var/run/halvren/show-tarnel-login";
constexpr char HINT_PIN_MODE[] =
    "{align:left}{color:black>}<F3>{/color} {color:dark-grey}Switch PIN/Password "
    "Login{/color}{/align}{align:right}{color:black}<Enter>{/color} {color:dark-grey}OK{/color}  "
    "{color:black}<Esc>{/color} {color:dark-grey}Cancel{/color}{/align}";

}  // namespace

LoginDialog::LoginDialog(Frame* parent)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT),
      _keyboardNote("", true),
      _loginItem(Text(TEXT_LOGIN_NAME), DEFAULT_USER, FIELD_WIDTH),
      _passwordItem(Text(TEXT_PASSWORD), "", FIELD_WIDTH) {
  _passwordItem.SetMasked(true);
  std::vector<Item*> items;
  if (!runningOverSerial) {
    ShowKeyboardNote();
    items.push_back(&_keyboardNote);
  }
  items.push_back(&_loginItem);
  items.push_back(&_passwordItem);
  _list = _content->Add<ItemList>(0, 0, _content->Width(), static_cast<int>(items.size()));
  _list->SetItems(items);
  PollSmartCard();
  _pinMode = HasSmartCardLogin();
  ShowMode(_pinMode);
}

bool LoginDialog::IsLoginEnabled() { return access(ENABLED_MARK, F_OK) == 0; }

bool LoginDialog::HasPassword(const std::string& user) {
  return PamAuthenticate(user, "") != PAM_SUCCESS;
}

bool LoginDialog::HasSmartCardLogin() { return !_smartCardLoginId.empty(); }

void LoginDialog::ShowKeyboardNote() {
  _keyboardNote.SetLabel("Configured Keyboard (" + _systemInfo.GetKeyboardLayout() + ")");
}

// What was typed in the other mode is gone.
void LoginDialog::ShowMode(bool pin) {
  const std::string host = TextArea::GetHostnameValue() + ".";
  SetFooter(pin ? HINT_PIN_MODE : HINT_OK_CANCEL);
  _loginItem.SetLabel(Text(pin ? TEXT_LOGIN_ID : TEXT_LOGIN_NAME));
  _loginItem.SetValue(pin ? _smartCardLoginId : DEFAULT_USER);
  _passwordItem.SetLabel(Text(pin ? TEXT_PIN : TEXT_PASSWORD));
  _passwordItem.SetValue("");
  SetBody(Text(pin ? TEXT_ENTER_PIN : TEXT_ENTER_PASSWORD) + host);
}

int LoginDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  ShowMode(_pinMode);
  SetCursorVisible(true);
  _list->SelectItem(LoginRow());
  _list->Repaint();
  for (;;) {
    const int key = WaitKey(true);
    if (key == ESC_KEY) {
      SetCursorVisible(false);
      Activate(false);
      return 0;
    }
    if (HandleKey(key)) {
      SetCursorVisible(false);
      return 1;
    }
  }
}

bool LoginDialog::HandleKey(int key) {
  switch (key) {
    case KEY_UP:
      _list->MoveUp();
      return false;
    case KEY_DOWN:
      _list->MoveDown();
      return false;
    case F3_KEY:
      _pinMode = !_pinMode;
      ShowMode(_pinMode);
      _list->Repaint();
      return false;
    case TAB_KEY:
    case ENTER_KEY:
      return Advance(key);
    default:
      Edit(key);
      return false;
  }
}

bool LoginDialog::Advance(int key) {
  const int row = _list->SelectionIndex();
  if (key == ENTER_KEY && row < LoginRow()) {
    ChooseKeyboard();
  } else if (row < PasswordRow()) {
    _list->MoveDown();
  } else if (key == TAB_KEY) {
    _list->SelectItem(0);
    _list->Repaint();
  } else {
    return Submit();
  }
  return false;
}

void LoginDialog::Edit(int key) {
  if (!IsEditingKey(key) && !IsPrintableKey(key)) {
    return;
  }
  const int row = _list->SelectionIndex();
  if (row == LoginRow()) {
    _loginItem.HandleKey(key);
  } else if (row == PasswordRow()) {
    _passwordItem.HandleKey(key);
  }
  _list->Repaint();
}

void LoginDialog::ChooseKeyboard() {
  KeyboardDialog(this).Exec();
  Activate(true);
  ShowKeyboardNote();
  _list->Repaint();
}

bool LoginDialog::Submit() {
  _userName = _loginItem.Value();
  const int result = PamAuthenticate(_userName, _passwordItem.Value());
  if (result != PAM_SUCCESS) {
    Refuse(result);
    return false;
  }
  SetLoginName(_userName);
  syslog(LOG_AUTH | LOG_EMERG, "Authentication of user %s succeeded", _userName.c_str());
  syslog(LOG_INFO, "User %s logged in", _userName.c_str());
  return true;
}

void LoginDialog::Refuse(int result) {
  const bool denied = result == PAM_PERM_DENIED;
  syslog(LOG_AUTH | LOG_ERR,
         denied ? "Authorization of user %s failed with permission denied error."
                : "Authentication of user %s failed with authentication failure.",
         _userName.c_str());
  PostEvent(NOTARY_LOGIN_FAILED, _userName.c_str());
  MessageDialog(this, TEXT_FAILED, denied ? TEXT_NO_PERMISSION : TEXT_INVALID).Exec();
  _passwordItem.SetValue("");
  _list->Repaint();
}

}  // namespace Tarnel
