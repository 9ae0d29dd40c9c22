#include "engine/pll/PassFilter.h"

#include <algorithm>
#include <cmath>

#include "engine/pll/Fudges.h"

namespace Ip::Pll {

namespace {

constexpr int kFirstChunk = 16;  // passes; small, since most fudges are
constexpr int kChunkGrowth = 4;

// Above this output-0 frequency, in MHz, rounding is no longer small against a fudge step.
constexpr double kLargestOutFreq0 = 1e9;

// Frequencies above this one, in MHz, are far enough from the smallest doubles for relative
// errors to be bounded.
constexpr double kSmallestFrequency = 1e-200;

// An M and a D need a VCO and an input frequency on the same side of 0. Nobody has clocks below it;
// the filter works above only.
bool IsBelowZero(const VorkelImp& imp, const Run& run) {
  return run.inFreq < 0.0 && imp.pll.minAdjVco < 0.0;
}

bool CanSucceed(const VorkelImp& imp, const Run& run, const VcoRanking& ranking) {
  if (IsBelowZero(imp, run)) return true;
  // Fudges end at 11 MHz and dividers begin at 1.
  const double outFreq0 = imp.requests.reqOutFreq[0];
  if (!(outFreq0 >= -11.0 && outFreq0 - 11.0 <= imp.pll.maxAdjVco)) return false;
  // So small an input frequency needs as small a VCO; but output 0 shifted by a fudge is 0, or
  // as large as the rounding of the fudge at least.
  if (!(run.inFreq >= kSmallestFrequency)) return false;
  return std::any_of(ranking.begin(), ranking.end(), [](const RankedRange& range) {
    return range.kind == RankedRange::Kind::kAccepted;
  });
}

}  // namespace

// The attempts of a chunk in one direction. Attempt k, from 0 to count - 1, takes first + k x step
// (MHz; the step is negative in downward attempts) for output 0.
class PassFilter::Attempts {
 public:
  Attempts(double first, double step, int count)
      : first_(first), perMHz_(1.0 / step), count_(count) {
    const double last = first + step * (count - 1);
    const double around = std::fabs(step);
    slowest_ = std::min(first, last) - around;
    fastest_ = std::max(first, last) + around;
    // A fudge, the sum of up to 11000 steps, is off by less than 1e-8 steps; the ends of ranges
    // and what is worked out from them, by less than 1e-14 of the frequency.
    margin_ = 1e-6 + 1e-12 * fastest_ / around;
  }

  int Count() const { return count_; }

  // Lower and upper bounds of output 0, MHz.
  double Slowest() const { return slowest_; }
  double Fastest() const { return fastest_; }

  // The attempts with an output 0 from `low` to `high` MHz; those that may have it, and those that
  // have it for certain. None when `first` is above `last`.
  struct Span {
    int first;
    int last;
  };
  struct Spans {
    Span possible;
    Span sure;
  };
  Spans Between(double low, double high) const {
    const double a = (low - first_) * perMHz_;
    const double b = (high - first_) * perMHz_;
    const double begin = std::min(a, b);
    const double end = std::max(a, b);
    return {{From(begin - margin_), UpTo(end + margin_)},
            {From(begin + margin_), UpTo(end - margin_)}};
  }

  // The first attempt for certain whose output 0 is below `frequency`, in downward attempts.
  int FirstBelow(double frequency) const { return From((frequency - first_) * perMHz_ + margin_); }

 private:
  int From(double k) const {
    if (!(k > 0.0)) return 0;
    return k < count_ ? static_cast<int>(std::ceil(k)) : count_;
  }
  int UpTo(double k) const {
    if (!(k >= 0.0)) return -1;
    return k < count_ ? static_cast<int>(k) : count_ - 1;
  }

