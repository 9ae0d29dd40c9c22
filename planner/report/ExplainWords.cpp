// Tested by explain_text_test.cpp and explain_data_test.cpp.
#include "planner/report/ExplainWords.h"

#include "hardware/Kru.h"
#include "hardware/Loop.h"
#include "planner/report/Numbers.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using explain::Change;
using explain::ChangeKind;
using explain::Demand;
using explain::DemandKind;
using std::string;

const Output& OutputOf(const Request& request, const Demand& demand) {
  return request.outputs[static_cast<std::size_t>(demand.output)];
}

string RangeWords(const Range& range) {
  return "from " + Short(range.lowest, kFrequencyDecimals) + " to " +
         Short(range.highest, kFrequencyDecimals) + " MHz";
}

// A number with its unit: decimals where they end soon; else the quotient that it is, too.
string ExactWords(const Rational& value, const string& unit) {
  const string decimal = Short(value, kFrequencyDecimals);
  const string text = decimal + " " + unit;
  return Decimal(value) == decimal ? text : text + " (" + Quotient(value) + ")";
}

string PhaseWords(const Rational& phase) { return ExactWords(phase, "degrees"); }
string DutyWords(const Rational& duty) { return ExactWords(duty, "percent"); }

string JitterWords(const Request& request, const Demand& demand) {
  return Outputs({demand.output}) + " with a jitter of at most " +
         Short(*request.MaxJitterOf(OutputOf(request, demand)), 3) + " ps";
}

string OutputRangeWords(const Demand& demand, const Device& device, Primitive primitive) {
  const string of = " of " + Outputs({demand.output});
  if (!hardware::IsLoop(primitive)) return "the range of the pin" + of;
  return "the range" + of + ", " + RangeWords(device.Loop(primitive).OutputOf(demand.output));
}

int LargestM(Primitive primitive) {
  return hardware::IsLoop(primitive) ? hardware::kLargestM
                                     : hardware::LargestKruRatioPart(primitive);
}

int LargestD(Primitive primitive) {
  return hardware::IsLoop(primitive) ? hardware::kLargestD
                                     : hardware::LargestKruRatioPart(primitive);
}

string DividersWords(const Device& device, Primitive primitive) {
  switch (primitive) {
    case Primitive::kKruSp:
      return "the divides of CLKDV";
    case Primitive::kKruClkgen:
      return "the divides of CLKFXDV";
    default:
      return "dividers up to " +
             std::to_string(hardware::LargestDivider(device.Loop(primitive).max_count));
  }
}

// Whether M and the divider of output 0 are in eighths already.
bool HasFractions(const Request& request, Primitive primitive) {
  return hardware::HasFractions(primitive, static_cast<int>(request.outputs.size()),
                                request.whole_divider_0);
}

// "1212 MHz, 12 above the range".
string BeyondWords(const Change& change) {
  const bool is_above = change.kind == ChangeKind::kHighest;
  const Rational by = (change.value - change.before).Absolute();
  return Distinct(change.value, change.before, kFrequencyDecimals) + " MHz, " +
         Short(by, kFrequencyDecimals) + (is_above ? " above" : " below") + " the range";
}

string LimitWords(const Change& change) {
  switch (change.demand.kind) {
    case DemandKind::kVco:
      return "a VCO of " + BeyondWords(change);
    case DemandKind::kPfd:
      return "a PFD of " + BeyondWords(change);
    default:
      return Outputs({change.demand.output}) + " at " + BeyondWords(change);
  }
}

string LossWords(const Demand& demand, Primitive primitive) {
  const string output = demand.output >= 0 ? Outputs({demand.output}) : "";
  switch (demand.kind) {
    case DemandKind::kFrequency:
      return "without " + output;
    case DemandKind::kPhase:
      return output + " at any phase";
    case DemandKind::kDuty:
      return output + " with any duty cycle";
    case DemandKind::kJitter:
      return output + " with any jitter";
    case DemandKind::kOutputRange:
      return output + " outside its range";
    case DemandKind::kVco:
      return "a VCO outside its range";
    case DemandKind::kPfd:
      return "a PFD outside its range";
    case DemandKind::kM:
      return "an M that the " + string(Name(primitive)) + " does not have";
    case DemandKind::kD:
      return "a D above " + std::to_string(LargestD(primitive));
    case DemandKind::kDividers:
      return "a divider that the " + string(Name(primitive)) + " does not have";
    case DemandKind::kWhole:
      return "M and all dividers in eighths";
    case DemandKind::kNothingMoves:
      return "phases and duty cycles beside a fraction";
    case DemandKind::kBandwidth:
      return "any bandwidth";
    case DemandKind::kFeedback:
      return "without feedback";
    case DemandKind::kInputTolerance:
      return "an input without a tolerance";
    case DemandKind::kSecondInput:
      break;
  }
  return "without the second input";
}

