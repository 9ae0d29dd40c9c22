#include "engine/pll/filter/PassFilter.h"

#include <algorithm>
#include <cmath>

#include "engine/pll/MultiplierSearch.h"
#include "engine/pll/OutputDividers.h"
#include "engine/pll/filter/Attempts.h"
#include "engine/pll/filter/Rounding.h"
#include "engine/pll/filter/VcoWindows.h"

namespace Ip::Pll {

namespace {

// Passes. The first chunk is small, since most fudges are.
constexpr int kFirstChunk = 64;
constexpr int kChunkGrowth = 4;
constexpr int kSmallestChunk = 16;  // where output 0 is near 0

// An M and a D need a VCO and an input frequency on the same side of 0. Nobody has clocks below it;
// the filter works above only.
bool IsBelowZero(const VorkelImp& imp, const Run& run) {
  return run.inFreq < 0.0 && imp.pll.minAdjVco < 0.0;
}

// Whether an output after output 0 may be within the widest tolerance, in its range and at a VCO of
// the range divided by 1 to 128. Odd requests may.
bool MayBeServed(const VorkelImp& imp, const Run& run, int n) {
  const double f = imp.requests.reqOutFreq[static_cast<std::size_t>(n)];
  if (!(f > 0.0 && std::isfinite(f))) return true;
  const OutputRange range = RangeOfOutput(imp.pllLimits, run.prim, n);
  const double widest = Tolerance(kTolerances - 1);
  const double low =
      std::max({range.min, f * (1.0 - widest), imp.pll.minAdjVco / kLargestDivider});
  const double high = std::min({range.max, f * (1.0 + widest), imp.pll.maxAdjVco});
  return !(low > 0.0 && low * (1.0 - kMargin) > high * (1.0 + kMargin));
}

}  // namespace

bool IsHopelessAtOnce(const VorkelImp& imp, const Run& run) {
  if (IsBelowZero(imp, run)) return false;
  // Fudges end at 11 MHz and dividers begin at 1.
  const double outFreq0 = imp.requests.reqOutFreq[0];
  if (!(outFreq0 >= -11.0 && outFreq0 - 11.0 <= imp.pll.maxAdjVco)) return true;
  // So small an input frequency needs as small a VCO; but output 0 shifted by a fudge is 0, or
  // as large as the rounding of the fudge at least.
  if (!(run.inFreq >= kSmallestFrequency) || !HasVcoWindow(imp, run)) return true;
  for (int n = 1; n < run.count; ++n) {
    if (!MayBeServed(imp, run, n)) return true;
  }
  return false;
}

namespace {

bool IsHopelessByRanking(const VorkelImp& imp, const Run& run, const VcoRanking& ranking) {
  return !IsBelowZero(imp, run) &&
         std::none_of(ranking.begin(), ranking.end(), [](const RankedRange& range) {
           return range.kind == RankedRange::Kind::kAccepted;
         });
}

}  // namespace

// One way down the ranking, with the attempts of a chunk in one direction. It notes in the filter
// which of them may succeed, and what they leave for the `next` ones of their passes if there are
// any.
class PassFilter::Walk {
 public:
  Walk(PassFilter& filter, const Attempts& attempts, const Attempts* next)
      : filter_(filter), attempts_(attempts), next_(next) {
    undecided_.InsertRange(attempts.AboveZero().first, attempts.AboveZero().last);
    undecided_.Remove(filter.maybe_);
    untouched_ = undecided_;
    filter_.later_.clear();
  }

  void GoDown() {
    for (const RankedRange& range : filter_.ranking_) {
      if (!ComeTo(range.key)) return;
      if (range.IsPoint()) {
        // Most of the ranking are points, and hardly a step brings an attempt to one.
        VisitSteps(range, [&](int step, double divider) {
          if (attempts_.MayMeet(range.low / divider)) Meet(range, step, divider);
        });
      } else {
        VisitSteps(range, [&](int step, double divider) { Meet(range, step, divider); });
      }
    }
    ComeTo(kNothingLeft);
  }

