// Phase and duty cycle of one output of a loop: how near the steps behind a divider come to what is
// asked for. They do not depend on M and D.
//
// Dividers are in eighths. Behind one that is no whole number the phase goes in eighths of a VCO
// period and the duty cycle in halves all the same: no hardware can do that, but an explanation
// wants to know.
//
// Tested by output_shape_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_OUTPUTSHAPE_H_
#define VORKEL_PLANNER_SEARCH_OUTPUTSHAPE_H_

#include <cstdint>

#include "planner/Request.h"
#include "planner/search/Near.h"

namespace planner::search {

// How far something is off, in units of its tolerance, and whether that is allowed.
struct ShapeError {
  Near error;
  bool is_met = true;
};

class OutputShape {
 public:
  // `count` is the largest high or low time, in VCO periods.
  OutputShape(const Request& request, const Output& asked, int count);

  bool AsksForPhase() const { return phase_.is_asked; }
  bool AsksForDuty() const { return duty_.is_asked; }

  // With the nearest step, or high time; no error where nothing is asked for.
  ShapeError Phase(int divider) const;
  ShapeError Duty(int divider) const;
  // With a phase of 0, and with a duty cycle of 50 percent.
  const ShapeError& StillPhase() const { return still_phase_; }
  const ShapeError& StillDuty() const { return still_duty_; }

  // The step and the high time of a divider; 0 where nothing is asked for.
  int Step(int divider) const;
  int HighTime(int divider) const;

 private:
  // asked / per, off by at most allowed / allowed_per; `per` is 0 where that does not fit.
  struct Demand {
    bool is_asked = false;
    std::int64_t asked = 0;
    std::int64_t per = 0;
    std::int64_t allowed = 0;
    std::int64_t allowed_per = 0;
    Rational exact;
    Rational tolerance;
    double per_unit = 0;
    double value = 0;      // `exact`
    double tolerated = 0;  // `tolerance`
  };
  static Demand DemandOf(const Rational& asked, const Rational& tolerance, const Rational& unit);
  static ShapeError Judge(const Demand& demand, const Rational& error);
  static ShapeError Compare(const Demand& demand, std::int64_t part, int whole);
  static std::int64_t NearestOf(const Demand& demand, int factor, int per);

  int count_;
  Demand phase_;  // in turns
  Demand duty_;   // percent
  ShapeError still_phase_;
  ShapeError still_duty_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_OUTPUTSHAPE_H_
