#include "hostops/command_runner.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstddef>
#include <filesystem>
#include <thread>

#include "tests/hostops/command_run.h"

namespace Tarnel::Testing {
namespace {

constexpr size_t MEGABYTE = 1 << 20;
// A run that has to end by itself does so within this time, also on a busy machine.
constexpr double SOON = 10;

std::string Repeat(const char* text, size_t count) {
  std::string repeated;
  while (count-- > 0) {
    repeated += text;
  }
  return repeated;
}

struct RunCase {
  const char* name;
  const char* script;
  int32_t capacity;
  size_t inputSize;
  int32_t code;
  std::string out;
  std::string err;
};

class RunCommandTable : public testing::TestWithParam<RunCase> {};

TEST_P(RunCommandTable, GivesCodeAndTheFirstBytes) {
  const RunCase& row = GetParam();
  // With a limit and without one the child is served alike.
  for (const int32_t timeout : {-1, 0, 60}) {
    const std::string input(row.inputSize, 'i');
    const CommandResult result = RunShell(row.script, row.capacity, timeout, input);
    EXPECT_EQ(result.code, row.code) << "with limit " << timeout;
    EXPECT_EQ(result.out, row.out) << "with limit " << timeout;
    EXPECT_EQ(result.err, row.err) << "with limit " << timeout;
    EXPECT_LT(result.seconds, SOON);
  }
}

INSTANTIATE_TEST_SUITE_P(
    All, RunCommandTable,
    testing::Values(
        RunCase{"success", "exit 0", 255, 0, 0, "", ""},
        RunCase{"code_1", "exit 1", 255, 0, 1, "", ""},
        RunCase{"code_255", "exit 255", 255, 0, 255, "", ""},
        RunCase{"killed", "echo last; kill -9 $$", 255, 0, -1, "last\n", ""},
        RunCase{"ended_by_a_signal", "kill -15 $$", 255, 0, -1, "", ""},
        RunCase{"both_outputs", "echo one; echo two >&2; exit 7", 255, 0, 7, "one\n", "two\n"},
        RunCase{"exactly_full", "printf 12345", 5, 0, 0, "12345", ""},
        RunCase{"one_over", "printf 123456", 5, 0, 0, "12345", ""},
        RunCase{"no_room", "echo text; exit 3", 0, 0, 3, "", ""},
        RunCase{"300_into_255", "printf %0300d 0; exit 4", 255, 0, 4, std::string(255, '0'), ""},
        RunCase{"megabytes", "yes | head -c 3000000; yes n | head -c 3000000 >&2; exit 5", 254, 0,
                5, Repeat("y\n", 127), Repeat("n\n", 127)},
        RunCase{"not_captured", "yes | head -c 3000000; exit 6", -1, 0, 6, "", ""},
        RunCase{"in_pieces", "for i in 1 2 3; do echo $i; sleep 0.05; done", 255, 0, 0, "1\n2\n3\n",
                ""},
        RunCase{"closes_its_outputs", "exec >&- 2>&-; sleep 0.1; exit 8", 255, 0, 8, "", ""},
        RunCase{"input_is_at_its_end", "cat; exit 9", 255, 0, 9, "", ""},
        RunCase{"input", "cat", 5, 4, 0, "iiii", ""},
        RunCase{"input_comes_back", "cat", 3, MEGABYTE, 0, "iii", ""},
        RunCase{"writes_before_it_reads", "yes | head -c 300000; wc -c", 4, MEGABYTE, 0, "y\ny\n",
                ""},
        RunCase{"input_not_read", "exit 10", 255, MEGABYTE, 10, "", ""},
        RunCase{"input_closed_early", "exec <&-; sleep 0.1; exit 11", 255, MEGABYTE, 11, "", ""},
        // A descendant keeps the pipes, silently or with a flood, when the child has long ended.
        RunCase{"silent_heir", "sleep 20 & echo left; exit 12", 255, 0, 12, "left\n", ""},
        RunCase{"flooding_heir", "yes >&2 & exit 13", 0, 0, 13, "", ""}),
    [](const auto& row) { return std::string(row.param.name); });

using Lines = std::vector<std::string>;
constexpr char KILLED_LINE[] = "user.warn Killing process because 1 seconds timeout expired";
constexpr char NOT_NORMAL_LINE[] = "user.err Run Command did not terminate normally";

TEST(RunCommand, KillsAtTheLimitAndDeliversWhatCame) {
  const Log log;
  const CommandResult result = RunShell("echo begun; echo bad >&2; exec sleep 60", 255, 1);
  EXPECT_EQ(result.code, -1);
  EXPECT_EQ(result.out, "begun\n");
  EXPECT_EQ(result.err, "bad\n");
  EXPECT_GE(result.seconds, 1.0);
  EXPECT_LT(result.seconds, 1.0 + SOON);
  EXPECT_EQ(waitpid(-1, nullptr, WNOHANG), -1) << "the child was not reaped";
  EXPECT_EQ(errno, ECHILD);
  EXPECT_EQ(Logged(log), Lines({KILLED_LINE, NOT_NORMAL_LINE}));
}

TEST(RunCommand, LogsAnAbnormalEndAndNothingElse) {
  const Log log;
  EXPECT_EQ(RunShell("exit 255").code, 255);
  EXPECT_EQ(RunPath("/no/such/program", {"program"}).code, -1);
  EXPECT_EQ(Logged(log), Lines());
  EXPECT_EQ(RunShell("kill -9 $$").code, -1);
  EXPECT_EQ(Logged(log), Lines({NOT_NORMAL_LINE}));
}

TEST(RunCommand, KillsAFloodingChildAtTheLimit) {
  const CommandResult result = RunPath("/bin/busybox", {"yes"}, 4, 1);
  EXPECT_EQ(result.code, -1);
  EXPECT_EQ(result.out, "y\ny\n");
  EXPECT_LT(result.seconds, 1.0 + SOON);
}

std::string OpenDescriptors() {
  std::vector<std::string> names;
  for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fd")) {
    names.push_back(entry.path().filename());
  }
  std::sort(names.begin(), names.end());
  std::string all;
  for (const std::string& name : names) {
    all += name + " ";
  }
  return all;
}

TEST(RunCommand, KeepsNoDescriptorOpen) {
  const std::string before = OpenDescriptors();
  EXPECT_EQ(RunShell("exit 0").code, 0);
  EXPECT_EQ(RunShell("kill -9 $$").code, -1);
  EXPECT_EQ(RunShell("exec sleep 60", 255, 1).code, -1);
  EXPECT_EQ(RunPath("/no/such/program", {"program"}).code, -1);
  EXPECT_EQ(OpenDescriptors(), before);
}

TEST(RunCommand, AFailedStartGivesNothing) {
  for (const char* path : {"/no/such/program", "/etc/passwd", "/"}) {
    errno = 0;
    const CommandResult result = RunPath(path, {"program"});
    EXPECT_EQ(result.code, -1) << path;
    EXPECT_NE(errno, 0) << path;
    EXPECT_EQ(result.out + result.err, "") << path;
  }
}

// Leaves room for so many more descriptors while it lives.
class DescriptorLimit {
 public:
  explicit DescriptorLimit(int room) {
    getrlimit(RLIMIT_NOFILE, &_before);
    const int next = open("/dev/null", O_RDONLY | O_CLOEXEC);
    close(next);
    const rlimit limit{static_cast<rlim_t>(next + room), _before.rlim_max};
    setrlimit(RLIMIT_NOFILE, &limit);
  }
  ~DescriptorLimit() { setrlimit(RLIMIT_NOFILE, &_before); }
  DescriptorLimit(const DescriptorLimit&) = delete;
  DescriptorLimit& operator=(const DescriptorLimit&) = delete;

