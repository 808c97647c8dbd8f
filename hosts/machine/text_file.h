#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace Machine {

// The whole file; empty when it cannot be read.
std::string ReadText(const std::string& path);
// The lines of a file, without their newlines.
std::vector<std::string> ReadLines(const std::string& path);
// The first line; empty when there is none.
std::string ReadFirstLine(const std::string& path);
// The names in a directory, sorted.
std::vector<std::string> ListDirectory(const std::string& path);

// What stands between runs of blanks and tabs.
std::vector<std::string> SplitWords(std::string_view text);
// Without the blanks and tabs at both ends.
std::string_view Trim(std::string_view text);

}  // namespace Machine
