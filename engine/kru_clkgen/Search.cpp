// M, D and DV of a KRU_CLKGEN: output 0 seeds a table of pairs of M and D, and each further
// output keeps the pairs that serve it, directly or through DV.
//
// Tested by kru_clkgen_search_test.cpp.

#include "engine/kru_clkgen/Search.h"

#include <algorithm>
#include <array>
#include <bitset>
#include <cmath>

#include "engine/Numbers.h"
#include "engine/kru/Stages.h"
#include "hardware/Kru.h"

namespace Ip::KruClkgen {

namespace {

using Kru::InRange;
using Kru::Matches;

constexpr int kSmallestM = 2;
constexpr int kLargestM = 256;
constexpr int kLargestD = 256;
constexpr double kTolerance = 0.0001;  // of D, and of an output frequency in MHz
constexpr int kDvValues[] = {2, 4, 8, 16, 32};
static_assert(kSmallestM == hardware::kSmallestKruM);
static_assert(kLargestM == hardware::LargestKruRatioPart(hardware::Primitive::kKruClkgen) &&
              kLargestD == kLargestM);
static_assert(std::equal(std::begin(kDvValues), std::end(kDvValues),
                         hardware::kClkfxdvHalves.begin(), hardware::kClkfxdvHalves.end(),
                         [](int divide, int halves) { return 2 * divide == halves; }));

// The D and DV of one M; D is 0 where there is no pair, DV 0 as long as no output needs one.
struct Pair {
  int d = 0;
  int dv = 0;
};

class Search {
 public:
  Search(VorkelImp& imp, const Run& run)
      : kru_(imp.kru), limits_(imp.kruLimits), requests_(imp.requests), run_(run) {}

  // False when output 0 is out of range or no pair makes it. Its phase does not matter.
  bool SeedByOutput0() {
    const double f = requests_.reqOutFreq[0];
    TRACE(run_.trace, "DLL ------ Clk_Out0 ofreq = %3.3f\n", f);
    if (!InClkfxRange(f)) return false;
    for (int m = kSmallestM; m <= kLargestM; ++m) {
      const double x = m * run_.inFreq / f;
      const int d = RoundToInt(x);
      if (!(std::fabs(d - x) < kTolerance) || d < 1 || d > kLargestD) continue;
      At(m).d = d;
      ++count_;
    }
    if (count_ == 0) return false;
    if (run_.numOut >= 2) {
      TRACE(run_.trace, "DLL -- Found %d possible M/D pairs for CLK_OUT1\n", count_);
    }
    kru_._kruChosenPin[0] = KruPin::CLKFX;
    return true;
  }

  // Keeps the pairs that serve output n; false when there are none.
  bool Serve(int n) {
    const auto output = static_cast<std::size_t>(n);
    const double f = requests_.reqOutFreq[output];
    const double phase = requests_.reqPhase[output];
    TRACE(run_.trace, "DLL ------ Clk_Out%d ofreq = %3.3f; phase = %3.3f\n", n, f, phase);
    const bool served = ServeByClkfx(n, f, phase) || ServeByClkfxdv(n, f, phase);
    if (served && count_ >= 1) return true;
    TRACE(run_.trace, "DLL --- couldn't find any M and Ds for clknum %d\n", n);
    return false;
  }

  // The pair with the smallest D, and the smallest M among equals.
  void TakeSmallestD() {
    TRACE(run_.trace, "DLL ----- found %d possible M and Ds\n", count_);
    int chosenM = kSmallestM;
    int chosenD = kLargestD + 1;
    for (int m = kSmallestM; m <= kLargestM; ++m) {
      if (At(m).d == 0 || At(m).d >= chosenD) continue;
      chosenM = m;
      chosenD = At(m).d;
    }
    const int dv = At(chosenM).dv;
    kru_._kruChosenM = chosenM;
    kru_._kruChosenD = chosenD;
    kru_._kruChosenClkdv = dv;
    TRACE(run_.trace, "DLL -- found M = %d, D = %d, DV = %d\n", chosenM, chosenD, dv);
  }

 private:
  Pair& At(int m) { return pairs_[static_cast<std::size_t>(m - kSmallestM)]; }

  bool InClkfxRange(double f) const {
    if (InRange(f, limits_._kruClkfxMin, limits_._kruClkfxMax)) return true;
    TRACE(run_.trace, "DLL -!!!!!! Can't use CLKFX because requested freq %3.3f is out of range\n",
          f);
    return false;
  }