 private:
  // Goes on to a key that is not smaller. False when all attempts are decided.
  bool ComeTo(ToleranceKey key) {
    while (!filter_.later_.empty() && filter_.later_.front().key <= key) {
      if (!Begin(filter_.later_.front().key)) return false;
      Decide(TakeFirstOfLater());
    }
    return Begin(key);
  }

  // What is in the ranking before a key has put out what comes with it.
  bool Begin(ToleranceKey key) {
    if (key != key_) undecided_.Remove(putOut_);
    key_ = key;
    return !undecided_.IsEmpty();
  }

  void Meet(const RankedRange& range, int step, double divider) {
    const Attempts::Between met(attempts_, range.low / divider, range.high / divider);
    const Attempts::Span possible = met.Possible();
    if (possible.IsEmpty()) return;
    if (range.IsPoint()) {
      LookAt(range, step, possible);
    } else {
      MeetStretch(range, step, possible, met.Sure());
    }
    if (next_ != nullptr) untouched_.EraseRange(possible.first, possible.last);
  }

  void MeetStretch(const RankedRange& range, int step, const Attempts::Span& possible,
                   const Attempts::Span& sure) {
    if (range.kind != RankedRange::Kind::kAccepted) {
      putOut_.InsertRange(sure.first, sure.last);
      NoteWhatIsLeft(range, step, sure);
    } else if (sure.IsEmpty()) {
      LookAt(range, step, possible);
    } else {
      LookAt(range, step, {possible.first, sure.first - 1});
      LookAt(range, step, {sure.last + 1, possible.last});
      undecided_.EraseRange(sure.first, sure.last,
                            [&](int attempt) { NoteMaybe(attempt, range.key); });
    }
  }

  void NoteMaybe(int attempt, ToleranceKey key) {
    // What the attempt before has left may put it out.
    if (key <= filter_.left_[static_cast<std::size_t>(attempt)]) filter_.maybe_.Insert(attempt);
  }

  void NoteWhatIsLeft(const RankedRange& range, int step, const Attempts::Span& sure) {
    if (next_ == nullptr || range.kind != RankedRange::Kind::kUnserved) return;
    const int first = next_->FirstBelow(filter_.imp_.pll.minAdjVco / filter_.steps_[step]);
    untouched_.EraseRange(std::max(first, sure.first), sure.last, [&](int attempt) {
      filter_.left_[static_cast<std::size_t>(attempt)] = range.key;
    });
  }

  // Looks at the candidates of a step themselves.
  void LookAt(const RankedRange& range, int step, const Attempts::Span& span) {
    const VorkelImp& imp = filter_.imp_;
    for (int attempt = span.first; attempt <= span.last; ++attempt) {
      if (!undecided_.Contains(attempt)) continue;
      const double vco = attempts_.OutFreq(attempt) * filter_.steps_[step];
      if (!(imp.pll.minAdjVco <= vco && vco <= imp.pll.maxAdjVco)) continue;
      const KeyDigits digits = KeyOf(imp, filter_.run_, vco);
      const bool mayHaveMAndD = range.kind == RankedRange::Kind::kAccepted && digits.isServed;
      const Candidate candidate = {vco, attempt, digits.key, mayHaveMAndD};
      if (candidate.key <= key_) {
        Decide(candidate);
      } else {
        filter_.later_.push_back(candidate);
        std::push_heap(filter_.later_.begin(), filter_.later_.end(), IsLater);
      }
    }
  }

  // A candidate that is there for certain: it succeeds, or puts out those with larger keys.
  void Decide(const Candidate& candidate) {
    if (!undecided_.Contains(candidate.attempt)) return;
    if (candidate.mayHaveMAndD && filter_.HasMAndD(candidate.vco)) {
      undecided_.Erase(candidate.attempt);
      NoteMaybe(candidate.attempt, candidate.key);
    } else {
      putOut_.Insert(candidate.attempt);
    }
  }

  static bool IsLater(const Candidate& a, const Candidate& b) { return a.key > b.key; }

