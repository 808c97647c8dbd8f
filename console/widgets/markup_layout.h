#pragma once

#include <functional>
#include <map>
#include <string>
#include <string_view>

namespace Tarnel {

// Tags that stand for a fact, each with the function that reads it.
using ValueTags = std::map<std::string, std::function<std::string()>>;

// Turns marked-up text into display text for lines of a width: line ends and alignment blanks are
// in place and value tags are replaced by their facts. What is left of the markup are tags that
// take no column. A column is a byte. Any text will do; nothing fits into a width below 1. An
// exception of a value function passes.
//
// A right-aligned or centred region that takes several lines is aligned line by line. The line on
// which it ends is settled: what follows the region directly starts a new line.
std::string LayoutMarkup(std::string_view text, int width, const ValueTags& valueTags);

}  // namespace Tarnel
