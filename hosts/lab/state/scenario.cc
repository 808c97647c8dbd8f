#include "hosts/lab/state/scenario.h"

#include <algorithm>
#include <filesystem>

#include "hosts/lab/state/faults.h"
#include "hosts/lab/state/files.h"
#include "hosts/lab/state/kernel_nics.h"
#include "hosts/lab/state/lock.h"
#include "hosts/lab/state/trace.h"

namespace Lab {

namespace {

constexpr char SUPERVISOR_FILE[] = "/var/run/lab-supervisor.pid";

namespace fs = std::filesystem;

// More levels of "over" than any scenario needs: two that name each other.
constexpr int MAX_LEVELS = 8;

std::string ScenarioPath(const std::string& scenario, const std::string& directory) {
  if (scenario.find('/') != std::string::npos) return scenario;
  return directory + "/" + scenario + ".json";
}

bool IsMerged(const Json& state, const std::string& scenario) {
  const Json merged = state.value("scenarios", Json::array());
  return std::find(merged.begin(), merged.end(), scenario) != merged.end();
}

Json Merge(Json base, const std::string& scenario, const std::string& directory, int level) {
  const std::string path = ScenarioPath(scenario, directory);
  if (level > MAX_LEVELS) throw StateError(path + ": stands over itself");
  Json patch = ReadDocument(path);
  if (!patch.is_object()) throw StateError(path + ": not an object");
  const std::string below = Text(patch, "/over", "");
  if (!below.empty() && !IsMerged(base, below))
    base = Merge(std::move(base), below, directory, level + 1);
  patch.erase("over");
  patch.erase("description");
  base.merge_patch(patch);
  base["scenarios"].push_back(scenario);
  return base;
}

void ApplyFile(const Json& entry, const std::string& path) {
  if (Flag(entry, "/absent", false)) {
    fs::remove_all(path);
    return;
  }
  fs::create_directories(fs::path(path).parent_path());
  const std::string mode = Text(entry, "/mode", "0644");
  ReplaceFile(path, Text(entry, "/content", ""),
              static_cast<mode_t>(strtoul(mode.c_str(), nullptr, 8)));
}

// "10.0.0.20<TAB>name.domain name", nothing without an address or a name.
std::string OwnHostsLine(const Json& state, const std::string& name) {
  const std::string nic = "/network/kernelNics/" + Text(state, "/network/management", "");
  const std::string address = Text(state, (nic + "/running/address").c_str(), "");
  const std::string domain = Text(state, "/network/stacks/defaultTcpipStack/running/domain", "");
  if (address.empty() || name.empty()) return "";
  return address + "\t" + (domain.empty() ? "" : name + "." + domain + " ") + name + "\n";
}

void TakeStoredSettings(Json& state) {
  Json& network = state["network"];
  network["ipv6"]["running"] = Flag(network, "/ipv6/nextStart", false);
  for (Json& stack : network["stacks"]) stack["running"] = stack["stored"];
  for (const auto& [name, nic] : network["kernelNics"].items()) {
    TakeDownKernelNic(state, name);
    BringUpKernelNic(state, name);
  }
  for (Json& machine : state["virtualMachines"]) machine["running"] = false;
  for (Json& service : state["services"]) service["running"] = Flag(service, "/enabled", false);
  Json& keyboard = state["host"]["keyboard"];
  keyboard["loaded"] = keyboard["configured"];
}

}  // namespace

Json MergeScenario(Json base, const std::string& scenario, const std::string& directory) {
  return Merge(std::move(base), scenario, directory, 0);
}

void ApplyFiles(const Json& state, const std::string& root) {
  if (!state.contains("files")) return;
  try {
    for (const auto& [path, entry] : Object(state, "/files").items()) ApplyFile(entry, root + path);
  } catch (const fs::filesystem_error& error) {
    throw StateError(error.what());
  }
}

void WriteNames(const Json& state, const std::string& root) {
  const std::string name =
      Text(state, "/network/stacks/defaultTcpipStack/running/hostname", "localhost");
  ReplaceFile(root + "/etc/hostname", name + "\n");
  ReplaceFile(root + "/etc/hosts",
              "127.0.0.1\tlocalhost\n::1\tlocalhost\n" + OwnHostsLine(state, name));
}

void LoadScenarios(const std::vector<std::string>& scenarios) {
  const std::string directory = LAB_DIRECTORY;
  Json state = ReadDocument(directory + "/default.json");
  for (const std::string& scenario : scenarios) {
    state = MergeScenario(std::move(state), scenario, SCENARIO_DIRECTORY);
  }
  const Lock lock;
  ReplaceFile(directory + "/state.json", state.dump());
  WriteNames(state, "");
  ApplyFiles(state, "");
  ClearCounts();
  ClearTrace();
}

void StartAfresh() {
  ChangeState(TakeStoredSettings);
  for (const auto& entry : fs::directory_iterator("/var/run")) {
    if (entry.path() != SUPERVISOR_FILE) fs::remove_all(entry.path());
  }
  const auto state = ReadState();
  WriteNames(*state, "");
  const Json files = state->value("files", Json::object());
  for (const auto& [path, entry] : files.items()) {
    // What is written anew at each start.
    if (path.starts_with("/var/run/") || path.starts_with("/etc/host")) ApplyFile(entry, path);
  }
}

void LoadScenario(const std::string& scenario) { LoadScenarios({scenario}); }

}  // namespace Lab
