#include "tests/hostops/command_run.h"

#include <syslog.h>

#include <cerrno>
#include <chrono>

#include "hostops/command_runner.h"

namespace Tarnel::Testing {

CommandResult RunPath(const char* path, std::vector<const char*> argv, int32_t capacity,
                      int32_t timeoutSeconds, const std::string& input) {
  CommandResult result;
  int32_t outLength = capacity;
  int32_t errLength = capacity;
  if (capacity >= 0) {
    result.out.resize(static_cast<size_t>(capacity));
    result.err.resize(static_cast<size_t>(capacity));
  }
  argv.push_back(nullptr);
  const auto start = std::chrono::steady_clock::now();
  result.code = RunCommand(path, argv.data(), capacity < 0 ? nullptr : result.out.data(),
                           &outLength, capacity < 0 ? nullptr : result.err.data(), &errLength,
                           input.empty() ? nullptr : input.data(),
                           static_cast<uint32_t>(input.size()), timeoutSeconds);
  result.seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
  if (capacity >= 0) {
    result.out.resize(static_cast<size_t>(outLength));
    result.err.resize(static_cast<size_t>(errLength));
  }
  return result;
}

CommandResult RunTool(std::vector<const char*> argv, int32_t capacity) {
  return RunPath("/bin/busybox", std::move(argv), capacity);
}

CommandResult RunShell(const char* script, int32_t capacity, int32_t timeoutSeconds,
                       const std::string& input) {
  return RunPath("/bin/sh", {"sh", "-c", script}, capacity, timeoutSeconds, input);
}

std::vector<std::string> Logged(const Log& log) {
  // Lines of one process arrive in their order, so behind this one there is nothing to wait for.
  static int mark = 0;
  const std::string own = std::string(program_invocation_short_name) + ": ";
  const std::string last = "end of case " + std::to_string(++mark);
  syslog(LOG_DEBUG, "%s", last.c_str());
  log.WaitFor({"user.debug", own + last});
  std::vector<std::string> lines;
  for (const LogLine& line : log.Lines()) {
    if (line.text.rfind(own, 0) == 0 && line.level != "user.debug") {
      lines.push_back(line.level + " " + line.text.substr(own.size()));
    }
  }
  return lines;
}

}  // namespace Tarnel::Testing
