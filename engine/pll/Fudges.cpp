#include "engine/pll/Fudges.h"

#include <array>
#include <cstddef>

namespace Ip::Pll {

namespace {

// Added up by the compiler, so that no call waits for a chain of 11000 additions.
constexpr std::array<double, kPasses + 1> AddUp() {
  std::array<double, kPasses + 1> fudges{};
  double fudge = 0.0;
  for (double& entry : fudges) {
    entry = fudge;
    fudge += kFudgeStep;
  }
  return fudges;
}

constexpr std::array<double, kPasses + 1> kFudges = AddUp();
static_assert(kFudges[kPasses - 1] <= kLargestFudge && kFudges[kPasses] > kLargestFudge);

}  // namespace

double FudgeOf(int pass) { return kFudges[static_cast<std::size_t>(pass)]; }

}  // namespace Ip::Pll
