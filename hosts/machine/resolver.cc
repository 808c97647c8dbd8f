#include <arpa/inet.h>

#include "hosts/machine/readers.h"
#include "hosts/machine/text_file.h"

namespace Machine {

namespace {

// As many as the C library asks.
constexpr size_t MAX_NAME_SERVERS = 3;
// Where systemd's resolver listens on the machine itself, and where it tells whom it asks.
constexpr char STUB_ADDRESS[] = "127.0.0.53";
constexpr char STUB_FILE[] = "/run/systemd/resolve/resolv.conf";

bool IsAddress(const std::string& text) {
  in6_addr address{};
  const std::string unscoped = text.substr(0, text.find('%'));
  return inet_pton(AF_INET, text.c_str(), &address) == 1 ||
         inet_pton(AF_INET6, unscoped.c_str(), &address) == 1;
}

std::string WithoutFinalDot(std::string name) {
  if (name.ends_with('.')) name.pop_back();
  return name;
}

// "search" and "domain" replace one another: the last line of the two holds.
std::vector<std::string> ParseDomains(const std::vector<std::string>& words) {
  std::vector<std::string> domains;
  for (size_t i = 1; i < words.size(); ++i) {
    const std::string domain = WithoutFinalDot(words[i]);
    if (!domain.empty()) domains.push_back(domain);
    if (words[0] == "domain") break;
  }
  return domains;
}

Resolver ReadResolverFile(const std::string& path) {
  Resolver resolver;
  for (const std::string& line : ReadLines(path)) {
    const std::vector<std::string> words = SplitWords(line);
    // A keyword counts in the first column only; comments start there as well.
    if (words.size() < 2 || !line.starts_with(words[0])) continue;
    if (words[0] == "search" || words[0] == "domain") resolver.searchDomains = ParseDomains(words);
    if (words[0] == "nameserver" && IsAddress(words[1]) &&
        resolver.nameServers.size() < MAX_NAME_SERVERS) {
      resolver.nameServers.push_back(words[1]);
    }
  }
  return resolver;
}

// The domain that /etc/hosts gives the host: from a line that holds "name.domain".
std::string FindDomainInHosts(const std::string& path, const std::string& name) {
  for (const std::string& line : ReadLines(path)) {
    const std::vector<std::string> words = SplitWords(line.substr(0, line.find('#')));
    for (size_t i = 1; i < words.size(); ++i) {
      if (words[i].starts_with(name + "."))
        return WithoutFinalDot(words[i].substr(name.size() + 1));
    }
  }
  return {};
}

std::string FindDomain(const Sources& sources, const std::string& name) {
  std::string domain = FindDomainInHosts(sources.root + "/etc/hosts", name);
  if (!domain.empty()) return domain;
  const std::vector<std::string> search = ReadResolver(sources).searchDomains;
  return search.empty() ? std::string() : search.front();
}

}  // namespace

Resolver ReadResolver(const Sources& sources) {
  Resolver resolver = ReadResolverFile(sources.root + "/etc/resolv.conf");
  if (resolver.nameServers != std::vector<std::string>{STUB_ADDRESS}) return resolver;
  Resolver asked = ReadResolverFile(sources.root + STUB_FILE);
  if (!asked.nameServers.empty()) return asked;
  return resolver;
}

HostName ReadHostName(const Sources& sources) {
  const std::string full = ReadFirstLine(sources.root + "/proc/sys/kernel/hostname");
  HostName hostName;
  const size_t dot = full.find('.');
  if (dot != 0 && !full.empty() && full != "(none)") hostName.name = full.substr(0, dot);
  hostName.domain = dot != std::string::npos ? WithoutFinalDot(full.substr(dot + 1))
                                             : FindDomain(sources, hostName.name);
  return hostName;
}

bool ReadIpv6Enabled(const Sources& sources) {
  return ReadFirstLine(sources.root + "/proc/sys/net/ipv6/conf/all/disable_ipv6") == "0";
}

}  // namespace Machine
