// Random requests to the PLL/TSYN solver, and random device limits, for comparing solvers.
//
// The same seed gives the same requests on every machine.
#ifndef VORKEL_TESTS_COMPARE_REQUESTGENERATOR_H_
#define VORKEL_TESTS_COMPARE_REQUESTGENERATOR_H_

#include <cstdint>
#include <random>
#include <string>
#include <vector>

#include "tests/plain/plain_pll.h"

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

// What kind of request to draw. The kinds differ in how far the search has to go.
enum class Kind {
  kCommon,       // frequencies that designs use
  kConstructed,  // made from a setting: solved at a fudge of 0, or nearly so
  kShifted,      // made from a setting, then output 0 moved: needs a fudge
  kRangeEnds,    // limits that lie exactly on what the request needs
  kInfeasible,   // nothing serves it: the search goes through all fudges
  kWild,         // zero, negative, huge, inf, nan, text, short and long lists, odd counts
};
const char* KindName(Kind kind);

struct Case {
  plain::PllLimits limits;
  plain::PllRequest request;
};

// Draws one case.
Case DrawCase(Kind kind, Random& random);

// A case in words, to be read in the message of a failed comparison.
std::string Describe(const Case& drawn);

}  // namespace compare

#endif  // VORKEL_TESTS_COMPARE_REQUESTGENERATOR_H_
