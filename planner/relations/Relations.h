// How the clocks of an answer relate, and how data can cross from one to another.
//
// What one primitive makes of one input is synchronous: all frequencies are quotients of whole
// numbers of each other, so that the edges come again after a hyperperiod. That does not make a
// crossing one that can be timed. Data launched by an edge must be there at the next edge of the
// capturing clock, and the tightest gap between such edges is what a timing tool gives every path.
// doc/relations.md has the rule by which crossings are told apart, and why.
//
// Tested by relations_test.cpp.
#ifndef VORKEL_PLANNER_RELATIONS_RELATIONS_H_
#define VORKEL_PLANNER_RELATIONS_RELATIONS_H_

#include <cstddef>
#include <optional>
#include <vector>

#include "planner/Answer.h"
#include "planner/Request.h"
#include "planner/relations/Clocks.h"
#include "planner/relations/Gaps.h"

namespace planner::relations {

// How data crosses from one clock to another.
enum class Crossing {
  kSingleCycle,  // the same frequency and phase: as within one clock
  kMulticycle,   // a whole ratio, and the slower clock rises with the faster: timed with a period
                 // of the faster, and with more where an enable says which of its edges count
  kPhase,        // the same frequency at another phase, which leaves enough of the period
  kShort,        // timed as it stands, with less than a period of the faster clock
  kRelaxed,      // the gap is too small, but the same behind every launch: a multicycle of 2
  kFifo,         // the gap is too small, and comes and goes: a FIFO or a handshake
  kUnrelated     // not synchronous: each follows an input of its own
};

// From which gap on a path can be timed. A crossing that has a whole period of the faster clock is
// no harder than a path within that clock, whatever the rule says.
struct Rule {
  std::optional<Rational> gap;      // ns; where it is not given, the share counts
  Rational share = Rational(1, 4);  // of the shorter period
};

// From clock `from` to clock `to`, places in Relations::clocks.
struct Relation {
  std::size_t from = 0;
  std::size_t to = 0;
  Crossing crossing = Crossing::kUnrelated;

  // Of synchronous ones:
  Rational ratio;        // the frequency of the capturing clock by that of the launching one
  Rational hyperperiod;  // ns
  Rational launches;     // rising edges of either clock in a hyperperiod, whole numbers
  Rational captures;
  Rational phase;  // by which the capturing clock is behind the launching one at time 0,
                   // degrees of the capturing clock, from 0 to below 360
  Gaps gaps;       // ns
  Rational hold;   // ns, see HoldGap
  Rational limit;  // ns: what the rule wants of the gap
  // Where the ratio is whole, periods of the faster clock in one of the slower; 0 else.
  Rational cycles;

  bool IsSynchronous() const { return crossing != Crossing::kUnrelated; }
  bool NeedsFifo() const { return crossing == Crossing::kFifo || crossing == Crossing::kUnrelated; }
};

struct Relations {
  std::vector<Clock> clocks;
  // All ordered pairs of two clocks that are there at the same time, by their places. The outputs
  // with one input are never there together with those of the other input: there is no crossing.
  std::vector<Relation> all;
};

// Of an answer that is solved. A share of the rule is above 0 and at most 1, a gap above 0.
Relations RelationsOf(const Request& request, const Answer& answer, const Rule& rule = {});

// From one clock to another, with the same input.
Relation Relate(const Clock& launching, const Clock& capturing, const Rule& rule);

}  // namespace planner::relations

#endif  // VORKEL_PLANNER_RELATIONS_RELATIONS_H_
