// The parser of TOML for all that read it, compiled into the file that includes this.
//
// It is compiled without exceptions. That of the system's library makes an exception of what is
// wrong with a text in places where no other may pass: where there is no memory for it, the process
// ends.
//
// Tested by toml_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_TOML_H_
#define VORKEL_HOST_BUNDLED_DEVICE_TOML_H_

#include <cstdint>
#include <string_view>
#include <utility>

#define TOML_HEADER_ONLY 1
#define TOML_EXCEPTIONS 0
#define TOML_ENABLE_FORMATTERS 0
// Whether a letter is white space, the parser decides range by range. In the first range it takes
// for granted that no letter but U+00A0 comes, which is undefined behaviour for one such as U+00FF.
// No other letter of that range is white space.
#include <toml++/impl/forward_declarations.h>
#undef TOML_UNREACHABLE
#define TOML_UNREACHABLE return false
#include <toml++/impl/unicode.h>
#undef TOML_UNREACHABLE
#define TOML_UNREACHABLE __builtin_unreachable()
#include <toml++/toml.h>

namespace Device {

// What a text says, or its first mistake. The caller has refused what is too deep for the parser's
// stack.
//
// The parser is not told the path: where there is no memory to note it, the process ends. And a
// number for which there is no memory is wrong to it. So what it takes for wrong is read once more:
// a mistake is there again.
inline toml::parse_result ParseToml(std::string_view text) {
  toml::parse_result result = toml::parse(text);
  return result ? std::move(result) : toml::parse(text);
}

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_TOML_H_
