#include "console/troubleshooting/restart_agents_dialog.h"

#include <pthread.h>
#include <syslog.h>

#include <cstring>

#include "console/hostops/event_reporting.h"
#include "console/screen/colours.h"
#include "console/screen/key_map.h"
#include "console/screen/screen.h"
#include "console/widgets/hints.h"
#include "hostapi/coreplane/system.h"
#include "hostapi/kernel.h"
#include "hostapi/nodeplane/exception.h"

namespace Tarnel {

namespace {

constexpr int TEXT_DONE = 123;
constexpr int TEXT_TITLE = 244;
constexpr int TEXT_WARNING = 245;
constexpr int TEXT_QUESTION = 246;
constexpr int TEXT_STOPPING = 247;
constexpr int TEXT_STARTING = 248;
constexpr int TEXT_COLLECT = 249;
constexpr int TEXT_COLLECTING = 250;

constexpr char STOP_AGENTS[] = "/bin/sh /sbin/services.sh stop";
constexpr char START_AGENTS[] = "/bin/sh /sbin/services.sh start";
constexpr char TAKE_LIVE_CORE[] =
    "/sbin/corebacktrace -w -n stewardd -o stewardd-restart% -d /var/log/";

int Execute(const char* command) {
  return Coreplane::Util::Coreplane_Exec(command, false, true, false);
}

// Nobody waits for the thread: a core may take longer than the operator stays.
bool StartLiveCoreThread() {
  pthread_attr_t attributes;
  int error = pthread_attr_init(&attributes);
  if (error == 0) {
    pthread_t thread{};
    error = pthread_create(&thread, &attributes, RestartAgentsDialog::GenerateStewarddLiveCore,
                           nullptr);
    pthread_attr_destroy(&attributes);
  }
  if (error != 0) {
    syslog(LOG_ERR, "failed to create live core generation thread: %s", strerror(error));
  }
  return error == 0;
}

}  // namespace

RestartAgentsDialog::RestartAgentsDialog(Frame* parent)
    : Dialog(parent, 71, 20, 9),
      _progressText(_content->Add<TextArea>(1, 2, Width() - 8, 3, PARENT_COLOUR)),
      _collectItem(Text(TEXT_COLLECT), false, 0),
      _list(_content->Add<ItemList>(0, 0, Width() - 4, 1)),
      _finishedSteps("{color:dark-grey}") {}

int RestartAgentsDialog::Run() {
  SetTitle(Text(TEXT_TITLE));
  SetBody(Text(TEXT_WARNING));
  SetFooter(HINT_F11_OK);
  _progressText->SetText(Text(TEXT_QUESTION));
  _list->SetItems({&_collectItem});
  _list->Repaint();
  if (!IsConfirmed()) {
    return 0;
  }
  Restart();
  SetFooter(HINT_OK);
  WaitForEnter();
  return 1;
}

bool RestartAgentsDialog::IsConfirmed() {
  for (;;) {
    switch (WaitKey(true)) {
      case SPACE_KEY:
        _collectItem.SetChecked(!_collectItem.IsChecked());
        _list->Repaint();
        break;
      case F11_KEY:
        return true;
      case ESC_KEY:
        return false;
      default:
        break;
    }
  }
}

void RestartAgentsDialog::Restart() {
  SetFooter("");
  syslog(LOG_INFO, "%s", "Restarting host agents");
  PostEvent(NOTARY_AGENTS_RESTART);
  if (_collectItem.IsChecked() && StartLiveCoreThread()) {
    FinishStep(TEXT_COLLECTING);
  }
  RunStep(TEXT_STOPPING, STOP_AGENTS);
  RunStep(TEXT_STARTING, START_AGENTS);
}

void RestartAgentsDialog::RunStep(int text, const char* command) {
  _progressText->SetText(_finishedSteps + "{color:black}" + Text(text));
  UpdateScreen();
  Execute(command);
  FinishStep(text);
}

void RestartAgentsDialog::FinishStep(int text) {
  _finishedSteps += Text(text) + " " + Text(TEXT_DONE) + "\n";
  _progressText->SetText(_finishedSteps);
}

void* RestartAgentsDialog::GenerateStewarddLiveCore(void*) {
  try {
    syslog(LOG_INFO, "%s", "Executing corebacktrace -c against stewardd");
    if (Execute(TAKE_LIVE_CORE) == 0) {
      Coreplane::System::SystemInfoImpl().SetSystemAlert("Stewardd core dump completed");
    } else {
      syslog(LOG_ERR, "corebacktrace failed, probably stewardd was down");
    }
  } catch (const Nodeplane::Lib::NodeplaneException& error) {
    syslog(LOG_ERR, "%s", error.what());
  }
  return nullptr;
}

}  // namespace Tarnel
