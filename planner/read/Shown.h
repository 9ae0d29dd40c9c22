// Texts of users, as a message shows them, and names that are nearly other ones.
//
// Tested by shown_test.cpp.
#ifndef VORKEL_PLANNER_READ_SHOWN_H_
#define VORKEL_PLANNER_READ_SHOWN_H_

#include <cstddef>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace planner::read {

// Of a text that is wrong a message shows so many letters.
inline constexpr std::size_t kMostShown = 60;

// A text on one line, and not without end: control letters and bytes that are no UTF-8 as escapes
// (\x1b, \u202e, \xff), and "..." behind the first letters of a longer one.
std::string Shown(std::string_view text, std::size_t most = kMostShown);

// The same without an end: for what must be complete, such as a path.
std::string ShownWhole(std::string_view text);

// The names as a list in a sentence: "a, b and c".
std::string Enumerated(std::span<const std::string> names, std::string_view last = "and");

// The name that a mistyped one is nearest to: one slip away, or two when it is long; empty when
// there is none. A slip is a letter changed, added, left out or swapped with the next.
std::string Nearest(std::string_view name, std::span<const std::string> names);

// "; did you mean X?", or nothing.
std::string DidYouMean(std::string_view name, std::span<const std::string> names);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_SHOWN_H_
