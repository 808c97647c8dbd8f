#pragma once

#include <string>

#include "hosts/lab/state/descriptor.h"
#include "hosts/lab/state/host_state.h"

// Files as a whole. Every operation throws StateError with the file's name in its text.
namespace Lab {

std::string ReadFile(const std::string& path);
std::string ReadFile(const Descriptor& file, const std::string& path);
// Replaces the file in one step: a reader sees the old content or the new one.
void ReplaceFile(const std::string& path, const std::string& content, mode_t mode = 0644);

// A document from its text; the error names the place of a mistake.
Json ParseDocument(const std::string& text, const std::string& path);
Json ReadDocument(const std::string& path);

}  // namespace Lab
