#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "tests/support/lab.h"

namespace Tarnel::Testing {

// What a run of RunCommand() gave.
struct CommandResult {
  int32_t code = 0;
  std::string out;
  std::string err;
  double seconds = 0;
};

// Runs a program with room for so many bytes of each output; -1: the output is not captured.
CommandResult RunPath(const char* path, std::vector<const char*> argv, int32_t capacity = 255,
                      int32_t timeoutSeconds = 0, const std::string& input = "");

// Runs a shell script.
CommandResult RunShell(const char* script, int32_t capacity = 255, int32_t timeoutSeconds = 0,
                       const std::string& input = "");

}  // namespace Tarnel::Testing
