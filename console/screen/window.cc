#include "console/screen/window.h"

#include <algorithm>
#include <cwchar>
#include <cwctype>

#include "console/screen/colours.h"

namespace Tarnel {

bool Window::_cursor = false;
int Window::_xCursor = 0;
int Window::_yCursor = 0;

namespace {

// To curses a size of 0 means "up to the edge"; here it is a window that does not fit.
bool HasCells(int width, int height) { return width > 0 && height > 0; }

CursesWindow NewTopLevel(int x, int y, int width, int height) {
  return CursesWindow(HasCells(width, height) ? newwin(height, width, y, x) : nullptr);
}

CursesWindow NewChild(WINDOW* parent, int x, int y, int width, int height) {
  if (parent == nullptr || !HasCells(width, height)) {
    return nullptr;
  }
  return CursesWindow(subwin(parent, height, width, y, x));
}

// The next character of the text, as one cell shows it.
wchar_t TakeCell(const char*& next, const char* end, mbstate_t& state) {
  wchar_t character = 0;
  const size_t length = mbrtowc(&character, next, static_cast<size_t>(end - next), &state);
  if (length == 0 || length > static_cast<size_t>(end - next)) {  // a NUL, or no valid sequence
    state = mbstate_t{};
    next += 1;
    return L'?';
  }
  next += length;
  if (iswspace(static_cast<wint_t>(character)) != 0) {
    return L' ';
  }
  return wcwidth(character) > 0 ? character : L'?';
}

// At most so many columns of the text, with one cell for each byte that is no printable character:
// no byte of it can move the cursor.
std::wstring PrintableCells(const std::string& text, int columns) {
  std::wstring cells;
  mbstate_t state{};
  const char* next = text.data();
  const char* const end = next + text.size();
  while (next < end) {
    const wchar_t character = TakeCell(next, end, state);
    columns -= wcwidth(character);
    if (columns < 0) {
      break;
    }
    cells += character;
  }
  return cells;
}

// Gives every cell of a row the attributes and keeps its character. Line characters are such by an
// attribute of their cell, so the row is rewritten in runs of equal kind.
void RecolourRow(WINDOW* window, int y, int width, attr_t attributes) {
  std::vector<chtype> cells(static_cast<size_t>(width) + 1);
  mvwinchnstr(window, y, 0, cells.data(), width);
  const auto kindAt = [&](int x) { return cells[static_cast<size_t>(x)] & A_ALTCHARSET; };
  const auto pair = static_cast<short>(PAIR_NUMBER(static_cast<int>(attributes)));
  for (int start = 0; start < width;) {
    const chtype kind = kindAt(start);
    int end = start + 1;
    while (end < width && kindAt(end) == kind) {
      ++end;
    }
    mvwchgat(window, y, start, end - start, (attributes & ~A_COLOR) | kind, pair, nullptr);
    start = end;
  }
}

}  // namespace

Window::Window(int x, int y, int width, int height, int bg, int fg)
    : _x(x),
      _y(y),
      _width(width),
      _height(height),
      _bgColor(bg),
      _fgColor(fg),
      _window(NewTopLevel(x, y, width, height)) {}

Window::Window(Window* parent, int x, int y, int width, int height, int bg, int fg)
    : _parent(parent),
      _x(parent->_x + x),
      _y(parent->_y + y),
      _width(width),
      _height(height),
      _bgColor(bg == PARENT_COLOUR ? parent->_bgColor : bg),
      _fgColor(fg == PARENT_COLOUR ? parent->_fgColor : fg),
      _window(NewChild(parent->Curses(), _x, _y, width, height)) {
  parent->_children.push_back(this);
}

Window::~Window() {
  if (_parent != nullptr) {
    _parent->RemoveChild(this);
  }
  DeleteChildren();
}

Window* Window::CreateChild(int x, int y, int width, int height, int bg, int fg) {
  return Add<Window>(x, y, width, height, bg, fg);
}

void Window::DeleteChildren() {
  while (!_children.empty()) {
    delete _children.front();  // takes itself from the list
  }
}

void Window::RemoveChild(Window* child) {
  const auto found = std::find(_children.begin(), _children.end(), child);
  if (found != _children.end()) {
    _children.erase(found);
  }
}

void Window::Activate(bool active) {
  _active = active;
  if (!active && _parent == nullptr) {
    SaveCursor();
  }
  if (active) {
    ApplyColours(_bgColor, _fgColor);
  } else {
    ApplyColours(BLACK, DARK_GREY);
  }
  for (Window* child : _children) {
    child->Activate(active);
  }
  Refresh();
  if (active && _parent == nullptr) {
    RestoreCursor();
  }
  flushinp();
}

void Window::SaveCursor() {
  _savedCursor = _cursor;
  _savedX = _xCursor;
  _savedY = _yCursor;
  SetCursorVisible(false);
}

void Window::RestoreCursor() {
  _xCursor = _savedX;
  _yCursor = _savedY;
  SetCursorVisible(_savedCursor);
  if (_savedCursor) {
    move(_savedY, _savedX);
  }
}

void Window::SetColours(int bg, int fg) {
  _bgColor = bg == PARENT_COLOUR ? _parent->_bgColor : bg;
  _fgColor = fg == PARENT_COLOUR ? _parent->_fgColor : fg;
  if (!_active) {
    return;
  }
  ApplyColours(_bgColor, _fgColor);
  for (Window* child : _children) {
    child->SetColours(bg, fg);
  }
}

// Every cell takes the colours. The background function of curses changes only those cells whose
// colours are the window's previous background, and a parent has recoloured the cells of its
// children before.
void Window::ApplyColours(int bg, int fg) {
  WINDOW* const window = Curses();
  if (window == nullptr) {
    return;
  }
  const attr_t attributes = ColourAttr(bg, fg);
  int x = 0;
  int y = 0;
  getyx(window, y, x);
  wbkgdset(window, ' ' | attributes);
  wattrset(window, static_cast<int>(attributes));
  for (int row = 0; row < _height; ++row) {
    RecolourRow(window, row, _width, attributes);
  }
  wmove(window, y, x);
}

void Window::TouchAll() {
  if (Curses() != nullptr) {
    wtouchln(Curses(), 0, getmaxy(Curses()), 1);
  }
}

void Window::Refresh() {
  TouchAll();
  if (Curses() != nullptr) {
    wnoutrefresh(Curses());
  }
}

void Window::RedrawLines() {
  if (Curses() != nullptr) {
    wredrawln(Curses(), 0, getmaxy(Curses()));
  }
  for (Window* child : _children) {
    child->RedrawLines();
  }
}

void Window::PutText(int x, int y, const std::string& text) {
  if (Curses() == nullptr || wmove(Curses(), y, x) == ERR) {
    return;
  }
  const std::wstring cells = PrintableCells(text, _width - x);
  waddnwstr(Curses(), cells.data(), static_cast<int>(cells.size()));
}

void Window::MoveCursor(int x, int y) {
  _xCursor = _x + x;
  _yCursor = _y + y;
  move(_yCursor, _xCursor);
}

void Window::SetCursorVisible(bool visible) {
  _cursor = visible;
  curs_set(visible ? 1 : 0);
}

void Window::Erase() {
  if (Curses() != nullptr) {
    werase(Curses());
  }
}

void Window::DrawBox() {
  if (Curses() != nullptr) {
    box(Curses(), 0, 0);
  }
}

void Window::DrawRule(int x, int y, int length) {
  if (Curses() != nullptr) {
    mvwhline(Curses(), y, x, 0, length);
  }
}

}  // namespace Tarnel
