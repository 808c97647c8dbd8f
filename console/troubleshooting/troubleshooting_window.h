#pragma once

#include <memory>
#include <string>
#include <vector>

#include "console/widgets/item.h"
#include "console/widgets/root_window.h"

namespace Tarnel {

// Switches the host's local shell and its SSH service on and off, and leads to their timeouts, the
// console's own and the restart of the management agents. The state of the two services is read
// when the window is made. Gives 1.
class TroubleShootingWindow : public RootWindow {
 public:
  explicit TroubleShootingWindow(Frame* parent);

 protected:
  int Run() override;
  void RefreshPanes() override;

 private:
  // What there is to know of a service to switch it.
  struct Service;
  static const Service SHELL;
  static const Service SSH;

  void AddRows();
  void OpenRow();
  template <class DialogClass>
  void Open();

  // Has the service change over from the given state, and tells the operator's log.
  void Toggle(const Service& service, bool& enabled);
  static void StartOrStop(const Service& service, bool enabled);
  static void SwitchFirewall(bool enabled);
  static void KeepForNextStart(const Service& service, bool enabled);
  // The timeouts can be changed only while both services are off.
  void OfferTimeouts(bool offered);

  void ShowRightPane();
  std::string RightText(int row) const;

  std::vector<std::unique_ptr<LabelItem>> _items;
  bool _shellEnabled;
  bool _sshEnabled;
};

}  // namespace Tarnel
