// The lab's own tool: shows and changes the state of the host while the console runs.

#include <signal.h>

#include <cstdio>
#include <cstdlib>
#include <exception>
#include <string>
#include <vector>

#include "hosts/lab/state/faults.h"
#include "hosts/lab/state/files.h"
#include "hosts/lab/state/scenario.h"
#include "hosts/lab/state/trace.h"

namespace {

using Words = std::vector<std::string>;

constexpr char CONSOLE_FILE[] = "/var/run/tarnel.pid";
constexpr size_t MAX_SLOTS = 16;

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

// The host's stack tells the console of a change in the readers; a console that does not run looks
// for itself when it starts.
void TellConsole() {
  try {
    const pid_t console = atoi(Lab::ReadFile(CONSOLE_FILE).c_str());
    if (console > 0) kill(console, SIGUSR1);
  } catch (const Lab::StateError&) {
  }
}

size_t SlotNumber(const std::string& word) {
  char* end = nullptr;
  const unsigned long number = strtoul(word.c_str(), &end, 10);
  if (word.empty() || word[0] == '-' || *end != '\0' || number >= MAX_SLOTS) {
    throw Lab::StateError(word + ": no slot; they count from 0 to " +
                          std::to_string(MAX_SLOTS - 1));
  }
  return number;
}

void SetSlot(const std::string& word, const Lab::Json& slot) {
  const size_t number = SlotNumber(word);
  Lab::ChangeState([&](Lab::Json& state) {
    Lab::Json& slots = state["hardware"]["cardSlots"];
    while (slots.size() <= number) slots.push_back(Lab::Json::object());
    slots[number] = slot;
  });
  TellConsole();
}

// "insert SLOT ID ...", in place of a card that is there, or "pull SLOT".
void Card(const Words& words) {
  if (words[0] == "insert" && words.size() > 2) {
    SetSlot(words[1], {{"ids", Words(words.begin() + 2, words.end())}});
  } else if (words[0] == "pull" && words.size() == 2) {
    SetSlot(words[1], Lab::Json::object());
  } else {
    throw Lab::StateError("card: insert SLOT ID ... or pull SLOT");
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
    {"card", 2, 9, Card},
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
            "usage: lab get [POINTER] | set PATCH | scenario NAME ... | trace [clear] | restart |\n"
            "           card insert SLOT ID ... | card pull SLOT\n");
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
