#include "console/widgets/markup_layout.h"

#include <algorithm>
#include <cctype>
#include <cstdlib>
#include <utility>
#include <vector>

#include "console/widgets/markup.h"

namespace Tarnel {

namespace {

constexpr std::string_view PADDING_PREFIX = "padding:";

bool IsSpace(char c) { return isspace(static_cast<unsigned char>(c)) != 0; }

// Puts the lines together, byte by byte. All insertions happen in the line in progress or once for
// a whole region, so that the cost stays linear in the text.
class LineComposer {
 public:
  LineComposer(int width, const ValueTags& valueTags)
      : _width(width), _valueTags(valueTags), _remain(width) {}

  std::string Compose(std::string_view text);

 private:
  enum class Align { NONE, RIGHT, CENTER, PADDING };
  static constexpr size_t NO_SPACE = std::string::npos;
  struct Blanks {
    size_t position;
    size_t count;
  };

  void PutByte(char c);
  void PutValue(const std::string& value);
  void PutTag(const MarkupTag& tag);
  void Append(char c);

  void BreakLine(bool atSpace);
  void BreakHard();
  void BreakAtLastSpace();
  void StartLine();

  void OpenAlign(std::string_view value);
  void CloseAlign();
  void FillColumn();
  void InsertLineBlanks();

  bool IsShifting() const { return _align == Align::RIGHT || _align == Align::CENTER; }
  bool IsColumnFull() const { return _align == Align::PADDING && _padding == 0; }
  // Of the columns that are free on a line, how many go before the region.
  size_t BlanksBefore(size_t free) const { return _align == Align::RIGHT ? free : free / 2; }

  const int _width;
  const ValueTags& _valueTags;
  std::string _out;
  // Columns left on the line.
  long _remain;
  // Where the line can be broken: index of its last white space.
  size_t _lastSpace = NO_SPACE;
  // Bytes since then, the white space included. Facts and the blanks that fill a column are no part
  // of a word and do not count.
  size_t _wordLen = 0;
  Align _align = Align::NONE;
  // Where the blanks for this line of the region go.
  size_t _alignStart = 0;
  // Columns left in the padding column; below 0 it has no limit.
  long _padding = 0;
  // Blanks for the region's lines so far that ended with a line end. They count only when the
  // region is closed.
  std::vector<Blanks> _lineBlanks;
};

std::string LineComposer::Compose(std::string_view text) {
  _out.reserve(text.size() + text.size() / 8);
  while (!text.empty()) {
    if (text.front() == TAG_OPEN) {
      PutTag(TakeTag(text));
    } else {
      PutByte(text.front());
      text.remove_prefix(1);
    }
  }
  return std::move(_out);
}

void LineComposer::PutByte(char c) {
  const bool space = IsSpace(c);
  const bool dropped = IsColumnFull();
  // White space that the column cuts off is not on the line, so no line can end there.
  if (space && !dropped) {
    _lastSpace = _out.size();
    _wordLen = 0;
  }
  if (_remain == 0) {
    BreakLine(space);
    if (space) return;
  }
  if (!dropped) {
    if (c == '\n' && IsShifting()) {
      _lineBlanks.push_back({_alignStart, BlanksBefore(static_cast<size_t>(_remain))});
    }
    Append(c);
    ++_wordLen;
  }
  if (c == '\n') StartLine();
}

void LineComposer::PutValue(const std::string& value) {
  for (const char c : value) {
    if (IsColumnFull()) return;
    if (_remain == 0) BreakHard();
    Append(c);
  }
}

void LineComposer::PutTag(const MarkupTag& tag) {
  if (tag.content.empty()) return;
  if (tag.name == "align") {
    OpenAlign(tag.value);
  } else if (tag.name == "/align") {
    CloseAlign();
  } else if (const auto value = _valueTags.find(std::string(tag.content));
             value != _valueTags.end()) {
    PutValue(value->second());
  } else {
    _out += TAG_OPEN;
    _out += tag.content;
    _out += TAG_CLOSE;
  }
}

void LineComposer::Append(char c) {
  _out += c;
  --_remain;
  if (_padding > 0) --_padding;
}

void LineComposer::BreakLine(bool atSpace) {
  if (atSpace || _lastSpace == NO_SPACE) {
    BreakHard();
  } else {
    BreakAtLastSpace();
  }
}

void LineComposer::BreakHard() {
  _out += '\n';
  StartLine();
}

void LineComposer::BreakAtLastSpace() {
  _out[_lastSpace] = '\n';
  // A region that moves to the next line as a whole leaves no blanks behind.
  if (IsShifting() && _lastSpace >= _alignStart) {
    const size_t blanks = BlanksBefore(_wordLen);
    _out.insert(_alignStart, blanks, ' ');
    _alignStart = _lastSpace + blanks + 1;
  }
  _remain = _width + 1 - static_cast<long>(_wordLen);
  _lastSpace = NO_SPACE;
  _wordLen = 0;
}

void LineComposer::StartLine() {
  _remain = _width;
  _lastSpace = NO_SPACE;
  _wordLen = 0;
  _alignStart = _out.size();
}

void LineComposer::OpenAlign(std::string_view value) {
  if (_align != Align::NONE) return;
  _alignStart = _out.size();
  if (value == "right") {
    _align = Align::RIGHT;
  } else if (value == "center") {
    _align = Align::CENTER;
  } else if (value.starts_with(PADDING_PREFIX)) {
    _align = Align::PADDING;
    _padding = strtol(std::string(value.substr(PADDING_PREFIX.size())).c_str(), nullptr, 10);
  }
}

void LineComposer::CloseAlign() {
  if (_align == Align::PADDING) FillColumn();
  if (IsShifting()) {
    _lineBlanks.push_back({_alignStart, BlanksBefore(static_cast<size_t>(_remain))});
    InsertLineBlanks();
    _remain = 0;
    _lastSpace = NO_SPACE;
    _wordLen = 0;
  }
  _align = Align::NONE;
}

void LineComposer::FillColumn() {
  const long blanks = std::clamp(_remain, 0L, std::max(_padding, 0L));
  _out.append(static_cast<size_t>(blanks), ' ');
  _remain -= blanks;
}

void LineComposer::InsertLineBlanks() {
  const size_t start = _lineBlanks.front().position;
  const std::string region = _out.substr(start);
  _out.resize(start);
  for (size_t i = 0; i < _lineBlanks.size(); ++i) {
    const auto [position, count] = _lineBlanks[i];
    const size_t end =
        i + 1 < _lineBlanks.size() ? _lineBlanks[i + 1].position : start + region.size();
    _out.append(count, ' ');
    _out.append(region, position - start, end - position);
  }
  _lineBlanks.clear();
}

}  // namespace

std::string LayoutMarkup(std::string_view text, int width, const ValueTags& valueTags) {
  if (width <= 0) return {};
  return LineComposer(width, valueTags).Compose(text);
}

}  // namespace Tarnel