// A number above 0 with up to so many decimals, and with more where it would be 0 with these.
string RoundedDown(const Rational& value, int decimals) {
  Rational scale = Rational::FromDecimal("1", decimals);
  while ((value * scale).Floor() == Rational(0)) {
    scale *= 10;
    ++decimals;
  }
  return Short((value * scale).Floor() / scale, decimals);
}

}  // namespace

string RoundedUp(const Rational& value, int decimals) {
  const Rational scale = Rational::FromDecimal("1", decimals);
  return Short(-(-value * scale).Floor() / scale, decimals);
}

string FrequencyWords(const Rational& frequency) { return ExactWords(frequency, "MHz"); }

string DemandWords(const Demand& demand, const Request& request, const Device& device,
                   Primitive primitive) {
  switch (demand.kind) {
    case DemandKind::kFrequency:
      return Outputs({demand.output}) + " at " +
             FrequencyWords(OutputOf(request, demand).frequency);
    case DemandKind::kPhase:
      return Outputs({demand.output}) + " at " + PhaseWords(*OutputOf(request, demand).phase);
    case DemandKind::kDuty:
      return Outputs({demand.output}) + " with a duty cycle of " +
             DutyWords(*OutputOf(request, demand).duty);
    case DemandKind::kJitter:
      return JitterWords(request, demand);
    case DemandKind::kOutputRange:
      return OutputRangeWords(demand, device, primitive);
    case DemandKind::kVco:
      return "the VCO " + RangeWords(device.Loop(primitive).vco);
    case DemandKind::kPfd:
      return "the PFD " + RangeWords(request.bandwidth == Bandwidth::kLow
                                         ? device.Loop(primitive).pfd_low
                                         : device.Loop(primitive).pfd);
    case DemandKind::kM:
      return "M up to " + std::to_string(LargestM(primitive));
    case DemandKind::kD:
      return "D up to " + std::to_string(LargestD(primitive));
    case DemandKind::kDividers:
      return DividersWords(device, primitive);
    case DemandKind::kWhole:
      return HasFractions(request, primitive) ? "whole dividers but that of output 0"
                                              : "whole M and dividers";
    case DemandKind::kNothingMoves:
      return "no phases and duty cycles beside a fraction";
    case DemandKind::kBandwidth:
      return "bandwidth " + string(Name(*request.bandwidth));
    case DemandKind::kFeedback:
      return "the feedback";
    case DemandKind::kInputTolerance:
      return "an input that can be off by " + Short(request.input_tolerance, 6) + " ppm";
    case DemandKind::kSecondInput:
      break;
  }
  return "the second input";
}

string ChangeWords(const Change& change, Primitive primitive) {
  const Demand& demand = change.demand;
  switch (change.kind) {
    case ChangeKind::kWithout:
      return LossWords(demand, primitive);
    case ChangeKind::kTolerance:
      return (demand.output < 0 ? "all outputs" : Outputs({demand.output})) +
             string(" with a tolerance of ") + RoundedUp(change.value, 2) + " ppm";
    case ChangeKind::kFrequency:
      return Outputs({demand.output}) + " at " + FrequencyWords(change.value);
    case ChangeKind::kPhase:
      return Outputs({demand.output}) + " at " + PhaseWords(change.value);
    case ChangeKind::kDuty:
      return Outputs({demand.output}) + " with a duty cycle of " + DutyWords(change.value);
    case ChangeKind::kJitter:
      if (demand.output < 0) {
        return "all jitter limits at " + RoundedUp(change.value, 3) + " ps";
      }
      return Outputs({demand.output}) + " with a jitter of up to " + RoundedUp(change.value, 3) +
             " ps";
    case ChangeKind::kLowest:
    case ChangeKind::kHighest:
      return LimitWords(change);
    case ChangeKind::kInputTolerance:
      return change.value == Rational(0)
                 ? string("an input without a tolerance")
                 : "an input that is off by at most " + RoundedDown(change.value, 2) + " ppm";
    case ChangeKind::kBandwidth:
      break;
  }
  const auto* settings = std::get_if<LoopSettings>(&change.settings);
  return "bandwidth " + string(Name(settings ? settings->bandwidth : Bandwidth::kOptimized));
}

}  // namespace planner::report
