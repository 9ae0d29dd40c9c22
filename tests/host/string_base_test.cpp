#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "host/Port_StringBase.h"

namespace {

using Port::CompareType;
using Port::StringBase;
using Port::TrimMode;

std::vector<std::string> Tokens(const StringBase& text, std::string_view separators) {
  std::vector<std::string> tokens;
  std::size_t position = 0;
  std::size_t begin = 0;
  std::size_t end = 0;
  while (text.NextTokenRange(separators, &position, &begin, &end)) {
    EXPECT_EQ(position, end);
    tokens.emplace_back(text.Substring(begin, end).View());
  }
  return tokens;
}

std::string Trimmed(std::string_view text, TrimMode mode) {
  StringBase string(text);
  string.Trim(Port::kWhiteSpace, mode);
  return std::string(string.View());
}

TEST(StringBase, KeepsItsText) {
  EXPECT_TRUE(StringBase().IsEmpty());
  EXPECT_TRUE(StringBase("").IsEmpty());
  const StringBase text("abc");
  EXPECT_FALSE(text.IsEmpty());
  EXPECT_EQ(text.Length(), 3U);
  EXPECT_STREQ(text.CStr(), "abc");
  EXPECT_EQ(StringBase(std::string_view("a\0b", 3)).Length(), 3U);
}

TEST(StringBase, ComparesExactly) {
  EXPECT_EQ(StringBase("true").Compare("true"), 0);
  EXPECT_NE(StringBase("true").Compare("True"), 0);
  EXPECT_NE(StringBase("true").Compare("true "), 0);
  EXPECT_LT(StringBase("abc").Compare("abd"), 0);
  EXPECT_GT(StringBase("abd").Compare("abc"), 0);
  EXPECT_LT(StringBase("ab").Compare("abc"), 0);
  EXPECT_GT(StringBase("b").Compare("abc"), 0);
  EXPECT_LT(StringBase("B").Compare("a"), 0);
}

TEST(StringBase, ComparesWithoutCase) {
  const auto compare = [](const char* a, const char* b) {
    return StringBase(a).Compare(b, CompareType::kIgnoreCase);
  };
  EXPECT_EQ(compare("TrUe", "tRuE"), 0);
  EXPECT_EQ(compare("", ""), 0);
  EXPECT_LT(compare("a", "B"), 0);
  EXPECT_GT(compare("B", "a"), 0);
  EXPECT_LT(compare("AB", "abc"), 0);
  EXPECT_GT(compare("abc", "AB"), 0);
  // The neighbours of the letters in ASCII are no letters.
  EXPECT_NE(compare("@", "`"), 0);
  EXPECT_NE(compare("[", "{"), 0);
  EXPECT_NE(compare("\xc4", "\xe4"), 0);
}

TEST(StringBase, SortsBytesAboveAsciiLast) {
  EXPECT_GT(StringBase("\xff").Compare("a"), 0);
  EXPECT_GT(StringBase("\xff").Compare("a", CompareType::kIgnoreCase), 0);
}

TEST(StringBase, FindsTokens) {
  const std::vector<std::string> two = {"100", "200.5"};
  EXPECT_EQ(Tokens("100 200.5", " "), two);
  EXPECT_EQ(Tokens("  100   200.5  ", " "), two);
  EXPECT_EQ(Tokens(",100 ,200.5", ", "), two);
  EXPECT_EQ(Tokens("100\t200.5", " "), std::vector<std::string>{"100\t200.5"});
  EXPECT_EQ(Tokens("", " "), std::vector<std::string>());
  EXPECT_EQ(Tokens("   ", " "), std::vector<std::string>());
  EXPECT_EQ(Tokens("a b", ""), std::vector<std::string>{"a b"});
}

TEST(StringBase, LeavesTheResultAloneWhenThereIsNoToken) {
  const StringBase text("ab  ");
  std::size_t position = 2;
  std::size_t begin = 77;
  std::size_t end = 78;
  EXPECT_FALSE(text.NextTokenRange(" ", &position, &begin, &end));
  EXPECT_EQ(begin, 77U);
  EXPECT_EQ(end, 78U);
  position = 1000;
  EXPECT_FALSE(text.NextTokenRange(" ", &position, &begin, &end));
  EXPECT_EQ(begin, 77U);
}

TEST(StringBase, StartsATokenInTheMiddle) {
  const StringBase text("abc def");
  std::size_t position = 1;
  std::size_t begin = 0;
  std::size_t end = 0;
  ASSERT_TRUE(text.NextTokenRange(" ", &position, &begin, &end));
  EXPECT_EQ(begin, 1U);
  EXPECT_EQ(end, 3U);
}

TEST(StringBase, CutsSubstringsToTheText) {
  const StringBase text("abcdef");
  EXPECT_EQ(text.Substring(1, 3), StringBase("bc"));
  EXPECT_EQ(text.Substring(0, 6), text);
  EXPECT_EQ(text.Substring(4, 100), StringBase("ef"));
  EXPECT_EQ(text.Substring(3, 3), StringBase());
  EXPECT_EQ(text.Substring(4, 2), StringBase());
  EXPECT_EQ(text.Substring(7, 9), StringBase());
}

TEST(StringBase, TrimsTheEndsThatTheModeNames) {
  EXPECT_EQ(Trimmed(" \ta b\r\n", TrimMode::kLeading), "a b\r\n");
  EXPECT_EQ(Trimmed(" \ta b\r\n", TrimMode::kTrailing), " \ta b");
  EXPECT_EQ(Trimmed(" \ta b\r\n", TrimMode::kBoth), "a b");
  EXPECT_EQ(Trimmed("\v\f", TrimMode::kBoth), "");
  EXPECT_EQ(Trimmed("\v\f", TrimMode::kLeading), "");
  EXPECT_EQ(Trimmed("\v\f", TrimMode::kTrailing), "");
  EXPECT_EQ(Trimmed("", TrimMode::kBoth), "");
  EXPECT_EQ(Trimmed("a", TrimMode::kBoth), "a");
}

}  // namespace
