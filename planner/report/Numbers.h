// Numbers as texts show them. All are exact until here and are rounded once, half of the last
// decimal away from 0; none is ever "-0".
#ifndef VORKEL_PLANNER_REPORT_NUMBERS_H_
#define VORKEL_PLANNER_REPORT_NUMBERS_H_

#include <string>

#include "hardware/Exact.h"

namespace planner::report {

using hardware::Rational;

// Decimals of a frequency in MHz: down to 1 Hz.
inline constexpr int kFrequencyDecimals = 6;

// With exactly so many decimals, and with up to so many, without zeros at the end. A double must
// be finite.
std::string Fixed(const Rational& value, int decimals);
std::string Fixed(double value, int decimals);
std::string Short(const Rational& value, int decimals);
std::string Short(double value, int decimals);

// With so many digits in all, without zeros at the end; very large and very small ones with an
// exponent, as "1e+300".
std::string General(const Rational& value, int digits);

// As short as Short, but with as many more decimals as it takes to tell it from `other`, if it is
// another number.
std::string Distinct(const Rational& value, const Rational& other, int decimals);

// A time, ps, as all of them are shown.
std::string Ps(double value);

// A count of eighths as a number: 499 is "62.375".
std::string Eighths(int count);

// Exactly, as "148" or "297/2".
std::string Quotient(const Rational& value);

// Exactly, in decimals where these end: "148.5"; else as Quotient has it: "100/3".
std::string Decimal(const Rational& value);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_NUMBERS_H_
