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

// The text with its control characters as \n, \r, \t or \x1b. Letters of UTF-8 stay as they are.
std::string Escaped(std::string_view text);

// The same for the beginning of a text that is longer than `most` bytes, with "..." behind it.
std::string Shown(std::string_view text, std::size_t most);

}  // namespace Port

#endif  // VORKEL_HOST_BUNDLED_PORT_SHOWNTEXT_H_
