// Measures what a full-screen program costs on a pseudo-terminal of 80 columns and 25 rows that
// answers no queries: its first paint, its keys and its memory.

#include <getopt.h>
#include <poll.h>
#include <pty.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

using Clock = std::chrono::steady_clock;
using Milliseconds = std::chrono::duration<double, std::milli>;

// A screen has settled when the terminal has got nothing for so long.
constexpr int QUIET_MS = 150;
constexpr int APPEAR_LIMIT_MS = 10000;

struct Options {
  std::string term = "linux";
  // Appears on the settled screen; without blanks, which a program may skip over.
  std::string text;
  // Typed in turn.
  std::vector<std::string> keys;
  int runs = 15;
  std::vector<char*> command;
};

struct Burst {
  size_t bytes = 0;
  double milliseconds = 0;
};

struct Samples {
  std::vector<double> values;

  void Add(double value) { values.push_back(value); }
  double At(double part) const {
    std::vector<double> sorted = values;
    std::sort(sorted.begin(), sorted.end());
    return sorted.empty() ? 0 : sorted[static_cast<size_t>(part * double(sorted.size() - 1))];
  }
};

// A program on a pseudo-terminal of its own.
class Session {
 public:
  explicit Session(const Options& options) : _start(Clock::now()) {
    winsize size{25, 80, 0, 0};
    _pid = forkpty(&_terminal, nullptr, nullptr, &size);
    if (_pid < 0) {
      throw std::runtime_error(std::string("no pseudo-terminal: ") + strerror(errno));
    }
    if (_pid == 0) {
      setenv("TERM", options.term.c_str(), 1);
      execvp(options.command[0], options.command.data());
      _exit(127);
    }
  }
  ~Session() {
    kill(_pid, SIGTERM);
    Collect({}, QUIET_MS);
    kill(_pid, SIGKILL);
    waitpid(_pid, nullptr, 0);
    close(_terminal);
  }
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;

  // From just before the start of the program until the last output of the settled screen.
  Burst FirstPaint(const std::string& text) {
    const Burst burst = Collect(text, APPEAR_LIMIT_MS);
    if (_seen.find(text) == std::string::npos) {
      throw std::runtime_error("the text \"" + text + "\" does not appear");
    }
    return burst;
  }

  Burst Type(const std::string& key) {
    _start = Clock::now();
    if (write(_terminal, key.data(), key.size()) != static_cast<ssize_t>(key.size())) {
      throw std::runtime_error("the program takes no keys");
    }
    return Collect({}, QUIET_MS);
  }

  long ResidentKilobytes() const {
    std::ifstream status("/proc/" + std::to_string(_pid) + "/status");
    for (std::string line; std::getline(status, line);) {
      if (line.rfind("VmRSS:", 0) == 0) {
        return std::stol(line.substr(6));
      }
    }
    throw std::runtime_error("the program has ended");
  }

 private:
  // Reads until the text has come and the terminal is quiet, and for at most the given time
  // before anything comes.
  Burst Collect(const std::string& text, int patience) {
    Burst burst;
    _seen.clear();
    for (;;) {
      const bool appeared = _seen.find(text) != std::string::npos;
      pollfd output{_terminal, POLLIN, 0};
      char buffer[65536];
      if (poll(&output, 1, burst.bytes != 0 && appeared ? QUIET_MS : patience) <= 0) {
        return burst;
      }
      const ssize_t count = read(_terminal, buffer, sizeof buffer);
      if (count <= 0) {
        return burst;
      }
      burst.bytes += static_cast<size_t>(count);
      burst.milliseconds = Milliseconds(Clock::now() - _start).count();
      _seen.append(buffer, static_cast<size_t>(count));
    }
  }

  Clock::time_point _start;
  int _terminal = -1;
  pid_t _pid = -1;
  std::string _seen;
};

Options ParseOptions(int argc, char** argv) {
  Options options;
  for (int option = 0; (option = getopt(argc, argv, "+T:t:k:n:")) != -1;) {
    switch (option) {
      case 'T':
        options.term = optarg;
        break;
      case 't':
        options.text = optarg;
        break;
      case 'k':
        options.keys.emplace_back(optarg);
        break;
      case 'n':
        options.runs = std::max(1, atoi(optarg));
        break;
      default:
        throw std::invalid_argument(
            "usage: console_cost [-T TERM] [-n RUNS] -t TEXT [-k KEY]... COMMAND [ARGUMENT]...");
    }
  }
  options.command.assign(argv + optind, argv + argc + 1);
  if (options.text.empty() || options.command[0] == nullptr) {
    throw std::invalid_argument("console_cost needs a text (-t) and a command");
  }
  return options;
}

void PrintTimes(const char* what, const Samples& times, const Samples& bytes) {
  printf("  %-12s %8.2f ms median (%.2f to %.2f, n=%zu) %6.0f bytes\n", what, times.At(0.5),
         times.At(0), times.At(1), times.values.size(), bytes.At(0.5));
}

void Measure(const Options& options) {
  Samples paintTimes;
  Samples paintBytes;
  Samples keyTimes;
  Samples keyBytes;
  Samples memory;
  for (int run = 0; run < options.runs; ++run) {
    Session session(options);
    const Burst paint = session.FirstPaint(options.text);
    paintTimes.Add(paint.milliseconds);
    paintBytes.Add(static_cast<double>(paint.bytes));
    memory.Add(static_cast<double>(session.ResidentKilobytes()));
    for (const std::string& key : options.keys) {
      const Burst burst = session.Type(key);
      keyTimes.Add(burst.milliseconds);
      keyBytes.Add(static_cast<double>(burst.bytes));
    }
  }
  printf("%s on %s, 80x25\n", options.command[0], options.term.c_str());
  PrintTimes("first paint", paintTimes, paintBytes);
  if (!options.keys.empty()) {
    PrintTimes("key", keyTimes, keyBytes);
  }
  printf("  %-12s %8.0f KiB\n", "memory (RSS)", memory.At(0.5));
}

}  // namespace

int main(int argc, char** argv) {
  try {
    Measure(ParseOptions(argc, argv));
  } catch (const std::exception& error) {
    fprintf(stderr, "%s\n", error.what());
    return 2;
  }
  return 0;
}
