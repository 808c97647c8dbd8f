#include <chrono>
#include <filesystem>
#include <thread>
#include <vector>

#include "hosts/lab/state/lock.h"
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
  const pid_t first = StartProcess([] { Increment(100); });
  const pid_t second = StartProcess([] { Increment(100); });
  std::thread third(Increment, 100);
  Increment(100);
  third.join();
  EXPECT_EQ(ExitCode(first), 0);
  EXPECT_EQ(ExitCode(second), 0);
  EXPECT_EQ(Lab::Number(*Lab::ReadState(), "/count"), 400);
}

TEST_F(StateTest, AReaderNeverSeesHalfAChange) {
  const pid_t writer = StartProcess([] {
    for (size_t i = 0; i < 300; ++i) {
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
}

TEST_F(StateTest, AnUnchangedDocumentIsNotParsedAgain) {
  using Clock = std::chrono::steady_clock;
  Lab::ChangeState([](Json& state) { state["ballast"] = std::vector<int>(100000, 1234567); });
  const auto start = Clock::now();
  Lab::ReadState();
  const auto parsed = Clock::now();
  for (int i = 0; i < 100; ++i) Lab::ReadState();
  EXPECT_LT((Clock::now() - parsed) / 100, (parsed - start) / 20);
}

TEST_F(StateTest, AChangeThatThrowsStoresNothingAndFreesTheLock) {
  EXPECT_THROW(Lab::ChangeState([](Json& state) {
                 state["half"] = true;
                 throw Lab::StateError("stop");
               }),
               Lab::StateError);
  EXPECT_FALSE(Lab::ReadState()->contains("half"));
  const Lab::Lock lock;
}

TEST_F(StateTest, AnUnreadableStateSaysWhichFile) {
  Lab::ReplaceFile(LabFile("state.json"), "{\"host\": ");
  EXPECT_EQ(Thrown<Lab::StateError>(Lab::ReadState),
            "/etc/halvren/lab/state.json: not JSON at byte 10");
  std::filesystem::remove(LabFile("state.json"));
  EXPECT_EQ(Thrown<Lab::StateError>(Lab::ReadState),
            "/etc/halvren/lab/state.json: No such file or directory");
}

struct NodeCase {
  const char* node;
  std::string (*read)(const Json& state, const char* pointer);
  const char* result;
};

std::string AsText(const Json& state, const char* pointer) { return Lab::Text(state, pointer); }
std::string AsNumber(const Json& state, const char* pointer) {
  return std::to_string(Lab::Number(state, pointer));
}
std::string AsOptionalNumber(const Json& state, const char* pointer) {
  return std::to_string(Lab::Number(state, pointer, 7));
}
std::string AsFlag(const Json& state, const char* pointer) {
  return Lab::Flag(state, pointer) ? "true" : "false";
}
std::string AsList(const Json& state, const char* pointer) {
  return Lab::List(state, pointer).dump();
}

class NodeTest : public testing::TestWithParam<NodeCase> {};

TEST_P(NodeTest, IsReadByItsType) {
  const Json state = Json::parse(GetParam().node);
  std::string result;
  try {
    result = GetParam().read(state, "/a/b");
  } catch (const Lab::StateError& error) {
    result = error.what();
  }
  EXPECT_EQ(result, GetParam().result);
}

INSTANTIATE_TEST_SUITE_P(
    All, NodeTest,
    testing::Values(NodeCase{R"({"a":{"b":"x"}})", AsText, "x"},
                    NodeCase{R"({"a":{"b":{"bytes":"41ff09"}}})", AsText, "A\xff\t"},
                    NodeCase{R"({"a":{"b":{"bytes":"4"}}})", AsText, "/a/b is not hexadecimal"},
                    NodeCase{R"({"a":{"b":{"bytes":"4g"}}})", AsText, "/a/b is not hexadecimal"},
                    NodeCase{R"({"a":{"b":1}})", AsText, "/a/b is not a text"},
                    NodeCase{R"({"a":{}})", AsText, "/a/b is missing"},
                    NodeCase{R"({"a":[]})", AsText, "/a/b is missing"},
                    NodeCase{R"({})", AsOptionalNumber, "7"},
                    NodeCase{R"({"a":{"b":"7"}})", AsOptionalNumber, "/a/b is not a whole number"},
                    NodeCase{R"({"a":{"b":1.5}})", AsNumber, "/a/b is not a whole number"},
                    NodeCase{R"({"a":{"b":4611686018427387904}})", AsNumber, "4611686018427387904"},
                    NodeCase{R"({"a":{"b":0}})", AsFlag, "/a/b is not a flag"},
                    NodeCase{R"({"a":{"b":{}}})", AsList, "/a/b is not a list"}));

}  // namespace
