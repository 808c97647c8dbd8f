#pragma once

#include <sys/types.h>

#include <cstddef>
#include <cstdint>
#include <string>

// Services of the host's kernel.

// What Kernel_Spawn starts.
struct SpawnRequest {
  // File of the program; there is no search in PATH.
  const char* path;
  // Null-terminated; entry 0 is the program's short name.
  const char* const* argv;
  // Null-terminated; the whole environment of the child.
  const char* const* envp;
  // Descriptors of the caller that become 0, 1, 2 ... of the child. It inherits no others.
  const int32_t* descriptors;
  int32_t descriptorCount;
  // Unless -1, a descriptor of the caller that is its controlling terminal: the child leads a
  // process group of its own, which becomes that terminal's foreground group.
  int32_t terminal = -1;
};

struct SpawnResult {
  // 0 when the child was started.
  int32_t status;
  // 0, or an errno value with its sign turned.
  int32_t errorWord;
  // Process id of the child, valid with status 0.
  pid_t pid;
};

// Starts a child with an empty signal mask and default dispositions for all signals.
SpawnResult Kernel_Spawn(const SpawnRequest& request);

// Nodes of the kernel's system information tree.
enum SysinfoNode {
  SYSNODE_NODE_system_version,
  SYSNODE_NODE_system_bootOption,
};

// Content of SYSNODE_NODE_system_version. The texts are NUL-terminated; the reserved bytes are the
// kernel's.
struct SystemVersionRecord {
  char productName[32];
  char version[64];
  char releaseType[32];
  char buildText[164];
  uint32_t buildNumber;
  uint8_t reserved[16];
};
static_assert(offsetof(SystemVersionRecord, version) == 32);
static_assert(offsetof(SystemVersionRecord, releaseType) == 96);
static_assert(offsetof(SystemVersionRecord, buildText) == 128);
static_assert(offsetof(SystemVersionRecord, buildNumber) == 292);
static_assert(sizeof(SystemVersionRecord) == 312);

// Content of SYSNODE_NODE_system_bootOption.
struct SystemBootOptionRecord {
  // 1: the host runs in audit mode and forgets its configuration at the next start.
  uint8_t auditMode;
  uint8_t reserved[3];
};
static_assert(sizeof(SystemBootOptionRecord) == 4);

// Fills the buffer with the node's record, whose size must be the given one. 0 on success, else an
// error code.
int Sysnode_Get(SysinfoNode node, void* buffer, size_t size);

namespace Coreplane::Util {

// A parameter list for nodes that take one; none that the console reads does.
struct SysinfoParams;

class SysinfoUtil {
 public:
  // Sysnode_Get for a node with parameters (null: none); throws NodeplaneException on failure.
  static void SysinfoGet(SysinfoNode node, void* buffer, size_t size, const SysinfoParams* params);
};

// Runs a command line, words with blanks between them, to its end. The environment is empty and the
// three standard descriptors are /dev/null unless a flag says otherwise: with keepOutput they are
// the caller's, with ownGroup the child leads a process group of its own, with keepEnvironment it
// has the caller's environment. Gives the exit code, 0 for success; throws NodeplaneException when
// the program cannot be started.
int Coreplane_Exec(std::string commandLine, bool keepOutput, bool ownGroup, bool keepEnvironment);

}  // namespace Coreplane::Util