  Candidate TakeFirstOfLater() {
    std::pop_heap(filter_.later_.begin(), filter_.later_.end(), IsLater);
    const Candidate first = filter_.later_.back();
    filter_.later_.pop_back();
    return first;
  }

  // Visits the divider steps by which an attempt may come to the range.
  template <typename Visit>
  void VisitSteps(const RankedRange& range, Visit visit) const {
    const Div0Steps& steps = filter_.steps_;
    const int first = steps.Below(range.low / attempts_.Fastest());
    double divider = steps[first];
    for (int step = first; step < steps.Count(); ++step) {
      if (attempts_.Slowest() * divider > range.high) return;
      visit(step, divider);
      divider = step == 0 ? 2.0 : divider + steps.Width();
    }
  }

  PassFilter& filter_;
  const Attempts& attempts_;
  const Attempts* next_;
  ToleranceKey key_ = 0;
  AttemptSet undecided_;
  AttemptSet putOut_;     // by what is in the ranking up to here
  AttemptSet untouched_;  // surely without a candidate in it so far
};

PassFilter::PassFilter(const VorkelImp& imp, const Run& run)
    : imp_(imp),
      run_(run),
      outFreq0_(imp.requests.reqOutFreq[0]),
      steps_(HasIntegerDiv0(imp, run)),
      ranking_(RankVcos(imp, run)),
      hopeless_(IsHopelessAtOnce(imp, run) || IsHopelessByRanking(imp, run, ranking_)),
      applies_(std::fabs(outFreq0_) <= kLargestOutFreq0 && !IsBelowZero(imp, run)) {}

int PassFilter::NextFrom(int pass) {
  if (hopeless_) return kPasses;
  if (!applies_) return pass;
  while (pass < kPasses) {
    if (pass >= first_ + chunk_) {
      const int longest = LongestChunk(pass);
      if (longest == 0) return pass;
      WorkOutChunk(pass, longest);
    }
    const int next = maybe_.NextFrom(pass - first_);
    if (next < chunk_) return first_ + next;
    pass = first_ + chunk_;
  }
  return kPasses;
}

// As many passes as leave output 0 on its side of 0 and within a factor of 2, in each direction that
// comes into the VCO range: with more, many divider steps bring it to each range of the ranking. 0
// where it is just above 0: there all steps may do so, and to run the pass is less.
int PassFilter::LongestChunk(int firstPass) const {
  const double fudge = FudgeOf(firstPass);
  const double higher = (outFreq0_ + fudge) / kFudgeStep;
  const double lower = (outFreq0_ - fudge) / kFudgeStep;
  if (higher >= 0.0 && higher < kSmallestChunk) return 0;
  const int smallest = higher < 0.0 ? 1 : kSmallestChunk;
  const bool bothCount = lower > 0.0 && lower * kFudgeStep * kLargestDivider > imp_.pll.minAdjVco;
  const double longest = bothCount ? std::min(higher, lower / 2.0) : std::fabs(higher);
  return static_cast<int>(std::clamp<double>(longest, smallest, kLargestChunk));
}

void PassFilter::WorkOutChunk(int firstPass, int longest) {
  const int wanted = std::max(chunk_ * kChunkGrowth, kFirstChunk);
  first_ = firstPass;
  chunk_ = std::min({wanted, longest, kPasses - firstPass});
  maybe_.Clear();
  left_.fill(kNothingLeft);
  const Attempts upward(outFreq0_, firstPass, chunk_, Direction::kUpward);
  const Attempts downward(outFreq0_, firstPass, chunk_, Direction::kDownward);
  Walk(*this, upward, &downward).GoDown();
  Walk(*this, downward, nullptr).GoDown();
}

bool PassFilter::HasMAndD(double vco) const {
  VcoCandidate candidate;
  candidate.vco = vco;
  return SearchMAndD(candidate, imp_.pllLimits.pfdMin, PfdMaximum(imp_), true, run_);
}

}  // namespace Ip::Pll
