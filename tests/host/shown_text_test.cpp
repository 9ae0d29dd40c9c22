#include <gtest/gtest.h>

#include <string>
#include <string_view>

#include "host/bundled/port/ShownText.h"

namespace {

using Port::Escaped;
using Port::Shown;
using std::string_view_literals::operator""sv;

TEST(ShownText, LeavesLettersAsTheyAre) {
  EXPECT_EQ(Escaped(""), "");
  EXPECT_EQ(Escaped("a \"b\" ~\\n"), "a \"b\" ~\\n");
  // Of two, three and four bytes; the continuations are those of control characters, too.
  for (const std::string_view letter :
       {"\xc3\xbc", "\xc3\x9b", "\xe2\x82\x9b", "\xf0\x9f\x9b\x80"}) {
    EXPECT_EQ(Escaped(letter), letter);
  }
}

TEST(ShownText, EscapesControlCharacters) {
  EXPECT_EQ(Escaped("a\nb\rc\td"), "a\\nb\\rc\\td");
  EXPECT_EQ(Escaped("\0\x1b[31m\x07\x1f\x7f"sv), "\\x00\\x1b[31m\\x07\\x1f\\x7f");
}

// 0x9b begins a sequence for a terminal, by itself where letters have 8 bits.
TEST(ShownText, EscapesControlCharactersOf8Bits) {
  EXPECT_EQ(Escaped("\xc2\x9b"
                    "31m"),
            "\\x9b31m");
  EXPECT_EQ(Escaped("\xc2\x80\xc2\x9f\xc2\xa0"), "\\x80\\x9f\xc2\xa0");
  EXPECT_EQ(Escaped("\x9b"
                    "31m\xfc"),
            "\\x9b31m\xfc");
}

// U+202E turns all that follows, U+200B is not seen.
TEST(ShownText, EscapesWhatTurnsText) {
  EXPECT_EQ(Escaped("a\xe2\x80\xae b\xe2\x80\x8b\xe2\x81\xa0\xef\xbb\xbf"),
            "a\\u202e b\\u200b\\u2060\\ufeff");
  EXPECT_EQ(Escaped("\xe2\x80\x8a\xe2\x80\x90\xe2\x80\xaf\xe2\x81\x9f\xef\xbb\xbe"),
            "\xe2\x80\x8a\xe2\x80\x90\xe2\x80\xaf\xe2\x81\x9f\xef\xbb\xbe");
}

TEST(ShownText, EscapesWhatIsHiddenInLettersThatAreCutOff) {
  EXPECT_EQ(Escaped("\xe2\x82"), "\xe2\\x82");
  EXPECT_EQ(Escaped("\xe2\x1b[0m"), "\xe2\\x1b[0m");
  EXPECT_EQ(Escaped("\xc2"), "\xc2");
}

TEST(ShownText, CutsWhatIsTooLong) {
  EXPECT_EQ(Shown("abc", 3), "abc");
  EXPECT_EQ(Shown("abcd", 3), "abc...");
  EXPECT_EQ(Shown("a\x1b"
                  "cd",
                  2),
            "a\\x1b...");
  EXPECT_EQ(Shown(std::string(1'000'000, 'x'), 10), "xxxxxxxxxx...");
}

TEST(ShownText, CutsBetweenLetters) {
  EXPECT_EQ(Shown("a\xe2\x82\xac"
                  "b",
                  1),
            "a...");
  EXPECT_EQ(Shown("a\xe2\x82\xac"
                  "b",
                  2),
            "a...");
  EXPECT_EQ(Shown("a\xe2\x82\xac"
                  "b",
                  3),
            "a...");
  EXPECT_EQ(Shown("a\xe2\x82\xac"
                  "b",
                  4),
            "a\xe2\x82\xac...");
}

}  // namespace
