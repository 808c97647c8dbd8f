#include <benchmark/benchmark.h>
#include <spawn.h>
#include <sys/wait.h>

#include "console/hostops/command_runner.h"

namespace {

// A program that does nothing, so that only the running of it is measured.
constexpr char PROGRAM[] = "/bin/busybox";

void BarePosixSpawn(benchmark::State& state) {
  char name[] = "true";
  char environment[] = "PYTHONHOME=/";
  char* argv[] = {name, nullptr};
  char* envp[] = {environment, nullptr};
  for ([[maybe_unused]] auto _ : state) {
    pid_t pid = -1;
    int status = -1;
    if (posix_spawn(&pid, PROGRAM, nullptr, nullptr, argv, envp) != 0 ||
        waitpid(pid, &status, 0) != pid || status != 0) {
      state.SkipWithError("the program did not run");
    }
  }
}
BENCHMARK(BarePosixSpawn)->UseRealTime();

void RunCommand(benchmark::State& state) {
  const auto timeoutSeconds = static_cast<int32_t>(state.range(0));
  const bool captured = state.range(1) != 0;
  const char* argv[] = {"true", nullptr};
  char output[256];
  for ([[maybe_unused]] auto _ : state) {
    int32_t length = 255;
    if (Tarnel::RunCommand(PROGRAM, argv, captured ? output : nullptr, &length, nullptr, nullptr,
                           nullptr, 0, timeoutSeconds) != 0) {
      state.SkipWithError("the program did not run");
    }
  }
}
BENCHMARK(RunCommand)
    ->ArgNames({"limit", "captured"})
    ->Args({0, 0})
    ->Args({0, 1})
    ->Args({120, 1})
    ->UseRealTime();

}  // namespace
