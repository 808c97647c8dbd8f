#include "tests/network/form_player.h"

#include <vector>

#include "console/screen/colours.h"

namespace Tarnel::Testing {

namespace {

using namespace Keys;

// What opens the form.
class Opener : public Frame {
 public:
  explicit Opener(const std::function<int(Frame*)>& open)
      : Frame(nullptr, 0, 0, 80, 25, BLACK, WHITE), _open(open) {}

  int Run() override { return _open(this); }

 private:
  const std::function<int(Frame*)>& _open;
};

// Single characters, and the sequences of other keys.
std::vector<std::string> SplitKeys(const std::string& keys) {
  std::vector<std::string> split;
  for (size_t start = 0; start < keys.size();) {
    const bool sequence = keys.compare(start, 2, "\x1b[") == 0;
    const size_t end = sequence ? keys.find_first_of("ABCD~", start) + 1 : start + 1;
    split.push_back(keys.substr(start, end - start));
    start = end;
  }
  return split;
}

}  // namespace

int FormPlayer::Play(const std::string& keys, const Opening& open) {
  FakeTime time;
  _seen.clear();
  _cursors.clear();
  const std::vector<std::string> split = SplitKeys(keys);
  for (const std::string& key : split) {
    FakeTime::Plan(1 + 0.001 * static_cast<double>(&key - split.data()),
                   [this, key] { LookAndType(key); });
  }
  const int result = Opener(open).Exec();
  EXPECT_EQ(_cursors.size(), split.size()) << "keys were left over";
  return result;
}

void FormPlayer::LookAndType(const std::string& key) {
  _seen += _screen.Picture();
  _cursors += CursesScreen::CursorVisible() ? '|' : '.';
  _screen.Type(key);
}

}  // namespace Tarnel::Testing
