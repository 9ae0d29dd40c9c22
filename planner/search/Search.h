// All settings of a primitive, searched for the best.
//
// The search takes every setting that keeps the device's limits, and answers exactly what trying
// them one by one in exact arithmetic would (tests/planner/search/plain_enumeration.h does).
//
// A PLL or a TSYN: every bandwidth that the request leaves open and every M and D with which VCO
// and PFD are in range with each input. Each output then has a divider of its own, of those that
// keep its range with each input. Preferred is one that meets the demands of the output; of those
// the one with the largest margin, when the request ranks by margin; then the smallest worst error
// in units of the tolerances (answer/Rank.h), the smallest error of the frequency, of the phase, of
// the duty cycle, and the smallest divider. Phases and high times are those that are nearest to the
// request: 0 and 50 percent where none is asked for.
//
// Beside a fraction nothing can be moved. So where phases or duty cycles are asked for, a TSYN that
// has fractions offers two settings for a whole M: all dividers whole, with phases and high times;
// and a fraction for output 0, with none. The ranking decides.
//
// A KRU: every CLKIN_DIVIDE_BY_2, feedback, M, D, divide, PHASE_SHIFT and pin of each output that
// keep the ranges of the pins. With the same figures the pins with the lower codes are taken.
//
// Tested by search_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_SEARCH_H_
#define VORKEL_PLANNER_SEARCH_SEARCH_H_

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"

namespace planner::search {

// The trade-offs that are kept at most.
inline constexpr std::size_t kMostOfFront = 10000;

// Settings that keep the device's limits, with what they are ranked by first.
struct Candidate {
  Settings settings;
  bool within = false;               // all demands are met
  Rational worst_error = 0;          // in units of the tolerances
  std::optional<double> max_jitter;  // ps, peak to peak; nothing when unknown
};

// What there was to look at. A pair is an M and a D that keep VCO and PFD in range, with a
// bandwidth; of a KRU an M and a D of the synthesiser, or neither, with CLKIN_DIVIDE_BY_2 or not
// and with feedback or not.
struct Counts {
  std::int64_t pairs = 0;
  // How often dividers or pins were chosen; of the others a bound tells that they can neither be
  // the best nor a trade-off.
  std::int64_t judged = 0;
};

struct Found {
  // For each bandwidth that the request leaves open, in the order of kBandwidths, the settings that
  // rank first; not there when no setting with it keeps the limits. Of a KRU one, or none.
  std::vector<Candidate> best;
  // Trade-offs, over all bandwidths: settings of which each has less jitter than all with a smaller
  // worst error, the smallest error first; only those that meet all demands when there are any
  // such (answer/Front.h). With an unknown jitter only the one with the smallest error.
  std::vector<Candidate> front;
  Counts counts;
  // Nothing was left out that could be in `best` or `front`. False only when the front has more
  // than kMostOfFront settings: then those with the smaller errors are there.
  bool complete = true;
};

// What a search is for.
struct Aim {
  enum class Part {
    kAll,
    kMet,     // only what meets all demands: `best` and `front` have nothing else
    kNearest  // what comes nearest: it is known that nothing meets all demands
  };
  Part part = Part::kAll;
  // Of what does not meet all demands, nothing with a larger worst error than this is of use: it
  // may be found or not. Nothing: all is.
  std::optional<Rational> worst_error = {};
};

// The best settings of a primitive of the device, and the trade-offs. Empty when no setting keeps
// the limits, and when the request has more inputs or outputs than the primitive. The request is
// as Request.h says; its `primitive`, `any_order` and `engine_only` change nothing here.
Found Search(const Request& request, const Device& device, Primitive primitive,
             const Aim& aim = {});

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_SEARCH_H_
