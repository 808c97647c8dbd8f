#pragma once

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdio>
#include <exception>
#include <functional>
#include <string>

#include "hostapi/nodeplane/exception.h"
#include "hosts/lab/state/files.h"
#include "hosts/lab/state/host_state.h"
#include "hosts/lab/state/scenario.h"

// Each case starts on the made-up machine.
class LabTest : public testing::Test {
 protected:
  void SetUp() override { Lab::LoadScenario("sample"); }

  static void Patch(const std::string& patch) {
    Lab::ChangeState([&](Lab::Json& state) { state.merge_patch(Lab::Json::parse(patch)); });
  }
};

// Starts a process that does the work and ends; an exception gives exit code 1.
inline pid_t StartProcess(const std::function<void()>& work) {
  const pid_t pid = fork();
  if (pid != 0) return pid;
  try {
    work();
  } catch (const std::exception&) {
    _exit(1);
  }
  _exit(0);
}

// The exit code of a process, -1 when it died otherwise.
inline int ExitCode(pid_t pid) {
  int status = 0;
  if (waitpid(pid, &status, 0) != pid || !WIFEXITED(status)) return -1;
  return WEXITSTATUS(status);
}

// The text of the exception that the operation throws, "none" without one.
inline std::string Thrown(const std::function<void()>& operation) {
  try {
    operation();
  } catch (const Nodeplane::Lib::NodeplaneException& error) {
    return error.what();
  } catch (const Lab::StateError& error) {
    return std::string("state: ") + error.what();
  }
  return "none";
}

// What a shell command line printed, with "!" before the lines of standard error, and its status.
inline std::string RunLine(const std::string& command) {
  FILE* pipe = popen(
      ("{ " + command + "; } 2>/tmp/errors; end=$?; sed 's/^/!/' /tmp/errors; echo \"= $end\"")
          .c_str(),
      "re");
  std::string output;
  for (int c = 0; (c = fgetc(pipe)) != EOF;) output += static_cast<char>(c);
  pclose(pipe);
  return output;
}
