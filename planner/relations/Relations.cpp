// Tested by relations_test.cpp.
#include "planner/relations/Relations.h"

#include <algorithm>

namespace planner::relations {

namespace {

Crossing CrossingOf(const Relation& relation, const Rational& shorter) {
  const bool is_whole = relation.cycles != Rational(0);
  const bool is_same = relation.ratio == Rational(1);
  // The gap is at most the common step of the periods, and that at most the shorter one.
  if (relation.gaps.rise_rise == shorter) {
    return is_same ? Crossing::kSingleCycle : Crossing::kMulticycle;
  }
  if (relation.gaps.rise_rise >= relation.limit) {
    return is_same ? Crossing::kPhase : Crossing::kShort;
  }
  return is_whole ? Crossing::kRelaxed : Crossing::kFifo;
}

// Whether both can be there at the same time.
bool AreTogether(const Clock& one, const Clock& other) {
  return one.input == other.input || one.IsInput() || other.IsInput();
}

}  // namespace

Relation Relate(const Clock& launching, const Clock& capturing, const Rule& rule) {
  const Rational& shorter = std::min(launching.period, capturing.period);
  Relation relation;
  relation.ratio = launching.period / capturing.period;
  relation.hyperperiod = Hyperperiod(launching.period, capturing.period);
  relation.launches = relation.hyperperiod / launching.period;
  relation.captures = relation.hyperperiod / capturing.period;
  relation.phase =
      Modulo((capturing.rise - launching.rise) / capturing.period * 360, Rational(360));
  relation.gaps = GapsBetween(launching, capturing);
  relation.hold = HoldGap(launching, capturing);
  relation.limit = rule.gap ? *rule.gap : shorter * rule.share;
  if (relation.launches == Rational(1) || relation.captures == Rational(1)) {
    relation.cycles = std::max(relation.launches, relation.captures);
  }
  relation.crossing = CrossingOf(relation, shorter);
  return relation;
}

Relations RelationsOf(const Request& request, const Answer& answer, const Rule& rule) {
  Relations relations;
  relations.clocks = ClocksOf(request, answer);
  const std::vector<Clock>& clocks = relations.clocks;
  for (std::size_t from = 0; from < clocks.size(); ++from) {
    for (std::size_t to = 0; to < clocks.size(); ++to) {
      if (from == to || !AreTogether(clocks[from], clocks[to])) continue;
      Relation relation;
      if (clocks[from].input == clocks[to].input) {
        relation = Relate(clocks[from], clocks[to], rule);
      }
      relation.from = from;
      relation.to = to;
      relations.all.push_back(relation);
    }
  }
  return relations;
}

}  // namespace planner::relations
