// The host's string class: every argument, message and result text is one.
//
// Tested by string_base_test.cpp.
#ifndef VORKEL_HOST_PORT_STRINGBASE_H_
#define VORKEL_HOST_PORT_STRINGBASE_H_

#include <cstddef>
#include <string>
#include <string_view>

namespace Port {

// How Compare treats letter case.
enum class CompareType { kIgnoreCase = 0, kExact = 1 };

// Which ends of a string Trim works on.
enum class TrimMode { kLeading = 0, kTrailing = 1, kBoth = 2 };

// The characters that count as white space for Trim.
inline constexpr std::string_view kWhiteSpace = " \t\n\v\f\r";

class StringBase {
 public:
  StringBase() = default;
  StringBase(const char* text) : text_(text) {}  // NOLINT: literals are host strings
  StringBase(std::string_view text) : text_(text) {}  // NOLINT

  bool IsEmpty() const { return text_.empty(); }
  std::size_t Length() const { return text_.size(); }
  const char* CStr() const { return text_.c_str(); }
  std::string_view View() const { return text_; }

  // Negative, 0 or positive as this text sorts before, equals or sorts after `other`.
  // kIgnoreCase folds the 26 ASCII letters and no others.
  int Compare(std::string_view other, CompareType type = CompareType::kExact) const;

  // Finds the next token at or after `*position`. Any run of characters of `separators`
  // separates two tokens. On success stores the token as [*begin, *end), moves `*position`
  // behind it and returns true; returns false, with nothing stored, when only separators
  // are left.
  bool NextTokenRange(std::string_view separators, std::size_t* position, std::size_t* begin,
                      std::size_t* end) const;

  // The characters [begin, end); the bounds are cut to the length of the text.
  StringBase Substring(std::size_t begin, std::size_t end) const;

  // Removes the characters of `set` from the ends that `mode` names.
  void Trim(std::string_view set, TrimMode mode);

  friend bool operator==(const StringBase&, const StringBase&) = default;

 private:
  std::string text_;
};

}  // namespace Port

#endif  // VORKEL_HOST_PORT_STRINGBASE_H_
