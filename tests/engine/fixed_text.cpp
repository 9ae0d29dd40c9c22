#include "tests/engine/fixed_text.h"

#include <bit>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <random>

#include "engine/FixedText.h"

namespace engine_test {
namespace {

std::string MismatchOf(double x, char* (*write)(double, char*), const char* format) {
  char text[Ip::kLongestFixed];
  char* const end = write(x, text);
  if (end == nullptr && !(std::fabs(x) < 0x1p63)) return "";
  char expected[400];
  std::snprintf(expected, sizeof expected, format, x);
  if (end == nullptr) return std::string(expected) + " is not written";
  const std::string written(text, end);
  return written == expected ? "" : written + " in place of " + expected;
}

}  // namespace

std::string FixedMismatch(double x) {
  const std::string mismatch = MismatchOf(x, Ip::WriteFixed3, "%.3f");
  return mismatch.empty() ? MismatchOf(x, Ip::WriteFixed6, "%.6f") : mismatch;
}

std::string FirstDrawnMismatch(int count) {
  std::mt19937_64 random(20261122);
  for (int i = 0; i < count; ++i) {
    const std::uint64_t bits = random();
    const auto part = static_cast<double>(bits % 1000000007);
    double x = 0.0;
    switch (i % 4) {
      case 0: x = std::bit_cast<double>(bits); break;
      case 1: x = part / static_cast<double>(random() % 100000 + 1); break;
      case 2: x = (part + 0.5) / 1000.0; break;
      default: x = std::ldexp(part, static_cast<int>(random() % 100) - 70); break;
    }
    const std::string mismatch = FixedMismatch(x);
    if (!mismatch.empty()) return mismatch;
  }
  return "";
}

}  // namespace engine_test
