#pragma once

#include <string>

#include "console/widgets/dialog.h"
#include "console/widgets/item.h"
#include "console/widgets/item_list.h"

namespace Tarnel {

// Stops and starts the management agents. Gives 1 when that was done, whatever became of it.
class RestartAgentsDialog : public Dialog {
 public:
  explicit RestartAgentsDialog(Frame* parent);

  // A thread's function: takes a live core of the management agent and raises a system alert when
  // it is there. Takes and gives null; outlives the dialog.
  static void* GenerateStewarddLiveCore(void*);

 protected:
  int Run() override;

 private:
  bool IsConfirmed();
  void Restart();
  // Runs a command while the step's text is the current one; then the step is finished.
  void RunStep(int text, const char* command);
  void FinishStep(int text);

  TextArea* _progressText;
  CheckItem _collectItem;
  ItemList* _list;
  // The progress text up to the step that runs.
  std::string _finishedSteps;
};

}  // namespace Tarnel
