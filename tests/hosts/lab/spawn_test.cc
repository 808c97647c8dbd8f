#include <fcntl.h>

#include <array>
#include <cerrno>
#include <csignal>
#include <filesystem>
#include <sstream>
#include <vector>

#include "hostapi/kernel.h"
#include "tests/hosts/lab/lab_test.h"

namespace {

using Words = std::vector<const char*>;

// argv and envp are given without their null.
SpawnResult Spawn(const char* path, Words argv, Words envp, const std::vector<int32_t>& fds) {
  argv.push_back(nullptr);
  envp.push_back(nullptr);
  return Kernel_Spawn(
      {path, argv.data(), envp.data(), fds.data(), static_cast<int32_t>(fds.size())});
}

class SpawnTest : public LabTest {
 protected:
  // What a program writes when it gets descriptors that all lead to one file.
  static std::string OutputOf(const char* path, const Words& argv, const Words& envp = {}) {
    const Lab::Descriptor file("/tmp/spawned", O_RDWR | O_CREAT | O_TRUNC | O_APPEND, 0600);
    const SpawnResult result = Spawn(path, argv, envp, {file.Get(), file.Get(), file.Get()});
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.errorWord, 0);
    EXPECT_EQ(ExitCode(result.pid), 0);
    return Lab::ReadFile("/tmp/spawned");
  }
};

// The value behind "name:" in the text of /proc/PID/status.
std::string StatusField(const std::string& status, const std::string& name) {
  std::istringstream lines(status);
  for (std::string word; lines >> word;) {
    if (word == name + ":" && lines >> word) return word;
  }
  return "none";
}

// The signal state of this process, given back at the end.
class SavedSignals {
 public:
  SavedSignals() {
    sigset_t all;
    sigfillset(&all);
    pthread_sigmask(SIG_BLOCK, &all, &_mask);
    for (size_t i = 0; i < IGNORED.size(); ++i) _handlers[i] = std::signal(IGNORED[i], SIG_IGN);
  }
  ~SavedSignals() {
    for (size_t i = 0; i < IGNORED.size(); ++i) std::signal(IGNORED[i], _handlers[i]);
    pthread_sigmask(SIG_SETMASK, &_mask, nullptr);
  }
  SavedSignals(const SavedSignals&) = delete;
  SavedSignals& operator=(const SavedSignals&) = delete;

 private:
  static constexpr std::array IGNORED = {SIGHUP, SIGTSTP, SIGPIPE, SIGCHLD};
  sigset_t _mask{};
  std::array<sighandler_t, IGNORED.size()> _handlers{};
};

TEST_F(SpawnTest, AChildStartsWithNoSignalBlockedOrIgnored) {
  std::string status;
  {
    const SavedSignals signals;
    const Lab::Descriptor file("/tmp/spawned", O_RDWR | O_CREAT | O_TRUNC, 0600);
    const SpawnResult result =
        Spawn("/bin/cat", {"cat", "/proc/self/status"}, {}, {file.Get(), file.Get(), file.Get()});
    ASSERT_EQ(result.status, 0);
    // With SIGCHLD ignored, the wait ends when there is no child any more.
    EXPECT_EQ(ExitCode(result.pid), -1);
    status = Lab::ReadFile("/tmp/spawned");
  }
  EXPECT_EQ(StatusField(status, "SigBlk"), "0000000000000000");
  // The C library keeps 32 and 33 for its threads and sets them up itself.
  EXPECT_EQ(StatusField(status, "SigIgn"), "0000000180000000");
}

TEST_F(SpawnTest, AChildInheritsItsDescriptorsAndNoOther) {
  const Lab::Descriptor kept(fcntl(STDERR_FILENO, F_DUPFD, 40));
  // ls opens the directory itself, as its lowest free descriptor.
  EXPECT_EQ(OutputOf("/bin/ls", {"ls", "/proc/self/fd"}), "0\n1\n2\n3\n");
}

TEST_F(SpawnTest, AChildHasTheGivenEnvironmentAndTheCallersGroup) {
  EXPECT_EQ(OutputOf("/bin/env", {"env"}, {"PYTHONHOME=/"}), "PYTHONHOME=/\n");
  std::istringstream stat(OutputOf("/bin/cat", {"cat", "/proc/self/stat"}));
  std::string pid, name, state, parent, group;
  stat >> pid >> name >> state >> parent >> group;
  EXPECT_EQ(group, std::to_string(getpgrp()));
}