 private:
  rlimit _before{};
};

TEST(RunCommand, WithoutThreePipesNothingStarts) {
  const std::string before = OpenDescriptors();
  for (const int room : {0, 1, 2, 3, 4, 5}) {
    const DescriptorLimit limit(room);
    EXPECT_EQ(RunShell("exit 0").code, -1) << "room for " << room;
  }
  EXPECT_EQ(OpenDescriptors(), before);
}

// The child is a tool that looks at itself; the console's own peculiarities must not reach it.
class ChildView : public testing::Test {
 protected:
  void SetUp() override {
    sigset_t blocked;
    sigemptyset(&blocked);
    for (const int signal : {SIGINT, SIGQUIT, SIGTERM, SIGUSR1, SIGUSR2, SIGWINCH}) {
      sigaddset(&blocked, signal);
    }
    pthread_sigmask(SIG_BLOCK, &blocked, &_mask);
    for (const int signal : {SIGHUP, SIGPIPE, SIGTSTP}) {
      signal_t previous = std::signal(signal, SIG_IGN);
      _dispositions.emplace_back(signal, previous);
    }
    // Inheritable, and above the ones that a start would use.
    _extra = fcntl(STDIN_FILENO, F_DUPFD, 40);
    setenv("TERMINFO", "/somewhere", 1);
  }
  void TearDown() override {
    unsetenv("TERMINFO");
    close(_extra);
    for (const auto& [signal, disposition] : _dispositions) {
      std::signal(signal, disposition);
    }
    pthread_sigmask(SIG_SETMASK, &_mask, nullptr);
  }

