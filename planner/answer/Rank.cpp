// Tested by rank_test.cpp.
#include "planner/answer/Rank.h"

#include <algorithm>
#include <cstddef>
#include <initializer_list>

namespace planner::answer {

namespace {

constexpr std::strong_ordering kEqual = std::strong_ordering::equal;
constexpr std::strong_ordering kFirst = std::strong_ordering::less;
constexpr std::strong_ordering kSecond = std::strong_ordering::greater;

constexpr std::strong_ordering Reversed(std::strong_ordering order) { return 0 <=> order; }

Comparison By(Criterion criterion, std::strong_ordering order) {
  return {order, order == kEqual ? Criterion::kNone : criterion};
}

Comparison ByWorstError(const Order&, const RankKey& a, const RankKey& b) {
  return By(Criterion::kWorstError, a.worst_error <=> b.worst_error);
}

Comparison ByJitter(const Order&, const RankKey& a, const RankKey& b) {
  if (a.jitter == b.jitter) return {};
  const bool are_known = a.jitter != kUnknownJitter && b.jitter != kUnknownJitter;
  return By(are_known ? Criterion::kJitter : Criterion::kKnownJitter,
            a.jitter < b.jitter ? kFirst : kSecond);
}

Comparison ByMargin(const Order&, const RankKey& a, const RankKey& b) {
  return By(Criterion::kMargin, b.margin <=> a.margin);
}

Comparison ByVco(const Order& order, const RankKey& a, const RankKey& b) {
  const std::strong_ordering lowest = a.vco <=> b.vco;
  return By(Criterion::kVco, order.prefer_max_vco ? Reversed(lowest) : lowest);
}

using Rule = Comparison (*)(const Order&, const RankKey&, const RankKey&);

Comparison ByRules(std::initializer_list<Rule> rules, const Order& order, const RankKey& a,
                   const RankKey& b) {
  for (const Rule rule : rules) {
    const Comparison comparison = rule(order, a, b);
    if (comparison.order != kEqual) return comparison;
  }
  return {};
}

// Those that meet all demands and keep all limits.
Comparison CompareMet(const Order& order, const RankKey& a, const RankKey& b) {
  switch (order.rank) {
    case planner::Rank::kJitter:
      return ByRules({ByJitter, ByWorstError, ByVco}, order, a, b);
    case planner::Rank::kError:
      return ByRules({ByWorstError, ByJitter, ByVco}, order, a, b);
    case planner::Rank::kMargin:
      return ByRules({ByMargin, ByJitter, ByWorstError, ByVco}, order, a, b);
    case planner::Rank::kVco:
      break;
  }
  return ByRules({ByVco, ByJitter, ByWorstError}, order, a, b);
}

std::size_t PlaceOf(Primitive primitive) {
  const auto found =
      std::find(hardware::kPrimitives.begin(), hardware::kPrimitives.end(), primitive);
  return static_cast<std::size_t>(found - hardware::kPrimitives.begin());
}

std::size_t PlaceOf(Bandwidth bandwidth) {
  const auto found =
      std::find(hardware::kBandwidths.begin(), hardware::kBandwidths.end(), bandwidth);
  return static_cast<std::size_t>(found - hardware::kBandwidths.begin());
}

Comparison ByPrimitive(Primitive a, Primitive b) {
  return By(Criterion::kPrimitive, PlaceOf(a) <=> PlaceOf(b));
}

// One field of the members of two lists. (The library of the compilers that this is for has no
// comparison of vectors in three ways.)
template <typename T, typename Of>
std::strong_ordering Lexicographically(const std::vector<T>& a, const std::vector<T>& b, Of of) {
  const std::size_t count = std::min(a.size(), b.size());
  for (std::size_t i = 0; i < count; ++i) {
    const std::strong_ordering order = of(a[i]) <=> of(b[i]);
    if (order != kEqual) return order;
  }
  return a.size() <=> b.size();
}

Comparison FirstOf(std::initializer_list<Comparison> comparisons) {
  for (const Comparison& comparison : comparisons) {
    if (comparison.order != kEqual) return comparison;
  }
  return {};
}

}  // namespace

Comparison Compare(const Order& order, const RankKey& a, const RankKey& b) {
  if (a.rank_class != b.rank_class) {
    return By(Criterion::kClass, a.rank_class < b.rank_class ? kFirst : kSecond);
  }
  switch (a.rank_class) {
    case Class::kMet:
      return CompareMet(order, a, b);
    case Class::kMissed:
    case Class::kBroken:
      return ByRules({ByWorstError, ByJitter, ByVco}, order, a, b);
    case Class::kUnsolved:
      break;
  }
  return {};
}

Comparison CompareSettings(const LoopSettings& a, const LoopSettings& b) {
  const auto divider = [](const LoopOutput& output) { return output.divider; };
  const auto phase = [](const LoopOutput& output) { return output.phase; };
  const auto high_time = [](const LoopOutput& output) { return output.high_time; };
  return FirstOf({ByPrimitive(a.primitive, b.primitive),
                  By(Criterion::kBandwidth, PlaceOf(a.bandwidth) <=> PlaceOf(b.bandwidth)),
                  By(Criterion::kSettings, a.d <=> b.d), By(Criterion::kSettings, a.m <=> b.m),
                  By(Criterion::kSettings, Lexicographically(a.outputs, b.outputs, divider)),
                  By(Criterion::kSettings, Lexicographically(a.outputs, b.outputs, phase)),
                  By(Criterion::kSettings, Lexicographically(a.outputs, b.outputs, high_time))});
}

Comparison CompareSettings(const KruSettings& a, const KruSettings& b) {
  const auto pin = [](hardware::Pin one) { return static_cast<int>(one); };
  return FirstOf({ByPrimitive(a.primitive, b.primitive),
                  By(Criterion::kBandwidth, a.feedback <=> b.feedback),
                  By(Criterion::kBandwidth, a.divide_by_2 <=> b.divide_by_2),
                  By(Criterion::kSettings, a.d <=> b.d), By(Criterion::kSettings, a.m <=> b.m),
                  By(Criterion::kSettings, a.divide_halves <=> b.divide_halves),
                  By(Criterion::kSettings, Lexicographically(a.pins, b.pins, pin)),
                  By(Criterion::kSettings, a.phase_shift <=> b.phase_shift)});
}

Comparison CompareSettings(const Settings& a, const Settings& b) {
  const auto* const loop = std::get_if<LoopSettings>(&a);
  const auto* const other_loop = std::get_if<LoopSettings>(&b);
  if (loop != nullptr && other_loop != nullptr) return CompareSettings(*loop, *other_loop);
  const auto* const kru = std::get_if<KruSettings>(&a);
  const auto* const other_kru = std::get_if<KruSettings>(&b);
  if (kru != nullptr && other_kru != nullptr) return CompareSettings(*kru, *other_kru);
  return ByPrimitive(PrimitiveOf(a), PrimitiveOf(b));
}

RankKey KeyOf(const Answer& answer) {
  if (!answer.solved) return {.rank_class = Class::kUnsolved};
  const bool is_broken = !answer.violations.empty();
  return {.rank_class = is_broken       ? Class::kBroken
                        : answer.within ? Class::kMet
                                        : Class::kMissed,
          .worst_error = answer.worst_error,
          .jitter = answer.max_jitter.value_or(kUnknownJitter),
          .margin = answer.margin,
          .vco = answer.vco};
}

Comparison Compare(const Request& request, const Answer& a, const Answer& b) {
  const Comparison comparison = Compare(Order(request), KeyOf(a), KeyOf(b));
  if (comparison.order != kEqual) return comparison;
  if (!a.solved) return ByPrimitive(a.primitive, b.primitive);
  return CompareSettings(a.settings, b.settings);
}

bool Before(const Request& request, const Answer& a, const Answer& b) {
  return Compare(request, a, b).order < 0;
}

Criterion Decided(const Request& request, const Answer& a, const Answer& b) {
  return Compare(request, a, b).decided;
}

void Rank(const Request& request, std::vector<Answer>* answers) {
  std::stable_sort(answers->begin(), answers->end(),
                   [&](const Answer& a, const Answer& b) { return Before(request, a, b); });
}

bool SameSettings(const Answer& a, const Answer& b) { return a.settings == b.settings; }

}  // namespace planner::answer
