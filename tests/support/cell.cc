#include "tests/support/cell.h"

namespace Tarnel::Testing {

namespace {

std::string ColourName(const Cell& cell) {
  if (cell.bg < 0 && cell.fg < 0) {
    return cell.standout ? "standout" : "plain";
  }
  return std::to_string(cell.bg) + "/" + std::to_string(cell.fg) + (cell.standout ? "s" : "");
}

}  // namespace

std::string CellScreen::Row(int y) const {
  std::string text;
  for (const Cell& cell : Cells(y)) {
    text += cell.text;
  }
  return text.substr(0, text.find_last_not_of(' ') + 1);
}

std::string CellScreen::Colours(int y) const {
  const CellRow row = Cells(y);
  std::string colours;
  for (size_t start = 0; start < row.size();) {
    const std::string name = ColourName(row[start]);
    size_t end = start;
    while (end < row.size() && ColourName(row[end]) == name) {
      ++end;
    }
    colours += (colours.empty() ? "" : " ") + name + "*" + std::to_string(end - start);
    start = end;
  }
  return colours;
}

std::string CellScreen::Picture() const {
  std::string picture;
  for (int y = 0; y < Rows(); ++y) {
    picture += Row(y) + '\n';
  }
  const size_t end = picture.find_last_not_of('\n');
  return end == std::string::npos ? "" : picture.substr(0, end + 2);
}

}  // namespace Tarnel::Testing
