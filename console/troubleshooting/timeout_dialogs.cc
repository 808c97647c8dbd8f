#include "console/troubleshooting/timeout_dialogs.h"

#include <syslog.h>

#include <cctype>
#include <cstdlib>
#include <optional>
#include <string>

#include "console/hostops/command_runner.h"
#include "console/screen/key_map.h"
#include "console/troubleshooting/service_script.h"
#include "console/widgets/form_fields.h"
#include "console/widgets/hints.h"
#include "console/widgets/message_dialog.h"

namespace Tarnel {

namespace {

constexpr int FIELD_WIDTH = 5;
constexpr int32_t SECONDS_PER_MINUTE = 60;
constexpr int32_t MAX_MINUTES = 1440;

constexpr char AVAILABILITY_OPTION[] = "/UserVars/OstrelShellTimeOut";
constexpr char IDLE_OPTION[] = "/UserVars/OstrelShellInteractiveTimeOut";

constexpr int TEXT_SHELL_TITLE = 265;
constexpr int TEXT_SHELL_BODY = 266;
constexpr int TEXT_AVAILABILITY = 267;
constexpr int TEXT_IDLE = 268;
constexpr int TEXT_INVALID_TITLE = 269;
constexpr int TEXT_INVALID = 270;
constexpr int TEXT_TARNEL_TITLE = 271;
constexpr int TEXT_TARNEL_BODY = 272;
constexpr int TEXT_TARNEL = 273;

// 0 when the option cannot be read.
int32_t ReadMinutes(const char* option) {
  char output[256] = {};
  int32_t length = sizeof output;
  const char* argv[] = {"ostrelcfg-advcfg", "-q", "-g", option, nullptr};
  RunCommand("/sbin/ostrelcfg-advcfg", argv, output, &length, nullptr, nullptr, nullptr, 0, 0);
  if (length == 0) {
    return 0;
  }
  output[length - 1] = '\0';  // where the line ends
  return static_cast<int32_t>(strtol(output, nullptr, 10) / SECONDS_PER_MINUTE);
}

// The second tool stands in for the first; what becomes of it is not asked.
void WriteMinutes(const char* option, int32_t minutes) {
  const std::string seconds = std::to_string(minutes * SECONDS_PER_MINUTE);
  const char* argv[] = {"ostrelcli", "system", "settings", "advanced",      "set",
                        "-o",        option,   "-i",       seconds.c_str(), nullptr};
  if (RunCommand("/sbin/ostrelcli", argv, nullptr, nullptr, nullptr, nullptr, nullptr, 0, 0) != 0) {
    argv[0] = "nodecli";
    RunCommand("/sbin/nodecli", argv, nullptr, nullptr, nullptr, nullptr, nullptr, 0, 0);
  }
}

void RestartIfRunning(const char* script) {
  if (IsServiceRunning(script)) {
    RunServiceScript(script, "restart");
  }
}

// The minutes that the operator wants; none when the field is empty or, which is told of, when they
// are out of range. A number too large for strtol() is out of range too; negative ones are only
// borne where they are stored already.
std::optional<int32_t> MinutesIn(const InputItem& item, int32_t stored, Frame* form) {
  if (item.Value().empty()) {
    return std::nullopt;
  }
  const long minutes = strtol(item.Value().c_str(), nullptr, 10);
  if (minutes > MAX_MINUTES || (minutes < 0 && minutes != stored)) {
    MessageDialog(form, TEXT_INVALID_TITLE, TEXT_INVALID).Exec();
    return std::nullopt;
  }
  return static_cast<int32_t>(minutes);
}

void LogChange(const char* name, int32_t minutes) {
  if (minutes == 0) {
    syslog(LOG_INFO, "Disabled %s timeout", name);
  } else {
    syslog(LOG_INFO, "Modified %s timeout to %d minutes", name, minutes);
  }
}

}  // namespace

ShellTimeoutDialog::ShellTimeoutDialog(Frame* parent)
    : Dialog(parent, 70, 21, 15),
      _availabilityMinutes(ReadMinutes(AVAILABILITY_OPTION)),
      _idleMinutes(ReadMinutes(IDLE_OPTION)),
      _availabilityItem(Text(TEXT_AVAILABILITY), std::to_string(_availabilityMinutes), FIELD_WIDTH),
      _idleItem(Text(TEXT_IDLE), std::to_string(_idleMinutes), FIELD_WIDTH) {
  _list = _content->Add<ItemList>(0, 0, _content->Width(), 2);
  _list->SetItems({&_availabilityItem, &_idleItem});
}

int ShellTimeoutDialog::Run() {
  SetTitle(Text(TEXT_SHELL_TITLE));
  SetBody(Text(TEXT_SHELL_BODY));
  SetFooter(HINT_OK_CANCEL);
  SetCursorVisible(true);
  _list->Repaint();
  const bool confirmed = IsConfirmed();
  if (confirmed) {
    ApplyAvailability();
    ApplyIdle();
  }
  SetCursorVisible(false);
  return confirmed ? 1 : 0;
}

bool ShellTimeoutDialog::IsConfirmed() {
  for (;;) {
    const int key = WaitKey(true);
    switch (key) {
      case ENTER_KEY:
        return true;
      case ESC_KEY:
        return false;
      case KEY_UP:
        _list->MoveUp();
        break;
      case KEY_DOWN:
        _list->MoveDown();
        break;
      default:
        if (IsFieldKey(key, isdigit, "")) {
          FocusedItem().HandleKey(key);
          _list->Repaint();
        }
    }
  }
}

InputItem& ShellTimeoutDialog::FocusedItem() {
  return _list->SelectionIndex() == 0 ? _availabilityItem : _idleItem;
}

// A service that runs reads its availability only when it starts.
void ShellTimeoutDialog::ApplyAvailability() {
  const std::optional<int32_t> minutes = MinutesIn(_availabilityItem, _availabilityMinutes, this);
  if (!minutes || *minutes == _availabilityMinutes) {
    return;
  }
  WriteMinutes(AVAILABILITY_OPTION, *minutes);
  RestartIfRunning(SHELL_SCRIPT);
  RestartIfRunning(SSH_SCRIPT);
  LogChange("Shell", *minutes);
}

void ShellTimeoutDialog::ApplyIdle() {
  const std::optional<int32_t> minutes = MinutesIn(_idleItem, _idleMinutes, this);
  if (!minutes || *minutes == _idleMinutes) {
    return;
  }
  WriteMinutes(IDLE_OPTION, *minutes);
  LogChange("shell interactive", *minutes);
}

TarnelTimeoutDialog::TarnelTimeoutDialog(Frame* parent)
    : Dialog(parent, 70, 15, 9),
      _oldSeconds(GetTarnelTimeoutValue()),
      _timeoutItem(Text(TEXT_TARNEL), std::to_string(_oldSeconds / SECONDS_PER_MINUTE),
                   FIELD_WIDTH) {
  _list = _content->Add<ItemList>(0, 0, _content->Width(), 2);
  _list->SetItems({&_timeoutItem});
}

int TarnelTimeoutDialog::Run() {
  SetTitle(Text(TEXT_TARNEL_TITLE));
  SetBody(Text(TEXT_TARNEL_BODY));
  SetFooter(HINT_OK_CANCEL);
  SetCursorVisible(true);
  _list->Repaint();
  const bool confirmed = IsConfirmed();
  if (confirmed) {
    Apply();
  }
  SetCursorVisible(false);
  return confirmed ? 1 : 0;
}

bool TarnelTimeoutDialog::IsConfirmed() {
  for (;;) {
    const int key = WaitKey(true);
    if (key == ENTER_KEY || key == ESC_KEY) {
      return key == ENTER_KEY;
    }
    if (IsFieldKey(key, isdigit, "")) {
      _timeoutItem.HandleKey(key);
      _list->Repaint();
    }
  }
}

// Compared in seconds: a stored value that is no whole number of minutes is rounded down to one.
void TarnelTimeoutDialog::Apply() {
  const std::optional<int32_t> minutes =
      MinutesIn(_timeoutItem, _oldSeconds / SECONDS_PER_MINUTE, this);
  if (!minutes || *minutes * SECONDS_PER_MINUTE == _oldSeconds) {
    return;
  }
  SetTarnelTimeoutValue(*minutes * SECONDS_PER_MINUTE);
  LoadIdleTimeout();
  LogChange("Tarnel", *minutes);
}

}  // namespace Tarnel
