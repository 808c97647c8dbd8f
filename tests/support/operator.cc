#include "tests/support/operator.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>

namespace Tarnel::Testing {

Operator::Operator(const Launch& launch) : Terminal(launch) {
  WaitFor("<F2> Customize");
  Press({Keys::F2});
  WaitFor("<Esc> Cancel");
  Press({"root\tlaboratory\r"});
  WaitFor("System Customization");
  Settle();
}

void Operator::Press(const std::vector<std::string>& keys) {
  for (const std::string& key : keys) {
    const size_t before = Output().size();
    Type(key);
    if (key == Keys::ESC) {
      // It is held back for a while: what is typed meanwhile would become one key with it.
      constexpr std::chrono::milliseconds HELD_BACK(150);
      const auto end = std::chrono::steady_clock::now() + HELD_BACK;
      WaitUntil([&] { return Output().size() > before || std::chrono::steady_clock::now() > end; },
                "what Esc does");
    }
    Settle();
  }
}

void Operator::PressTimes(const std::string& key, int times) {
  Press(std::vector<std::string>(static_cast<size_t>(times), key));
}

void Operator::GoTo(const std::string& title) {
  constexpr int MOST_ROWS = 12;
  for (int row = 0; row < MOST_ROWS && RightPane(1) != title; ++row) {
    Press({Keys::DOWN});
  }
  EXPECT_EQ(RightPane(1), title);
}

std::string Operator::RightPane(int y) const {
  std::string row = Row(y).substr(41, 38);
  row.erase(row.find_last_not_of(' ') + 1);
  return row.substr(std::min(row.find_first_not_of(' '), row.size()));
}

}  // namespace Tarnel::Testing
