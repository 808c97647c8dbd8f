#include "console/hostops/command_runner.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstddef>
#include <filesystem>
#include <set>
#include <thread>

#include "tests/hostops/command_run.h"

namespace Tarnel::Testing {
namespace {

constexpr size_t MEGABYTE = 1 << 20;
// A run that has to end by itself does so within this time, also on a busy machine.
constexpr double SOON = 10;

TEST(RunCommand, GivesCodeAndTheFirstBytes) {
  struct {
    const char* script;
    size_t inputSize;
    int32_t capacity;
    int32_t code;
    std::string out;
    std::string err;
  } const rows[] = {
      {"exit 255", 0, 255, 255, "", ""},
      {"echo last; kill -9 $$", 0, 255, -1, "last\n", ""},
      {"echo one; echo two >&2; exit 7", 0, 255, 7, "one\n", "two\n"},
      {"printf 12345", 0, 5, 0, "12345", ""},
      {"printf 123456; printf 123456 >&2; exit 4", 0, 5, 4, "12345", "12345"},
      {"echo text; exit 3", 0, 0, 3, "", ""},
      {"yes | head -c 900000; yes n | head -c 900000 >&2; exit 5", 0, 4, 5, "y\ny\n", "n\nn\n"},
      {"yes | head -c 900000; exit 6", 0, -1, 6, "", ""},
      {"for i in 1 2 3; do echo $i; sleep 0.01; done", 0, 255, 0, "1\n2\n3\n", ""},
      {"exec >&- 2>&-; sleep 0.05; exit 8", 0, 255, 8, "", ""},
      {"cat; exit 9", 0, 255, 9, "", ""},
      {"cat", MEGABYTE, 3, 0, "iii", ""},
      {"yes | head -c 300000; wc -c", MEGABYTE, 4, 0, "y\ny\n", ""},
      {"exec <&-; sleep 0.05; exit 11", MEGABYTE, 255, 11, "", ""},
      // A descendant keeps the pipes, silently or with a flood, when the child has long ended.
      {"sleep 20 & echo left; exit 12", 0, 255, 12, "left\n", ""},
      {"yes >&2 & exit 13", 0, 0, 13, "", ""},
  };
  for (const auto& row : rows) {
    // With a limit and without one the child is served alike.
    for (const int32_t timeout : {-1, 60}) {
      const CommandResult result =
          RunShell(row.script, row.capacity, timeout, std::string(row.inputSize, 'i'));
      EXPECT_EQ(result.code, row.code) << row.script;
      EXPECT_EQ(result.out, row.out) << row.script;
      EXPECT_EQ(result.err, row.err) << row.script;
      EXPECT_LT(result.seconds, SOON) << row.script;
    }
  }
}

using Lines = std::vector<std::string>;

std::string OpenDescriptors() {
  std::set<std::string> names;
  for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fd")) {
    names.insert(entry.path().filename());
  }
  return testing::PrintToString(names);
}

TEST(RunCommand, KillsAtTheLimitAndDeliversWhatCame) {
  const std::string before = OpenDescriptors();
  const Log log;
  const CommandResult result = RunShell("echo begun; echo bad >&2; exec sleep 60", 255, 1);
  EXPECT_EQ(result.code, -1);
  EXPECT_EQ(result.out + result.err, "begun\nbad\n");
  EXPECT_GE(result.seconds, 1.0);
  EXPECT_LT(result.seconds, 1.0 + SOON);
  EXPECT_EQ(waitpid(-1, nullptr, WNOHANG), -1) << "the child was not reaped";
  EXPECT_EQ(OpenDescriptors(), before);
  EXPECT_EQ(Logged(log), Lines({"user.warn Killing process because 1 seconds timeout expired",
                                "user.err Run Command did not terminate normally"}));
}

TEST(RunCommand, KillsWhatStops) {
  sigset_t childSignal;
  sigemptyset(&childSignal);
  sigaddset(&childSignal, SIGCHLD);
  pthread_sigmask(SIG_BLOCK, &childSignal, nullptr);
  const Log log;
  const CommandResult result = RunShell("echo begun; kill -TSTP $$; echo ended", 255, 10);
  pthread_sigmask(SIG_UNBLOCK, &childSignal, nullptr);
  EXPECT_EQ(result.code, -1);
  EXPECT_EQ(result.out, "begun\n");
  EXPECT_EQ(waitpid(-1, nullptr, WNOHANG), -1) << "the child was not reaped";
  EXPECT_EQ(Logged(log), Lines({"user.err Run Command did not terminate normally"}));
}

TEST(RunShell, GoesOnAfterAStop) {
  const int status = Tarnel::RunShell("kill -TSTP $$; exit 3");
  EXPECT_TRUE(WIFEXITED(status));
  EXPECT_EQ(WEXITSTATUS(status), 3);
}

TEST(RunCommand, AFailedStartGivesNothing) {
  const std::string before = OpenDescriptors();
  const Log log;
  for (const char* path : {"/no/such/program", "/etc/passwd", "/"}) {
    errno = 0;
    const CommandResult result = RunPath(path, {"program"});
    EXPECT_EQ(result.code, -1) << path;
    EXPECT_NE(errno, 0) << path;
    EXPECT_EQ(result.out + result.err, "") << path;
  }
  // Nor does anything start without three pipes.
  rlimit limit{};
  getrlimit(RLIMIT_NOFILE, &limit);
  const int next = dup(STDIN_FILENO);
  close(next);
  for (const int room : {0, 1, 3, 5}) {
    const rlimit tight{static_cast<rlim_t>(next + room), limit.rlim_max};
    setrlimit(RLIMIT_NOFILE, &tight);
    EXPECT_EQ(RunShell("exit 0").code, -1) << "room for " << room;
  }
  setrlimit(RLIMIT_NOFILE, &limit);
  EXPECT_EQ(OpenDescriptors(), before);
  EXPECT_EQ(Logged(log), Lines());
}

// The child is a tool that looks at itself; the console's own peculiarities must not reach it.
class ChildView : public testing::Test {
 protected:
  void SetUp() override {
    sigset_t blocked;
    sigfillset(&blocked);
    pthread_sigmask(SIG_BLOCK, &blocked, &_mask);
    for (const int signal : IGNORED) std::signal(signal, SIG_IGN);
    // Inheritable, and above the ones that a start would use.
    _extra = fcntl(STDIN_FILENO, F_DUPFD, 40);
  }
  void TearDown() override {
    close(_extra);
    for (const int signal : IGNORED) std::signal(signal, SIG_DFL);
    pthread_sigmask(SIG_SETMASK, &_mask, nullptr);
  }

