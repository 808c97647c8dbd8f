#pragma once

#include <memory>
#include <string>
#include <vector>

#include "console/widgets/dialog.h"
#include "console/widgets/item.h"
#include "console/widgets/item_list.h"

namespace Tarnel {

// Chooses the adapters of the management network. Gives 1 when the form was accepted; 0 also when
// the host could not tell its adapters and who uses them. An adapter that cannot be read beyond
// the name of its device throws NodeplaneException.
class AdaptersDialog : public Dialog {
 public:
  // switchName is the switch that the management network is on.
  AdaptersDialog(Frame* parent, const std::vector<std::string>& selected, int maxActiveUplinks,
                 const std::string& switchName);

  // In the order of choosing; those from before stay in front.
  const std::vector<std::string>& Selected() const { return _selected; }
  // As it was given.
  int MaxActiveUplinks() const { return _maxActiveUplinks; }

 protected:
  int Run() override;

 private:
  // What is known of an adapter, as texts.
  struct Adapter {
    std::string name;
    std::string label;
    std::string mac;
    std::string status;
    std::string usedBy;  // a switch; empty for none
  };

  // The first three give false, and tell the log why, when the host fails.
  bool ReadNames();
  bool ScanVirtualSwitches();
  bool ScanLatticeSwitches();
  void ReadAdapters();
  void ShowRows();

  int HandleKeys();
  void ToggleFocused();
  void ShowDetails();
  // True also when the operator wants them all the same.
  bool AreAdaptersFree();
  bool IsSelected(const std::string& name) const;
  bool IsUsedElsewhere(const std::string& name);
  // Null when the host has no such adapter.
  Adapter* Find(const std::string& name);
  void SetUsedBy(const std::string& name, const std::string& switchName);

  ItemList* _list;
  LabelItem _columns;
  // One for each adapter, in the same order.
  std::vector<std::unique_ptr<CheckItem>> _items;
  std::vector<Adapter> _adapters;
  std::vector<std::string> _selected;
  int _maxActiveUplinks;
  std::string _switchName;
};

// Asks whether adapters may be taken from where they are used. Gives 1 for yes.
class UsedAdaptersDialog : public Dialog {
 public:
  explicit UsedAdaptersDialog(Frame* parent);

 protected:
  int Run() override;

 private:
  TextArea* _question;
};

// Shows all that is known of one adapter, at full length. Gives 1.
class AdapterInfoDialog : public Dialog {
 public:
  AdapterInfoDialog(Frame* parent, const std::string& name, const std::string& label,
                    const std::string& mac, const std::string& status, const std::string& usedBy);

 protected:
  int Run() override;

 private:
  std::string _name;
  std::string _label;
  std::string _mac;
  std::string _status;
  std::string _usedBy;
  TextArea* _details;
};

}  // namespace Tarnel
