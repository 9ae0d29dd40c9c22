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
  const Rational percent = source == PinSource::kDivider
                               ? hardware::PinDuty(Pin::kClkdv, divide_halves)
                               : Rational(50);
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
    pins_.push_back({&facts, facts.phase / 90, RatioRange(inputs_, usual),
                     RatioRange(inputs_, doubled)});
  }
  is_jitter_all_known_ = is_narrower || !jitter_.IsKnown();
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

Rational KruTask::Exact(const KruError& error) const {
  const KruOutput& output = outputs_[error.output];
  const Output& asked = output.Asked();
  switch (error.demand) {
    case KruError::Demand::kNone:
      return 0;
    case KruError::Demand::kFrequency:
      return output.Frequency().Ppm(error.ratio.a, error.ratio.b) /
             answer::FrequencyUnit(request_.ToleranceOf(asked));
    case KruError::Demand::kPhase: {
      const Rational made =
          Rational(90 * error.quarter) + Rational(360 * error.shift, hardware::kShiftSteps);
      return hardware::TurnedToHalf(made - *asked.phase).Absolute() /
             answer::PhaseUnit(request_.PhaseToleranceOf(asked));
    }
    case KruError::Demand::kDuty:
      return output.ExactDutyError(error.source, error.divide_halves);
    case KruError::Demand::kJitter:
      break;
  }
  return output.Jitter().ExactError(error.jitter);
}

bool KruTask::IsSame(const KruError& a, const KruError& b) {
  if (a.demand != b.demand || a.output != b.output) return false;
  switch (a.demand) {
    case KruError::Demand::kNone:
      return true;
    case KruError::Demand::kFrequency:
      return a.ratio.a * b.ratio.b == b.ratio.a * a.ratio.b;
    case KruError::Demand::kPhase:
      return a.quarter == b.quarter && a.shift == b.shift;
    case KruError::Demand::kDuty:
      return a.source == b.source && a.divide_halves == b.divide_halves;
    case KruError::Demand::kJitter:
      break;
  }
  return a.jitter == b.jitter;
}

std::strong_ordering KruTask::Compare(const KruError& a, const KruError& b) const {
  if (IsSurelyBelow(a.near, b.near)) return std::strong_ordering::less;
  if (IsSurelyBelow(b.near, a.near)) return std::strong_ordering::greater;
  const bool are_zero = a.near.value + a.near.slack + b.near.value + b.near.slack == 0;
  if (are_zero || IsSame(a, b)) return std::strong_ordering::equal;
  return Exact(a) <=> Exact(b);
}

}  // namespace planner::search
