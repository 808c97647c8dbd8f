#pragma once

#include <chrono>
#include <functional>
#include <thread>

namespace Tarnel::Testing {

// How long a test waits for what must come before it fails.
inline constexpr std::chrono::milliseconds PATIENCE{10000};

// Waits until a condition holds; false when it does not within the time.
inline bool WaitUntil(const std::function<bool()>& condition,
                      std::chrono::milliseconds time = PATIENCE) {
  const auto deadline = std::chrono::steady_clock::now() + time;
  while (!condition()) {
    if (std::chrono::steady_clock::now() > deadline) {
      return false;
    }
    std::this_thread::sleep_for(std::chrono::microseconds(200));
  }
  return true;
}

}  // namespace Tarnel::Testing
