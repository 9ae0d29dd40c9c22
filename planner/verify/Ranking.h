// Which of two settings ranks first. The order is that of answer/Rank.h, written down once more.
//
// Tested by ranking_test.cpp.
#ifndef VORKEL_PLANNER_VERIFY_RANKING_H_
#define VORKEL_PLANNER_VERIFY_RANKING_H_

#include <limits>
#include <vector>

#include "planner/Answer.h"
#include "planner/Request.h"
#include "planner/Settings.h"

namespace planner::verify {

inline constexpr double kNoJitter = std::numeric_limits<double>::infinity();

// What counts of settings. Without unit, ps, without unit, MHz.
struct Figures {
  int rank_class = 0;  // 0: all demands met; 1: some missed; 2: a limit of the device broken
  Rational worst_error = 0;
  double jitter = kNoJitter;
  Rational margin = 0;
  Rational vco = 0;
};
Figures FiguresOf(const Answer& answer);

struct Ranked {
  Settings settings;
  Figures figures;
};

// Below 0 when the first ranks before the second by what counts; 0 when they are equal in that.
int CompareFigures(const Request& request, const Figures& a, const Figures& b);

// Settings as numbers, in the order in which the smaller one comes first.
std::vector<int> Numbers(const Settings& settings);

bool IsBefore(const Request& request, const Ranked& a, const Ranked& b);

// The trade-offs of a set of settings: of the best class, each with less jitter than all that have
// a smaller error; of several with the same of both the one that ranks first.
class Tradeoffs {
 public:
  explicit Tradeoffs(const Request& request) : request_(request) {}

  void Add(const Ranked& one);
  // The smallest error first.
  const std::vector<Ranked>& All() const { return all_; }
  // Whether one with at least such an error and jitter would not be a trade-off, being worse in
  // one of them. `margin` is by how much of it, at least, an error has to be worse to count.
  bool IsBehind(int rank_class, double error, double jitter, double margin) const;

 private:
  const Request& request_;
  std::vector<Ranked> all_;
};

}  // namespace planner::verify

#endif  // VORKEL_PLANNER_VERIFY_RANKING_H_
