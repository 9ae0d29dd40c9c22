// Where the VCO can be: spans of the ratio M / D (M in eighths) in which outputs meet demands.
//
// An output that may be off by so much, with a divider that keeps its range, leaves a span of the
// VCO for each divider. What is left for several outputs is where their spans meet: a handful of
// short spans, among which to look for M and D, in place of all M and D of the grid.
//
// Spans are rounded outwards: all ratios that meet the demands are in them, and of those close to
// an end some that do not.
//
// Tested by vco_spans_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_VCOSPANS_H_
#define VORKEL_PLANNER_SEARCH_VCOSPANS_H_

#include <algorithm>
#include <vector>

namespace planner::search {

struct Span {
  double lowest;
  double highest;
};
// In rising order, apart from each other.
using Spans = std::vector<Span>;

// How much wider than rounded a span is, as a fraction of its ends.
inline constexpr double kWider = 1e-12;

// Adds a span that does not begin below the last one, whose end it can go into.
inline void AddSpan(double lowest, double highest, Spans* spans) {
  if (lowest > highest) return;
  if (!spans->empty() && lowest <= spans->back().highest) {
    spans->back().highest = std::max(spans->back().highest, highest);
  } else {
    spans->push_back({lowest, highest});
  }
}

// The dividers that an output can have, in steps, and the ratios that go with one of them.
struct SpanOutput {
  // A ratio has to be from divider x lowest to divider x highest. None may be HUGE_VAL or NaN.
  double lowest;
  double highest;
  int first;  // the smallest divider, a multiple of `step`
  int last;
  int step;
};

// What of `spans` an output leaves, into `left`, which is empty. `is_allowed` tells for a divider
// whether the output can have it.
template <typename IsAllowed>
void Meet(const Spans& spans, const SpanOutput& output, const IsAllowed& is_allowed, Spans* left) {
  const double step = output.step;
  const double end = output.last / output.step + 1;  // NOLINT: rounded down, and one more
  for (const Span& span : spans) {
    // The dividers that reach into the span, one further out.
    const double from = span.lowest / output.highest / step - 1;
    const double to = output.lowest > 0 ? span.highest / output.lowest / step + 1 : end;
    const int first = std::max(static_cast<int>(std::min(from, end)) * output.step, output.first);
    const int last = std::min(static_cast<int>(std::min(to, end)) * output.step, output.last);
    for (int divider = first; divider <= last; divider += output.step) {
      const double lowest = std::max(span.lowest, divider * output.lowest * (1 - kWider));
      const double highest = std::min(span.highest, divider * output.highest * (1 + kWider));
      if (lowest > highest || !is_allowed(divider)) continue;
      AddSpan(lowest, highest, left);
      // All that follows lies in there.
      if (highest == span.highest) break;
    }
  }
}

// What two lists of spans have in common, into `common`, which is empty.
inline void Common(const Spans& spans, const Spans& others, Spans* common) {
  auto other = others.begin();
  for (const Span& span : spans) {
    other = std::lower_bound(other, others.end(), span.lowest,
                             [](const Span& one, double lowest) { return one.highest < lowest; });
    for (auto next = other; next != others.end() && next->lowest <= span.highest; ++next) {
      AddSpan(std::max(span.lowest, next->lowest), std::min(span.highest, next->highest), common);
    }
  }
}

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_VCOSPANS_H_
