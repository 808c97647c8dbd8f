#include "console/widgets/markup.h"

#include <algorithm>

namespace Tarnel {

MarkupTag TakeTag(std::string_view& text) {
  const size_t close = text.find(TAG_CLOSE);
  if (close == std::string_view::npos) {
    text = {};
    return {};
  }
  const std::string_view content = text.substr(1, close - 1);
  text.remove_prefix(close + 1);
  const size_t colon = std::min(content.find(':'), content.size());
  return {.content = content,
          .name = content.substr(0, colon),
          .value = content.substr(std::min(colon + 1, content.size()))};
}

}  // namespace Tarnel
