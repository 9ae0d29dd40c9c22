// M and D of the frequency synthesiser: one pair for all outputs on CLKFX and CLKFX180.
//
// The first such output seeds a table of pairs, each later one keeps the pairs that serve it,
// too. The seed is meant to be looser than the filter.
//
// Tested by kru_multiplier_search_test.cpp.

#include <array>
#include <cmath>

#include "engine/Numbers.h"
#include "engine/kru/Stages.h"
#include "hardware/Kru.h"

namespace Ip::Kru {

namespace {

constexpr int kSmallestM = 2;
constexpr int kLargestM = 32;
constexpr int kLargestD = 32;
static_assert(kSmallestM == hardware::kSmallestKruM);
static_assert(kLargestM == hardware::LargestKruRatioPart(hardware::Primitive::kKruSp) &&
              kLargestD == kLargestM);
constexpr double kSeedTolerance = 0.0005;    // of D; exclusive
constexpr double kFilterTolerance = 0.0001;  // of D; inclusive

// The D of each M, 0 where there is none.
class Pairs {
 public:
  int& D(int m) { return d_[static_cast<std::size_t>(m - kSmallestM)]; }
  int count = 0;

 private:
  std::array<int, kLargestM - kSmallestM + 1> d_{};
};

// `c` is the input frequency of the synthesiser, `f` that of the output, both MHz.
void Seed(Pairs& pairs, double c, double f, const Trace& trace) {
  for (int m = kSmallestM; m <= kLargestM; ++m) {
    const double x = m * c / f;
    if (!(x >= 1.0 && x <= kLargestD)) continue;
    const int d = RoundToInt(x);
    if (!(std::fabs(d - x) < kSeedTolerance)) continue;
    pairs.D(m) = d;
    ++pairs.count;
    TRACE(trace, "DLL ----- a possible M = %d, D = %d\n", m, d);
  }
}

void Filter(Pairs& pairs, double c, double f, const Trace& trace) {
  for (int m = kSmallestM; m <= kLargestM; ++m) {
    const int d = pairs.D(m);
    if (d == 0) continue;
    TRACE(trace, "DLL ----- testing M = %d, D = %d\n", m, d);
    if (Matches(m * c / f, d, kFilterTolerance)) continue;
    pairs.D(m) = 0;
    --pairs.count;
    TRACE(trace, "DLL ----- removed possible M = %d, D = %d\n", m, d);
  }
}

// The smallest D, and the smallest M among equals.
void TakeSmallestD(Pairs& pairs, KruState& kru) {
  int chosenM = kSmallestM;
  int chosenD = kLargestD + 1;
  for (int m = kSmallestM; m <= kLargestM; ++m) {
    if (pairs.D(m) == 0 || pairs.D(m) >= chosenD) continue;
    chosenM = m;
    chosenD = pairs.D(m);
  }
  kru._kruChosenM = chosenM;
  kru._kruChosenD = chosenD;
}

}  // namespace

bool FindMAndD(VorkelImp& imp, const KruPinList& pins, bool divBy2, const Run& run) {
  const double c = divBy2 ? run.inFreq * 0.5 : run.inFreq;
  Pairs pairs;
  bool seeded = false;
  for (int n = 0; n < run.numOut; ++n) {
    const auto output = static_cast<std::size_t>(n);
    if (!UsesSynthesiser(pins[output])) continue;
    const double f = imp.requests.reqOutFreq[output];
    TRACE(run.trace, "DLL ----- looking for M/D for requested ofreq = %f\n", f);
    if (seeded) {
      Filter(pairs, c, f, run.trace);
    } else {
      Seed(pairs, c, f, run.trace);
      seeded = true;
    }
    if (pairs.count < 1) {
      TRACE(run.trace, "DLL ----- couldn't find and M and Ds for clknum %d\n", n);
      break;
    }
  }
  if (pairs.count < 1) {
    TRACE(run.trace, "DLL -- couldn't find an M and D\n");
    return false;
  }
  TRACE(run.trace, "DLL ----- found %d possible M and Ds\n", pairs.count);
  TakeSmallestD(pairs, imp.kru);
  TRACE(run.trace, "DLL -- found M = %d, D = %d\n", imp.kru._kruChosenM, imp.kru._kruChosenD);
  return true;
}

}  // namespace Ip::Kru
