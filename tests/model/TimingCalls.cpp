// Timing figures.

#include <cmath>

#include "tests/model/ObjectModel.h"

namespace model {

namespace {

// The calculator's code of a pin.
int PinCode(const std::string& pin) {
  static const std::vector<std::pair<const char*, int>> codes = {
      {"CLK0", 1},  {"CLK90", 2},    {"CLK180", 3}, {"CLK270", 4},   {"CLK2X", 5},
      {"CLK2X180", 7}, {"CLKFX", 8}, {"CLKFX180", 9}, {"CLKDV", 10}};
  for (const auto& [name, code] : codes) {
    if (pin == name) return code;
  }
  return 12;
}

// Of dividers beyond these the walks below are not of this world: they take hours, or never end.
bool IsWalked(double divider) {
  return divider == 0.0 || (divider >= 0.001 && divider <= 1000.0);
}

// The multiple of an eighth of a period that is nearest to a phase, of two the later.
double NearestPhase(double phase, double divider) {
  if (phase == 0.0 || divider == 0.0) return 0.0;
  const double step = 1.0 / (divider * 8.0) * 360.0;
  double best = 0.0;
  for (int k = 0; k * step <= 360.0; ++k) {
    const double candidate = phase > 0.0 ? k * step : k * step - 360.0;
    if (candidate == phase) return candidate;
    if (k == 0) {
      best = candidate;
      continue;
    }
    const double before = phase > 0.0 ? best - phase : candidate - best;
    if (std::fabs(before) >= std::fabs(candidate - phase)) best = candidate;
  }
  return best;
}

// The fraction that is nearest to a duty cycle in percent, in halves of a VCO period.
double NearestDuty(double duty, double divider, double most_count) {
  if (duty == 0.0 || divider == 0.0) return 0.0;
  if (divider == 1.0) return 0.5;
  const double wanted = duty / 100.0;
  const bool is_long = divider > most_count;
  const double lowest = is_long ? (divider - most_count) / divider : 1.0 / divider;
  double highest = is_long ? (most_count + 0.5) / divider : (divider - 0.5) / divider;
  if (highest > 1.0) highest = 1.0;
  if (highest < lowest) return 0.0;
  double best = lowest;
  for (double candidate = lowest; candidate <= highest; candidate += 0.5 / divider) {
    if (candidate == wanted) return candidate;
    if (std::fabs(best - wanted) >= std::fabs(candidate - wanted)) best = candidate;
  }
  return best;
}

struct Query {
  Port::StringBase error;
  double figure = 0.0;
  double phase = 0.0;
  double duty = 0.0;
};

bool Ask(Tw_BmCMBCalculator& calculator, const Words& w, Query* q) {
  const auto number = [&](std::size_t i) { return Number(w[i]); };
  const auto flag = [&](std::size_t i) { return Flag(w[i]); };
  const std::string& name = w[0];
  if (name == "GetVcoFreq") {
    return calculator.VcoFrequency(number(1), number(2), number(3), number(4), &q->error,
                                   &q->figure);
  }
  if (name == "GetPLLPkToPkJitter") {
    return calculator.PllPkToPkJitter(number(1), number(2), number(3), w[4].c_str(), number(5),
                                      number(6), &q->error, &q->figure);
  }
  if (name == "GetPLLPhaseError") {
    return calculator.PllPhaseError(number(1), number(2), w[3].c_str(), &q->error, &q->figure);
  }
  if (name == "GetKRUPhaseError") return calculator.KruPhaseError(&q->error, &q->figure);
  if (name == "GetKRUPeriodPhaseDutyCycle") {
    return calculator.KruPeriodPhaseDutyCycle(number(1), PinCode(w[2]), flag(3), number(4),
                                              number(5), number(6), &q->error, &q->figure,
                                              &q->phase, &q->duty);
  }
  if (name == "GetPLLPeriodPhaseDutyCycle") {
    return calculator.PllPeriodPhaseDutyCycle(number(1), number(2), number(3), number(4),
                                              number(5), number(6), number(7), &q->error,
                                              &q->figure, &q->phase, &q->duty);
  }
  const bool is_clkgen = name == "GetKRU_CLKGENPkToPkJitter";
  return calculator.KruPkToPkJitter(number(1), PinCode(w[2]), is_clkgen, flag(3), flag(4),
                                    flag(5), number(6), number(7), &q->error, &q->figure);
}

}  // namespace

void ObjectModel::CallTiming(const Words& words, Answer* answer) {
  const std::string& name = words[0];
  if (name == "GetLatestPhase") {
    answer->text = Written("%3.3f", latest_phase_);
    return;
  }
  if (name == "GetLatestDutyCycle") {
    answer->text = Written("%3.3f", latest_duty_);
    return;
  }
  if (name == "TSYNCalculateActualPhase" || name == "TSYNCalculateActualDutyCycle") {
    const double asked = Number(words[1]);
    const double divider = Number(words[2]);
    answer->is_known = IsWalked(divider) && std::isfinite(asked);
    if (!answer->is_known) return;
    answer->text = Written("%3.3f", name == "TSYNCalculateActualPhase"
                                        ? NearestPhase(asked, divider)
                                        : NearestDuty(asked, divider,
                                                      loop_limits_.maxHighLowCount) * 100.0);
    return;
  }
  Tw_BmCMBCalculator* const calculator = Bind() ? device_->calculator() : nullptr;
  if (calculator == nullptr) {
    answer->is_ok = false;
    answer->errors.push_back(
        "Internal getCMBCalculator() error -- could not obtain CMBCalculator");
    return;
  }
  Query query;
  answer->is_ok = Ask(*calculator, words, &query);
  answer->text = answer->is_ok ? Written("%3.3f", query.figure) : query.error.CStr();
  if (!answer->is_ok) return;
  if (name == "GetKRUPeriodPhaseDutyCycle") {
    latest_phase_ = std::trunc(query.phase * 360.0);
    latest_duty_ = query.duty;
  } else if (name == "GetPLLPeriodPhaseDutyCycle") {
    latest_phase_ = query.phase;
    latest_duty_ = query.duty;
  }
}

}  // namespace model
