#include <filesystem>
#include <thread>

#include "tests/hosts/lab/lab_test.h"

namespace {

using Lab::Json;

class StateTest : public LabTest {};

void Increment(int times) {
  for (int i = 0; i < times; ++i) {
    Lab::ChangeState([](Json& state) { state["count"] = state.value("count", 0) + 1; });
  }
}

TEST_F(StateTest, NoChangeOfAnotherProcessOrThreadIsLost) {
  const pid_t process = StartProcess([] { Increment(100); });
  std::thread thread(Increment, 100);
  Increment(100);
  thread.join();
  EXPECT_EQ(ExitCode(process), 0);
  EXPECT_EQ(Lab::Number(*Lab::ReadState(), "/count"), 300);
}

TEST_F(StateTest, AReaderNeverSeesHalfAChange) {
  const pid_t writer = StartProcess([] {
    for (size_t i = 0; i < 100; ++i) {
      Lab::ChangeState([i](Json& state) {
        state["first"] = std::string(i * 37 % 9000, 'x');
        state["second"] = state["first"];
      });
    }
  });
  size_t versions = 0;
  std::shared_ptr<const Json> last;
  int status = 0;
  while (waitpid(writer, &status, WNOHANG) == 0) {
    const auto state = Lab::ReadState();
    ASSERT_EQ(state->value("first", ""), state->value("second", ""));
    versions += state == last ? 0 : 1;
    last = state;
  }
  EXPECT_EQ(status, 0);
  EXPECT_GT(versions, 1U);
}

// Equal sizes within one tick of the file system's clock: only the file itself differs.
TEST_F(StateTest, TheLastOfManyQuickChangesIsSeen) {
  for (int i = 0; i < 10; ++i) {
    const pid_t writer = StartProcess([i] {
      for (int step = 0; step < 20; ++step) {
        Lab::ChangeState([&](Json& state) { state["digit"] = (i + step) % 10; });
      }
    });
    ASSERT_EQ(ExitCode(writer), 0);
    ASSERT_EQ(Lab::Number(*Lab::ReadState(), "/digit"), (i + 19) % 10);
  }
  EXPECT_EQ(Lab::ReadState(), Lab::ReadState());
}

TEST_F(StateTest, AnUnreadableStateSaysWhichFile) {
  const std::string path = std::string(Lab::LAB_DIRECTORY) + "/state.json";
  Lab::ReplaceFile(path, "{\"host\": ");
  EXPECT_EQ(Thrown(Lab::ReadState), "state: " + path + ": not JSON at byte 10");
  std::filesystem::remove(path);
  EXPECT_EQ(Thrown(Lab::ReadState), "state: " + path + ": No such file or directory");
}

}  // namespace
