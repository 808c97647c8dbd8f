#include "console/screen/key_map.h"

#include <curses.h>
#include <gtest/gtest.h>

#include "tests/support/curses_screen.h"

namespace Tarnel {

namespace {

struct KeyRow {
  int code;
  std::vector<std::string> sequences;
};

const KeyRow KEYS[] = {
    {410, {"\033R"}},
    {265, {"\033[11~", "\0331", "\033[M"}},
    {266, {"\033[12~", "\0332", "\033[N"}},
    {267, {"\033[13~", "\0333", "\033[O"}},
    {268, {"\033[14~", "\0334", "\033[P"}},
    {269, {"\033[15~", "\0335", "\033[Q"}},
    {270, {"\033[17~", "\0336", "\033[R"}},
    {271, {"\033[18~", "\0337", "\033[S"}},
    {272, {"\033[19~", "\0338", "\033[T"}},
    {273, {"\033[20~", "\0339", "\033[U"}},
    {274, {"\033[21~", "\0330", "\033[V"}},
    {275, {"\033[23~", "\033!", "\033[W"}},
    {276, {"\033[24~", "\033@", "\033[X"}},
    {262, {"\033h", "\033[1~"}},
    {360, {"\033k", "\033[4~"}},
    {331, {"\033+", "\033[2~"}},
    {330, {"\033-", "\033[3~"}},
    {339, {"\033?", "\033[5~"}},
    {338, {"\033/", "\033[6~"}},
    {259, {"\033OA", "\033[A"}},
    {258, {"\033OB", "\033[B"}},
    {261, {"\033OC", "\033[C"}},
    {260, {"\033OD", "\033[D"}},
    {263, {"\177"}},
    // Characters that stand for themselves.
    {10, {"\n"}},
    {'q', {"q"}},
    {'R', {"R"}},
    {'~', {"~"}},
    {0xc3, {"\303"}},
    {0xff, {"\377"}},
};

class KeyMap : public testing::TestWithParam<const char*> {};

TEST_P(KeyMap, MakesOneKeyOfEachSequence) {
  Testing::CursesScreen screen(10, 2, GetParam());
  wtimeout(stdscr, 0);
  for (const KeyRow& row : KEYS) {
    for (const std::string& sequence : row.sequences) {
      screen.Type(sequence);
      EXPECT_EQ(wgetch(stdscr), row.code) << testing::PrintToString(sequence);
      EXPECT_EQ(wgetch(stdscr), ERR) << testing::PrintToString(sequence);
    }
  }
}

// Types whose own descriptions give some of the sequences another meaning are among them.
INSTANTIATE_TEST_SUITE_P(Types, KeyMap,
                         testing::Values("linux", "xterm", "xterm-256color", "vt100", "vt220",
                                         "screen-256color", "dumb"));

}  // namespace

}  // namespace Tarnel
