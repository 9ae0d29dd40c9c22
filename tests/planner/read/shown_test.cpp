// Texts of users in messages, and names that are nearly other ones.
#include "planner/read/Shown.h"

#include <gtest/gtest.h>

#include "planner/read/Letters.h"

namespace planner::read {
namespace {

TEST(Shown, IsOnOneLineAndNotWithoutEnd) {
  EXPECT_EQ(Shown("plain text, \xc3\xa4 \xe2\x82\xac \xf0\x9f\x95\x90"),
            "plain text, \xc3\xa4 \xe2\x82\xac \xf0\x9f\x95\x90");
  EXPECT_EQ(Shown("1\n2\t\x1b[2J\x7f"), "1\\x0a2\\x09\\x1b[2J\\x7f");
  EXPECT_EQ(Shown(std::string("a\0b", 3)), "a\\x00b");
  EXPECT_EQ(Shown("\xc2\x9b"), "\\x9b");              // a control letter beyond ASCII
  EXPECT_EQ(Shown("\xe2\x80\xae"), "\\u202e");          // what follows would run backwards
  EXPECT_EQ(Shown(std::string(60, 'x')), std::string(60, 'x'));
  EXPECT_EQ(Shown(std::string(61, 'x')), std::string(60, 'x') + "...");
  std::string letters;
  for (int i = 0; i < 60; ++i) letters += "\xc3\xa4";
  EXPECT_EQ(Shown(letters), letters);
  EXPECT_EQ(Shown(letters + "b"), letters + "...");
  EXPECT_EQ(Shown("abcd", 3), "abc...");
  EXPECT_EQ(ShownWhole(std::string(100, 'x')), std::string(100, 'x'));
}

TEST(Shown, TellsBytesThatAreNoLetters) {
  EXPECT_EQ(Shown("a\xff"), "a\\xff");
  EXPECT_EQ(Shown("\xc3"), "\\xc3");                     // cut off
  EXPECT_EQ(Shown("\xc0\x80"), "\\xc0\\x80");            // longer than it has to be
  EXPECT_EQ(Shown("\xed\xa0\x80"), "\\xed\\xa0\\x80");   // half of a pair of UTF-16
  EXPECT_EQ(Shown("\xf4\x90\x80\x80"), "\\xf4\\x90\\x80\\x80");  // beyond the last letter
  EXPECT_FALSE(IsUtf8("\xc3"));
  EXPECT_TRUE(IsUtf8("\xc3\xa4"));
  EXPECT_EQ(LetterCount("a\xc3\xa4\xff"), 3U);
}

TEST(Enumerated, HasCommasAndAWord) {
  const std::vector<std::string> names = {"a", "b", "c"};
  EXPECT_EQ(Enumerated(names), "a, b and c");
  EXPECT_EQ(Enumerated(std::span(names).first(2), "or"), "a or b");
  EXPECT_EQ(Enumerated(std::span(names).first(1)), "a");
  EXPECT_EQ(Enumerated({}), "");
}

TEST(Nearest, IsOneSlipAwayOrTwoInALongName) {
  const std::vector<std::string> names = {"plan", "pll", "explain", "--tolerance"};
  EXPECT_EQ(Nearest("paln", names), "plan");          // swapped
  EXPECT_EQ(Nearest("plann", names), "plan");         // added
  EXPECT_EQ(Nearest("pan", names), "plan");           // left out
  EXPECT_EQ(Nearest("plen", names), "plan");          // changed
  EXPECT_EQ(Nearest("pleen", names), "");             // two slips
  EXPECT_EQ(Nearest("--tolerence", names), "--tolerance");
  EXPECT_EQ(Nearest("--tolerenze", names), "--tolerance");  // two in a long name
  EXPECT_EQ(Nearest("--toleranzzz", names), "");
  EXPECT_EQ(Nearest("pl", names), "");                // too short to tell
  EXPECT_EQ(Nearest(std::string(61, 'p'), names), "");
  EXPECT_EQ(DidYouMean("paln", names), "; did you mean plan?");
  EXPECT_EQ(DidYouMean("xyz", names), "");
}

}  // namespace
}  // namespace planner::read