  // Without a shell, so that the tool is the very child.
  static std::string Tool(std::vector<const char*> argv) {
    return RunPath("/bin/busybox", std::move(argv)).out;
  }

 private:
  static constexpr int IGNORED[] = {SIGHUP, SIGPIPE, SIGTSTP};
  sigset_t _mask{};
  int _extra = -1;
};

TEST_F(ChildView, EmptyMaskAndDefaultDispositions) {
  for (const char* line : {"SigBlk:\t", "SigIgn:\t", "SigCgt:\t"}) {
    const std::string text = Tool({"grep", line, "/proc/self/status"});
    ASSERT_TRUE(text.starts_with(line)) << text;
    // 32 and 33 are the C library's.
    EXPECT_EQ(std::stoull(text.substr(8), nullptr, 16) & ~(UINT64_C(3) << 31), 0U) << text;
  }
}

TEST_F(ChildView, OwnArgumentsOneVariableAndThreePipes) {
  EXPECT_EQ(Tool({"cat", "/proc/self/cmdline"}), std::string("cat\0/proc/self/cmdline\0", 23));
  EXPECT_EQ(Tool({"cat", "/proc/self/environ"}), std::string("PYTHONHOME=/\0", 13));
  // 3 is the directory that the tool itself reads.
  EXPECT_EQ(Tool({"ls", "/proc/self/fd"}), "0\n1\n2\n3\n");
  for (const char* link : {"/proc/self/fd/0", "/proc/self/fd/1", "/proc/self/fd/2"}) {
    EXPECT_EQ(Tool({"readlink", link}).substr(0, 6), "pipe:[") << link;
  }
}

// Makes pidfd_open fail as on a kernel without it, for this process and for good.
void ForbidPidfd() {
  sock_filter program[] = {
      BPF_STMT(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr)),
      BPF_JUMP(BPF_JMP | BPF_JEQ | BPF_K, SYS_pidfd_open, 0, 1),
      BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ERRNO | ENOSYS),
      BPF_STMT(BPF_RET | BPF_K, SECCOMP_RET_ALLOW),
  };
  const sock_fprog filter{std::size(program), program};
  prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0);
  if (prctl(PR_SET_SECCOMP, SECCOMP_MODE_FILTER, &filter) != 0 ||
      syscall(SYS_pidfd_open, getpid(), 0) != -1) {
    _exit(77);
  }
}

// The number of the first step that went wrong, 0 for none.
int RunWithoutPidfd() {
  ForbidPidfd();
  const CommandResult untimed = RunShell("yes | head -c 300000; sleep 0.1; exit 21", 2);
  if (untimed.code != 21 || untimed.out != "y\n") return 1;
  const CommandResult timed = RunShell("sleep 0.1; exit 22", 255, 60);
  if (timed.code != 22 || timed.seconds > SOON) return 2;
  const CommandResult killed = RunShell("echo begun; exec yes >&2", 4, 1);
  if (killed.code != -1 || killed.out + killed.err != "beguy\ny\n") return 3;
  return waitpid(-1, nullptr, WNOHANG) == -1 ? 0 : 4;
}

TEST(RunCommand, WorksWhereTheKernelDoesNotTellOfTheEnd) {
  EXPECT_EXIT(_exit(RunWithoutPidfd()), testing::ExitedWithCode(0), "");
}

TEST(ReadFully, CollectsPiecesUpToTheSizeOrTheEnd) {
  for (const int flags : {0, O_NONBLOCK}) {
    int ends[2];
    ASSERT_EQ(pipe2(ends, flags), 0);
    std::thread writer([&ends] {
      for (const char piece : std::string("abcdef")) {
        std::this_thread::sleep_for(std::chrono::milliseconds(2));
        EXPECT_EQ(write(ends[1], &piece, 1), 1);
      }
      close(ends[1]);
    });
    std::string buffer(8, '-');
    EXPECT_EQ(ReadFully(ends[0], buffer.data(), 4), 4);
    EXPECT_EQ(ReadFully(ends[0], buffer.data() + 4, 4), 2) << "the end of file ends the reading";
    EXPECT_EQ(buffer, "abcdef--");
    writer.join();
    close(ends[0]);
    EXPECT_EQ(ReadFully(ends[0], buffer.data(), 8), 0) << "an error ends the reading";
  }
}

}  // namespace
}  // namespace Tarnel::Testing
