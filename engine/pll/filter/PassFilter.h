// Which passes of the fudge loop are worth running. The page to begin with in this folder:
//
//   VcoWindows    the VCO frequencies that have an M and a D
//   ToleranceKey  what the divider search makes of a VCO frequency, in one number
//   VcoRanking    both together: ranges of VCO frequencies, by what the divider search prefers
//   Attempts      a run of passes in one direction, and which of them come into a range
//   PassFilter    the way down the ranking with a run of passes
//   Rounding      how far doubles may be off, for all of them
//
// A request that cannot be met at the requested output-0 frequency goes through up to 11000
// passes, each with two attempts: output 0 a fudge higher, and a fudge lower. Nearly all of
// them fail, and most can be told to fail without running a stage. The filter answers "no"
// only where a pass fails for certain, and "maybe" otherwise; the pass then runs as it is. So
// the loop chooses what it would choose without the filter.
//
// An attempt succeeds only if a candidate that the divider search keeps has an M and a D. What
// the divider search does with a VCO frequency depends on no fudge: VcoRanking has the
// frequencies, in ranges, in the order in which it prefers them. The first key of the ranking that
// a candidate of the attempt has decides. The candidates with that key put out all others; if none
// of them can have an M, a D and all dividers, the attempt fails.
//
// The ranges are not looked up for each attempt, but the attempts for each range: a range [low,
// high] and a divider step s are met by the fudges that bring output 0 into [low / s, high / s],
// which is a run of neighbouring attempts, and a run is a few bits in a set of attempts. So the
// filter goes down the ranking once for a chunk of attempts, and mostly not far.
//
// Example: 100 MHz in, PLL, outputs 197 and 70 MHz, VCO 400 to 1080 MHz. Of the candidates 591,
// 788 and 985 MHz, only 985 MHz is within one percent of a multiple of 70 MHz, as is 5 times any
// output 0 from 194.04 to 197.96 MHz. The nearest window that M and D leave there is 979.902 to
// 980.098 MHz, 100 x 49 / 5 and its surroundings, or an output 0 from 195.98 to 196.02 MHz. So the
// upward attempts are a "no" up to a fudge of 0.96 MHz at least, the downward ones up to 0.98; at
// 0.981 there is a "maybe".
//
// The upward and the downward attempt of a pass have one candidate table. An upward attempt that
// fails because an output has no divider leaves in it the candidates that it then had. They still
// lack the divider; and where they have a smaller key than all new ones, they put these out, and
// the downward attempt fails at the same output. The filter notes what is left if it is certain:
// that no candidate of the upward attempt has a smaller key, and that no new one takes the slot,
// since the VCO of the step is then below the VCO range.
//
// A point of the ranking is met by a candidate that lies on it, but for rounding. There the filter
// looks at the candidate itself, with the doubles of the search: what its key is, and, where that
// decides, whether it has an M and a D. So it does at the ends of what may succeed. Such a
// candidate takes its place by its own key, behind ranges with smaller ones.
//
// Why a "no" is safe. Ranges are met with a margin, a hundred times what all roundings in their
// ends, here and in the search can come to (Rounding.h). A range where an attempt may succeed is
// met where a candidate may lie in it, margins included; one that puts others out is met only where
// a candidate lies in it for certain, within its margins, or has been looked at; and for certain
// there is no candidate with a smaller key where none is even in the margins of the ranges with
// smaller keys.
//
// Tested by pass_filter_test.cpp, and by comparing whole answers with a plain search.
#ifndef VORKEL_ENGINE_PLL_FILTER_PASSFILTER_H_
#define VORKEL_ENGINE_PLL_FILTER_PASSFILTER_H_

#include <array>
#include <vector>

#include "engine/pll/Div0Steps.h"
#include "engine/pll/SlotSet.h"
#include "engine/pll/Stages.h"
#include "engine/pll/filter/VcoRanking.h"

namespace Ip::Pll {

// Whether no pass at all can succeed, as far as that can be told without a filter: no VCO has an M
// and a D, or an output is out of reach. For a run whose VCO range is prepared.
bool IsHopelessAtOnce(const VorkelImp& imp, const Run& run);

class PassFilter {
 public:
  // For a run whose VCO range is prepared.
  PassFilter(const VorkelImp& imp, const Run& run);

  // True when no pass at all can succeed.
  bool IsHopeless() const { return hopeless_; }

  // The first pass from `pass` on, above 0, that may succeed; kPasses when all fail for certain. To
  // be asked with rising passes.
  int NextFrom(int pass);

 private:
  static constexpr int kLargestChunk = 1024;
  static constexpr ToleranceKey kNothingLeft = ~ToleranceKey{0};  // above all keys
  using AttemptSet = SlotSet<kLargestChunk>;
  class Walk;

  // A candidate that was looked at: its VCO in MHz, its attempt and its key; and whether it is
  // worth looking for its M and D.
  struct Candidate {
    double vco;
    int attempt;
    ToleranceKey key;
    bool mayHaveMAndD;
  };

  int LongestChunk(int firstPass) const;
  void WorkOutChunk(int firstPass, int longest);
  bool HasMAndD(double vco) const;

  const VorkelImp& imp_;
  const Run& run_;
  const double outFreq0_;
  const Div0Steps steps_;
  const VcoRanking ranking_;
  const bool hopeless_;
  const bool applies_;  // rounding is small against a fudge step

  // The chunk at hand: its first pass, how many there are, and those that may succeed.
  int first_ = 0;
  int chunk_ = 0;
  AttemptSet maybe_;

  // The key of what each upward attempt of the chunk leaves for the downward one.
  std::array<ToleranceKey, kLargestChunk> left_;

  // The candidates of a walk whose turn comes later: a heap, the smallest key on top.
  std::vector<Candidate> later_;
};

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_FILTER_PASSFILTER_H_
