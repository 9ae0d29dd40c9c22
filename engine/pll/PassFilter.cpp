#include "engine/pll/PassFilter.h"

#include <algorithm>
#include <cmath>

namespace Ip::Pll {

namespace {

constexpr int kFirstChunk = 16;   // passes; small, since most fudges are
constexpr int kChunkGrowth = 4;
constexpr int kKeyBits = 5;       // for tolerance numbers 0 to kTolerances
constexpr int kFewSteps = 100;
constexpr unsigned kDigit = (1u << kKeyBits) - 1;
static_assert(kTolerances < kDigit);

// Above this output-0 frequency, in MHz, rounding is no longer small against a fudge step.
constexpr double kLargestOutFreq0 = 1e9;

// Frequencies above this one, in MHz, are far enough from the smallest doubles for relative
// errors to be bounded.
constexpr double kSmallestFrequency = 1e-200;

}  // namespace

PassFilter::PassFilter(const VorkelImp& imp, const Run& run, double fudgeStep)
    : imp_(imp),
      run_(run),
      fudgeStep_(fudgeStep),
      outFreq0_(imp.requests.reqOutFreq[0]),
      steps_(HasIntegerDiv0(imp, run)),
      windows_(FindVcoWindows(imp, run)),
      hopeless_(IsHopelessRun(imp, run, windows_)),
      applies_(std::fabs(outFreq0_) <= kLargestOutFreq0) {
  for (int n = 1; n < run.count; ++n) {
    const auto output = static_cast<std::size_t>(n);
    ranges_[output] = RangeOfOutput(imp.pllLimits, n);
    inverse_[output] = 1.0 / imp.requests.reqOutFreq[output];
  }
}

bool PassFilter::IsHopelessRun(const VorkelImp& imp, const Run& run, const VcoWindows& windows) {
  // M and D need a VCO above 0. Fudges end at 11 MHz and dividers begin at 1.
  const double outFreq0 = imp.requests.reqOutFreq[0];
  if (!(outFreq0 >= -11.0 && outFreq0 - 11.0 <= imp.pll.maxAdjVco)) return true;
  // So small an input frequency needs as small a VCO; but output 0 shifted by a fudge is 0, or
  // as large as the rounding of the fudge at least.
  if (!(run.inFreq >= kSmallestFrequency)) return true;
  return windows.empty();
}

bool PassFilter::MaySucceed(double fudge) {
  if (!applies_) return true;
  if (next_ == chunk_) WorkOutChunk(fudge);
  return maybe_.test(static_cast<std::size_t>(next_++));
}

void PassFilter::WorkOutChunk(double firstFudge) {
  chunk_ = std::min(std::max(chunk_ * kChunkGrowth, kFirstChunk), kLargestChunk);
  next_ = 0;
  maybe_.reset();
  double fudge = firstFudge;
  for (int attempt = 0; attempt < chunk_; ++attempt) {
    fudges_[static_cast<std::size_t>(attempt)] = fudge;
    fudge += fudgeStep_;  // as the loop adds
  }
  WorkOutDirection(1.0);
  WorkOutDirection(-1.0);
}

// Goes through the divider steps and, since a larger step reaches higher VCO frequencies, on
// through the windows beside them.
void PassFilter::WorkOutDirection(double sign) {
  sign_ = sign;
  std::fill_n(best_.begin(), chunk_, kNoKey);
  scanned_.reset();
  const double slowest = std::min(OutFreq0(0), OutFreq0(chunk_ - 1));
  const double fastest = std::max(OutFreq0(0), OutFreq0(chunk_ - 1));
  if (!(fastest > 0.0)) return;  // no VCO frequency above 0
  if (run_.count > 1) NarrowWindows(SurelyKeptTolerance(slowest, fastest));
  const VcoWindows& windows = Windows();
  if (windows.empty()) return;
  auto window = windows.begin();
  for (int step = steps_.FirstWorthTrying(fastest, window->low); step < steps_.Count(); ++step) {
    const double lowestVco = (slowest - fudgeStep_) * steps_[step];
    const double highestVco = (fastest + fudgeStep_) * steps_[step];
    while (window != windows.end() && window->high < lowestVco) ++window;
    if (window == windows.end()) return;
    for (auto met = window; met != windows.end() && met->low <= highestVco; ++met) {
      AddAttempts(*met, step);
    }
  }
}

// The number of a tolerance that, in every attempt with an output-0 frequency from `slowest` to
// `fastest` (MHz), some candidate keeps on output 1.
//
// The steps lie evenly, so any frequency between the lowest and the highest of their VCOs has
// one within half a step width. Taken for a multiple of output 1 - the higher, the less half a
// step width is against it - this is a candidate if it lies in the VCO range, rounds to the
// divider of that multiple, and leaves output 1 in its range.
int PassFilter::SurelyKeptTolerance(double slowest, double fastest) const {
  constexpr int kAny = kTolerances - 1;
  constexpr double kMargin = 1.0 + 1e-9;  // for the roundings here and in the search
  const double requested = imp_.requests.reqOutFreq[1];
  if (!(requested > 0.0 && slowest > 0.0)) return kAny;
  const double off = 0.5 * steps_.Width() * fastest * kMargin;
  const double highest = std::min(imp_.pll.maxAdjVco, slowest * steps_[steps_.Count() - 1]) - off;
  const double divider = std::min(std::floor(highest / requested), kLargestDivider);
  const double multiple = divider * requested;
  const double lowest = std::max(imp_.pll.minAdjVco, fastest * steps_[1]) + off;
  if (!(divider >= 1.0 && multiple * kMargin <= highest && multiple >= lowest * kMargin)) {
    return kAny;
  }
  if (!(off < 0.49 * requested)) return kAny;
  const double outputOff = off / divider * kMargin;
  if (!(requested - outputOff >= ranges_[1].min && requested + outputOff <= ranges_[1].max)) {
    return kAny;
  }
  return std::min(FirstTolerance(off / multiple * kMargin), kAny);
}

// Leaves of the windows what is within the tolerance of that number on output 1.
void PassFilter::NarrowWindows(int tolerance) {
  if (tolerance == narrowedTo_) return;
  narrowedTo_ = tolerance;
  scannedFor_ = kStale;
  FindOutputWindows(imp_, 1, tolerance, output1_);
  Intersect(windows_, output1_, narrowed_);
}

// The attempts that bring the VCO of a step into a window.
void PassFilter::AddAttempts(const VcoWindow& window, int step) {
  const double firstFudge = fudges_[0];
  auto attemptAt = [&](double vco) {
    return (sign_ * (vco / steps_[step] - outFreq0_) - firstFudge) / fudgeStep_;
  };
  const double a = attemptAt(window.low);
  const double b = attemptAt(window.high);
  const double first = std::max(std::floor(std::min(a, b)) - 1.0, 0.0);
  const double last = std::min(std::ceil(std::max(a, b)) + 1.0, chunk_ - 1.0);
  for (double attempt = first; attempt <= last; ++attempt) {
    const double vco = OutFreq0(static_cast<int>(attempt)) * steps_[step];
    if (window.low <= vco && vco <= window.high) AddCandidate(static_cast<int>(attempt), vco);
  }
}

// Notes that an attempt has a candidate in a window, unless a witness puts it out.
void PassFilter::AddCandidate(int attempt, double vco) {
  const auto index = static_cast<std::size_t>(attempt);
  if (maybe_.test(index) || !IsCandidate(vco)) return;
  if (run_.count > 1) {
    const Key key = KeyOf(vco, best_[index]);
    if (key == kNoKey || IsPutOut(attempt, key)) return;
  }
  maybe_.set(index);
}

// True when a candidate with that key, which is not above the smallest known, goes all the
// same: by a witness, by any candidate of the attempt, or by one that the upward attempt left.
bool PassFilter::IsPutOut(int attempt, Key key) {
  const auto index = static_cast<std::size_t>(attempt);
  if (!scanned_.test(index)) {
    for (const double witness : witnesses_) {
      best_[index] = std::min(best_[index], WitnessKey(attempt, witness));
      if (best_[index] < key) return true;
    }
    best_[index] = SmallestKey(attempt, best_[index]);
    scanned_.set(index);
    if (best_[index] < key) return true;
  }
  return sign_ < 0.0 && IsPutOutByLeftovers(attempt, key);
}

// When the divider search of the upward attempt has found no divider for an output, what it
// then had is left: the candidates with the smallest key. In the downward attempt, those stay
// whose slot is not taken over.
bool PassFilter::IsPutOutByLeftovers(int attempt, Key key) {
  const double downward = OutFreq0(attempt, -1.0);
  Key smallest = key;
  bool stays = false;
  Scan(OutFreq0(attempt, 1.0), key, [&](int step, double vco) {
    const Key left = KeyOf(vco, smallest);
    if (left > smallest) return;
    stays = (left == smallest && stays) || !IsCandidate(downward * steps_[step]);
    smallest = left;
  });
  return stays && smallest < key && LacksDivider(smallest);
}

// The frequency that an attempt takes for output 0, by the additions of the search.
double PassFilter::OutFreq0(int attempt, double sign) const {
  const double fudge = fudges_[static_cast<std::size_t>(attempt)];
  return (sign > 0.0 ? fudge : 0.0 - fudge) + outFreq0_;
}

bool PassFilter::IsCandidate(double vco) const {
  return imp_.pll.minAdjVco <= vco && vco <= imp_.pll.maxAdjVco;
}

// True when the divider of output n is off by more than the tolerance of that number for
// certain; cheap, and often false where it could be true. Without divisions the ratio is off by
// some 1e-15 of its value. Half way between two dividers it may take the wrong one; they are
// both off by half a divider there, which is held against the larger one's tolerance.
bool PassFilter::SurelyMissesTolerance(double vco, int n, int tolerance) const {
  constexpr double kMargin = 1e-9;
  const double ratio = vco * inverse_[static_cast<std::size_t>(n)];
  if (!(ratio >= 1.0 && ratio <= kLargestDivider)) return false;
  const double divider = static_cast<int>(ratio + 0.5);
  return std::fabs(ratio - divider) > Tolerance(tolerance) * (divider + 1.0) + kMargin;
}

// The key of a VCO frequency; kNoKey when it is above `atMost`. The digits after that of an
// output without a divider are 0: the divider search does not get to them.
PassFilter::Key PassFilter::KeyOf(double vco, Key atMost) const {
  Key key = 0;
  for (int n = 1; n < run_.count; ++n) {
    const auto output = static_cast<std::size_t>(n);
    const int digitsLeft = run_.count - 1 - n;
    const Key most = atMost >> (kKeyBits * digitsLeft);
    const auto digit = static_cast<int>(most & kDigit);
    if (atMost != kNoKey && key == most >> kKeyBits && digit < kTolerances &&
        SurelyMissesTolerance(vco, n, digit)) {
      return kNoKey;
    }
    const OutputFit fit = FitOutput(vco, imp_.requests.reqOutFreq[output], ranges_[output]);
    key = key << kKeyBits | static_cast<Key>(fit.tolerance);
    if (atMost != kNoKey && key > most) return kNoKey;
    if (fit.tolerance == kTolerances) return key << (kKeyBits * digitsLeft);
  }
  return key;
}

// True when the candidates with that key have no divider for some output.
bool PassFilter::LacksDivider(Key key) const {
  for (int n = 1; n < run_.count; ++n, key >>= kKeyBits) {
    if ((key & kDigit) == kTolerances) return true;
  }
  return false;
}

// The smaller key of the two candidates on either side of a witness; kNoKey without them.
PassFilter::Key PassFilter::WitnessKey(int attempt, double witness) const {
  const double outFreq0 = OutFreq0(attempt);
  Key smallest = kNoKey;
  if (witness == 0.0) return smallest;
  const int below = steps_.Below(witness / outFreq0);
  for (int step = below; step <= std::min(below + 1, steps_.Count() - 1); ++step) {
    const double vco = outFreq0 * steps_[step];
    if (IsCandidate(vco)) smallest = std::min(smallest, KeyOf(vco, smallest));
  }
  return smallest;
}

// The smallest key of all candidates of an attempt, one of which has the key `known` if that is
// a key. The VCO of a smaller one becomes a witness.
PassFilter::Key PassFilter::SmallestKey(int attempt, Key known) {
  Key smallest = known;
  double witness = 0.0;
  Scan(OutFreq0(attempt), known, [&](int, double vco) {
    const Key key = KeyOf(vco, smallest);
    if (key >= smallest) return;
    smallest = key;
    witness = vco;
  });
  if (witness != 0.0) {
    witnesses_[static_cast<std::size_t>(nextWitness_)] = witness;
    nextWitness_ = (nextWitness_ + 1) % kWitnesses;
  }
  return smallest;
}

// Visits the candidates of an output-0 frequency whose key can be the smallest and not above
// `known`, and others, some of them twice. A few are all visited; that is quicker than to find
// out where to look.
template <typename Visit>
void PassFilter::Scan(double outFreq0, Key known, Visit visit) {
  const int lowest = steps_.FirstWorthTrying(outFreq0, imp_.pll.minAdjVco);
  const int highest =
      std::min(steps_.Below(imp_.pll.maxAdjVco / outFreq0) + 1, steps_.Count() - 1);
  if (highest - lowest < kFewSteps) {
    for (int step = lowest; step <= highest; ++step) {
      const double vco = outFreq0 * steps_[step];
      if (IsCandidate(vco)) visit(step, vco);
    }
    return;
  }
  FindScanWindows(known);
  for (const VcoWindows* windows : {&narrower_, &asNarrow_}) {
    for (const VcoWindow& window : *windows) {
      const int first = std::max(steps_.Below(window.low / outFreq0) - 1, 0);
      const int last = std::min(steps_.Below(window.high / outFreq0) + 1, steps_.Count() - 1);
      for (int step = first; step <= last; ++step) {
        const double vco = outFreq0 * steps_[step];
        if (IsCandidate(vco)) visit(step, vco);
      }
    }
  }
}

// Candidates outside the windows of output 1 do not have the smallest key; with a key known,
// many of the others do not, either.
void PassFilter::FindScanWindows(Key known) {
  constexpr int kAny = kTolerances - 1;
  const Key digits = known == kNoKey || run_.count < 3
                         ? kNoKey
                         : known >> (kKeyBits * (run_.count - 3));
  if (digits == scannedFor_) return;
  scannedFor_ = digits;
  narrower_.clear();
  if (digits == kNoKey) {
    asNarrow_ = output1_;
    return;
  }
  const int first = std::min(static_cast<int>(digits >> kKeyBits), kAny);
  const int second = std::min(static_cast<int>(digits & kDigit), kAny);
  if (first > 0) FindOutputWindows(imp_, 1, first - 1, narrower_);
  FindOutputWindows(imp_, 1, first, scratch_[0]);
  FindOutputWindows(imp_, 2, second, scratch_[1]);
  Intersect(scratch_[0], scratch_[1], asNarrow_);
}

}  // namespace Ip::Pll
