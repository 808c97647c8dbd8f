#include "shell/key_map.h"

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
    {410, {"\x1bR"}},
    {265,
     {"\x1b[11~",
      "\x1b"
      "1",
      "\x1b[M"}},
    {266,
     {"\x1b[12~",
      "\x1b"
      "2",
      "\x1b[N"}},
    {267,
     {"\x1b[13~",
      "\x1b"
      "3",
      "\x1b[O"}},
    {268,
     {"\x1b[14~",
      "\x1b"
      "4",
      "\x1b[P"}},
    {269,
     {"\x1b[15~",
      "\x1b"
      "5",
      "\x1b[Q"}},
    {270,
     {"\x1b[17~",
      "\x1b"
      "6",
      "\x1b[R"}},
    {271,
     {"\x1b[18~",
      "\x1b"
      "7",
      "\x1b[S"}},
    {272,
     {"\x1b[19~",
      "\x1b"
      "8",
      "\x1b[T"}},
    {273,
     {"\x1b[20~",
      "\x1b"
      "9",
      "\x1b[U"}},
    {274,
     {"\x1b[21~",
      "\x1b"
      "0",
      "\x1b[V"}},
    {275, {"\x1b[23~", "\x1b!", "\x1b[W"}},
    {276, {"\x1b[24~", "\x1b@", "\x1b[X"}},
    {262, {"\x1bh", "\x1b[1~"}},
    {360, {"\x1bk", "\x1b[4~"}},
    {331, {"\x1b+", "\x1b[2~"}},
    {330, {"\x1b-", "\x1b[3~"}},
    {339, {"\x1b?", "\x1b[5~"}},
    {338, {"\x1b/", "\x1b[6~"}},
    {259, {"\x1bOA", "\x1b[A"}},
    {258, {"\x1bOB", "\x1b[B"}},
    {261, {"\x1bOC", "\x1b[C"}},
    {260, {"\x1bOD", "\x1b[D"}},
    {263, {"\x7f"}},
};

class KeyMap : public testing::TestWithParam<const char*> {};

TEST_P(KeyMap, MakesOneKeyOfEachSequence) {
  Testing::CursesScreen screen(10, 2, GetParam());
  wtimeout(stdscr, 0);
  int count = 0;
  for (const KeyRow& row : KEYS) {
    for (const std::string& sequence : row.sequences) {
      screen.Type(sequence);
      EXPECT_EQ(wgetch(stdscr), row.code) << testing::PrintToString(sequence);
      EXPECT_EQ(wgetch(stdscr), ERR) << testing::PrintToString(sequence);
      ++count;
    }
  }
  EXPECT_EQ(count, 58);
}

TEST_P(KeyMap, LeavesOtherCharactersAlone) {
  Testing::CursesScreen screen(10, 2, GetParam());
  wtimeout(stdscr, 0);
  for (const int character :
       {10, 9, 32, int{'q'}, int{'R'}, int{'1'}, int{'~'}, 0xc3, 0xbc, 0xff}) {
    screen.Type(std::string(1, static_cast<char>(character)));
    EXPECT_EQ(wgetch(stdscr), character);
  }
}

// Types whose own descriptions give some of the sequences another meaning are among them.
INSTANTIATE_TEST_SUITE_P(Types, KeyMap,
                         testing::Values("linux", "xterm", "xterm-256color", "vt100", "vt220",
                                         "screen-256color", "dumb"));

}  // namespace

}  // namespace Tarnel
