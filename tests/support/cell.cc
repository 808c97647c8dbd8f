#include "tests/support/cell.h"

#include <string_view>

namespace Tarnel::Testing {

namespace {

char LineShape(char32_t character) {
  constexpr std::u32string_view LINES = U"─│┌┐└┘├┤┴┬┼";
  const size_t place = LINES.find(character);
  return place == std::u32string_view::npos ? '\0' : "-|+++++++++"[place];
}

std::string ToUtf8(char32_t character) {
  const auto tail = [&](int shift) {
    return static_cast<char>(0x80 | (character >> shift & 0x3f));
  };
  if (character < 0x80) {
    return {static_cast<char>(character)};
  }
  if (character < 0x800) {
    return {static_cast<char>(0xc0 | character >> 6), tail(0)};
  }
  if (character < 0x10000) {
    return {static_cast<char>(0xe0 | character >> 12), tail(6), tail(0)};
  }
  return {static_cast<char>(0xf0 | character >> 18), tail(12), tail(6), tail(0)};
}

std::string ColourName(const Cell& cell) {
  if (cell.bg < 0 && cell.fg < 0) {
    return cell.standout ? "standout" : "plain";
  }
  return std::to_string(cell.bg) + "/" + std::to_string(cell.fg) + (cell.standout ? "s" : "");
}

}  // namespace

Cell CharacterCell(char32_t character) {
  Cell cell;
  const char shape = LineShape(character);
  cell.line = shape != '\0';
  cell.text = cell.line ? std::string(1, shape) : ToUtf8(character);
  return cell;
}

std::string RowText(const CellRow& row) {
  std::string text;
  for (const Cell& cell : row) {
    text += cell.text;
  }
  return text.substr(0, text.find_last_not_of(' ') + 1);
}

std::string RowColours(const CellRow& row) {
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

std::string PictureText(const std::vector<CellRow>& rows) {
  std::string picture;
  std::string emptyRows;
  for (const CellRow& cells : rows) {
    const std::string row = RowText(cells);
    emptyRows += '\n';
    if (!row.empty()) {
      picture += emptyRows.substr(1) + row + '\n';
      emptyRows.clear();
    }
  }
  return picture;
}

}  // namespace Tarnel::Testing
