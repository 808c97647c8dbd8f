#include "tests/hostops/command_run.h"

#include <algorithm>
#include <chrono>

#include "console/hostops/command_runner.h"

namespace Tarnel::Testing {

CommandResult RunPath(const char* path, std::vector<const char*> argv, int32_t capacity,
                      int32_t timeoutSeconds, const std::string& input) {
  using Clock = std::chrono::steady_clock;
  std::string out(static_cast<size_t>(std::max(capacity, 0)), '\0');
  std::string err = out;
  int32_t outLength = capacity;
  int32_t errLength = capacity;
  const bool captured = capacity >= 0;
  argv.push_back(nullptr);
  const auto start = Clock::now();
  const int32_t code = RunCommand(path, argv.data(), captured ? out.data() : nullptr, &outLength,
                                  captured ? err.data() : nullptr, &errLength,
                                  input.empty() ? nullptr : input.data(),
                                  static_cast<uint32_t>(input.size()), timeoutSeconds);
  const double seconds = std::chrono::duration<double>(Clock::now() - start).count();
  if (captured) {
    out.resize(static_cast<size_t>(outLength));
    err.resize(static_cast<size_t>(errLength));
  }
  return {code, out, err, seconds};
}

CommandResult RunShell(const char* script, int32_t capacity, int32_t timeoutSeconds,
                       const std::string& input) {
  return RunPath("/bin/sh", {"sh", "-c", script}, capacity, timeoutSeconds, input);
}

}  // namespace Tarnel::Testing
