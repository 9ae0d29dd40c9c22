// Tested by rule_test.cpp.
#include "planner/relations/Rule.h"

#include "planner/read/Units.h"

namespace planner::relations {

std::optional<Rule> ReadRule(std::string_view text, const read::Place& place,
                             read::Mistakes* mistakes) {
  const bool is_share = text.find('%') != std::string_view::npos;
  const auto kind = is_share ? read::ValueKind::kShare : read::ValueKind::kGap;
  const std::optional<Rational> value = read::ReadValue(text, kind, place, mistakes);
  if (!value) return std::nullopt;
  Rule rule;
  if (is_share) {
    rule.share = *value / 100;
  } else {
    rule.gap = *value;
  }
  return rule;
}

}  // namespace planner::relations
