// Answers as a port prints them: every double as its bits, so that two ports that print the same
// have answered the same.
#ifndef VORKEL_TESTS_PORTS_BITS_H_
#define VORKEL_TESTS_PORTS_BITS_H_

#include <bit>
#include <cinttypes>
#include <cstdint>
#include <cstdio>
#include <string>

namespace ports {

inline void Print(double value) { std::printf(" %016" PRIx64, std::bit_cast<std::uint64_t>(value)); }
inline void Print(int value) { std::printf(" %d", value); }

// A text by its length and its FNV-1a hash.
inline void Print(const std::string& text) {
  std::uint64_t hash = 0xcbf29ce484222325;
  for (const char letter : text) {
    hash = (hash ^ static_cast<unsigned char>(letter)) * 0x100000001b3;
  }
  std::printf(" %d:%016" PRIx64, static_cast<int>(text.size()), hash);
}

}  // namespace ports

#endif  // VORKEL_TESTS_PORTS_BITS_H_
