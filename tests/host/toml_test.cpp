// Letters beyond ASCII, which mean something in TOML only within texts and comments.
#include "host/bundled/device/Toml.h"

#include <gtest/gtest.h>

#include <string>

namespace {

// The UTF-8 of a letter.
std::string Utf8(unsigned letter) {
  std::string bytes;
  if (letter < 0x800) {
    bytes += static_cast<char>(0xC0 | (letter >> 6));
  } else {
    bytes += static_cast<char>(0xE0 | (letter >> 12));
    bytes += static_cast<char>(0x80 | ((letter >> 6) & 0x3F));
  }
  bytes += static_cast<char>(0x80 | (letter & 0x3F));
  return bytes;
}

bool IsSurrogate(unsigned letter) { return letter >= 0xD800 && letter <= 0xDFFF; }

// The letters of Unicode that are white space, which this parser skips, and U+0085, which ends a
// line. U+FEFF is the mark of the order of bytes.
bool IsWhite(unsigned letter) {
  return letter == 0x85 || letter == 0xA0 || letter == 0x1680 || letter == 0x180E ||
         (letter >= 0x2000 && letter <= 0x200B) || letter == 0x2028 || letter == 0x2029 ||
         letter == 0x202F || letter == 0x205F || letter == 0x2060 || letter == 0x3000 ||
         letter == 0xFEFF;
}

TEST(Toml, LettersAreNoKeysAndFollowNoValue) {
  for (unsigned letter = 0x80; letter <= 0xFFFF; ++letter) {
    if (IsSurrogate(letter) || IsWhite(letter)) continue;
    EXPECT_FALSE(Device::ParseToml(Utf8(letter) + " = 1\n").succeeded()) << letter;
    EXPECT_FALSE(Device::ParseToml("x = 1 " + Utf8(letter) + "\n").succeeded()) << letter;
  }
}

TEST(Toml, LettersStandInTextsAndComments) {
  for (unsigned letter = 0xA0; letter <= 0xFFFF; ++letter) {
    if (IsSurrogate(letter)) continue;
    const std::string text = Utf8(letter);
    const toml::parse_result parsed = Device::ParseToml("x = \"" + text + "\" # " + text + "\n");
    ASSERT_TRUE(parsed.succeeded()) << letter;
    EXPECT_EQ(parsed.table()["x"].value<std::string>(), text);
  }
}

}  // namespace