  // True when pairs serve output n on CLKFX or CLKFX180; the others are gone then.
  bool ServeByClkfx(int n, double f, double phase) {
    std::bitset<kLargestM + 1> serving;
    if (InClkfxRange(f) && (phase == 0.0 || phase == 180.0)) {
      for (int m = kSmallestM; m <= kLargestM; ++m) {
        if (At(m).d == 0 || !Matches(m * run_.inFreq / f, At(m).d, kTolerance)) continue;
        serving.set(static_cast<std::size_t>(m));
      }
    }
    if (serving.none()) {
      TRACE(run_.trace, "DLL ----- for clk%d, CLKFX doesn't work, so trying CLKFXDV\n", n);
      return false;
    }
    const KruPin pin = phase == 180.0 ? KruPin::CLKFX180 : KruPin::CLKFX;
    kru_._kruChosenPin[static_cast<std::size_t>(n)] = pin;
    TRACE(run_.trace, "DLL ----- for clk%d, found match: %s\n", n, KruPinName(pin).CStr());
    for (int m = kSmallestM; m <= kLargestM; ++m) {
      if (At(m).d == 0 || serving.test(static_cast<std::size_t>(m))) continue;
      const Pair removed = Remove(m);
      TRACE(run_.trace, "DLL ----- removed possible M = %d, D = %d\n", m, removed.d);
    }
    TRACE(run_.trace, "DLL ----- for clk%d, found %d possible M/D pairs that work for CLKFX\n", n,
          count_);
    return true;
  }

  // False when CLKFXDV cannot have the phase or the frequency; else the pairs are left that
  // serve output n on it, possibly none.
  bool ServeByClkfxdv(int n, double f, double phase) {
    const bool phaseFits = phase == 0.0;
    if (!phaseFits) {
      TRACE(run_.trace, "DLL -!!!!!! Can't use CLKFXDV because phase is set to %3.3f, not 0\n",
            phase);
    }
    const bool frequencyFits = InRange(f, limits_._kruClkfxdvMin, limits_._kruClkfxdvMax);
    if (!frequencyFits) {
      TRACE(run_.trace,
            "DLL -!!!!!! Can't use CLKFXDV because requested freq %3.3f is out of range\n", f);
    }
    if (!phaseFits || !frequencyFits) return false;
    for (int m = kSmallestM; m <= kLargestM; ++m) {
      if (At(m).d != 0 && FitDv(n, f, m)) {
        kru_._kruChosenPin[static_cast<std::size_t>(n)] = KruPin::CLKFXDV;
      }
    }
    return true;
  }

  // Keeps the pair of M if its DV, or one that it can still take, makes `f` (MHz) for output n.
  // A DV once taken binds the outputs that follow.
  bool FitDv(int n, double f, int m) {
    Pair& pair = At(m);
    if (pair.dv != 0) {
      if (MakesWithDv(m, pair.d, pair.dv, f)) return true;
      const Pair removed = Remove(m);
      TRACE(run_.trace,
            "DLL ----- for clk %d, existing DV = %d didn't work, so remove M = %d, D = %d\n", n,
            removed.dv, m, removed.d);
      return false;
    }
    for (const int dv : kDvValues) {
      if (!MakesWithDv(m, pair.d, dv, f)) continue;
      pair.dv = dv;
      return true;
    }
    const Pair removed = Remove(m);
    TRACE(run_.trace, "DLL ----- for clk %d, not a CLKFXDV solution, so remove M = %d, D = %d\n",
          n, m, removed.d);
    return false;
  }

  bool MakesWithDv(int m, int d, int dv, double f) const {
    return Matches(run_.inFreq * m / (dv * d), f, kTolerance);
  }

  // Removes the pair of M, and returns what it was.
  Pair Remove(int m) {
    const Pair removed = At(m);
    At(m) = Pair{};
    --count_;
    return removed;
  }

  KruState& kru_;
  const KruLimits& limits_;
  const Requests& requests_;
  const Run& run_;
  std::array<Pair, kLargestM - kSmallestM + 1> pairs_{};
  int count_ = 0;
};

bool ServeAll(Search& search, const Run& run) {
  if (!search.SeedByOutput0()) return false;
  for (int n = 1; n < run.numOut; ++n) {
    if (!search.Serve(n)) return false;
  }
  return true;
}

}  // namespace

bool FindMDAndDv(VorkelImp& imp, const Run& run) {
  KruState& kru = imp.kru;
  kru._kruChosenM = 0;
  kru._kruChosenD = 0;
  kru._kruChosenClkdv = 0.0;
  kru._kruChosenPin.fill(KruPin::NONE);
  kru._kruPinsDivBy2F.fill(KruPin::NONE);
  kru._kruPinsDivBy2T.fill(KruPin::NONE);
  TRACE(run.trace, "DLL ---- Calculating KRU_CLKGEN actuals \n");

  Search search(imp, run);
  if (!ServeAll(search, run)) {
    TRACE(run.trace, "DLL -- couldn't find an M and D\n");
    return false;
  }
  search.TakeSmallestD();
  return true;
}

}  // namespace Ip::KruClkgen
