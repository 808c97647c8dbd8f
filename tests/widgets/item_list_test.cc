#include "console/widgets/item_list.h"

#include <curses.h>
#include <gtest/gtest.h>

#include <map>
#include <memory>
#include <vector>

#include "console/screen/screen.h"
#include "console/widgets/input_item.h"
#include "tests/support/curses_screen.h"

namespace Tarnel::Testing {
namespace {

constexpr int COLUMNS = 23;
constexpr int ROWS = 3;

// A list over the whole of a small screen; the rows' texts are 20 columns wide.
class ItemListTest : public testing::Test {
 protected:
  ItemListTest() { _window.Activate(true); }
  template <class Kind, class... Arguments>
  Kind* Add(Arguments&&... arguments) {
    auto item = std::make_unique<Kind>(std::forward<Arguments>(arguments)...);
    Kind* const added = item.get();
    _items.push_back(std::move(item));
    return added;
  }
  void Show() {
    std::vector<Item*> items;
    for (const auto& item : _items) items.push_back(item.get());
    _list->SetItems(items);
    Paint();
  }
  void Paint() {
    _list->Repaint();
    UpdateScreen();
  }

  CursesScreen _screen{COLUMNS, ROWS};
  Window _window{0, 0, COLUMNS, ROWS, YELLOW, DARK_GREY};
  ItemList* _list = _window.Add<ItemList>(0, 0, COLUMNS, ROWS);
  std::vector<std::unique_ptr<Item>> _items;
};

struct EditCase {
  std::vector<int> keys;
  const char* value;
  const char* shown;
  int cursor;
};

// Label of four columns, a field of six from column 12 of the screen on.
TEST_F(ItemListTest, EditsAField) {
  const EditCase cases[] = {
      {{}, "abc", "abc   ", 3},
      {{'x'}, "x", "x     ", 1},
      {{'x', 'y', 'z', '1', '2', '3', '4'}, "xyz1234", "yz1234", 6},
      {{KEY_LEFT, 'x'}, "abxc", "abxc  ", 3},
      {{KEY_HOME, 'x', KEY_END, 'y'}, "xabcy", "xabcy ", 5},
      {{KEY_LEFT, KEY_LEFT, KEY_LEFT, KEY_LEFT, KEY_DC}, "bc", "bc    ", 0},
      {{KEY_RIGHT, KEY_DC, KEY_BACKSPACE}, "ab", "ab    ", 2},
      {{KEY_HOME, KEY_BACKSPACE}, "abc", "abc   ", 0},
      {{KEY_DC}, "", "      ", 0},
      {{8, 'q'}, "q", "q     ", 1},
      {{KEY_DC, KEY_END, KEY_LEFT, KEY_DC, 8}, "", "      ", 0},
      {{200}, "", "      ", 0},
      // The value is markup to the row.
      {{'{', '}', ' '}, "{} ", "    ", 3},
      // Back over the left edge of a scrolled field: it scrolls to its end again.
      {{'1', '2', '3', '4', '5', '6', '7', '8', KEY_LEFT, KEY_LEFT, KEY_LEFT, KEY_LEFT, KEY_LEFT,
        KEY_LEFT, KEY_BACKSPACE},
       "1345678",
       "345678",
       6},
  };
  for (const EditCase& edit : cases) {
    SCOPED_TRACE(edit.value);
    _items.clear();
    auto* const item = Add<InputItem>("Name", "abc", 6);
    Show();
    for (const int key : edit.keys) {
      item->HandleKey(key);
      Paint();
    }
    EXPECT_EQ(item->Value(), edit.value);
    EXPECT_EQ(_screen.Row(0), std::string(" Name      [ ") + edit.shown + " ]");
    EXPECT_EQ(CursesScreen::CursorX(), 13 + edit.cursor);
  }
}

struct ScrollCase {
  const char* value;
  const char* keys;  // Left, Right, Home, End, Backspace, Delete
  const char* shown;
  int cursor;
};

TEST_F(ItemListTest, ScrollsAFieldToItsCursor) {
  const std::map<char, int> keys = {{'L', KEY_LEFT}, {'R', KEY_RIGHT},     {'H', KEY_HOME},
                                    {'E', KEY_END},  {'B', KEY_BACKSPACE}, {'D', KEY_DC}};
  const ScrollCase cases[] = {
      {"12345678", "", "345678", 6},
      {"12345678", "LLLLLL", "345678", 0},
      {"12345678", "LLLLLLL", "234567", 0},
      {"12345678", "H", "123456", 0},
      {"12345678", "HRRRRRR", "123456", 6},
      {"12345678", "HRRRRRRR", "234567", 6},
      {"12345678", "LLLLLLLE", "345678", 6},
      {"12345678", "HD", "234567", 0},
      // A value that has become shorter than its field is shown from its start.
      {"12345678", "EBB", "3456  ", 4},
      {"12345678", "EBBB", "12345 ", 5},
      // Columns are bytes.
      {"\u00e9b", "", "\u00e9b    ", 3},
  };
  for (const ScrollCase& scroll : cases) {
    SCOPED_TRACE(scroll.keys);
    _items.clear();
    auto* const item = Add<InputItem>("Name", scroll.value, 6);
    Show();
    for (const char* key = scroll.keys; *key != '\0'; ++key) {
      item->HandleKey(keys.at(*key));
      Paint();
    }
    EXPECT_EQ(_screen.Row(0), std::string(" Name      [ ") + scroll.shown + " ]");
    EXPECT_EQ(CursesScreen::CursorX(), 13 + scroll.cursor);
  }
}

TEST_F(ItemListTest, ShowsTheFieldInFocusInverted) {
  auto* const secret = Add<InputItem>("PIN", "12", 6);
  secret->SetMasked(true);
  Add<InputItem>("Name", "root ", 6);
  Show();
  EXPECT_EQ(_screen.Row(0), " PIN       [ **     ]");
  EXPECT_EQ(_screen.Row(1), " Name      [ root   ]");
  EXPECT_EQ(_screen.Colours(0), "3/6*1 0/7*12 7/0*2 0/7*6 3/6*2");
  EXPECT_EQ(_screen.Colours(1), "3/6*1 3/0*20 3/6*2");
  secret->HandleKey(KEY_END);
  Paint();
  EXPECT_EQ(_screen.Colours(0), "3/6*1 0/7*20 3/6*2");
  _list->MoveDown();
  secret->SetEnabled(false);
  Paint();
  EXPECT_EQ(_screen.Colours(0), "3/6*23");
  EXPECT_EQ(CursesScreen::CursorY(), 1);
  // With the focus a field becomes pristine again.
  secret->SetEnabled(true);
  _list->MoveUp();
  secret->HandleKey('9');
  EXPECT_EQ(secret->Value(), "9");
}

TEST_F(ItemListTest, MovesTheFocusOverWhatCannotTakeIt) {
  Add<LabelItem>("head", false);
  Add<LabelItem>("off", true)->SetEnabled(false);
  Add<CheckItem>("a", true, 2);
  Add<LabelItem>("", false);
  Add<RadioItem>("b", false)->SetEnabled(false);
  Add<RadioItem>("c", true);
  Add<LabelItem>("tail", false);
  Show();
  EXPECT_EQ(
      _screen.Picture(),
      " head                 \u2588\n off                  \u2593\n   [X] a              \u2593\n");
  EXPECT_EQ(_list->SelectionIndex(), 1);
  _list->MoveUp();
  EXPECT_EQ(_list->SelectionIndex(), 1);
  _list->MoveDown();
  UpdateScreen();
  EXPECT_EQ(_list->SelectionIndex(), 3);
  EXPECT_EQ(_list->FocusIndex(), 5);
  // 3 of 4 hidden rows are 75 %, of which the thumb's two steps give 1.
  EXPECT_EQ(
      _screen.Picture(),
      "                      \u2593\n ( ) b                \u2588\n (o) c                \u2593\n");
  EXPECT_EQ(_screen.Colours(2), "3/6*1 0/7*20 3/6*2");
  _list->MoveDown();
  EXPECT_EQ(_list->FocusIndex(), 5);
  _list->MoveUp();
  UpdateScreen();
  EXPECT_EQ(_list->SelectionIndex(), 1);
  EXPECT_EQ(_screen.Row(0), "   [X] a              \u2593");
  _list->SelectItem(9);
  EXPECT_EQ(_list->SelectionIndex(), 1);
}

TEST_F(ItemListTest, HasNoBarWhenAllFits) {
  for (int item = 0; item <= ROWS; ++item) Add<LabelItem>("row", item > 0);
  Show();
  _items.pop_back();
  Show();
  EXPECT_EQ(_screen.Picture(), " row\n row\n row\n");
  EXPECT_EQ(_list->FocusIndex(), 1);
  _items.clear();
  Show();
  EXPECT_EQ(_screen.Picture(), "");
}

TEST_F(ItemListTest, ShowsNothingWithoutRoom) {
  for (const char* const label : {"a", "b", "c"}) Add<LabelItem>(label, true);
  _list = _window.Add<ItemList>(0, 0, COLUMNS, 0);
  Show();
  _list->MoveDown();
  _list->MoveDown();
  _list->MoveUp();
  Paint();
  EXPECT_EQ(_screen.Picture(), "");
  EXPECT_EQ(_list->SelectionIndex(), 1);
}

}  // namespace
}  // namespace Tarnel::Testing
