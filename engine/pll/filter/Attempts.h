// A run of neighbouring attempts in one direction, and which of them bring output 0 into a range.
//
// Tested by pass_filter_test.cpp.
#ifndef VORKEL_ENGINE_PLL_FILTER_ATTEMPTS_H_
#define VORKEL_ENGINE_PLL_FILTER_ATTEMPTS_H_

#include <algorithm>
#include <cmath>

#include "engine/pll/Fudges.h"
#include "engine/pll/filter/Rounding.h"

namespace Ip::Pll {

enum class Direction { kUpward, kDownward };

// Attempt k, from 0 to count - 1, is that of pass firstPass + k: it takes for output 0 the fudge of
// its pass more, or less, than is requested (MHz).
class Attempts {
 public:
  Attempts(double requested, int firstPass, int count, Direction direction)
      : requested_(requested),
        firstPass_(firstPass),
        count_(count),
        isUpward_(direction == Direction::kUpward),
        first_(OutFreq(0)),
        perMHz_((isUpward_ ? 1.0 : -1.0) / kFudgeStep),
        margin_(MarginInSteps(std::fabs(OutFreq(FastestAttempt())), kFudgeStep)),
        aboveZero_(FindAboveZero()) {
    if (aboveZero_.IsEmpty()) return;
    slowest_ = std::max(OutFreq(SlowestAttempt()) - margin_ * kFudgeStep, 0.0);
    fastest_ = OutFreq(FastestAttempt()) + margin_ * kFudgeStep;
  }

  // None when `first` is above `last`.
  struct Span {
    int first;
    int last;
    bool IsEmpty() const { return first > last; }
  };

  // The attempts with an output 0 above 0. Others have no VCO above 0.
  const Span& AboveZero() const { return aboveZero_; }

  // Output 0 of an attempt, MHz: the very double of the search.
  double OutFreq(int attempt) const {
    const double fudge = FudgeOf(firstPass_ + attempt);
    return (isUpward_ ? fudge : 0.0 - fudge) + requested_;
  }

  // Bounds of what output 0 comes to above 0, MHz; both are 0 where no attempt is.
  double Slowest() const { return slowest_; }
  double Fastest() const { return fastest_; }

  // The attempts with an output 0 from `low` to `high` MHz: those that may have it, and those that
  // have it for certain.
  class Between {
   public:
    Between(const Attempts& attempts, double low, double high) : attempts_(attempts) {
      const double a = (low - attempts.first_) * attempts.perMHz_;
      const double b = (high - attempts.first_) * attempts.perMHz_;
      begin_ = std::min(a, b);
      end_ = std::max(a, b);
    }
    Span Possible() const {
      return {attempts_.From(begin_ - attempts_.margin_), attempts_.UpTo(end_ + attempts_.margin_)};
    }
    Span Sure() const {
      return {attempts_.From(begin_ + attempts_.margin_), attempts_.UpTo(end_ - attempts_.margin_)};
    }

   private:
    const Attempts& attempts_;
    double begin_;  // attempts
    double end_;
  };

  // Whether any attempt may have an output 0 of `frequency` MHz: whether Between has it as possible.
  bool MayMeet(double frequency) const {
    const double k = (frequency - first_) * perMHz_;
    return UpTo(k + margin_) >= k - margin_;
  }

  // The first attempt for certain whose output 0 is below `frequency`, in downward attempts.
  int FirstBelow(double frequency) const { return From((frequency - first_) * perMHz_ + margin_); }

 private:
  // Of those that are above 0, if any is.
  int FastestAttempt() const { return isUpward_ ? count_ - 1 : 0; }
  int SlowestAttempt() const { return isUpward_ ? aboveZero_.first : aboveZero_.last; }

  Span FindAboveZero() const {
    Span span = {0, count_ - 1};
    if (!(OutFreq(FastestAttempt()) > 0.0)) return {0, -1};
    while (!(OutFreq(isUpward_ ? span.first : span.last) > 0.0)) {
      isUpward_ ? ++span.first : --span.last;
    }
    return span;
  }

  // The way down the ranking spends its time here: no jumps, and no call to round.
  int From(double k) const {
    const double most = count_;
    const double inside = k > 0.0 ? (k < most ? k : most) : 0.0;
    const int whole = static_cast<int>(inside);
    return whole + (whole < inside ? 1 : 0);
  }
  int UpTo(double k) const {
    const double most = count_ - 1.0;
    return static_cast<int>(k >= 0.0 ? (k < most ? k : most) : -1.0);
  }

  double requested_;
  int firstPass_;
  int count_;
  bool isUpward_;
  double first_;   // output 0 of attempt 0, MHz
  double perMHz_;  // attempts; negative in downward ones
  double margin_;  // attempts
  Span aboveZero_;
  double slowest_ = 0.0;  // MHz
  double fastest_ = 0.0;
};

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_FILTER_ATTEMPTS_H_
