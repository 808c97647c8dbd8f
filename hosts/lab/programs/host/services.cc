// The scripts that start and stop services: a file for the shell, which becomes this program.

#include "hosts/lab/programs/host/services.h"

#include "hosts/lab/programs/host/program.h"

namespace Lab::Host {

namespace {

constexpr int NOT_RUNNING = 3;

Json::json_pointer FlagOf(const std::string& service, const char* flag) {
  return Json::json_pointer("/services") / service / flag;
}

void SetFlag(const std::string& service, const char* flag, bool value) {
  ChangeState([&](Json& state) { state[FlagOf(service, flag)] = value; });
}

std::string NameOf(const std::string& path) { return path.substr(path.rfind('/') + 1); }

}  // namespace

bool IsRunning(const std::string& service) {
  return Flag(*ReadState(), FlagOf(service, "running").to_string().c_str(), false);
}

void SetRunning(const std::string& service, bool running) { SetFlag(service, "running", running); }

void SetEnabled(const std::string& service, bool enabled) { SetFlag(service, "enabled", enabled); }

void SwitchByAgent(const std::string& service, bool running) {
  SetRunning(service, running);
  if (service != SSH_SERVICE) return;
  ChangeState([running](Json& state) {
    Json& rulesets = state["network"]["rulesets"];
    if (rulesets.contains("sshServer")) rulesets["sshServer"]["on"] = running;
  });
}

Outcome ServiceScript(const Words& words) {
  const std::string service = NameOf(words[0]);
  const std::string verb = words.size() == 2 ? words[1] : "";
  if (verb == "status") {
    const bool running = IsRunning(service);
    return {running ? 0 : NOT_RUNNING,
            service + (running ? " is running.\n" : " is not running.\n")};
  }
  if (verb != "start" && verb != "stop" && verb != "restart") {
    return {1, "", "usage: " + words[0] + " start|stop|restart|status\n"};
  }
  SetRunning(service, verb != "stop");
  return {};
}

Outcome AgentsScript(const Words& words) {
  if (words.size() != 2 || (words[1] != "start" && words[1] != "stop")) {
    return {1, "", "usage: services.sh start|stop\n"};
  }
  SetRunning(AGENT_SERVICE, words[1] == "start");
  return {};
}

}  // namespace Lab::Host
