// Values as people write them, exactly: 148.5, 148.5MHz, 148500kHz, 8ns for a period, 100/3,
// 90deg, 50%, 50ps, 100ppm.
//
// A value is a number, perhaps divided by another, and perhaps with a unit. The decimals that are
// written are the value: 33.333 is 33333/1000. Without a unit it is in MHz, degrees, percent, ps
// or ppm. Units are written in any case, but where that says something else than what is nearly
// always meant, as in mHz, the value is refused.
//
// In a list, commas stand between the entries, and each entry has a unit of its own or none. An
// entry without a unit beside one that is in another unit than that, as in 8,16ns, is refused.
//
// Tested by units_test.cpp.
#ifndef VORKEL_PLANNER_READ_UNITS_H_
#define VORKEL_PLANNER_READ_UNITS_H_

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "hardware/Exact.h"
#include "planner/read/Mistake.h"

namespace planner::read {

// The entries of a list, nothing for "-".
using Values = std::vector<std::optional<hardware::Rational>>;

// The value of a text in the unit of its kind. What is wrong is added to `mistakes` with the place,
// and there is no value then.
std::optional<hardware::Rational> ReadValue(std::string_view text, ValueKind kind,
                                            const Place& place, Mistakes* mistakes);

// The values of a text with commas between them. With `optional` an entry may be "-".
std::optional<Values> ReadValues(std::string_view text, ValueKind kind, const Place& place,
                                 bool optional, Mistakes* mistakes);

// Whether a word is a unit of the kind, in any case, as the MHz of "27 MHz" that comes as two
// words.
bool IsUnit(std::string_view word, ValueKind kind);

// A value as a person would write it: 148.5 for what ends as a decimal, else 100/3.
std::string Written(const hardware::Rational& value);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_UNITS_H_