 private:
  using signal_t = void (*)(int);
  sigset_t _mask{};
  std::vector<std::pair<int, signal_t>> _dispositions;
  int _extra = -1;
};

// The signal set in one line of the tool's own status, without 32 and 33, which are the C
// library's.
std::string SignalsOfChild(const char* line) {
  const std::string text = RunTool({"grep", line, "/proc/self/status"}).out;
  EXPECT_EQ(text.rfind(line, 0), 0U) << text;
  const uint64_t signals = std::stoull(text.substr(text.find('\t')), nullptr, 16);
  return std::to_string(signals & ~(UINT64_C(3) << 31));
}

TEST_F(ChildView, EmptyMaskAndDefaultDispositions) {
  for (const char* line : {"SigBlk", "SigIgn", "SigCgt"}) {
    EXPECT_EQ(SignalsOfChild(line), "0") << line;
  }
}

TEST_F(ChildView, OneEntryInItsEnvironment) {
  EXPECT_EQ(RunTool({"cat", "/proc/self/environ"}).out, std::string("PYTHONHOME=/\0", 13));
}

TEST_F(ChildView, ThreePipesAndNoOtherDescriptor) {
  // 3 is the directory that the tool itself reads.
  EXPECT_EQ(RunTool({"ls", "/proc/self/fd"}).out, "0\n1\n2\n3\n");
  for (const char* link : {"/proc/self/fd/0", "/proc/self/fd/1", "/proc/self/fd/2"}) {
    EXPECT_EQ(RunTool({"readlink", link}).out.substr(0, 6), "pipe:[") << link;
  }
}

TEST_F(ChildView, ArgumentZeroIsTheCallers) {
  const CommandResult result = RunPath("/bin/busybox", {"cat", "/proc/self/cmdline"});
  EXPECT_EQ(result.out, std::string("cat\0/proc/self/cmdline\0", 23));
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

int RunWithoutPidfd() {
  ForbidPidfd();
  const CommandResult untimed = RunShell("yes | head -c 300000; sleep 0.1; exit 21", 2);
  const CommandResult timed = RunShell("sleep 0.1; exit 22", 255, 60);
  const CommandResult killed = RunShell("echo begun; exec sleep 60", 255, 1);
  const bool good = untimed.code == 21 && untimed.out == "y\n" && timed.code == 22 &&
                    timed.seconds < SOON && killed.code == -1 && killed.out == "begun\n" &&
                    waitpid(-1, nullptr, WNOHANG) == -1;
  return good ? 0 : 1;
}

TEST(RunCommand, WorksWhereTheKernelDoesNotTellOfTheEnd) {
  EXPECT_EXIT(_exit(RunWithoutPidfd()), testing::ExitedWithCode(0), "");
}

TEST(ReadFully, CollectsPiecesUpToTheSizeOrTheEnd) {
  for (const bool nonBlocking : {false, true}) {
    int ends[2];
    ASSERT_EQ(pipe2(ends, nonBlocking ? O_NONBLOCK : 0), 0);
    std::thread writer([&ends] {
      for (const char piece : std::string("abcdef")) {
        std::this_thread::sleep_for(std::chrono::milliseconds(2));
        EXPECT_EQ(write(ends[1], &piece, 1), 1);
      }
      close(ends[1]);
    });
    char buffer[8] = {};
    EXPECT_EQ(ReadFully(ends[0], buffer, 4), 4);
    EXPECT_EQ(std::string(buffer, 4), "abcd");
    EXPECT_EQ(ReadFully(ends[0], buffer, 8), 2) << "the end of file ends the reading";
    EXPECT_EQ(std::string(buffer, 2), "ef");
    writer.join();
    close(ends[0]);
    EXPECT_EQ(ReadFully(ends[0], buffer, 8), 0) << "an error ends the reading";
  }
}

}  // namespace
}  // namespace Tarnel::Testing
