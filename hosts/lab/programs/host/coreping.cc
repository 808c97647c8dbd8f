// coreping ADDRESS [-I NIC] [-c COUNT]: whether an address answers, by the state's table "ping",
//   ADDRESS: {exit, signal, delayMs}
// Without an entry the host's own addresses and its gateways answer, and nothing else does.

#include <sys/time.h>
#include <syslog.h>

#include <chrono>
#include <optional>
#include <thread>

#include "hostapi/nodeplane/ip_address.h"
#include "hosts/lab/programs/host/program.h"

namespace Lab::Host {

namespace {

using Nodeplane::Network::Ipv6Address;

constexpr int NO_ANSWER = 1;
constexpr int USAGE = 2;

// One text for each address: IPv6 in its shortest form and without a scope.
std::string Canonical(const std::string& address) {
  return Ipv6Address::IsValidAddress(address) ? Ipv6Address(address).GetStringAddress() : address;
}

bool Is(const Json& node, const std::string& address) {
  return node.is_string() && Canonical(node.get<std::string>()) == address;
}

bool IsOwn(const Json& nic, const std::string& address) {
  const Json running = nic.value("running", Json::object());
  if (Is(running.value("address", Json()), address)) return true;
  for (const Json& entry : running.value("ipv6", Json::array())) {
    const std::string network = Text(entry, "/address", "");
    if (Canonical(network.substr(0, network.find('/'))) == address) return true;
  }
  return false;
}

bool IsOnNetwork(const Json& nic) {
  return Flag(nic, "/enabled", true) && Number(nic, "/connection/type", 0) > 0;
}

bool Answers(const Json& state, const std::string& address) {
  const Json& nics = Object(state, "/network/kernelNics");
  for (const Json& nic : nics) {
    if (IsOwn(nic, address)) return true;
  }
  const std::string management = Text(state, "/network/management", "");
  if (!nics.contains(management) || !IsOnNetwork(nics[management])) return false;
  const Json& stack = Object(state, "/network/stacks/defaultTcpipStack/running");
  return Is(stack.value("gateway4", Json()), address) ||
         Is(stack.value("gateway6", Json()), address);
}

Json Entry(const Json& state, const std::string& address) {
  const Json entries = state.value("ping", Json::object());
  for (const auto& [known, entry] : entries.items()) {
    if (Canonical(known) == address) return entry;
  }
  return {{"exit", Answers(state, address) ? 0 : NO_ANSWER}};
}

// The address to ask; none when the arguments are not understood. Options and their values:
// "-I" "NIC", "-c" "COUNT" or "-cCOUNT".
std::optional<std::string> ReadArguments(const Words& words, const Json& state) {
  std::optional<std::string> address;
  for (size_t i = 1; i < words.size(); ++i) {
    const std::string& word = words[i];
    if (word == "-I" || word == "-c") {
      if (++i == words.size()) return std::nullopt;
      if (word == "-I" && !Object(state, "/network/kernelNics").contains(words[i])) {
        return std::nullopt;
      }
    } else if (!word.starts_with("-c")) {
      if (word.starts_with("-") || address) return std::nullopt;
      address = word;
    }
  }
  return address;
}

// The last thing before the end, with its time: the log's own one counts in seconds.
void LogEnd(const std::string& address, const Outcome& outcome) {
  timeval now{};
  gettimeofday(&now, nullptr);
  openlog("coreping", 0, LOG_USER);
  syslog(LOG_INFO, "coreping %s ended with %s%d at %lld.%06lld", address.c_str(),
         outcome.signal != 0 ? "signal " : "",
         outcome.signal != 0 ? outcome.signal : outcome.exitCode,
         static_cast<long long>(now.tv_sec), static_cast<long long>(now.tv_usec));
}

}  // namespace

Outcome Coreping(const Words& words) {
  const auto state = ReadState();
  const std::optional<std::string> address = ReadArguments(words, *state);
  if (!address) return {USAGE, "", "usage: coreping ADDRESS [-I NIC] [-c COUNT]\n"};
  const Json entry = Entry(*state, Canonical(*address));
  std::this_thread::sleep_for(std::chrono::milliseconds(Number(entry, "/delayMs", 0)));
  Outcome outcome;
  outcome.exitCode = static_cast<int>(Number(entry, "/exit", 0));
  outcome.signal = static_cast<int>(Number(entry, "/signal", 0));
  LogEnd(*address, outcome);
  return outcome;
}

}  // namespace Lab::Host
