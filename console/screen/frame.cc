#include "console/screen/frame.h"

#include <sys/ioctl.h>
#include <syslog.h>
#include <unistd.h>

#include <cstdlib>

#include "console/hostops/command_runner.h"
#include "console/screen/idle_clock.h"
#include "console/screen/key_map.h"
#include "console/screen/screen.h"

namespace Tarnel {

Frame* Frame::fgFrame = nullptr;
uint32_t Frame::_idleTimeout = 600;
bool Frame::_loggedIn = false;
bool Frame::_markForRestart = false;
std::string Frame::_loginName;
bool Frame::_isLoggedWithSmartCard = false;
std::string Frame::_smartCardLoginId;
Coreplane::Hardware::SmartCardInfoImpl Frame::_cardInfo;

namespace {

timeval Now() {
  timeval now{};
  gettimeofday(&now, nullptr);
  return now;
}

}  // namespace

Frame::Frame(Frame* parent, int x, int y, int width, int height, int bg, int fg)
    : Window(x, y, width, height, bg, fg),
      _parentFrame(parent),
      _strings(StringFactory::ForLocale("en_US")) {}

int Frame::Exec() {
  fgFrame = nullptr;
  if (_parentFrame != nullptr) {
    _parentFrame->Activate(false);
    _parentFrame->Refresh();
  }
  Activate(true);
  UpdateScreen();
  fgFrame = this;
  int result = 0;
  try {
    result = Run();
  } catch (const TarnelTimeout&) {
    fgFrame = nullptr;
    throw;
  }
  if (_parentFrame != nullptr) {
    _parentFrame->Activate(true);
    _parentFrame->Refresh();
    UpdateScreen();
  }
  fgFrame = _parentFrame;
  return result;
}

void Frame::Redraw() {}

int Frame::WaitKey(bool useIdleLimit) {
  const bool limited = useIdleLimit && _idleTimeout != 0;
  IdleClock clock(Now(), _idleTimeout);
  bool dimmed = false;
  for (;;) {
    clock.Set(Now());
    if (limited && clock.LimitIsOver()) {
      fgFrame = nullptr;
      throw TarnelTimeout();
    }
    if (!dimmed && clock.DimIsDue()) {
      Activate(false);
      Refresh();
      dimmed = true;
    }
    timeval span = dimmed ? clock.UntilLimit() : clock.UntilDim();
    const int event = WaitEvent(dimmed && !limited ? nullptr : &span);
    if (!HandleEvent(event)) {
      continue;
    }
    if (dimmed) {
      Undim();
    }
    return event == KEY_ENTER ? static_cast<int>(ENTER_KEY) : event;
  }
}

int Frame::WaitKeyOrChild() {
  sigset_t mask;
  pthread_sigmask(SIG_SETMASK, nullptr, &mask);
  sigdelset(&mask, SIGCHLD);
  const int event = WaitEvent(nullptr, &mask);
  return HandleEvent(event) ? event : static_cast<int>(EVENT_NONE);
}

bool Frame::HandleEvent(int event) {
  switch (event) {
    case EVENT_REDRAW:
      if (fgFrame != nullptr) {
        fgFrame->Redraw();
      }
      PollSmartCard();
      return false;
    case EVENT_RESTART:
      if (!_loggedIn) {
        exit(0);
      }
      _markForRestart = true;
      return false;
    case KEY_RESIZE:
    case EVENT_RESIZE:
      HandleResize();
      exit(0);
    case EVENT_END:
      exit(0);
    default:
      return event >= 0;
  }
}

// The terminal may have lost the picture meanwhile, so all of it is sent again.
void Frame::Undim() {
  clearok(curscr, TRUE);
  Activate(true);
  Refresh();
}

void Frame::HandleResize() {
  winsize size{};
  if (ioctl(STDIN_FILENO, TIOCGWINSZ, &size) != 0 || size.ws_row == 0 || size.ws_col == 0) {
    return;
  }
  resizeterm(size.ws_row, size.ws_col);
  syslog(LOG_INFO, "Resized window to %dx%d", size.ws_col, size.ws_row);
  refresh();
}

void Frame::LoadIdleTimeout() { _idleTimeout = static_cast<uint32_t>(GetTarnelTimeoutValue()); }

void Frame::SetLoggedIn(bool loggedIn) {
  _loggedIn = loggedIn;
  if (loggedIn) {
    LoadIdleTimeout();
  }
}

void Frame::SetLoginName(const std::string& name) {
  _loginName = name;
  _isLoggedWithSmartCard = IsSmartCardPresent(name);
}

void Frame::PollSmartCard() {
  if (!_loggedIn) {
    _smartCardLoginId = FindSmartCardLoginId();
    if (!_smartCardLoginId.empty()) {
      syslog(LOG_INFO, "Found smart card with user id '%s'", _smartCardLoginId.c_str());
    }
  } else if (_isLoggedWithSmartCard && !IsSmartCardPresent(_loginName)) {
    syslog(LOG_INFO, "Logging out user id '%s'", _loginName.c_str());
    exit(0);
  }
}

}  // namespace Tarnel
