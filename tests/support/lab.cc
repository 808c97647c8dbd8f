#include "tests/support/lab.h"

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <syslog.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <fstream>
#include <iterator>
#include <memory>
#include <sstream>

#include "tests/support/wait.h"

namespace Tarnel::Testing {

namespace {

constexpr char LOG_FILE[] = "/var/log/syslog.log";
constexpr char TRACE_FILE[] = "/etc/halvren/lab/trace";

std::vector<std::string> SplitLines(const std::string& text) {
  std::vector<std::string> lines;
  std::istringstream stream(text);
  for (std::string line; std::getline(stream, line);) {
    lines.push_back(line);
  }
  return lines;
}

std::string Quoted(const std::string& argument) {
  std::string quoted = "'";
  for (const char character : argument) {
    quoted += character == '\'' ? std::string("'\\''") : std::string(1, character);
  }
  return quoted + "'";
}

// A line has the form "Jan  2 03:04:05 host user.info TARNEL: text".
LogLine ParseLogLine(const std::string& line) {
  constexpr size_t TIME_LENGTH = 16;
  LogLine parsed;
  std::string host;
  std::istringstream stream(line.size() > TIME_LENGTH ? line.substr(TIME_LENGTH) : "");
  stream >> host >> parsed.level >> std::ws;
  std::getline(stream, parsed.text);
  return parsed;
}

constexpr char MARK[] = "end of what was logged, ";

// Waits until all that was logged so far has arrived: lines arrive in their order.
void WaitForLog() {
  static int count = 0;
  const std::string mark = MARK + std::to_string(++count);
  syslog(LOG_USER | LOG_DEBUG, "%s", mark.c_str());
  EXPECT_TRUE(WaitUntil([&] { return ReadFile(LOG_FILE).find(mark + "\n") != std::string::npos; }));
}

bool Has(const std::vector<LogLine>& lines, const LogLine& line) {
  return std::find(lines.begin(), lines.end(), line) != lines.end();
}

}  // namespace

void LoadScenario(const std::string& name, const std::string& patch) {
  RunProgram({"/bin/lab", "scenario", name});
  if (!patch.empty()) {
    SetState(patch);
  }
}

void SetState(const std::string& patch) { RunProgram({"/bin/lab", "set", patch}); }

std::string GetState(const std::string& pointer) {
  return RunProgram({"/bin/lab", "get", pointer});
}

std::vector<std::string> TraceLines() { return SplitLines(ReadFile(TRACE_FILE)); }

std::string RunProgram(const std::vector<std::string>& arguments) {
  std::string command;
  for (const std::string& argument : arguments) {
    command += Quoted(argument) + " ";
  }
  FILE* const pipe = popen((command + "2>&1").c_str(), "re");
  std::string output;
  std::array<char, 4096> buffer;
  for (size_t size = 0; (size = fread(buffer.data(), 1, buffer.size(), pipe)) > 0;) {
    output.append(buffer.data(), size);
  }
  const int status = pclose(pipe);
  EXPECT_EQ(status, 0) << command << "\n" << output;
  return output;
}

std::string ReadFile(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

void WriteFile(const std::string& path, const std::string& content) {
  std::ofstream(path, std::ios::binary | std::ios::trunc) << content;
}

Log::Log() {
  WaitForLog();
  _start = ReadFile(LOG_FILE).size();
}

std::vector<LogLine> Log::Arrived() const {
  const std::string log = ReadFile(LOG_FILE);
  std::vector<LogLine> lines;
  for (const std::string& text : SplitLines(log.substr(std::min(_start, log.size())))) {
    if (text.find(MARK) == std::string::npos) {
      lines.push_back(ParseLogLine(text));
    }
  }
  return lines;
}

std::vector<LogLine> Log::Lines() const {
  WaitForLog();
  return Arrived();
}

bool Log::Contains(const LogLine& line) const { return Has(Lines(), line); }

void Log::WaitFor(const LogLine& line) const {
  EXPECT_TRUE(WaitUntil([&] { return Has(Arrived(), line); }))
      << "No log line \"" << line.level << " " << line.text << "\" behind\n"
      << LastLogLines(15);
}

std::vector<std::string> Logged(const Log& log) {
  const std::string own = std::string(program_invocation_short_name) + ": ";
  std::vector<std::string> lines;
  for (const LogLine& line : log.Lines()) {
    if (line.text.rfind(own, 0) == 0) {
      lines.push_back(line.level + " " + line.text.substr(own.size()));
    }
  }
  return lines;
}

std::string LastLogLines(size_t count) {
  const std::vector<std::string> lines = SplitLines(ReadFile(LOG_FILE));
  std::string text;
  for (size_t i = lines.size() - std::min(count, lines.size()); i < lines.size(); ++i) {
    text += lines[i] + "\n";
  }
  return text;
}

}  // namespace Tarnel::Testing
