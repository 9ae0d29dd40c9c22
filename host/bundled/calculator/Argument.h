// Checks of single arguments. A refused argument is told in one sentence, which names the
// argument, its value and what it may be:
//
//   M is 65, but must be a whole number from 1 to 64 for a PLL.
//
// Tested by calculator_argument_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_ARGUMENT_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_ARGUMENT_H_

#include <stdexcept>
#include <string>
#include <string_view>

namespace Calculator {

// What is wrong with a query. Operations turn it into their error text.
class ArgumentError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// Input frequencies in MHz, from 1 Hz to 1 THz. No device comes near either end; within them
// no figure overflows or becomes 0.
inline constexpr double kLowestInput = 1e-6;
inline constexpr double kHighestInput = 1e6;

// The largest input jitter, ps peak to peak: a microsecond.
inline constexpr double kLargestInputJitter = 1e6;

// The shortest text that reads back as the same number; "inf", "-inf" or "nan".
std::string NumberText(double number);

// A frequency that was worked out, with six digits: "33.3333 MHz".
std::string FrequencyText(double megahertz);

// "from 400 to 1080 MHz"
std::string FrequencyRange(double lowest, double highest);

// "<what> is <value>", with the unit behind it when there is one.
std::string Statement(std::string_view what, double value, std::string_view unit = "");

// Throws ArgumentError: "<statement>, but must be <range>."
[[noreturn]] void Refuse(std::string_view statement, std::string_view range);

// Each is false for NaN.
bool IsWithin(double value, double lowest, double highest);
bool IsMultiple(double value, double step);
bool IsWhole(double value, double lowest, double highest);

// Throw ArgumentError when the argument is not within its range, both ends included.
void CheckWithin(std::string_view what, double value, std::string_view unit, double lowest,
                 double highest);
void CheckWhole(std::string_view what, double value, double lowest, double highest);
void CheckInputFrequency(double megahertz);

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_ARGUMENT_H_
