// The coefficients of the timing calculator, which a speed grade may give beside its limits.
// doc/calculator.md says what each of them does.
//
// Tested by calculator_coefficients_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_COEFFICIENTTABLE_H_
#define VORKEL_HOST_BUNDLED_DEVICE_COEFFICIENTTABLE_H_

#include <cstddef>
#include <optional>
#include <span>
#include <string_view>

namespace Device {

// What a coefficient describes: the oscillator and loop of PLL and TSYN, or the delay line of
// KRU_SP and KRU_CLKGEN. A grade has all coefficients of a group or none.
enum class CoefficientGroup { kLoop, kKru };

struct Coefficient {
  std::string_view name;
  CoefficientGroup group;
};

// A wider loop than this fraction of the PFD frequency is not stable: the detector samples the
// phase only once in a PFD period.
inline constexpr double kWidestLoop = 0.1;

// Every coefficient, each once. Its place in the table is its index everywhere else.
std::span<const Coefficient> Coefficients();

// The index of a coefficient, exact case; none when there is no such coefficient.
std::optional<std::size_t> FindCoefficient(std::string_view name);

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_COEFFICIENTTABLE_H_
