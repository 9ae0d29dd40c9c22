// Tested by jitter_test.cpp.
#include "planner/answer/Jitter.h"

#include <cstddef>
#include <map>
#include <string>

#include "host/bundled/calculator/Argument.h"
#include "host/bundled/calculator/KruFigures.h"
#include "host/bundled/calculator/KruPin.h"
#include "host/bundled/calculator/LoopFigures.h"
#include "host/bundled/calculator/PeakToPeak.h"
#include "host/bundled/calculator/Slack.h"
#include "planner/answer/CalculatorTerms.h"
#include "planner/device/SpeedData.h"

namespace planner::answer {

namespace {

constexpr double kPeriodTimesFrequency = 1000.0;  // ns x MHz

bool IsInput(double megahertz) {
  return Calculator::IsWithin(megahertz, Calculator::kLowestInput, Calculator::kHighestInput);
}

std::optional<Calculator::LoopCoefficients> LoopCoefficientsOf(const Device& device) {
  const ::Device::Grade* grade = GradeOf(device);
  if (grade == nullptr || !grade->Has(::Device::CoefficientGroup::kLoop)) return std::nullopt;
  return Calculator::LoopCoefficients::Of(*grade);
}

Calculator::Loop LoopAt(double input, int m_eighths, int d, Bandwidth bandwidth) {
  const double m = static_cast<double>(m_eighths) / hardware::kEighths;
  return {.pfd = input / d, .vco = input * m / d, .bandwidth = CalculatorBandwidth(bandwidth)};
}

std::size_t Index(hardware::Pin pin) { return static_cast<std::size_t>(pin); }

}  // namespace

LoopJitter::LoopJitter(const Device& device, const Request& request)
    : LoopJitter(LoopCoefficientsOf(device), request.inputs.front().ToDouble(),
                 request.input_jitter.ToDouble()) {}

LoopJitter::LoopJitter(const std::optional<Calculator::LoopCoefficients>& coefficients,
                       double input, double input_jitter)
    : coefficients_(coefficients),
      is_known_(coefficients && IsInput(input) &&
                Calculator::IsWithin(input_jitter, 0.0, Calculator::kLargestInputJitter)),
      input_(input),
      input_jitter_(input_jitter) {}

double LoopJitter::PeakToPeak(int m_eighths, int d, Bandwidth bandwidth) const {
  if (!is_known_) return kUnknownJitter;
  return Calculator::LoopPkToPkJitter(*coefficients_, LoopAt(input_, m_eighths, d, bandwidth),
                                      input_jitter_);
}

double LoopJitter::Rms(int m_eighths, int d, Bandwidth bandwidth) const {
  if (!is_known_) return kUnknownJitter;
  return Calculator::LoopRmsJitter(*coefficients_, LoopAt(input_, m_eighths, d, bandwidth),
                                   input_jitter_);
}

double LoopJitter::PhaseError(int d, Bandwidth bandwidth) const {
  return Calculator::LoopPhaseError(*coefficients_, input_ / d, CalculatorBandwidth(bandwidth));
}

KruJitter::Span KruJitter::SpanOf(const ::Device::Grade& grade, std::string_view limits) {
  const std::string keyword =
      "D_KRU_" + std::string(limits) + "_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_";
  const std::optional<double> longest = grade.Figure(keyword + "MAXPERIOD");
  const std::optional<double> shortest = grade.Figure(keyword + "MINPERIOD");
  if (!longest || !shortest) return {};
  return {kPeriodTimesFrequency / *longest, kPeriodTimesFrequency / *shortest};
}

KruJitter::KruJitter(const Device& device, const Request& request, Primitive primitive)
    : input_(request.inputs.front().ToDouble()), input_jitter_(request.input_jitter.ToDouble()) {
  const ::Device::Grade* grade = GradeOf(device);
  if (grade == nullptr || !grade->Has(::Device::CoefficientGroup::kKru)) return;
  coefficients_ = Calculator::KruCoefficients::Of(*grade);
  is_known_ = IsInput(input_);
  std::map<std::string_view, Span> known;  // several pins share their limits
  for (const hardware::PinFacts& facts : hardware::kPins) {
    if (!(primitive == Primitive::kKruSp ? facts.is_sp : facts.is_clkgen)) continue;
    const std::string_view limits = CalculatorPin(facts.pin).frequency;
    if (known.count(limits) == 0) known[limits] = SpanOf(*grade, limits);
    spans_[Index(facts.pin)] = known[limits];
  }
}

bool KruJitter::Holds(const KruSettings& settings, hardware::Pin pin) const {
  if (!is_known_) return false;
  const Calculator::KruPin& output = CalculatorPin(pin);
  const Calculator::KruSettings model = CalculatorSettings(settings, input_);
  const double frequency = output.source == Calculator::KruSource::kDivider
                               ? Calculator::LineFrequency(model)
                               : Calculator::PinFrequency(output, model);
  const Span& span = spans_[Index(pin)];
  return Calculator::IsWithinLimits(frequency, span.lowest, span.highest);
}

double KruJitter::PeakToPeak(const KruSettings& settings, hardware::Pin pin) const {
  if (!Holds(settings, pin)) return kUnknownJitter;
  return Calculator::KruPkToPkJitter(*coefficients_, CalculatorPin(pin),
                                     CalculatorSettings(settings, input_)) +
         input_jitter_;
}

double KruJitter::Rms(const KruSettings& settings, hardware::Pin pin) const {
  if (!Holds(settings, pin)) return kUnknownJitter;
  return Calculator::KruRmsJitter(*coefficients_, CalculatorPin(pin),
                                  CalculatorSettings(settings, input_)) +
         input_jitter_ / Calculator::kPeakToPeakPerRms;
}

double KruJitter::PhaseError() const { return coefficients_->phase_error; }

}  // namespace planner::answer
