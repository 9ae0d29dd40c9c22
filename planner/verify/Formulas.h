// The formulas of the certificate, one a figure.
//
// Tested by formulas_test.cpp.
#ifndef VORKEL_PLANNER_VERIFY_FORMULAS_H_
#define VORKEL_PLANNER_VERIFY_FORMULAS_H_

#include <vector>

#include "hardware/Exact.h"
#include "hardware/Kru.h"
#include "planner/Request.h"

namespace planner::verify {

// (actual - wanted) / wanted, in millionths.
Rational Ppm(const Rational& actual, const Rational& wanted);

// An angle as one above -180 and up to 180 degrees.
Rational Turned(Rational degrees);

// What an input can be with a tolerance, ppm: its frequency alone where that is 0, else the lowest
// and the highest.
std::vector<Rational> CornersOf(const Rational& input, const Rational& tolerance);
// The same of some inputs.
std::vector<Rational> CornersOf(const std::vector<Rational>& inputs, const Rational& tolerance);

// The smaller of (f - lowest) / lowest and (highest - f) / highest. An end of 0 is none.
Rational MarginIn(const Range& range, const Rational& frequency);

// The size of an error in units of its tolerance. A tolerance of 0 has the unit of its kind.
Rational PpmInUnits(const Rational& error, const Rational& tolerance);      // 100 ppm
Rational DegreesInUnits(const Rational& error, const Rational& tolerance);  // 0.5 degrees
Rational PointsInUnits(const Rational& error, const Rational& tolerance);   // 0.5 points
Rational PsInUnits(const Rational& jitter, const Rational& allowed);        // 1 ps

// What a PLL or a TSYN makes; M and dividers in eighths, MHz, degrees, percent.
Rational VcoOf(const Rational& input, int m, int d);
Rational PfdOf(const Rational& input, int d);
Rational FrequencyOf(const Rational& vco, int divider);
Rational PhaseOf(int step, int divider);
Rational DutyOf(int high_time, int divider);

// What a pin of a KRU makes of an input, MHz.
Rational FrequencyOf(const Rational& input, hardware::Pin pin, const hardware::KruRatios& set);
// Degrees, from 0 to below 360; percent.
Rational PhaseOf(hardware::Pin pin, int phase_shift);
Rational DutyOf(hardware::Pin pin, int divide_halves);

// Whether a pin has M and D, or the divide, in its way.
bool HasM(hardware::Pin pin);
bool HasDivide(hardware::Pin pin);

}  // namespace planner::verify

#endif  // VORKEL_PLANNER_VERIFY_FORMULAS_H_
