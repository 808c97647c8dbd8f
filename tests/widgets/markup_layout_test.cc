#include "widgets/markup_layout.h"

#include <gtest/gtest.h>

#include <ostream>
#include <stdexcept>

namespace Tarnel::Testing {
namespace {

const ValueTags FACTS = {
    {"ip", [] { return std::string("10.0.0.1"); }},
    {"nothing", [] { return std::string(); }},
    {"fails", []() -> std::string { throw std::runtime_error("no fact"); }},
};

struct LayoutCase {
  const char* name;
  const char* text;
  const char* display;
  int width = 10;
};

std::ostream& operator<<(std::ostream& out, const LayoutCase& row) { return out << row.text; }

class LayoutTable : public testing::TestWithParam<LayoutCase> {};

TEST_P(LayoutTable, GivesTheDisplayText) {
  const LayoutCase& row = GetParam();
  EXPECT_EQ(LayoutMarkup(row.text, row.width, FACTS), row.display);
}

std::string CaseName(const testing::TestParamInfo<LayoutCase>& info) { return info.param.name; }

INSTANTIATE_TEST_SUITE_P(
    Wrapping, LayoutTable,
    testing::Values(
        LayoutCase{"Empty", "", ""}, LayoutCase{"ExactWidth", "abcdefghij", "abcdefghij"},
        LayoutCase{"OneOver", "abcdefghijk", "abcdefghij\nk"},
        LayoutCase{"LongWordTwice", "abcdefghijklmnopqrstu", "abcdefghij\nklmnopqrst\nu"},
        LayoutCase{"BlankAtTheEdgeIsGone", "abcdefghij kl", "abcdefghij\nkl"},
        LayoutCase{"SecondBlankStays", "abcdefghij  kl", "abcdefghij\n kl"},
        LayoutCase{"LineEndAtTheEdgeIsOneBreak", "abcdefghij\nkl", "abcdefghij\nkl"},
        LayoutCase{"LineEndBehindTheEdge", "abcdefghij\n\nkl", "abcdefghij\n\nkl"},
        LayoutCase{"TwoLineEnds", "a\n\nb", "a\n\nb"}, LayoutCase{"OnlyLineEnds", "\n\n", "\n\n"},
        LayoutCase{"WordMoves", "abc defghijk", "abc\ndefghijk"},
        LayoutCase{"LastBlankCounts", "a b c defghij", "a b c\ndefghij"},
        LayoutCase{"BlankInFront", " abcdefghij", "\nabcdefghij"},
        LayoutCase{"MovedWordLeavesTheRightRest", "abc defghij klm", "abc\ndefghij\nklm"},
        LayoutCase{"TabIsWhiteSpace", "abc\tdefghijk", "abc\ndefghijk"},
        LayoutCase{"ColumnsAreBytes", "\xC3\xA9\xC3\xA9\xC3\xA9", "\xC3\xA9\xC3\xA9\n\xC3\xA9", 4},
        LayoutCase{"HighBytesAreNoWhiteSpace",
                   "a\xA0\x85"
                   "bcde",
                   "a\xA0\x85"
                   "b\ncde",
                   4},
        LayoutCase{"WidthOne", "ab c", "a\nb\nc", 1}, LayoutCase{"WidthZero", "ab c", "", 0},
        LayoutCase{"WidthBelowZero", "{align:right}ab{/align}", "", -3}),
    CaseName);

INSTANTIATE_TEST_SUITE_P(
    Tags, LayoutTable,
    testing::Values(
        LayoutCase{"ClosingBraceIsText", "a}b", "a}b"},
        LayoutCase{"UnclosedTakesTheRest", "ab{color:red cd\nef", "ab"},
        LayoutCase{"EmptyIsDropped", "a{}b", "ab"},
        LayoutCase{"UnknownPasses", "a{x:y:z}b", "a{x:y:z}b"},
        LayoutCase{"OpeningBraceInside", "{a{b}c", "{a{b}c"},
        LayoutCase{"TakesNoColumns", "abcde{color:red}fghij{/color}k",
                   "abcde{color:red}fghij{/color}\nk"},
        LayoutCase{"LineEndInsideIsContent", "ab{x\ny}cdefghijk", "ab{x\ny}cdefghij\nk"},
        LayoutCase{"TravelsWithItsWord", "abc {color:red}defghijk{/color}",
                   "abc\n{color:red}defghijk{/color}"},
        LayoutCase{"OtherAlignHasNoEffect", "{align:left}ab{/align}c", "abc"},
        LayoutCase{"OtherAlignLeavesRoomForOne", "{align:x}{align:right}ab{/align}", "        ab"},
        LayoutCase{"CloseWithoutOpen", "a{/align}b", "ab"},
        LayoutCase{"CloseWithAValue", "{align:right}ab{/align:x}", "        ab"}),
    CaseName);

INSTANTIATE_TEST_SUITE_P(
    Facts, LayoutTable,
    testing::Values(LayoutCase{"InsideAText", "a{ip}b", "a10.0.0.1b"},
                    LayoutCase{"Empty", "a{nothing}b", "ab"},
                    LayoutCase{"WithAValueIsUnknown", "{ip:x}", "{ip:x}"},
                    LayoutCase{"WithAColonIsUnknown", "{ip:}", "{ip:}"},
                    LayoutCase{"CaseMatters", "{IP}", "{IP}"},
                    LayoutCase{"BrokenAtTheEdge", "abc d{ip}", "abc d10.0.\n0.1"},
                    LayoutCase{"ExactWidth", "ab{ip}", "ab10.0.0.1"},
                    LayoutCase{"BehindAFullLine", "abcdefghij{ip}", "abcdefghij\n10.0.0.1"},
                    LayoutCase{"SeveralLines", "{ip}{ip}", "10.0\n.0.1\n10.0\n.0.1", 4},
                    LayoutCase{"MovesWithTheWordBehindIt", "a {ip}c", "a\n10.0.0.1c"},
                    LayoutCase{"CutByItsColumn", "{align:padding:4}{ip}{/align}|", "10.0|"},
                    LayoutCase{"FilledInItsColumn", "{align:padding:9}{ip}{/align}|", "10.0.0.1 |"},
                    LayoutCase{"DroppedByAFullColumn", "{align:padding:1}a{ip}{/align}|", "a|"},
                    LayoutCase{"Right", "{align:right}{ip}{/align}", "  10.0.0.1"}),
    CaseName);

INSTANTIATE_TEST_SUITE_P(
    Right, LayoutTable,
    testing::Values(
        LayoutCase{"Alone", "{align:right}ab{/align}", "        ab"},
        LayoutCase{"TwoEdges", "Left{align:right}ab{/align}", "Left    ab"},
        LayoutCase{"NoRoomLeft", "{align:right}abcdefghij{/align}", "abcdefghij"},
        LayoutCase{"EmptyRegion", "a{align:right}{/align}", "a         "},
        LayoutCase{"NextBlankIsGone", "{align:right}ab{/align} cd", "        ab\ncd"},
        LayoutCase{"NextLineEndIsOneBreak", "{align:right}ab{/align}\ncd", "        ab\ncd"},
        LayoutCase{"NextByteStartsALine", "{align:right}ab{/align}cd", "        ab\ncd"},
        LayoutCase{"NextByteLeavesTheRegionWhole", "a {align:right}b c{/align}de",
                   "a      b c\nde"},
        LayoutCase{"NextRegionStartsALine", "{align:right}a{/align}{align:right}b{/align}",
                   "         a\n         b"},
        LayoutCase{"SecondAlignIsIgnored", "{align:right}a{align:center}b{/align}", "        ab"},
        LayoutCase{"BlanksGoBeforeColours", "a{align:right}{color:red}b{/color}{/align}",
                   "a        {color:red}b{/color}"},
        LayoutCase{"Unclosed", "a{align:right}b", "ab"},
        LayoutCase{"UnclosedWithALineEnd", "{align:right}a\nb", "a\nb"},
        LayoutCase{"WrapsLineByLine", "{align:right}hello world{/align}", "     hello\n     world"},
        LayoutCase{"LineByLine", "{align:right}ab\ncde{/align}", "        ab\n       cde"},
        LayoutCase{"LineByLineBehindAText", "12{align:right}a\n\nb{/align}",
                   "12       a\n          \n         b"},
        LayoutCase{"LongWord", "{align:right}abcdefghijkl{/align}", "abcdefghij\n        kl"},
        LayoutCase{"MovesAsAWhole", "abc {align:right}defghijkl{/align}", "abc\n defghijkl"}),
    CaseName);

INSTANTIATE_TEST_SUITE_P(
    Center, LayoutTable,
    testing::Values(LayoutCase{"OddRestGoesRight", "{align:center}abc{/align}", "   abc"},
                    LayoutCase{"LineIsFull", "{align:center}abc{/align}d", "   abc\nd"},
                    LayoutCase{"WhatIsLeftOfTheLine", "12{align:center}ab{/align}", "12   ab"},
                    LayoutCase{"OneColumnLeft", "{align:center}abcdefghi{/align}", "abcdefghi"},
                    LayoutCase{"LineByLine", "{align:center}ab\ncdef{/align}", "    ab\n   cdef"},
                    LayoutCase{"WrapsLineByLine", "{align:center}hello world{/align}",
                               "  hello\n  world"}),
    CaseName);

INSTANTIATE_TEST_SUITE_P(
    Padding, LayoutTable,
    testing::Values(
        LayoutCase{"Cut", "{align:padding:5}abcdefgh{/align}|", "abcde|"},
        LayoutCase{"Exact", "{align:padding:5}abcde{/align}|", "abcde|"},
        LayoutCase{"Filled", "{align:padding:5}ab{/align}|", "ab   |"},
        LayoutCase{"EmptyRegion", "{align:padding:5}{/align}|", "     |"},
        LayoutCase{"Zero", "{align:padding:0}ab cd{/align}|", "|"},
        LayoutCase{"NoNumber", "{align:padding:}ab{/align}|", "|"},
        LayoutCase{"NoDigits", "{align:padding:five}ab{/align}|", "|"},
        LayoutCase{"NegativeHasNoLimit", "{align:padding:-2}abcdef{/align}|", "abcdef|"},
        LayoutCase{"SmallestNumber", "{align:padding:-99999999999999999999}ab{/align}|", "ab|"},
        LayoutCase{"NoLimitStaysInItsRegion",
                   "{align:padding:-2}a{/align}{align:padding:3}bcdef{/align}|", "abcd|"},
        LayoutCase{"LargestNumberFillsTheLine", "{align:padding:99999999999999999999}ab{/align}|",
                   "ab        \n|"},
        LayoutCase{"RestOfTheLineOnly", "abcdefgh{align:padding:5}i{/align}j", "abcdefghi \nj"},
        LayoutCase{"ColumnsInARow", "{align:padding:3}ab{/align}{align:padding:4}cdefgh{/align}|",
                   "ab cdef|"},
        LayoutCase{"ColoursTakeNoColumn", "{align:padding:3}{color:red}ab{/color}{/align}|",
                   "{color:red}ab{/color} |"},
        LayoutCase{"CutBlankIsNoBreak", "{align:padding:2}ab cd{/align}efghijklmn",
                   "abefghijkl\nmn"},
        LayoutCase{"BlankInTheColumnIsABreak", "{align:padding:3}a b{/align}efghijklmn",
                   "a\nbefghijklm\nn"},
        LayoutCase{"WrapsAtTheEdge", "abcdefgh{align:padding:5}ijkl{/align}|", "abcdefghij\nkl |"},
        LayoutCase{"Unclosed", "{align:padding:5}ab", "ab"}),
    CaseName);

INSTANTIATE_TEST_SUITE_P(
    Screens, LayoutTable,
    testing::Values(
        LayoutCase{"Table",
                   "    {align:padding:13}Device Name{/align}{align:padding:30}Hardware Label (MAC "
                   "Address){/align}Status",
                   "    Device Name  Hardware Label (MAC Address)  Status", 80},
        LayoutCase{"HintLine", "<F2> Change{align:right}<F12> Shut Down{/align}",
                   "<F2> Change               <F12> Shut Down", 41}),
    CaseName);

TEST(Layout, PassesTheFailureOfAFact) {
  EXPECT_THROW(LayoutMarkup("a{fails}b", 10, FACTS), std::runtime_error);
}

TEST(Layout, ReadsAFactEachTimeItIsNamed) {
  int reads = 0;
  const ValueTags facts = {{"count", [&] { return std::to_string(++reads); }}};
  EXPECT_EQ(LayoutMarkup("{count}{count}", 10, facts), "12");
  EXPECT_EQ(LayoutMarkup("{count}", 10, facts), "3");
}

}  // namespace
}  // namespace Tarnel::Testing
