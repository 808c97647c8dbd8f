#include "hosts/lab/state/trace.h"

#include <algorithm>
#include <cctype>

#include "hosts/lab/state/descriptor.h"

namespace Lab {

namespace {

std::string TracePath() { return std::string(LAB_DIRECTORY) + "/trace"; }

// In double quotes, on one line whatever the text holds.
std::string Quoted(const std::string& text) {
  return Json(text).dump(-1, ' ', false, Json::error_handler_t::replace);
}

// As it stands where that is one plain word.
std::string Word(const std::string& text) {
  const bool plain = std::all_of(text.begin(), text.end(), [](char c) {
    return std::isgraph(static_cast<unsigned char>(c)) != 0 && c != '"';
  });
  return plain && !text.empty() ? text : Quoted(text);
}

std::string Describe(const Call& call) {
  std::string line = call.operation;
  if (!call.object.empty()) line += " " + Word(call.object);
  for (const std::string& argument : call.arguments) line += " " + Quoted(argument);
  return line;
}

}  // namespace

void TraceChange(const Call& call) { TraceLine(Describe(call)); }

void TraceRead(const Json& state, const Call& call) {
  const auto trace = state.find("trace");
  if (trace != state.end() && Flag(*trace, "/reads", false)) TraceLine("read " + Describe(call));
}

void TraceProgram(const std::string& path, const std::vector<std::string>& arguments) {
  std::string line = "program " + Word(path);
  for (const std::string& argument : arguments) line += " " + Word(argument);
  TraceLine(line);
}

void TraceLine(const std::string& line) {
  const Descriptor file(TracePath(), O_WRONLY | O_APPEND | O_CREAT, 0644);
  const std::string whole = line + "\n";
  // One write, so that lines of several processes never mix.
  if (write(file.Get(), whole.data(), whole.size()) < 0) return;
}

void ClearTrace() { const Descriptor file(TracePath(), O_WRONLY | O_TRUNC); }

}  // namespace Lab
