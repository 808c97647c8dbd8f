// Prepares the root of a lab from outside: the default host with this machine's facts in it, the
// state after the scenarios, the files that they ask for and the host's names.

#include <cstdio>
#include <exception>
#include <filesystem>
#include <string>
#include <vector>

#include "hosts/lab/state/default_host.h"
#include "hosts/lab/state/files.h"
#include "hosts/lab/state/scenario.h"
#include "hosts/machine/facts.h"

namespace {

struct Arguments {
  std::string root;
  // Where scenarios are that are given by name.
  std::string directory;
  std::vector<std::string> scenarios;
};

bool ReadArguments(std::vector<std::string> words, Arguments& arguments) {
  if (words.size() >= 2 && words[0] == "--scenarios") {
    arguments.directory = words[1];
    words.erase(words.begin(), words.begin() + 2);
  }
  if (words.empty() || words[0].empty() || words[0][0] == '-') return false;
  arguments.root = words[0];
  arguments.scenarios.assign(words.begin() + 1, words.end());
  if (arguments.directory.empty()) {
    arguments.directory = arguments.root + Lab::SCENARIO_DIRECTORY;
  }
  return true;
}

void Prepare(const Arguments& arguments) {
  const Lab::Json defaultHost = Lab::DefaultHost(Machine::ReadFacts());
  Lab::Json state = defaultHost;
  for (const std::string& scenario : arguments.scenarios) {
    state = Lab::MergeScenario(std::move(state), scenario, arguments.directory);
  }
  const std::string directory = arguments.root + Lab::LAB_DIRECTORY;
  std::filesystem::create_directories(directory);
  Lab::ReplaceFile(directory + "/default.json", defaultHost.dump());
  Lab::ReplaceFile(directory + "/state.json", state.dump());
  Lab::ReplaceFile(directory + "/lock", "");
  Lab::ReplaceFile(directory + "/trace", "");
  std::filesystem::remove(directory + "/counts");
  Lab::WriteNames(state, arguments.root);
  Lab::ApplyFiles(state, arguments.root);
}

}  // namespace

int main(int argc, char** argv) {
  Arguments arguments;
  if (!ReadArguments({argv + 1, argv + argc}, arguments)) {
    fprintf(stderr, "usage: lab-prepare [--scenarios DIR] ROOT [SCENARIO ...]\n");
    return 2;
  }
  try {
    Prepare(arguments);
    return 0;
  } catch (const std::exception& error) {
    fprintf(stderr, "lab-prepare: %s\n", error.what());
    return 2;
  }
}
