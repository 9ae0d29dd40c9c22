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
        perMHz_((isUpward_ ? 1.0 : -1.0) / kFudgeStep) {
    const double last = first_ + (count - 1) / perMHz_;
    slowest_ = std::min(first_, last) - kFudgeStep;
    fastest_ = std::max(first_, last) + kFudgeStep;
    margin_ = MarginInSteps(fastest_, kFudgeStep);
  }

  int Count() const { return count_; }

  // Output 0 of an attempt, MHz: the very double of the search.
  double OutFreq(int attempt) const {
    const double fudge = FudgeOf(firstPass_ + attempt);
    return (isUpward_ ? fudge : 0.0 - fudge) + requested_;
  }

  // Lower and upper bounds of output 0, MHz.
  double Slowest() const { return slowest_; }
  double Fastest() const { return fastest_; }

  // The attempts with an output 0 from `low` to `high` MHz; those that may have it, and those that
  // have it for certain. None when `first` is above `last`.
  struct Span {
    int first;
    int last;
    bool IsEmpty() const { return first > last; }
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

  double requested_;
  int firstPass_;
  int count_;
  bool isUpward_;
  double first_;   // output 0 of attempt 0, MHz
  double perMHz_;  // attempts; negative in downward ones
  double slowest_;
  double fastest_;
  double margin_;  // attempts
};

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_FILTER_ATTEMPTS_H_
