#pragma once

#include <curses.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace Tarnel {

struct CursesWindowDeleter {
  void operator()(WINDOW* window) const { delwin(window); }
};
using CursesWindow = std::unique_ptr<WINDOW, CursesWindowDeleter>;

// One curses window with its place, its two colours and its children. It is either active, in its
// own colours, or dimmed, dark grey on black. A top-level window has cells of its own; a child
// shares the cells of its parent, which owns it.
//
// x comes before y, width before height and background before foreground, everywhere. A window
// that does not fit has no cells: every operation on it does nothing.
class Window {
 public:
  // A top-level window at a place on the screen.
  Window(int x, int y, int width, int height, int bg, int fg);
  // A child at a place relative to its parent; a colour of -1 is the parent's. Always made with
  // new: the parent deletes it.
  Window(Window* parent, int x, int y, int width, int height, int bg, int fg);
  virtual ~Window();
  Window(const Window&) = delete;
  Window& operator=(const Window&) = delete;

  // Shows the window and its children in their own colours or dimmed, and drops all keys that were
  // typed ahead.
  virtual void Activate(bool active);

  // A plain child, owned by this window.
  Window* CreateChild(int x, int y, int width, int height, int bg, int fg);
  // A child of another kind, owned by this window.
  template <class Child, class... Arguments>
  Child* Add(Arguments&&... arguments) {
    return new Child(this, std::forward<Arguments>(arguments)...);
  }
  void DeleteChildren();
  // Takes the first entry that equals the child from the list, without destroying it.
  void RemoveChild(Window* child);

  // New colours for this window and all below it; a dimmed window only keeps them for later.
  void SetColours(int bg, int fg);
  // Marks every line as changed.
  void TouchAll();
  // Stages the whole window for the next UpdateScreen().
  void Refresh();
  // Has the lines of this window and of all below it sent again, whatever the terminal shows.
  void RedrawLines();
  // Writes at a place in this window, with its current attributes, up to the end of the row. What
  // is no printable character takes one cell all the same.
  void PutText(int x, int y, const std::string& text);
  // Clears all cells to the background.
  void Erase();
  // Draws the default line characters around the window.
  void DrawBox();
  // Draws a horizontal line of so many default characters.
  void DrawRule(int x, int y, int length);

  int Width() const { return _width; }
  int Height() const { return _height; }

  // The one cursor of the screen, at a place relative to this window.
  void MoveCursor(int x, int y);
  static void SetCursorVisible(bool visible);

 protected:
  WINDOW* Curses() const { return _window.get(); }

  Window* _parent = nullptr;
  int _x;
  int _y;
  int _width;
  int _height;
  int _bgColor;
  int _fgColor;
  std::vector<Window*> _children;
  bool _active = true;

  static bool _cursor;
  static int _xCursor;
  static int _yCursor;

 private:
  void ApplyColours(int bg, int fg);
  void SaveCursor();
  void RestoreCursor();

  CursesWindow _window;
  bool _savedCursor = false;
  int _savedX = 0;
  int _savedY = 0;
};

}  // namespace Tarnel
