#include "planner/report/Table.h"

#include <gtest/gtest.h>

#include "planner/report/Words.h"

namespace planner::report {
namespace {

const std::vector<Column> kColumns = {{Align::kRight, "n"}, {Align::kLeft, "name"}};

TEST(Table, ColumnsAreAsWideAsTheirWidestCells) {
  EXPECT_EQ(TableText({}, kColumns, {{{"1", "one"}}, {{"20", "twenty"}}, {{"3", ""}}}),
            " n  name\n"
            " 1  one\n"
            "20  twenty\n"
            " 3\n");
}

TEST(Table, LettersAreCountedAndNotBytes) {
  EXPECT_EQ(TableText({}, {{Align::kLeft, "a"}, {Align::kLeft, "b"}}, {{{"\u00b5\u00b5", "x"}}}),
            "a   b\n"
            "\u00b5\u00b5  x\n");
}

TEST(Table, AColourIsThatOfARowOrOfItsLastCell) {
  const Style style{.colour = true};
  EXPECT_EQ(TableText(style, kColumns,
                      {{{"1", "good"}, Role::kGood},
                       {{"2", "OFF"}, Role::kNone, Role::kOff},
                       {{"3", ""}, Role::kNone, Role::kOff}}),
            "\033[1mn  name\033[0m\n"
            "\033[32m1  good\033[0m\n"
            "2  \033[31m\033[1mOFF\033[0m\n"
            "3\n");
}

TEST(Table, WithoutColourThereAreNoControlSequences) {
  EXPECT_EQ(Paint({}, Role::kOff, "OFF"), "OFF");
  EXPECT_EQ(Paint({.colour = true}, Role::kNone, "OFF"), "OFF");
  EXPECT_EQ(Paint({.colour = true}, Role::kNote, "x"), "\033[33mx\033[0m");
}

TEST(Table, AFirstColumnThatIsTooWideHasLinesOfItsOwn) {
  const std::vector<Row> rows = {{{"A_LONG_KEYWORD", "ns", "4"}}, {{"B", "ns", "12"}}};
  const std::vector<Column> columns = {
      {Align::kLeft, "K"}, {Align::kLeft, "unit"}, {Align::kRight, "g"}};
  EXPECT_EQ(TableWidth(columns, rows), 14 + 2 + 4 + 2 + 2);
  EXPECT_EQ(FittedTable({.width = 24}, columns, rows),
            "K               unit   g\n"
            "A_LONG_KEYWORD  ns     4\n"
            "B               ns    12\n");
  EXPECT_EQ(FittedTable({.width = 23}, columns, rows),
            "K  unit   g\n"
            "A_LONG_KEYWORD\n"
            "   ns     4\n"
            "B\n"
            "   ns    12\n");
}

TEST(Table, PairsStandBelowEachOther) {
  EXPECT_EQ(PairsText({{"VCO", "1188 MHz"}, {"M", "44"}}), "VCO  1188 MHz\nM    44\n");
}

TEST(Prose, LinesAreFilledUpToTheWidth) {
  EXPECT_EQ(Filled("aa bb  cc\ndd", 5), "aa bb\ncc dd");
  EXPECT_EQ(Filled("aa bb cc", 4), "aa\nbb\ncc");
  EXPECT_EQ(Filled("a_word_that_is_long bb", 5), "a_word_that_is_long\nbb");
  EXPECT_EQ(Filled("", 5), "");
}

TEST(Prose, FurtherLinesAreIndented) {
  const Style style{.width = 12};
  EXPECT_EQ(Prose(style, "n: ", "is short"), "n: is short\n");
  // Broken lines leave room for the indent.
  EXPECT_EQ(Prose(style, "n: ", "it is not so"), "n: it is\n  not so\n");
  EXPECT_EQ(Paragraph(style, "one two three four"), "one two\nthree four\n");
}

TEST(Prose, ValuesStandBehindALabel) {
  EXPECT_EQ(Labelled({.width = 14}, 6, "about", "a device of"), "about a device\n      of\n");
  EXPECT_EQ(Labelled({}, 6, "about", ""), "about\n");
  EXPECT_EQ(Described({.width = 20}, {{"--in F", "the input clock"}, {"-o", "x"}}),
            "  --in F  the input\n"
            "          clock\n"
            "  -o      x\n");
}

TEST(Words, ListsInSentences) {
  EXPECT_EQ(Enumerated({}), "");
  EXPECT_EQ(Enumerated({"a"}), "a");
  EXPECT_EQ(Enumerated({"a", "b"}), "a and b");
  EXPECT_EQ(Enumerated({"a", "b", "c"}, "or"), "a, b or c");
  EXPECT_EQ(Outputs({1}), "output 1");
  EXPECT_EQ(Outputs({0, 2}), "outputs 0 and 2");
  EXPECT_EQ(Join({"a", "b"}, ","), "a,b");
}

}  // namespace
}  // namespace planner::report
