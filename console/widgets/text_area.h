#pragma once

#include <map>
#include <string>

#include "console/screen/window.h"
#include "console/widgets/markup_layout.h"

namespace Tarnel {

// A child window that shows one marked-up text: wrapped, aligned, coloured, with tags that stand
// for facts about the host. Whatever changes, the whole text is laid out and painted again. What
// does not fit into the height is not shown.
class TextArea : public Window {
 public:
  // The background is the parent's; a foreground of -1 is the parent's too.
  TextArea(Window* parent, int x, int y, int width, int height, int fg);

  void SetText(const std::string& text);
  // Shows it at once: for progress while the host works.
  void AppendText(const std::string& text);
  void Activate(bool active) override;

  // Facts about the host, each read anew at every call. What they show when a fact cannot be had
  // stands in host_facts.cc; a NodeplaneException may pass.
  static std::string GetIpValue();
  static std::string GetSSLThumbprintValue();
  static std::string GetSSHDsaKeyFingerprintValue();
  static std::string GetSSHRsaKeyFingerprintValue();
  static std::string GetSerialNumberValue();
  static std::string GetHostnameValue();
  static std::string GetOstrelProduct();
  static std::string GetOstrelVersion();
  static std::string GetSupportStart();
  static std::string GetSupportPeriod();
  static std::string GetSystemMemory();
  static std::string GetServiceTag();
  static std::string GetAssetTag();
  static std::string GetBIOSVersion();
  static std::string GetBMCVersion();
  static std::string GetCPLDVersion();
  static std::string GetPLSAVersion();

 private:
  class Painter;

  void Render();
  std::string Layout(const std::string& text) const;
  void Paint(const std::string& display);

  std::string _text;
  std::map<std::string, int> _colours;
  ValueTags _valueTags;
};

}  // namespace Tarnel
