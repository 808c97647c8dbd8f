#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <sstream>
#include <string>
#include <vector>

#include "hostapi/nodeplane/exception.h"
#include "hosts/lab/libraries/coreplanecore/spawn.h"
#include "hosts/lab/state/descriptor.h"

namespace {

using Nodeplane::Lib::NodeplaneException;

std::vector<std::string> Words(const std::string& line) {
  std::istringstream stream(line);
  std::vector<std::string> words;
  for (std::string word; stream >> word;) words.push_back(word);
  return words;
}

std::vector<const char*> Vector(const std::vector<std::string>& words) {
  std::vector<const char*> vector;
  vector.reserve(words.size() + 1);
  for (const std::string& word : words) vector.push_back(word.c_str());
  vector.push_back(nullptr);
  return vector;
}

// A child that died of a signal gives 128 and the signal, as a shell would tell it.
int WaitForEnd(pid_t pid) {
  constexpr int SIGNAL_STATUS = 128;
  int status = 0;
  while (waitpid(pid, &status, 0) < 0) {
    if (errno != EINTR) throw NodeplaneException(std::string("waitpid: ") + strerror(errno));
  }
  return WIFSIGNALED(status) ? SIGNAL_STATUS + WTERMSIG(status) : WEXITSTATUS(status);
}

}  // namespace

namespace Coreplane::Util {

// NOLINTNEXTLINE(performance-unnecessary-value-param): as it is declared for callers.
int Coreplane_Exec(std::string commandLine, bool keepOutput, bool ownGroup, bool keepEnvironment) {
  const std::vector<std::string> words = Words(commandLine);
  if (words.empty()) throw NodeplaneException("nothing to run");
  const std::vector<const char*> argv = Vector(words);
  const char* const nothing[] = {nullptr};
  const Lab::Descriptor null("/dev/null", O_RDWR);
  const int32_t kept[] = {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO};
  const int32_t silent[] = {null.Get(), null.Get(), null.Get()};
  const SpawnRequest request{words[0].c_str(), argv.data(), keepEnvironment ? environ : nothing,
                             keepOutput ? kept : silent, std::size(kept)};
  const SpawnResult child = Lab::SpawnProgram(request, ownGroup);
  if (child.status != 0) {
    throw NodeplaneException(words[0] + ": " + strerror(-child.errorWord));
  }
  return WaitForEnd(child.pid);
}

}  // namespace Coreplane::Util
