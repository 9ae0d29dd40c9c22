// How near the edges of two clocks come to each other, in exact arithmetic.
//
// A clock of period A has an edge at a + i A, another of period B one at b + j B. The difference is
// b - a + j B - i A, and j B - i A goes through the multiples of the greatest common divisor g of A
// and B, all of them and nothing else. So the capturing edges are behind launching ones by
// (b - a) mod g + k g: the tightest gap is (b - a) mod g, or g when that is 0, as an edge is not
// captured by one at the same time. No edge has to be looked at.
//
// An example: of 100 and 75 MHz, 10 and 13 1/3 ns, g is 3 1/3 ns. When both rise at 0, the second
// rises at 13 1/3 ns, 3 1/3 ns behind the first.
//
// Tested by gaps_test.cpp, against edges that are walked through one by one.
#ifndef VORKEL_PLANNER_RELATIONS_GAPS_H_
#define VORKEL_PLANNER_RELATIONS_GAPS_H_

#include "hardware/Exact.h"
#include "planner/relations/Clocks.h"

namespace planner::relations {

using hardware::Rational;

// The greatest quotient of which both periods, above 0, are whole multiples.
Rational CommonStep(const Rational& one, const Rational& other);
// The least time that is a whole multiple of both: after it all edges come again.
Rational Hyperperiod(const Rational& one, const Rational& other);

// What is left of a value when whole steps are taken away: from 0 to below a step.
Rational Modulo(const Rational& value, const Rational& step);

// The tightest gaps from an edge of one clock to a later one of another, ns: above 0 and at most
// the common step of their periods. They are named for the launching and the capturing edge.
struct Gaps {
  Rational rise_rise;
  Rational rise_fall;
  Rational fall_rise;
  Rational fall_fall;
  bool operator==(const Gaps&) const = default;
};
Gaps GapsBetween(const Clock& launching, const Clock& capturing);

// The tightest time by which a rising edge of the capturing clock is before one of the launching
// clock, ns, 0 when some are at the same time: what is launched may come so much too early, and no
// more, without touching what that edge captures.
Rational HoldGap(const Clock& launching, const Clock& capturing);

}  // namespace planner::relations

#endif  // VORKEL_PLANNER_RELATIONS_GAPS_H_
