// Whether a PLL or a TSYN has settings that meet some demands and keep some limits.
//
// The demands leave short spans of the ratio M / D (VcoSpans.h). Many of them have no quotient of
// an M and a D at all, which is quickly known (Fractions.h); what is in the others is tried.
//
// Tested by within_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_LOOPWITHIN_H_
#define VORKEL_PLANNER_SEARCH_LOOPWITHIN_H_

#include <cstddef>
#include <memory>
#include <optional>
#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"
#include "planner/answer/Jitter.h"
#include "planner/search/FrequencyDemand.h"
#include "planner/search/JitterDemand.h"
#include "planner/search/LoopGrid.h"
#include "planner/search/OutputShape.h"
#include "planner/search/RatioRange.h"
#include "planner/search/SpanStore.h"
#include "planner/search/VcoSpans.h"
#include "planner/search/Within.h"

namespace planner::search {

class LoopWithin {
 public:
  // `like` is another question to the same primitive, or null: the outputs of which all is the same
  // there are prepared once for both.
  LoopWithin(const Request& request, const Device& device, Primitive primitive,
             const LoopWithin* like);

  std::optional<Settings> Find(const Relaxed& relaxed) const;

 private:
  class Question;

  // All that the rest of an output depends on.
  struct Cause {
    std::vector<Rational> inputs;
    Output demand;  // with the tolerances that count
    Range range;
    int largest_count;
    bool operator==(const Cause&) const = default;
  };

  // A used output.
  struct Asked {
    Asked(std::size_t place, Cause all, const LoopWithin& within);

    std::size_t index;
    Cause cause;
    FrequencyDemand frequency;
    RatioRange range;        // with each input
    RatioRange first_range;  // with the first input alone
    OutputShape shape;
    OutputShape long_shape;  // without the limit of high and low times
    std::optional<Rational> max_jitter;
    mutable SpanStore spans;
  };
  using AskedPointer = std::shared_ptr<const Asked>;

  Cause CauseOf(std::size_t index) const;

  Request request_;
  LoopLimits limits_;
  Primitive primitive_;
  bool fractions_;
  Inputs inputs_;
  Inputs first_input_;
  std::vector<AskedPointer> outputs_;
  answer::LoopJitter jitter_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_LOOPWITHIN_H_
