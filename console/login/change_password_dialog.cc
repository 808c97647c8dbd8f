#include "console/login/change_password_dialog.h"

#include <security/pam_appl.h>
#include <syslog.h>

#include "console/hostops/command_runner.h"
#include "console/hostops/event_reporting.h"
#include "console/login/login_dialog.h"
#include "console/screen/key_map.h"
#include "console/widgets/hints.h"
#include "console/widgets/message_dialog.h"

namespace Tarnel {

namespace {

constexpr int WIDTH = 60;
constexpr int HEIGHT = 14;
constexpr int HEADER_HEIGHT = 6;
constexpr int FIELD_WIDTH = 30;

// What SelectionIndex() gives for each field.
constexpr int OLD_FIELD = 0;
constexpr int NEW_FIELD = 1;
constexpr int CONFIRM_FIELD = 2;

constexpr int TEXT_TITLE = 156;
constexpr int TEXT_BODY = 157;
constexpr int TEXT_OLD = 158;
constexpr int TEXT_NEW = 159;
constexpr int TEXT_CONFIRM = 160;
constexpr int TEXT_ERROR = 161;
constexpr int TEXT_WARNING = 162;
constexpr int TEXT_OLD_WRONG = 163;
constexpr int TEXT_NO_MATCH = 164;
constexpr int TEXT_EMPTY = 165;
constexpr int TEXT_SAME = 166;
constexpr int TEXT_CHANGE_FAILED = 167;

}  // namespace

ChangePasswordDialog::ChangePasswordDialog(Frame* parent)
    : Dialog(parent, WIDTH, HEIGHT, HEADER_HEIGHT),
      _oldItem(Text(TEXT_OLD), "", FIELD_WIDTH),
      _newItem(Text(TEXT_NEW), "", FIELD_WIDTH),
      _confirmItem(Text(TEXT_CONFIRM), "", FIELD_WIDTH) {
  _list = _content->Add<ItemList>(0, 0, _content->Width(), _content->Height());
  for (InputItem* item : {&_oldItem, &_newItem, &_confirmItem}) {
    item->SetMasked(true);
  }
  if (!LoginDialog::HasPassword(_loginName)) {
    _oldItem.SetEnabled(false);
  }
  _list->SetItems({&_oldItem, &_newItem, &_confirmItem});
}

int ChangePasswordDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_BODY));
  SetFooter(HINT_OK_CANCEL);
  _list->Repaint();
  SetCursorVisible(true);
  for (;;) {
    const int key = WaitKey(true);
    const bool changed = HandleKey(key);
    if (changed || key == ESC_KEY) {
      SetCursorVisible(false);
      return changed ? 1 : 0;
    }
  }
}

bool ChangePasswordDialog::HandleKey(int key) {
  switch (key) {
    case TAB_KEY:
    case ENTER_KEY:
    case KEY_DOWN:
      return Advance(key);
    case KEY_UP:
      // There is no way back to the old password.
      if (_list->SelectionIndex() == CONFIRM_FIELD) {
        _list->MoveUp();
      }
      return false;
    default:
      Edit(key);
      return false;
  }
}

bool ChangePasswordDialog::Advance(int key) {
  const int field = _list->SelectionIndex();
  if (field == OLD_FIELD) {
    CheckOldPassword();
  } else if (field == NEW_FIELD) {
    _list->MoveDown();
  } else if (key == TAB_KEY) {
    _list->MoveUp();
  } else if (key == ENTER_KEY) {
    return Submit();
  }
  return false;
}

void ChangePasswordDialog::Edit(int key) {
  if (!IsEditingKey(key) && !IsPrintableKey(key)) {
    return;
  }
  InputItem* const fields[] = {&_oldItem, &_newItem, &_confirmItem};
  fields[_list->SelectionIndex()]->HandleKey(key);
  _list->Repaint();
}

void ChangePasswordDialog::CheckOldPassword() {
  if (PamAuthenticate(_loginName, _oldItem.Value()) == PAM_SUCCESS) {
    _list->MoveDown();
    return;
  }
  MessageDialog(this, TEXT_ERROR, TEXT_OLD_WRONG).Exec();
  _oldItem.SetValue("");
  _list->Repaint();
}

bool ChangePasswordDialog::Submit() {
  if (const int refusal = Refusal(); refusal != 0) {
    Refuse(refusal);
    return false;
  }
  if (IsSameAndUnwanted()) {
    _list->Repaint();
    return false;
  }
  if (!ChangePassword()) {
    Refuse(TEXT_CHANGE_FAILED);
    return false;
  }
  ReportChange();
  return true;
}

int ChangePasswordDialog::Refusal() {
  if (_newItem.Value() != _confirmItem.Value()) {
    return TEXT_NO_MATCH;
  }
  return _newItem.Value().empty() ? TEXT_EMPTY : 0;
}

bool ChangePasswordDialog::IsSameAndUnwanted() {
  return _oldItem.Value() == _newItem.Value() && SamePasswordConfirmDialog(this).Exec() == 0;
}

void ChangePasswordDialog::Refuse(int bodyId) {
  MessageDialog(this, TEXT_ERROR, bodyId).Exec();
  _newItem.SetValue("");
  _confirmItem.SetValue("");
  _list->SelectItem(NEW_FIELD);
  _list->Repaint();
}

bool ChangePasswordDialog::ChangePassword() {
  return PamChangePassword(_loginName, _oldItem.Value(), _newItem.Value());
}

// The change has to survive a restart of the host, and the management agent has to see it.
void ChangePasswordDialog::ReportChange() {
  const char* argv[] = {"backup.sh", "0", nullptr};
  RunCommand("/sbin/backup.sh", argv, nullptr, nullptr, nullptr, nullptr, nullptr, 0, 0);
  StewRefresh();
  syslog(LOG_INFO, "Login password for user %s has changed", _loginName.c_str());
  PostEvent(NOTARY_PASSWORD_CHANGED, _loginName.c_str());
}

SamePasswordConfirmDialog::SamePasswordConfirmDialog(Frame* parent) : Dialog(parent, 70, 8, 5) {}

int SamePasswordConfirmDialog::Run() {
  SetTitle(Text(TEXT_WARNING));
  SetBody(Text(TEXT_SAME));
  SetFooter(HINT_CONFIRM);
  return IsAccepted(ENTER_KEY) ? 1 : 0;
}

}  // namespace Tarnel
