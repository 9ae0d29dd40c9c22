// Text from outside, such as scripts and device files, as a message shows it: on one line, and
// without what a terminal would obey.
//
// Tested by shown_text_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_PORT_SHOWNTEXT_H_
#define VORKEL_HOST_BUNDLED_PORT_SHOWNTEXT_H_

#include <cstddef>
#include <string>
#include <string_view>

namespace Port {

// Whether a letter moves the cursor of a terminal, has no width, or turns what follows.
constexpr bool MovesText(char32_t letter) {
  return letter < 0x20 || (letter >= 0x7f && letter <= 0x9f) ||
         (letter >= 0x200b && letter <= 0x200f) || (letter >= 0x2028 && letter <= 0x202e) ||
         (letter >= 0x2060 && letter <= 0x206f) || letter == 0xfeff;
}

// The text with the letters that move it as \n, \r, \t, \x1b or \u202e. Other letters of UTF-8 stay
// as they are.
std::string Escaped(std::string_view text);

// The same for the beginning of a text that is longer than `most` bytes, with "..." behind it.
std::string Shown(std::string_view text, std::size_t most);

}  // namespace Port

#endif  // VORKEL_HOST_BUNDLED_PORT_SHOWNTEXT_H_
