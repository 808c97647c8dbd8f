#pragma once

#include <sys/time.h>
#include <csignal>
#include <cstdint>
#include <string>

#include "console/screen/window.h"
#include "console/texts/string_factory.h"
#include "hostapi/coreplane/hardware.h"

namespace Tarnel {

// Thrown when the idle limit is over; unwinds to the welcome screen.
class TarnelTimeout {};

// Results of Frame::WaitEvent() that are no keys.
enum Event : int {
  EVENT_NONE = -1,
  EVENT_TIME_IS_UP = -2,
  EVENT_REDRAW = -3,
  EVENT_RESTART = -4,
  EVENT_RESIZE = -5,
  EVENT_END = -6,
};

// A top-level window with an input loop: the unit of modal interaction. A frame that is started
// from another dims it for as long as it runs.
class Frame : public Window {
 public:
  Frame(Frame* parent, int x, int y, int width, int height, int bg, int fg);

  // Runs this frame in the foreground and gives what its Run() gave.
  int Exec();

  // Repaints the content; called on the foreground frame when a SIGUSR1 came.
  virtual void Redraw();

  // The signals of the table in signals.cc become bytes in a pipe from here on, in every thread.
  // SIGCHLD is blocked along with them. Called once, before any other thread is made. Ends the
  // process with status 1 on failure.
  static void StartSignalThread();
  // Reads the idle limit anew.
  static void LoadIdleTimeout();
  static void SetLoggedIn(bool loggedIn);
  static void SetLoginName(const std::string& name);
  // The last operator that logged in; it stays after the logout.
  static const std::string& LoginName() { return _loginName; }

  // The first user id on an inserted card, or an empty string.
  static std::string FindSmartCardLoginId();
  // Some inserted card carries this user id.
  static bool IsSmartCardPresent(const std::string& user);

  // The only place where the process waits for the operator. Gives a key, or an Event. A null
  // timeout waits for ever. With a signal mask there is no timeout: that mask holds while the
  // process sleeps, and a signal that was handled then gives EVENT_NONE.
  static int WaitEvent(timeval* timeout, const sigset_t* mask = nullptr);
  // Takes the terminal's new size into curses and logs it.
  static void HandleResize();

 protected:
  // The frame's own loop. Its result goes to the caller of Exec().
  virtual int Run() = 0;

  // The next key. Dims the frame after 60 seconds; with useIdleLimit it throws TarnelTimeout when
  // the idle limit is over. Signals are dealt with inside.
  int WaitKey(bool useIdleLimit);

  // Waits for a key or for the end of a child process, which gives EVENT_NONE; SIGCHLD is handled
  // nowhere else. Neither dims nor ends.
  int WaitKeyOrChild();

  // Brings the smart card state up to date; ends the process when the card of the operator was
  // pulled.
  static void PollSmartCard();

  // A text of the catalogue.
  std::string Text(int id) const { return _strings->GetString(id); }

  Frame* _parentFrame;
  StringFactory* _strings;

  // The frame whose Run() is in progress; null while frames change and after an idle timeout.
  static Frame* fgFrame;
  // Seconds; 0 means no limit.
  static uint32_t _idleTimeout;
  static bool _loggedIn;
  static bool _markForRestart;
  static std::string _loginName;
  static bool _isLoggedWithSmartCard;
  static std::string _smartCardLoginId;
  static Coreplane::Hardware::SmartCardInfoImpl _cardInfo;

 private:
  void Undim();
  // True when the event was a key; the others are acted on.
  bool HandleEvent(int event);
  static void* SignalHandler(void*);

  static sigset_t _signalSet;
  static int _signalPipe[2];
};

// Logs the message with the current errno.
void LogErrno(const char* message);

}  // namespace Tarnel
