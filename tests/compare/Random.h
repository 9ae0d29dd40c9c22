// A source of random numbers for generated requests.
#ifndef VORKEL_TESTS_COMPARE_RANDOM_H_
#define VORKEL_TESTS_COMPARE_RANDOM_H_

#include <array>
#include <cstdint>
#include <cstdio>
#include <random>
#include <string>
#include <vector>

namespace compare {

// A source of random numbers whose results do not depend on the standard library at hand.
class Random {
 public:
  explicit Random(std::uint64_t seed) : engine_(seed) {}

  // A whole number from `low` to `high`, both included.
  int Int(int low, int high) {
    const auto span = static_cast<std::uint64_t>(high - low) + 1;
    return low + static_cast<int>(engine_() % span);
  }
  // A number from `low` up to `high`.
  double Real(double low, double high) {
    return low + (high - low) * (static_cast<double>(engine_() >> 11) * 0x1p-53);
  }
  // True once in `n` times.
  bool OneIn(int n) { return Int(1, n) == 1; }
  template <typename T>
  const T& Pick(const std::vector<T>& values) {
    return values[static_cast<std::size_t>(Int(0, static_cast<int>(values.size()) - 1))];
  }

 private:
  std::mt19937_64 engine_;
};

// A double in the given printf format.
inline std::string Number(const char* format, double value) {
  std::array<char, 400> text;
  std::snprintf(text.data(), text.size(), format, value);
  return text.data();
}

}  // namespace compare

#endif  // VORKEL_TESTS_COMPARE_RANDOM_H_
