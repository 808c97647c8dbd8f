#include <strings.h>

#include <sstream>

#include "hostapi/coreplane/ip_services.h"
#include "hosts/lab/libraries/perform.h"
#include "hosts/lab/state/files.h"

namespace Coreplane::Network {

namespace {

constexpr char HOSTS[] = "/etc/hosts";

// The line without the name; as it was when it does not hold the name, nothing when it holds no
// other.
std::string WithoutName(const std::string& line, const std::string& hostname) {
  const size_t comment = std::min(line.find('#'), line.size());
  std::istringstream words(line.substr(0, comment));
  std::string address;
  words >> address;
  std::string names;
  bool found = false;
  for (std::string name; words >> name;) {
    const bool same = strcasecmp(name.c_str(), hostname.c_str()) == 0;
    found = found || same;
    if (!same) names += (names.empty() ? "" : " ") + name;
  }
  if (!found) return line + "\n";
  if (names.empty()) return "";
  return address + "\t" + names + (comment < line.size() ? " " + line.substr(comment) : "") + "\n";
}

}  // namespace

void HostsFile::RemoveEntryByHostName(const std::string& hostname) {
  Lab::PerformBesideState({"HostsFile::RemoveEntryByHostName", "", {hostname}}, [&hostname] {
    std::istringstream lines(Lab::ReadFile(HOSTS));
    std::string kept;
    for (std::string line; std::getline(lines, line);) kept += WithoutName(line, hostname);
    Lab::ReplaceFile(HOSTS, kept);
  });
}

}  // namespace Coreplane::Network