  double first_;
  double perMHz_;
  int count_;
  double slowest_;
  double fastest_;
  double margin_;  // attempts
};

PassFilter::PassFilter(const VorkelImp& imp, const Run& run)
    : imp_(imp),
      outFreq0_(imp.requests.reqOutFreq[0]),
      steps_(HasIntegerDiv0(imp, run)),
      ranking_(RankVcos(imp, run)),
      hopeless_(!CanSucceed(imp, run, ranking_)),
      applies_(std::fabs(outFreq0_) <= kLargestOutFreq0 && !IsBelowZero(imp, run)) {}

int PassFilter::NextFrom(int pass) {
  if (hopeless_) return kPasses;
  if (!applies_) return pass;
  while (pass < kPasses) {
    if (pass >= first_ + chunk_) WorkOutChunk(pass);
    const int next = maybe_.NextFrom(pass - first_);
    if (next < chunk_) return first_ + next;
    pass = first_ + chunk_;
  }
  return kPasses;
}

void PassFilter::WorkOutChunk(int firstPass) {
  const int wanted = std::clamp(chunk_ * kChunkGrowth, kFirstChunk, kLargestChunk);
  first_ = firstPass;
  chunk_ = std::min(wanted, kPasses - firstPass);
  maybe_.Clear();
  left_.fill(kNothingLeft);
  const double fudge = FudgeOf(firstPass);
  const Attempts upward(outFreq0_ + fudge, kFudgeStep, chunk_);
  const Attempts downward(outFreq0_ - fudge, -kFudgeStep, chunk_);
  WorkOutAttempts(upward, &downward);
  WorkOutAttempts(downward, nullptr);
}

// Notes which attempts may succeed, and what they leave for the `next` ones of their passes if
// there are any.
void PassFilter::WorkOutAttempts(const Attempts& attempts, const Attempts* next) {
  AttemptSet undecided;
  undecided.InsertRange(0, chunk_ - 1);
  undecided.Remove(maybe_);
  AttemptSet putOut;                 // by what is in the ranking up to here
  AttemptSet untouched = undecided;  // surely without a candidate in it so far
  ToleranceKey key = 0;
  for (const RankedRange& range : ranking_) {
    if (range.key != key) {
      key = range.key;
      undecided.Remove(putOut);
      if (undecided.IsEmpty()) return;
    }
    if (range.kind == RankedRange::Kind::kAccepted) {
      VisitSteps(range, attempts, [&](int, const Attempts::Spans& spans) {
        undecided.EraseRange(spans.possible.first, spans.possible.last, [&](int attempt) {
          // What the attempt before has left may put it out.
          if (key <= left_[static_cast<std::size_t>(attempt)]) maybe_.Insert(attempt);
        });
      });
      continue;
    }
    VisitSteps(range, attempts, [&](int step, const Attempts::Spans& spans) {
      putOut.InsertRange(spans.sure.first, spans.sure.last);
      if (next == nullptr) return;
      if (range.kind == RankedRange::Kind::kUnserved) {
        const int first = next->FirstBelow(imp_.pll.minAdjVco / steps_[step]);
        untouched.EraseRange(std::max(first, spans.sure.first), spans.sure.last, [&](int attempt) {
          left_[static_cast<std::size_t>(attempt)] = key;
        });
      }
      untouched.EraseRange(spans.possible.first, spans.possible.last);
    });
  }
}

// Visits the divider steps by which an attempt may come to the range, with the attempts that do.
template <typename Visit>
void PassFilter::VisitSteps(const RankedRange& range, const Attempts& attempts,
                            Visit visit) const {
  if (!(attempts.Fastest() > 0.0)) return;  // no VCO frequency above 0
  for (int step = steps_.Below(range.low / attempts.Fastest()); step < steps_.Count(); ++step) {
    const double divider = steps_[step];
    if (attempts.Slowest() * divider > range.high) return;
    const Attempts::Spans spans = attempts.Between(range.low / divider, range.high / divider);
    if (spans.possible.first <= spans.possible.last) visit(step, spans);
  }
}

}  // namespace Ip::Pll
