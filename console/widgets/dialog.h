#pragma once

#include <string>

#include "console/screen/frame.h"
#include "console/widgets/text_area.h"

namespace Tarnel {

// A modal, framed window in the middle of the screen: a dark band with a title and a body above a
// yellow one with an optional pane for content and a key hint. Every question, form and message is
// one. What a subclass's Run() gives is 0 when the operator backed out.
class Dialog : public Frame {
 public:
  // The upper band takes headerHeight of the height.
  Dialog(Frame* parent, int width, int height, int headerHeight);

  // Each replaces the whole marked-up text at its place.
  void SetTitle(const std::string& title);
  void SetBody(const std::string& body);
  void SetFooter(const std::string& hint);

  void Activate(bool active) override;

 protected:
  // Waits for the key that accepts, which gives true, or for Esc.
  bool IsAccepted(int acceptKey);
  // Waits until the operator has seen enough.
  void WaitForEnter();

  Window* _header;
  Window* _footer;
  // Null where the lower band has no room for it.
  Window* _content = nullptr;
  TextArea* _titleText;
  TextArea* _bodyText;
  TextArea* _hintText;
};

}  // namespace Tarnel
