#pragma once

#include <cstddef>
#include <string>
#include <vector>

// The laboratory host, as a test inside it changes it and looks into it.
namespace Tarnel::Testing {

// Makes the host the one of a scenario, and then applies a JSON merge patch to it.
void LoadScenario(const std::string& name, const std::string& patch = "");
// Applies a JSON merge patch to the running host.
void SetState(const std::string& patch);
// A node of the host's state, as JSON text.
std::string GetState(const std::string& pointer);
// What happened to the host since the scenario was loaded, line by line.
std::vector<std::string> TraceLines();

// Runs a program of the lab to its end and gives its output. A program that fails is a test
// failure.
std::string RunProgram(const std::vector<std::string>& arguments);

std::string ReadFile(const std::string& path);
void WriteFile(const std::string& path, const std::string& content);

struct LogLine {
  std::string level;  // facility and level, such as "user.info"
  std::string text;   // identity and message, such as "TARNEL: Starting TARNEL"

  bool operator==(const LogLine&) const = default;
};

// What is written to the host's log from here on.
class Log {
 public:
  Log();

  // Both know all that was logged before the call.
  std::vector<LogLine> Lines() const;
  bool Contains(const LogLine& line) const;
  // Waits for a line; one that does not come is a test failure.
  void WaitFor(const LogLine& line) const;

 private:
  std::vector<LogLine> Arrived() const;

  size_t _start;
};

// All that this process has logged behind the given place, as "level text".
std::vector<std::string> Logged(const Log& log);

// The end of the host's log, for failures.
std::string LastLogLines(size_t count);

}  // namespace Tarnel::Testing
