#pragma once

#include <functional>

namespace Tarnel::Testing {

// Thrown by a wait without a limit in which nothing will ever happen.
class SleepsForEver {};

// While one lives, time passes only where the process waits in select, and there at once: up to
// the next thing that is planned, or to the limit of the wait.
class FakeTime {
 public:
  FakeTime();
  ~FakeTime();
  FakeTime(const FakeTime&) = delete;
  FakeTime& operator=(const FakeTime&) = delete;

  // Seconds since the start.
  static double Now();
  // Has something happen so many seconds from now that ends a wait, such as a key.
  static void Plan(double seconds, std::function<void()> action);
  // How often the process began to wait.
  static int Waits();
};

}  // namespace Tarnel::Testing
