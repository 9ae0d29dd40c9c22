// Which passes of the fudge loop are worth running.
//
// A request that cannot be met at the requested output-0 frequency goes through up to 11000
// passes, each with two attempts: output 0 a fudge higher, and a fudge lower. Nearly all of
// them fail, and most can be told to fail without running a stage. The filter answers "no"
// only where a pass fails for certain, and "maybe" otherwise; the pass then runs as it is. So
// the loop chooses what it would choose without the filter.
//
// An attempt succeeds only if one of its candidates is accepted by the M and D search and is
// among those that the divider search keeps. From this the filter rules out, coarse to fine:
//
// 1. The whole call, when no VCO frequency at all has an M, a D and dividers (VcoWindows).
// 2. Attempts none of whose candidates lies in a window. The loop is not asked what each
//    attempt has in the windows; the windows are asked which attempts they belong to: a
//    window [low, high] and a divider step s are met by the fudges that bring output 0 into
//    [low / s, high / s]. A chunk of attempts is worked out at a time.
// 3. Candidates that keep only a wider tolerance on output 1 than some other candidate of the
//    attempt surely does: the steps lie close enough for one of them to come near a multiple
//    of output 1. This narrows the windows before (2).
// 4. Candidates that another candidate of the same attempt puts out. The divider search keeps,
//    output by output, the candidates with the narrowest tolerance. That is: it keeps those
//    with the smallest key, when the numbers of the tolerances that a candidate keeps on
//    outputs 1, 2, ... are read as the digits of one number, the key. One candidate with a
//    smaller key - a witness - proves that a candidate goes. What is a witness in one attempt
//    is mostly one in the next, too, since neighbouring attempts differ by 0.001 MHz.
//    Candidates that the upward attempt has left in the table are witnesses as well.
//
// Example: 100 MHz in, PLL, outputs 200 and 70 MHz, VCO 400 to 1080 MHz. At a fudge of 0.5 MHz
// the candidates are 401, 601.5, 802 and 1002.5 MHz; the windows around 400, 600, 800 and 1000
// MHz have none of them, and so belong to other fudges. At 0.05 MHz, 400.1 MHz lies in a window;
// divided by 6 it is 66.68 MHz, off by 5 percent, and 1000.25 / 14 is 71.45 MHz, off by 2.1. So
// 400.1 MHz goes.
//
// Why a "no" is safe. (1), (2): the windows are outer bounds, and so are the fudges worked out
// from them: the division and the difference to the fudge's number are off by far less than
// the whole attempt that is added on either side. (3): see SurelyKeptTolerance. (4): witnesses
// are evaluated by the same function on the same doubles as in the divider search. An upward
// attempt that ends in the divider search leaves candidates in the table for the downward one.
// They lack a divider for some output, so there they can only put out others; one that comes as
// far as M and D has already made the pass a "maybe".
//
// Tested by pass_filter_test.cpp, and by comparing whole answers with a plain search.
#ifndef VORKEL_ENGINE_PLL_PASSFILTER_H_
#define VORKEL_ENGINE_PLL_PASSFILTER_H_

#include <array>
#include <bitset>
#include <cstdint>

#include "engine/pll/Div0Steps.h"
#include "engine/pll/OutputDividers.h"
#include "engine/pll/Stages.h"
#include "engine/pll/VcoWindows.h"

namespace Ip::Pll {

class PassFilter {
 public:
  // For a run whose VCO range is prepared and whose first pass has failed.
  PassFilter(const VorkelImp& imp, const Run& run, double fudgeStep);

  // True when no pass at all can succeed.
  bool IsHopeless() const { return hopeless_; }

  // False when the pass at `fudge` (MHz) fails for certain. To be asked for each fudge in turn,
  // from the one after 0 on.
  bool MaySucceed(double fudge);

 private:
  // The numbers of the tolerances that a candidate keeps, five bits an output, output 1 first.
  using Key = std::uint32_t;
  static constexpr Key kNoKey = ~Key{0};  // above all keys

  static constexpr int kLargestChunk = 1024;
  static constexpr int kNotNarrowed = -1;
  static constexpr int kWitnesses = 8;

  static bool IsHopelessRun(const VorkelImp& imp, const Run& run, const VcoWindows& windows);
  void WorkOutChunk(double firstFudge);
  void WorkOutDirection(double sign);
  int SurelyKeptTolerance(double slowest, double fastest) const;
  void NarrowWindows(int tolerance);
  void AddAttempts(const VcoWindow& window, int step);
  void AddCandidate(int attempt, double vco);
  bool IsPutOut(int attempt, Key key);
  bool IsPutOutByLeftovers(int attempt, Key key);

  const VcoWindows& Windows() const { return run_.count > 1 ? narrowed_ : windows_; }
  double OutFreq0(int attempt) const { return OutFreq0(attempt, sign_); }
  double OutFreq0(int attempt, double sign) const;
  bool IsCandidate(double vco) const;
  bool SurelyMissesTolerance(double vco, int n, int tolerance) const;
  Key KeyOf(double vco, Key atMost) const;
  bool LacksDivider(Key key) const;
  Key WitnessKey(int attempt, double witness) const;
  Key SmallestKey(int attempt, Key known);
  void FindScanWindows(Key known);
  template <typename Visit>
  void Scan(double outFreq0, Key known, Visit visit);

  const VorkelImp& imp_;
  const Run& run_;
  const double fudgeStep_;
  const double outFreq0_;
  const Div0Steps steps_;
  const VcoWindows windows_;
  const bool hopeless_;
  const bool applies_;  // rounding is small against a fudge step
  std::array<OutputRange, MAX_OUTPUTS> ranges_{};
  std::array<double, MAX_OUTPUTS> inverse_{};  // of the requested frequencies

  // The windows, and those of output 1 alone, as far as output 1 keeps the tolerance of this
  // number there; not in use with one output.
  int narrowedTo_ = kNotNarrowed;
  VcoWindows narrowed_;
  VcoWindows output1_;

  // The chunk at hand: its fudges, the passes that may succeed, and the next to be asked for.
  int chunk_ = 0;
  int next_ = 0;
  std::array<double, kLargestChunk> fudges_;
  std::bitset<kLargestChunk> maybe_;

  // The direction at hand: 1.0 upward, -1.0 downward; the smallest key known of each attempt,
  // and the attempts of which it is that of all candidates.
  double sign_ = 1.0;
  std::array<Key, kLargestChunk> best_;
  std::bitset<kLargestChunk> scanned_;

  // VCO frequencies (MHz) that have lately had the smallest key of an attempt; 0: none.
  std::array<double, kWitnesses> witnesses_{};
  int nextWitness_ = 0;

  // Where candidates lie whose key is not above a known one: those that keep a narrower
  // tolerance on output 1, and those that keep the same one there and no wider one on output 2.
  static constexpr Key kStale = kNoKey - 1;
  Key scannedFor_ = kStale;  // the digits of outputs 1 and 2; kNoKey: all of output1_
  VcoWindows narrower_;
  VcoWindows asNarrow_;
  VcoWindows scratch_[2];
};

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_PASSFILTER_H_