constexpr std::array FILES = {0, 1, 2, 30, 31, 32};

struct OrderCase {
  std::vector<int32_t> descriptors;
  // What the files of the caller's descriptors FILES hold afterwards.
  std::array<const char*, 6> files;
};

class SpawnOrderTest : public SpawnTest, public testing::WithParamInterface<OrderCase> {
 protected:
  static std::string FileName(int number) { return "/tmp/order" + std::to_string(number); }

  // In a process of its own, whose descriptors become the six files.
  static void SpawnOnFiles(const std::vector<int32_t>& descriptors) {
    for (const int fd : FILES) {
      dup2(open(FileName(fd).c_str(), O_RDWR | O_CREAT | O_TRUNC | O_APPEND, 0600), fd);
    }
    const SpawnResult result =
        Spawn("/bin/sh", {"sh", "-c", "printf 0 >&0; printf 1 >&1; printf 2 >&2"}, {}, descriptors);
    if (result.status != 0 || ExitCode(result.pid) != 0) throw Lab::StateError("not run");
  }
};

TEST_P(SpawnOrderTest, EachDescriptorArrivesAtItsPlace) {
  EXPECT_EQ(ExitCode(StartProcess([] { SpawnOnFiles(GetParam().descriptors); })), 0);
  for (size_t i = 0; i < FILES.size(); ++i) {
    EXPECT_EQ(Lab::ReadFile(FileName(FILES[i])), GetParam().files[i]) << FILES[i];
  }
}

INSTANTIATE_TEST_SUITE_P(All, SpawnOrderTest,
                         testing::Values(OrderCase{{0, 1, 2}, {"0", "1", "2", "", "", ""}},
                                         OrderCase{{2, 0, 1}, {"1", "2", "0", "", "", ""}},
                                         OrderCase{{1, 2, 0}, {"2", "0", "1", "", "", ""}},
                                         OrderCase{{1, 0, 2}, {"1", "0", "2", "", "", ""}},
                                         OrderCase{{1, 1, 1}, {"", "012", "", "", "", ""}},
                                         OrderCase{{32, 31, 30}, {"", "", "", "2", "1", "0"}},
                                         OrderCase{{31, 0, 0}, {"12", "", "", "", "0", ""}}));

struct FailureCase {
  const char* path;
  int32_t descriptor;
  int32_t errorWord;
};

class SpawnFailureTest : public SpawnTest, public testing::WithParamInterface<FailureCase> {};

TEST_P(SpawnFailureTest, GivesTheErrorAndNoChild) {
  const SpawnResult result = Spawn(GetParam().path, {"x"}, {}, {GetParam().descriptor});
  EXPECT_NE(result.status, 0);
  EXPECT_EQ(result.errorWord, GetParam().errorWord);
  EXPECT_EQ(waitpid(-1, nullptr, WNOHANG), -1);
}

INSTANTIATE_TEST_SUITE_P(All, SpawnFailureTest,
                         testing::Values(FailureCase{"/bin/no-such-program", 1, -ENOENT},
                                         FailureCase{"/etc/hostname", 1, -EACCES},
                                         FailureCase{"/bin/cat", 999, -EBADF},
                                         FailureCase{"/bin/cat", -1, -EBADF}));

TEST_F(SpawnTest, AStartThatTheLabRefusesIsTraced) {
  Patch(R"({"programs": {"/bin/cat": [{"noStart": true, "args": ["x y"], "times": 1}]}})");
  const SpawnResult refused = Spawn("/bin/cat", {"cat", "x y"}, {}, {0, 1, 2});
  EXPECT_NE(refused.status, 0);
  EXPECT_EQ(refused.errorWord, -ENOENT);
  EXPECT_EQ(TraceText(), "program /bin/cat cat \"x y\"\n");
  EXPECT_EQ(OutputOf("/bin/cat", {"cat", "/etc/hostname"}), "rack7\n");
}

TEST_F(SpawnTest, WithoutAStateProgramsStillStart) {
  std::filesystem::remove(LabFile("state.json"));
  EXPECT_EQ(OutputOf("/bin/cat", {"cat", "/etc/hostname"}), "rack7\n");
}

}  // namespace
