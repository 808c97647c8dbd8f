// Takes a live core of a service: corebacktrace -w -n SERVICE -o NAME -d DIRECTORY. The "%" in the
// name becomes the number of the core.

#include <sys/stat.h>

#include "hosts/lab/programs/host/program.h"
#include "hosts/lab/programs/host/services.h"
#include "hosts/lab/state/files.h"

namespace Lab::Host {

namespace {

std::string FreePath(const std::string& directory, const std::string& name) {
  const size_t mark = name.find('%');
  for (int number = 1;; ++number) {
    std::string path = directory + name;
    if (mark != std::string::npos) {
      path = directory + name.substr(0, mark) + std::to_string(number) + name.substr(mark + 1);
    }
    struct stat status {};
    if (mark == std::string::npos || stat(path.c_str(), &status) != 0) return path;
  }
}

}  // namespace

Outcome CoreBacktrace(const Words& words) {
  if (words.size() != 8 || words[1] != "-w" || words[2] != "-n" || words[4] != "-o" ||
      words[6] != "-d") {
    return {1, "", "usage: corebacktrace -w -n SERVICE -o NAME -d DIRECTORY\n"};
  }
  if (!IsRunning(words[3])) return {1, "", words[3] + " does not run.\n"};
  ReplaceFile(FreePath(words[7], words[5]), "A live core of " + words[3] + ".\n");
  return {};
}

}  // namespace Lab::Host
