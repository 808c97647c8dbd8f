#include "console/widgets/markup_layout.h"

#include <gtest/gtest.h>

#include <initializer_list>
#include <stdexcept>

namespace Tarnel::Testing {
namespace {

const ValueTags FACTS = {
    {"ip", [] { return std::string("10.0.0.1"); }},
    {"nothing", [] { return std::string(); }},
    {"fails", []() -> std::string { throw std::runtime_error("no fact"); }},
};

struct Row {
  const char* text;
  const char* display;
  int width = 10;
};

void ExpectLayouts(std::initializer_list<Row> rows) {
  for (const Row& row : rows) {
    EXPECT_EQ(LayoutMarkup(row.text, row.width, FACTS), row.display) << row.text;
  }
}

TEST(Layout, WrapsAtWhiteSpaceOrAtTheEdge) {
  ExpectLayouts({
      {"", ""},
      {"abcdefghij", "abcdefghij"},
      {"abcdefghijk", "abcdefghij\nk"},
      {"abcdefghijklmnopqrstu", "abcdefghij\nklmnopqrst\nu"},
      // White space at the edge is the break; the next one is text.
      {"abcdefghij kl", "abcdefghij\nkl"},
      {"abcdefghij  kl", "abcdefghij\n kl"},
      {"abcdefghij\nkl", "abcdefghij\nkl"},
      {"a\n\nb", "a\n\nb"},
      {"a b c defghij kl", "a b c\ndefghij kl"},
      {"abc\tdefghijk lm", "abc\ndefghijk\nlm"},
      {" abcdefghij", "\nabcdefghij"},
      // A column is a byte, and no byte above 127 is white space.
      {"\xC3\xA9\xC3\xA9\xC3\xA9", "\xC3\xA9\xC3\xA9\n\xC3\xA9", 4},
      {"\xA0\x85zz\xA0", "\xA0\x85zz\n\xA0", 4},
      {"ab c", "a\nb\nc", 1},
      {"ab c", "", 0},
  });
}

TEST(Layout, HandlesItsTagsAndPassesTheRest) {
  ExpectLayouts({
      {"a}b{}c", "a}bc"},
      {"ab{color:red cd\nef", "ab"},
      {"a{x:y:z}b", "a{x:y:z}b"},
      {"{a{b}c", "{a{b}c"},
      {"ab{x\ny}cdefghijk", "ab{x\ny}cdefghij\nk"},
      {"abcde{color:red}fghij{/color}k", "abcde{color:red}fghij{/color}\nk"},
      {"abc {color:red}defghijk{/color}", "abc\n{color:red}defghijk{/color}"},
      // An unknown alignment opens nothing.
      {"{align:left}ab{/align}c{/align}d", "abcd"},
      {"{align:x}{align:right}ab{/align:y}", "        ab"},
  });
}

TEST(Layout, PutsFactsInPlaceOfTheirTags) {
  ExpectLayouts({
      {"a{ip}b{nothing}", "a10.0.0.1b"},
      {"{ip:x}{ip:}{IP}", "{ip:x}{ip:}{IP}"},
      // A fact is broken where it stands and is no part of a word.
      {"ab{ip}", "ab10.0.0.1"},
      {"abc d{ip}", "abc d10.0.\n0.1"},
      {"abcdefghij{ip}", "abcdefghij\n10.0.0.1"},
      {"{ip}{ip}", "10.0\n.0.1\n10.0\n.0.1", 4},
      {"{align:padding:4}{ip}{/align}|", "10.0|"},
      {"{align:padding:1}a{ip}{/align}|", "a|"},
  });
  EXPECT_THROW(LayoutMarkup("a{fails}b", 10, FACTS), std::runtime_error);
}

TEST(Layout, AlignsRegionsThatFitOnTheirLine) {
  ExpectLayouts({
      {"{align:right}ab{/align}", "        ab"},
      {"{align:right}abcdefghij{/align}", "abcdefghij"},
      {"a{align:right}{color:red}b{/color}{/align}", "a        {color:red}b{/color}"},
      {"{align:right}a{align:center}b{/align}", "        ab"},
      {"a{align:right}b", "ab"},
      {"{align:center}abc{/align}d", "   abc\nd"},
      {"12{align:center}ab{/align}", "12   ab"},
      // Behind the region the line is full.
      {"{align:right}ab{/align} cd", "        ab\ncd"},
      {"{align:right}ab{/align}\ncd", "        ab\ncd"},
      {"a {align:right}b c{/align}de", "a      b c\nde"},
      {"{align:right}a{/align}{align:right}b{/align}", "         a\n         b"},
      {"<F2> Change{align:right}<F12> Shut Down{/align}",
       "<F2> Change               <F12> Shut Down", 41},
  });
}

TEST(Layout, AlignsLongerRegionsLineByLine) {
  ExpectLayouts({
      {"{align:right}hello world{/align}", "     hello\n     world"},
      {"{align:center}hello world{/align}", "  hello\n  world"},
      {"12{align:right}a\n\nb{/align}", "12       a\n          \n         b"},
      {"{align:right}abcdefghijkl{/align}", "abcdefghij\n        kl"},
      {"abc {align:right}defghijkl{/align}", "abc\n defghijkl"},
  });
}

TEST(Layout, CutsAndFillsColumns) {
  ExpectLayouts({
      {"{align:padding:5}abcdefgh{/align}|", "abcde|"},
      {"{align:padding:5}abcde{/align}|", "abcde|"},
      {"{align:padding:5}ab{/align}|", "ab   |"},
      {"{align:padding:0}ab cd{/align}|", "|"},
      // Below 0 there is no limit, for this region alone.
      {"{align:padding:-2}a{/align}{align:padding:3}bcdef{/align}|", "abcd|"},
      {"{align:padding:-99999999999999999999}ab{/align}|", "ab|"},
      // A column takes the rest of the line at most, and wraps there.
      {"{align:padding:99999999999999999999}ab{/align}|", "ab        \n|"},
      {"abcdefgh{align:padding:5}ijkl{/align}|", "abcdefghij\nkl |"},
      {"{align:padding:3}{color:red}ab{/color}{/align}|", "{color:red}ab{/color} |"},
      // White space that was cut off is no place to break.
      {"{align:padding:2}ab cd{/align}efghijklmn", "abefghijkl\nmn"},
      {"{align:padding:3}a b{/align}efghijklmn", "a\nbefghijklm\nn"},
      {"    {align:padding:13}Device Name{/align}{align:padding:30}Label (MAC){/align}Status",
       "    Device Name  Label (MAC)                   Status", 80},
  });
}

}  // namespace
}  // namespace Tarnel::Testing
