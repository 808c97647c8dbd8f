#include "console/screen/key_map.h"

#include <curses.h>

namespace Tarnel {

namespace {

struct KeySequence {
  int key;
  const char* sequence;
};

// For each key what terminals send, then what a person can type after Esc on a serial line.
constexpr KeySequence KEY_SEQUENCES[] = {
    {KEY_RESIZE, "\033R"},   {KEY_F(1), "\033[11~"},  {KEY_F(1), "\0331"},
    {KEY_F(1), "\033[M"},    {KEY_F(2), "\033[12~"},  {KEY_F(2), "\0332"},
    {KEY_F(2), "\033[N"},    {KEY_F(3), "\033[13~"},  {KEY_F(3), "\0333"},
    {KEY_F(3), "\033[O"},    {KEY_F(4), "\033[14~"},  {KEY_F(4), "\0334"},
    {KEY_F(4), "\033[P"},    {KEY_F(5), "\033[15~"},  {KEY_F(5), "\0335"},
    {KEY_F(5), "\033[Q"},    {KEY_F(6), "\033[17~"},  {KEY_F(6), "\0336"},
    {KEY_F(6), "\033[R"},    {KEY_F(7), "\033[18~"},  {KEY_F(7), "\0337"},
    {KEY_F(7), "\033[S"},    {KEY_F(8), "\033[19~"},  {KEY_F(8), "\0338"},
    {KEY_F(8), "\033[T"},    {KEY_F(9), "\033[20~"},  {KEY_F(9), "\0339"},
    {KEY_F(9), "\033[U"},    {KEY_F(10), "\033[21~"}, {KEY_F(10), "\0330"},
    {KEY_F(10), "\033[V"},   {KEY_F(11), "\033[23~"}, {KEY_F(11), "\033!"},
    {KEY_F(11), "\033[W"},   {KEY_F(12), "\033[24~"}, {KEY_F(12), "\033@"},
    {KEY_F(12), "\033[X"},   {KEY_HOME, "\033h"},     {KEY_HOME, "\033[1~"},
    {KEY_END, "\033k"},      {KEY_END, "\033[4~"},    {KEY_IC, "\033+"},
    {KEY_IC, "\033[2~"},     {KEY_DC, "\033-"},       {KEY_DC, "\033[3~"},
    {KEY_PPAGE, "\033?"},    {KEY_PPAGE, "\033[5~"},  {KEY_NPAGE, "\033/"},
    {KEY_NPAGE, "\033[6~"},  {KEY_UP, "\033OA"},      {KEY_UP, "\033[A"},
    {KEY_DOWN, "\033OB"},    {KEY_DOWN, "\033[B"},    {KEY_RIGHT, "\033OC"},
    {KEY_RIGHT, "\033[C"},   {KEY_LEFT, "\033OD"},    {KEY_LEFT, "\033[D"},
    {KEY_BACKSPACE, "\177"},
};
static_assert(sizeof(KEY_SEQUENCES) / sizeof(KEY_SEQUENCES[0]) == 58);

}  // namespace

void InitKeyMap() {
  for (const KeySequence& entry : KEY_SEQUENCES) {
    define_key(entry.sequence, entry.key);
  }
}

}  // namespace Tarnel
