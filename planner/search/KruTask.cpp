// Tested by search_test.cpp.
#include "planner/search/KruTask.h"

#include <algorithm>

#include "planner/answer/Demands.h"

namespace planner::search {

namespace {

constexpr int kHalvesOfOne = 2;

}  // namespace

KruRatio RatioOf(PinSource source, const KruBase& base) {
  const std::int64_t line = base.divide_by_2 ? 2 : 1;
  switch (source) {
    case PinSource::kLine:
      return {1, line};
    case PinSource::kDoubler:
      return {2, line};
    case PinSource::kDivider:
      return {kHalvesOfOne, base.divide_halves * line};
    case PinSource::kSynthesiser:
      return {base.m, base.d * line};
    case PinSource::kDividedSynthesiser:
      break;
  }
  return {kHalvesOfOne * base.m, base.d * base.divide_halves * line};
}

KruOutput::KruOutput(const Request& request, int index, std::size_t shifts)
    : request_(&request),
      index_(index),
      asked_(&request.outputs[static_cast<std::size_t>(index)]),
      frequency_(request, *asked_) {
  if (asked_->phase) phases_ = std::make_unique<const PhaseTable>(request, *asked_, shifts);
  if (const auto& allowed = request.MaxJitterOf(*asked_)) jitter_.Add(*allowed);
  if (!asked_->duty) return;
  even_ = DutyOf(50);
  divided_.resize(static_cast<std::size_t>(hardware::kClkdvHalves.back()) + 1, even_);
  for (int halves = kHalvesOfOne; halves <= hardware::kClkdvHalves.back(); ++halves) {
    divided_[static_cast<std::size_t>(halves)] = DutyOf(hardware::PinDuty(Pin::kClkdv, halves));
  }
}

KruOutput::Duty KruOutput::DutyOf(const Rational& percent) const {
  const Rational& tolerance = request_->DutyToleranceOf(*asked_);
  const Rational error = (percent - *asked_->duty).Absolute();
  return {Rounded((error / answer::DutyUnit(tolerance)).ToDouble()), error <= tolerance};
}

KruOutput::Duty KruOutput::Of(PinSource source, int divide_halves) const {
  if (source != PinSource::kDivider || divided_.empty()) return even_;
  const auto place = static_cast<std::size_t>(divide_halves);
  if (place < divided_.size()) return divided_[place];
  return DutyOf(hardware::PinDuty(Pin::kClkdv, divide_halves));
}

Near KruOutput::DutyError(PinSource source, int divide_halves) const {
  return Of(source, divide_halves).error;
}

bool KruOutput::IsDutyMet(PinSource source, int divide_halves) const {
  return Of(source, divide_halves).is_met;
}

Rational KruOutput::ExactDutyError(PinSource source, int divide_halves) const {
  const Rational percent =
      source == PinSource::kDivider ? hardware::PinDuty(Pin::kClkdv, divide_halves) : Rational(50);
  return (percent - *asked_->duty).Absolute() /
         answer::DutyUnit(request_->DutyToleranceOf(*asked_));
}

KruTask::KruTask(const Request& request, const Device& device, Primitive primitive)
    : request_(request),
      primitive_(primitive),
      inputs_(InputsOf(request.inputs)),
      jitter_(device, request, primitive) {
  for (const Output& output : request.outputs) {
    asks_for_phase_ = asks_for_phase_ || (output.used && output.phase);
  }
  outputs_.reserve(request.outputs.size());
  for (std::size_t i = 0; i < request.outputs.size(); ++i) {
    if (!request.outputs[i].used) continue;
    outputs_.emplace_back(request, static_cast<int>(i), IsSp() ? kShifts : 1);
  }
  const PinLimits& limits = device.Pins(primitive);
  bool is_narrower = true;
  pins_.reserve(hardware::kPins.size());
  for (const hardware::PinFacts& facts : hardware::kPins) {
    if (!(IsSp() ? facts.is_sp : facts.is_clkgen)) continue;
    const Range& usual = limits.Of(facts.pin, false);
    const Range& doubled = IsSp() ? limits.Of(facts.pin, true) : usual;
    is_narrower = is_narrower && usual.lowest <= doubled.lowest && doubled.highest <= usual.highest;
    pins_.push_back({&facts, facts.phase / 90, Shared(usual), Shared(doubled)});
  }
  is_jitter_all_known_ = is_narrower || !jitter_.IsKnown();
}

const RatioRange* KruTask::Shared(const Range& range) {
  for (const auto& [known, ratios] : ranges_) {
    if (known == range) return &ratios;
  }
  return &ranges_.emplace_back(range, RatioRange(inputs_, range)).second;
}

double KruTask::JitterOf(const KruBase& base, Pin pin, bool shifted) const {
  const KruSettings settings{.primitive = primitive_,
                             .feedback = base.feedback,
                             .divide_by_2 = base.divide_by_2,
                             .m = base.m,
                             .d = base.d,
                             .divide_halves = base.divide_halves,
                             .phase_shift = shifted ? 1 : 0,
                             .pins = {}};
  return jitter_.PeakToPeak(settings, pin);
}

KruError KruTask::FrequencyError(std::size_t place, const KruRatio& ratio) const {
  return {.near = outputs_[place].Frequency().Error(ratio.a, ratio.b),
          .demand = KruError::Demand::kFrequency,
          .output = static_cast<std::uint8_t>(place),
          .a = static_cast<std::int32_t>(ratio.a),
          .b = static_cast<std::int32_t>(ratio.b)};
}

KruError KruTask::PhaseError(std::size_t place, int quarter, int shift) const {
  return {.near = outputs_[place].Phases()->Error(static_cast<std::size_t>(quarter),
                                                  static_cast<std::size_t>(shift)),
          .demand = KruError::Demand::kPhase,
          .output = static_cast<std::uint8_t>(place),
          .a = quarter,
          .b = shift};
}

KruError KruTask::DutyError(std::size_t place, PinSource source, int divide_halves) const {
  const bool is_divided = source == PinSource::kDivider;
  return {.near = outputs_[place].DutyError(source, divide_halves),
          .demand = KruError::Demand::kDuty,
          .output = static_cast<std::uint8_t>(place),
          .a = is_divided ? 1 : 0,
          .b = is_divided ? divide_halves : 0};
}

KruError KruTask::JitterError(std::size_t place, double jitter) const {
  return {.near = outputs_[place].Jitter().Error(jitter),
          .demand = KruError::Demand::kJitter,
          .output = static_cast<std::uint8_t>(place),
          .jitter = jitter};
}

KruError KruTask::JustAbove(const Rational& error) {
  constexpr std::int64_t kFine = 1 << 30;
  given_ = error * Rational(kFine + 1, kFine) + Rational(1, kFine);
  return {.near = Rounded(given_.ToDouble()), .demand = KruError::Demand::kGiven};
}

Rational KruTask::Exact(const KruError& error) const {
  const KruOutput& output = outputs_[error.output];
  const Output& asked = output.Asked();
  switch (error.demand) {
    case KruError::Demand::kNone:
      return 0;
    case KruError::Demand::kGiven:
      return given_;
    case KruError::Demand::kFrequency:
      return output.Frequency().Ppm(error.a, error.b) /
             answer::FrequencyUnit(request_.ToleranceOf(asked));
    case KruError::Demand::kPhase: {
      const Rational made = Rational(90 * error.a) + Rational(360 * error.b, hardware::kShiftSteps);
      return hardware::TurnedToHalf(made - *asked.phase).Absolute() /
             answer::PhaseUnit(request_.PhaseToleranceOf(asked));
    }
    case KruError::Demand::kDuty:
      return output.ExactDutyError(error.a != 0 ? PinSource::kDivider : PinSource::kLine, error.b);
    case KruError::Demand::kJitter:
      break;
  }
  return output.Jitter().ExactError(error.jitter);
}

bool KruTask::IsSame(const KruError& a, const KruError& b) {
  if (a.demand != b.demand || a.output != b.output || a.jitter != b.jitter) return false;
  if (a.demand == KruError::Demand::kFrequency) {
    return std::int64_t{a.a} * b.b == std::int64_t{b.a} * a.b;
  }
  return a.a == b.a && a.b == b.b;
}

std::strong_ordering KruTask::Compare(const KruError& a, const KruError& b) const {
  if (IsSurelyBelow(a.near, b.near)) return std::strong_ordering::less;
  if (IsSurelyBelow(b.near, a.near)) return std::strong_ordering::greater;
  const bool are_zero = a.near.value + a.near.slack + b.near.value + b.near.slack == 0;
  if (are_zero || IsSame(a, b)) return std::strong_ordering::equal;
  if (a.demand == KruError::Demand::kFrequency && b.demand == KruError::Demand::kFrequency) {
    const auto order = FrequencyDemand::Compare(outputs_[a.output].Frequency(), a.a, a.b,
                                                outputs_[b.output].Frequency(), b.a, b.b);
    if (order) return *order;
  }
  return Exact(a) <=> Exact(b);
}

}  // namespace planner::search
