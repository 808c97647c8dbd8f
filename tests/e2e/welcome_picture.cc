#include "tests/e2e/welcome_picture.h"

namespace Tarnel::Testing {

std::string WelcomePicture(const Welcome& welcome) {
  const auto width = static_cast<size_t>(welcome.columns);
  const auto height = static_cast<size_t>(welcome.rows);
  const std::string edge = "+" + std::string(width - 2, '-') + "+\n";
  std::vector<std::string> rows(height, "|" + std::string(width - 2, ' ') + "|\n");
  rows.front() = rows.back() = edge;
  const auto put = [&](size_t x, size_t y, const std::string& text) {
    rows.at(y).replace(x, text.size(), text);
  };
  put(8, 5, "Ostrel Laboratory Host 8.0.2 (Corelin release Build 24022)");
  put(8, 7, welcome.machine);
  put(8, 9, welcome.processor);
  put(8, 10, welcome.memory);
  const size_t bottom = height / 2;
  for (size_t i = 0; i < welcome.network.size(); ++i) {
    put(8, bottom + 1 + i, welcome.network[i]);
  }
  for (size_t i = 0; i < welcome.warning.size(); ++i) {
    put(16, bottom + 9 + i, welcome.warning[i]);
  }
  const std::string shutDown = "<F12> Shut Down/Restart";
  put(2, height - 2, "<F2> Customize System/View Logs");
  put(width - 2 - shutDown.size(), height - 2, shutDown);
  std::string picture;
  for (const std::string& row : rows) {
    picture += row;
  }
  return picture;
}

}  // namespace Tarnel::Testing
