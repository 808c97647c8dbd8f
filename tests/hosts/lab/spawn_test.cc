#include <fcntl.h>

#include <array>
#include <cerrno>
#include <csignal>
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

class SpawnTest : public LabTest {};

// What a program writes when it gets descriptors that all lead to one file.
std::string OutputOf(const char* path, const Words& argv, const Words& envp = {}) {
  const Lab::Descriptor file("/tmp/spawned", O_RDWR | O_CREAT | O_TRUNC | O_APPEND, 0600);
  const SpawnResult result = Spawn(path, argv, envp, {file.Get(), file.Get(), file.Get()});
  EXPECT_EQ(result.status, 0);
  EXPECT_EQ(result.errorWord, 0);
  EXPECT_EQ(ExitCode(result.pid), 0);
  return Lab::ReadFile("/tmp/spawned");
}

TEST_F(SpawnTest, AChildStartsWithNoSignalBlockedOrIgnored) {
  const pid_t caller = StartProcess([] {
    sigset_t all;
    sigfillset(&all);
    sigprocmask(SIG_BLOCK, &all, nullptr);
    for (const int signal : {SIGHUP, SIGTSTP, SIGPIPE}) std::signal(signal, SIG_IGN);
    OutputOf("/bin/grep", {"grep", "-E", "SigBlk|SigIgn", "/proc/self/status"});
  });
  ASSERT_EQ(ExitCode(caller), 0);
  // The C library keeps 32 and 33 for its threads and sets them up itself.
  EXPECT_EQ(Lab::ReadFile("/tmp/spawned"),
            "SigBlk:\t0000000000000000\nSigIgn:\t0000000180000000\n");
}

TEST_F(SpawnTest, AChildInheritsItsDescriptorsEnvironmentAndGroupAlone) {
  const Lab::Descriptor kept(fcntl(STDERR_FILENO, F_DUPFD, 40));
  // ls opens the directory itself, as its lowest free descriptor.
  EXPECT_EQ(OutputOf("/bin/ls", {"ls", "/proc/self/fd"}), "0\n1\n2\n3\n");
  EXPECT_EQ(OutputOf("/bin/env", {"env"}, {"PYTHONHOME=/"}), "PYTHONHOME=/\n");
  EXPECT_EQ(OutputOf("/bin/awk", {"awk", "{ print $5 }", "/proc/self/stat"}),
            std::to_string(getpgrp()) + "\n");
}

constexpr std::array FILES = {0, 1, 2, 30, 31, 32};

std::string FileName(int number) { return "/tmp/order" + std::to_string(number); }

// For a process of its own, whose descriptors become the files.
void SpawnOnFiles(const std::vector<int32_t>& descriptors) {
  for (const int fd : FILES) {
    dup2(open(FileName(fd).c_str(), O_RDWR | O_CREAT | O_TRUNC | O_APPEND, 0600), fd);
  }
  const SpawnResult result =
      Spawn("/bin/sh", {"sh", "-c", "printf 0 >&0; printf 1 >&1; printf 2 >&2"}, {}, descriptors);
  if (result.status != 0 || ExitCode(result.pid) != 0) throw Lab::StateError("not run");
}

TEST_F(SpawnTest, EachDescriptorArrivesAtItsPlace) {
  struct Row {
    std::vector<int32_t> descriptors;
    // What the caller's files hold afterwards, with a comma behind each.
    std::string files;
  };
  const std::vector<Row> rows = {
      {{0, 1, 2}, "0,1,2,,,,"}, {{2, 0, 1}, "1,2,0,,,,"},    {{1, 0, 2}, "1,0,2,,,,"},
      {{1, 1, 1}, ",012,,,,,"}, {{32, 31, 30}, ",,,2,1,0,"}, {{31, 0, 0}, "12,,,,0,,"},
  };
  for (const Row& row : rows) {
    EXPECT_EQ(ExitCode(StartProcess([&] { SpawnOnFiles(row.descriptors); })), 0) << row.files;
    std::string files;
    for (const int fd : FILES) files += Lab::ReadFile(FileName(fd)) + ",";
    EXPECT_EQ(files, row.files);
  }
}

TEST_F(SpawnTest, AFailureGivesTheErrorAndNoChild) {
  struct Row {
    const char* path;
    int32_t descriptor;
    int32_t errorWord;
  };
  for (const auto& [path, descriptor, errorWord] :
       {Row{"/bin/no-such-program", 1, -ENOENT}, Row{"/etc/hostname", 1, -EACCES},
        Row{"/bin/cat", 999, -EBADF}, Row{"/bin/cat", -1, -EBADF}}) {
    const SpawnResult result = Spawn(path, {"x"}, {}, {descriptor});
    EXPECT_NE(result.status, 0) << path;
    EXPECT_EQ(result.errorWord, errorWord) << path;
    EXPECT_EQ(waitpid(-1, nullptr, WNOHANG), -1) << path;
  }
}

TEST_F(SpawnTest, AStartThatTheLabRefusesIsTraced) {
  Patch(R"({"programs": {"/bin/cat": [{"noStart": true, "args": ["x y"], "times": 1}]}})");
  EXPECT_EQ(Spawn("/bin/cat", {"cat", "x y"}, {}, {0, 1, 2}).errorWord, -ENOENT);
  EXPECT_EQ(Lab::ReadFile(std::string(Lab::LAB_DIRECTORY) + "/trace"),
            "program /bin/cat cat \"x y\"\n");
  EXPECT_EQ(OutputOf("/bin/cat", {"cat", "/etc/hostname"}), "rack7\n");
}

}  // namespace
