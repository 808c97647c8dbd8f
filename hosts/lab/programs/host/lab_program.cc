// Every program of the laboratory host: leaves its line in the trace, does what its path stands for
// and what the scenario told it.

#include <fcntl.h>
#include <signal.h>
#include <sys/auxv.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <cstring>
#include <exception>
#include <thread>

#include "hosts/lab/programs/host/program.h"
#include "hosts/lab/state/programs.h"
#include "hosts/lab/state/trace.h"

namespace Lab::Host {

namespace {

// A program acts by itself or stands before a real one that it becomes.
struct Program {
  const char* path;
  Outcome (*act)(const Words& words);
  const char* realPath;
};

constexpr Program PROGRAMS[] = {
    {"/bin/stew-cmd", StewCmd, nullptr},
    {"/bin/powerOffVms", PowerOffVms, nullptr},
    {"/sbin/powerOffVms", PowerOffVms, nullptr},
    {"/sbin/poweroff", PowerOff, nullptr},
    {"/sbin/reboot", Reboot, nullptr},
    {"/sbin/firmwareConfig.sh", FirmwareConfig, nullptr},
    {"/sbin/backup.sh", Backup, nullptr},
    {"/sbin/ostrelcfg-advcfg", AdvancedConfig, nullptr},
    {"/sbin/ostrelcli", SettingsTool, nullptr},
    {"/sbin/nodecli", SettingsTool, nullptr},
    {"/sbin/corebacktrace", CoreBacktrace, nullptr},
    {"/sbin/services.sh", AgentsScript, nullptr},
    {"/etc/init.d/OstrelShell", ServiceScript, nullptr},
    {"/etc/init.d/SSH", ServiceScript, nullptr},
    {"/sbin/coreping", Coreping, nullptr},
    {"/bin/openssl", nullptr, "/usr/libexec/lab/openssl"},
    {"/bin/less", nullptr, "/usr/libexec/lab/less"},
    {"/usr/lib/halvren/openssh/bin/ssh-keygen", nullptr, "/usr/libexec/lab/ssh-keygen"},
};

constexpr int CANNOT_RUN = 126;
// A script is a file that the shell reads; what it becomes stands below this directory.
constexpr char BEHIND_SCRIPTS[] = "/usr/libexec/lab";

const Program* FindProgram(const char* path) {
  for (const Program& program : PROGRAMS) {
    if (strcmp(program.path, path) == 0) return &program;
  }
  return nullptr;
}

// A caller may have left any of the first three descriptors closed; what is opened next must not
// become one of them.
void OpenStandardDescriptors() {
  int fd = open("/dev/null", O_RDWR);
  while (fd >= 0 && fd <= STDERR_FILENO) fd = dup(fd);
  if (fd > STDERR_FILENO) close(fd);
}

void Write(int fd, const std::string& text) {
  size_t done = 0;
  while (done < text.size()) {
    const ssize_t count = write(fd, text.data() + done, text.size() - done);
    if (count <= 0) return;
    done += static_cast<size_t>(count);
  }
}

bool KeepsRealProgramFromRunning(const ProgramBehaviour& told) {
  return told.skipEffect || told.exitCode || told.signal || told.standardOutput ||
         told.standardError;
}

Outcome Run(const Program& program, const Words& words, char** argv, const ProgramBehaviour& told) {
  if (program.act != nullptr) return told.skipEffect ? Outcome{} : program.act(words);
  if (KeepsRealProgramFromRunning(told)) return {};
  execv(program.realPath, argv);
  return {CANNOT_RUN, "", std::string(program.realPath) + ": " + strerror(errno) + "\n"};
}

int End(const Outcome& outcome, const ProgramBehaviour& told) {
  Write(STDOUT_FILENO, told.standardOutput.value_or(outcome.standardOutput));
  Write(STDERR_FILENO, told.standardError.value_or(outcome.standardError));
  if (const int fatal = told.signal.value_or(outcome.signal); fatal != 0) {
    signal(fatal, SIG_DFL);
    raise(fatal);
  }
  return told.exitCode.value_or(outcome.exitCode);
}

int Main(const char* path, char** argv) {
  Words words;
  for (char** word = argv; *word != nullptr; ++word) words.emplace_back(*word);
  if (strncmp(path, BEHIND_SCRIPTS, strlen(BEHIND_SCRIPTS)) == 0 && !words.empty()) {
    path += strlen(BEHIND_SCRIPTS);
    words[0] = path;
  }
  const Program* program = FindProgram(path);
  if (program == nullptr || words.empty()) {
    fprintf(stderr, "%s: no program of this host\n", path);
    return CANNOT_RUN;
  }
  TraceProgram(path, words);
  const auto state = ReadState();
  const ProgramBehaviour told =
      TakeProgramBehaviour(*state, path, {words.begin() + 1, words.end()});
  std::this_thread::sleep_for(std::chrono::milliseconds(told.delayMs));
  return End(Run(*program, words, argv, told), told);
}

}  // namespace

}  // namespace Lab::Host

int main(int, char** argv) {
  Lab::Host::OpenStandardDescriptors();
  // The path as it was started by, which argument 0 and a resolved link do not tell.
  const char* path =
      reinterpret_cast<const char*>(getauxval(AT_EXECFN));  // NOLINT(performance-no-int-to-ptr)
  try {
    return Lab::Host::Main(path, argv);
  } catch (const std::exception& error) {
    fprintf(stderr, "%s: %s\n", path, error.what());
    return 1;
  }
}
