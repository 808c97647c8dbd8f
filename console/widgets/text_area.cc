#include "console/widgets/text_area.h"

#include <string_view>

#include "console/screen/colours.h"
#include "console/screen/screen.h"
#include "console/widgets/markup.h"

namespace Tarnel {

// Walks one display text and writes it into the area.
class TextArea::Painter {
 public:
  explicit Painter(TextArea& area) : _area(area), _curFg(area._fgColor), _curBg(area._bgColor) {}

  void Paint(std::string_view display);

 private:
  void PutTag(const MarkupTag& tag);
  void OpenColour(std::string_view name);
  void CloseColour();
  void OpenBackground(std::string_view name);
  void CloseBackground();

  // False, with the number unchanged, when the area has no such colour.
  bool LookupColour(std::string_view name, int& number) const;
  void SwitchAttr(attr_t off, attr_t on);
  void Flush();
  void EndLine();
  void PutRest();

  TextArea& _area;
  int _x = 0;
  int _y = 0;
  std::string _buffer;
  int _curFg;
  int _curBg;
  bool _fgOpen = false;
  bool _bgOpen = false;
};

void TextArea::Painter::Paint(std::string_view display) {
  while (!display.empty() && _y < _area._height) {
    const char c = display.front();
    if (c == TAG_OPEN) {
      PutTag(TakeTag(display));
      continue;
    }
    display.remove_prefix(1);
    if (c == '\n') {
      EndLine();
    } else {
      _buffer += c;
    }
  }
  PutRest();
}

void TextArea::Painter::PutTag(const MarkupTag& tag) {
  if (tag.name == "color") {
    OpenColour(tag.value);
  } else if (tag.name == "/color") {
    CloseColour();
  } else if (tag.name == "bgcolor") {
    OpenBackground(tag.value);
  } else if (tag.name == "/bgcolor") {
    CloseBackground();
  }
}

void TextArea::Painter::OpenColour(std::string_view name) {
  Flush();
  if (LookupColour(name, _curFg)) {
    SwitchAttr(ColourAttr(_curBg, _area._fgColor), ColourAttr(_curBg, _curFg));
  }
  _fgOpen = true;
}

void TextArea::Painter::CloseColour() {
  if (!_fgOpen) return;
  Flush();
  SwitchAttr(ColourAttr(_area._bgColor, _curFg), ColourAttr(_area._bgColor, _area._fgColor));
  _fgOpen = false;
}

void TextArea::Painter::OpenBackground(std::string_view name) {
  Flush();
  if (LookupColour(name, _curBg)) {
    SwitchAttr(ColourAttr(_area._bgColor, _curFg), ColourAttr(_curBg, _curFg));
  }
  _bgOpen = true;
}

void TextArea::Painter::CloseBackground() {
  if (!_bgOpen) return;
  Flush();
  SwitchAttr(ColourAttr(_curBg, _area._fgColor), ColourAttr(_area._bgColor, _area._fgColor));
  _bgOpen = false;
}

bool TextArea::Painter::LookupColour(std::string_view name, int& number) const {
  const auto colour = _area._colours.find(std::string(name));
  if (colour == _area._colours.end()) return false;
  number = colour->second;
  return true;
}

void TextArea::Painter::SwitchAttr(attr_t off, attr_t on) {
  if (!_area._active) return;
  wattr_off(_area.Curses(), off, nullptr);
  wattr_on(_area.Curses(), on, nullptr);
}

void TextArea::Painter::Flush() {
  _area.PutText(_x, _y, _buffer);
  _x += static_cast<int>(_buffer.size());
  _buffer.clear();
}

void TextArea::Painter::EndLine() {
  _area.PutText(_x, _y, _buffer);
  _buffer.clear();
  _x = 0;
  ++_y;
}

void TextArea::Painter::PutRest() {
  if (_buffer.empty() || _y >= _area._height || _x >= _area._width) return;
  _area.PutText(_x, _y, _buffer.substr(0, static_cast<size_t>(_area._width - _x)));
}

TextArea::TextArea(Window* parent, int x, int y, int width, int height, int fg)
    : Window(parent, x, y, width, height, PARENT_COLOUR, fg),
      _colours{
          {"white", WHITE},           {"black", BLACK},   {"dark-grey", DARK_GREY},
          {"light-grey", LIGHT_GREY}, {"yellow", YELLOW}, {"red", RED},
      },
      _valueTags{
          {"ip", GetIpValue},
          {"ssl-thumbprint", GetSSLThumbprintValue},
          {"ssh-dsa-fingerprint", GetSSHDsaKeyFingerprintValue},
          {"ssh-rsa-fingerprint", GetSSHRsaKeyFingerprintValue},
          {"serial-number", GetSerialNumberValue},
          {"hostname", GetHostnameValue},
          {"ostrelproduct", GetOstrelProduct},
          {"ostrelversion", GetOstrelVersion},
          {"supportstart", GetSupportStart},
          {"supportperiod", GetSupportPeriod},
          {"memory", GetSystemMemory},
          {"servicetag", GetServiceTag},
          {"assettag", GetAssetTag},
          {"BIOSversion", GetBIOSVersion},
          {"BMCversion", GetBMCVersion},
          {"CPLDversion", GetCPLDVersion},
          {"PLSAversion", GetPLSAVersion},
      } {}

void TextArea::SetText(const std::string& text) {
  _text = text;
  Render();
}

void TextArea::AppendText(const std::string& text) {
  _text += text;
  Render();
  UpdateScreen();
}

void TextArea::Activate(bool active) {
  Window::Activate(active);
  Render();
}

void TextArea::Render() {
  if (Curses() == nullptr) return;
  Erase();
  Paint(Layout(_text));
}

std::string TextArea::Layout(const std::string& text) const {
  return LayoutMarkup(text, _width, _valueTags);
}

void TextArea::Paint(const std::string& display) {
  Painter(*this).Paint(display);
  Refresh();
}

}  // namespace Tarnel
