#pragma once

#include "console/screen/colours.h"
#include "console/screen/window.h"
#include "console/widgets/text_area.h"

namespace Tarnel::Testing {

// A light grey window from the upper left corner on, with text areas in it.
class Pane : public Window {
 public:
  Pane(int width, int height) : Window(0, 0, width, height, LIGHT_GREY, BLACK) { Activate(true); }

  TextArea* AddText(int x, int y, int width, int height, int fg = PARENT_COLOUR) {
    auto* area = Add<TextArea>(x, y, width, height, fg);
    area->Activate(true);
    return area;
  }
};

}  // namespace Tarnel::Testing
