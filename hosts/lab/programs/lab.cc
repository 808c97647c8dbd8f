// The lab's own tool: shows and changes the state of the host while the console runs.

#include <cstdio>
#include <exception>
#include <string>
#include <vector>

#include "hosts/lab/state/faults.h"
#include "hosts/lab/state/files.h"
#include "hosts/lab/state/scenario.h"
#include "hosts/lab/state/trace.h"

namespace {

using Words = std::vector<std::string>;

void Print(const std::string& text) { fwrite(text.data(), 1, text.size(), stdout); }

// The node at a JSON pointer, a text without quotes.
void Get(const Words& words) {
  const auto state = Lab::ReadState();
  const Lab::Json& node = state->at(Lab::Json::json_pointer(words.empty() ? "" : words[0]));
  Print((node.is_string() ? node.get<std::string>() : node.dump(2)) + "\n");
}

// New faults start with new counts.
void Set(const Words& words) {
  const Lab::Json patch = Lab::ParseDocument(words[0], "patch");
  if (!patch.is_object()) throw Lab::StateError("patch: not an object");
  Lab::ChangeState([&patch](Lab::Json& state) { state.merge_patch(patch); });
  if (patch.contains("faults") || patch.contains("programs")) Lab::ClearCounts();
}

void Trace(const Words& words) {
  if (words.empty()) {
    Print(Lab::ReadFile(std::string(Lab::LAB_DIRECTORY) + "/trace"));
  } else {
    Lab::ClearTrace();
  }
}

struct Command {
  const char* name;
  size_t minWords;
  size_t maxWords;
  void (*run)(const Words& words);
};

constexpr Command COMMANDS[] = {
    {"get", 0, 1, Get},
    {"set", 1, 1, Set},
    {"scenario", 1, 9, [](const Words& words) { Lab::LoadScenarios(words); }},
    {"trace", 0, 1, Trace},
    {"restart", 0, 0, [](const Words&) { Lab::StartAfresh(); }},
};

const Command* FindCommand(const Words& words) {
  for (const Command& command : COMMANDS) {
    const size_t count = words.size() - 1;
    if (words[0] == command.name && count >= command.minWords && count <= command.maxWords) {
      return &command;
    }
  }
  return nullptr;
}

}  // namespace

int main(int argc, char** argv) {
  Words words(argv + 1, argv + argc);
  const Command* command = words.empty() ? nullptr : FindCommand(words);
  if (command == nullptr) {
    fprintf(stderr,
            "usage: lab get [POINTER] | set PATCH | scenario NAME ... | trace [clear] | restart\n");
    return 2;
  }
  try {
    words.erase(words.begin());
    command->run(words);
    return 0;
  } catch (const std::exception& error) {
    fprintf(stderr, "lab: %s\n", error.what());
    return 2;
  }
}
