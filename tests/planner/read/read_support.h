// What the tests of planner/read/ share.
#ifndef VORKEL_TESTS_PLANNER_READ_READ_SUPPORT_H_
#define VORKEL_TESTS_PLANNER_READ_READ_SUPPORT_H_

#include <optional>
#include <string>
#include <vector>

#include "hardware/Exact.h"
#include "planner/read/Draft.h"
#include "planner/read/MistakeText.h"

namespace planner::read {

// The sentences of some mistakes.
inline std::vector<std::string> TextsOf(const Mistakes& mistakes) {
  std::vector<std::string> texts;
  for (const Mistake& mistake : mistakes) texts.push_back(TextOf(mistake));
  return texts;
}

inline Place Called(std::string entry) {
  Place place;
  place.entry = std::move(entry);
  return place;
}

inline Rational Quotient(std::int64_t numerator, std::int64_t denominator) {
  return Rational(numerator, denominator);
}

// A quotient as text, so that a failure shows it.
inline std::string Shape(const std::optional<Rational>& value) {
  if (!value) return "nothing";
  return value->NumeratorText() + "/" + value->DenominatorText();
}

}  // namespace planner::read

#endif  // VORKEL_TESTS_PLANNER_READ_READ_SUPPORT_H_
