// What the targets share: each is a file with one LLVMFuzzerTestOneInput, which libFuzzer calls with
// inputs that it makes up, and replay.cpp with those that are kept.
//
// An input is text where it can be, so that a case that was found can be read.
#ifndef VORKEL_FUZZ_FUZZ_H_
#define VORKEL_FUZZ_FUZZ_H_

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

// 0, or -1 for an input that is not worth keeping.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace fuzz {

inline std::string_view TextOf(const std::uint8_t* data, std::size_t size) {
  return {reinterpret_cast<const char*>(data), size};
}

// The parts of a text between separators; one more than there are separators.
inline std::vector<std::string> Split(std::string_view text, char separator) {
  std::vector<std::string> parts(1);
  for (const char letter : text) {
    if (letter == separator) {
      parts.emplace_back();
    } else {
      parts.back() += letter;
    }
  }
  return parts;
}

// Ends the process, which is how a target says that it has found something.
[[noreturn]] inline void Found(const std::string& what) {
  std::fprintf(stderr, "found: %s\n", what.c_str());
  std::abort();
}

inline void Require(bool holds, const std::string& what) {
  if (!holds) Found(what);
}

}  // namespace fuzz

#endif  // VORKEL_FUZZ_FUZZ_H_
