#pragma once

#include <string_view>

namespace Tarnel {

// What stands between two braces of a marked-up text: {name} or {name:value}.
struct MarkupTag {
  std::string_view content;
  // The content up to the first colon.
  std::string_view name;
  // What is behind the colon; empty when there is none.
  std::string_view value;
};

inline constexpr char TAG_OPEN = '{';
inline constexpr char TAG_CLOSE = '}';

// Takes the tag at the front of the text, whose first byte opens it. A tag that nothing closes
// takes the whole rest with it and has no content.
MarkupTag TakeTag(std::string_view& text);

}  // namespace Tarnel
