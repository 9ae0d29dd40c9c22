// Tested by phase_table_test.cpp.
#include "planner/search/PhaseTable.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>

#include "planner/answer/Demands.h"
#include "planner/search/Factor.h"

namespace planner::search {

namespace {

// With parts of the phase and its tolerance below this, all products fit into 63 or 127 bits.
constexpr std::int64_t kLargest = std::int64_t{1} << 44;

constexpr int kTurn = 360;
constexpr int kQuarter = kTurn / static_cast<int>(kQuarters);

bool Fits(const Rational& value) {
  const auto words = value.InWords();
  return words && std::abs(words->numerator) < kLargest && words->denominator < kLargest;
}

}  // namespace

PhaseTable::PhaseTable(const Request& request, const Output& asked, std::size_t shifts) {
  if (Fits(*asked.phase) && Fits(request.PhaseToleranceOf(asked))) {
    Fill(request, asked, shifts);
  } else {
    FillSlowly(request, asked, shifts);
  }
}

// Phases are counted in parts of 1 / (255 x the denominator of the asked one) degrees.
void PhaseTable::Fill(const Request& request, const Output& asked, std::size_t shifts) {
  const auto phase = *asked.phase->InWords();
  const auto tolerance = *request.PhaseToleranceOf(asked).InWords();
  const double per_unit = (1 / answer::PhaseUnit(request.PhaseToleranceOf(asked))).ToDouble();
  const std::int64_t degree = hardware::kShiftSteps * phase.denominator;
  const std::int64_t turn = kTurn * degree;
  const std::int64_t step = kTurn * phase.denominator;
  const double per_part = per_unit / static_cast<double>(degree);
  const Wide allowed = Wide{tolerance.numerator} * degree;
  for (std::size_t quarter = 0; quarter < kQuarters; ++quarter) {
    std::int64_t difference = (static_cast<std::int64_t>(quarter) * kQuarter * degree -
                               hardware::kShiftSteps * phase.numerator) %
                              turn;
    if (difference < 0) difference += turn;
    for (std::size_t shift = 0; shift < shifts; ++shift) {
      const std::int64_t error = std::min(difference, turn - difference);
      errors_[quarter][shift] = static_cast<double>(error) * per_part;
      met_[quarter][shift] = Wide{error} * tolerance.denominator <= allowed;
      difference += step;
      if (difference >= turn) difference -= turn;
    }
  }
}

void PhaseTable::FillSlowly(const Request& request, const Output& asked, std::size_t shifts) {
  const Rational& tolerance = request.PhaseToleranceOf(asked);
  const Rational unit = answer::PhaseUnit(tolerance);
  for (std::size_t quarter = 0; quarter < kQuarters; ++quarter) {
    for (std::size_t shift = 0; shift < shifts; ++shift) {
      const Rational made =
          Rational(static_cast<int>(quarter) * kQuarter) +
          Rational(static_cast<std::int64_t>(shift) * kTurn, hardware::kShiftSteps);
      const Rational error = hardware::TurnedToHalf(made - *asked.phase).Absolute();
      errors_[quarter][shift] = (error / unit).ToDouble();
      met_[quarter][shift] = error <= tolerance;
    }
  }
}

}  // namespace planner::search
