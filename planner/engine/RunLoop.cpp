// A run for a PLL or a TSYN.
//
// Tested by run_test.cpp.
#include <cmath>
#include <stdexcept>

#include "engine/ResultTexts.h"
#include "hardware/Loop.h"
#include "planner/engine/Object.h"
#include "planner/engine/Run.h"

namespace planner::engine {
namespace {

// Half an eighth is far more than the engine's doubles are off.
int Eighths(double value) { return static_cast<int>(std::lround(value * hardware::kEighths)); }

bool IsClosest(const Request& request, const Variant& variant) {
  return variant.closest || request.AsksForShape();
}

// The engine gives a fraction to the first output that it is asked for. Only output 0 can have one,
// and only where there are few outputs, be they used or not.
bool IsWhole(const Request& request, const Variant& variant) {
  return variant.whole_divider_0 || !request.outputs.front().used ||
         request.outputs.size() >= hardware::kWholeOutputs;
}

class LoopRun {
 public:
  LoopRun(const Request& request, const Device& device, Primitive primitive, const Variant& variant,
          bool trace)
      : request_(request),
        device_(device),
        primitive_(primitive),
        variant_(variant),
        trace_(trace),
        used_(UsedOutputs(request)),
        closest_(IsClosest(request, variant)),
        object_(MakeObject(device)) {}

  Outcome Run() {
    const int code = Calculate();
    if (code == Ip::Pll::kNoSpeedData) {
      throw std::logic_error("The engine cannot read the limits of a primitive that is there.");
    }
    if (code != Ip::Pll::kSolved) return Refused{Ip::PllResultText(Entry(), code, Count())};
    return Found{Chosen(), Searched()};
  }

 private:
  int Count() const { return static_cast<int>(used_.size()); }
  int Code() const { return primitive_ == Primitive::kPll ? Ip::Pll::kPll : Ip::Pll::kTsyn; }

  Ip::PllEntry Entry() const {
    if (closest_) return Ip::PllEntry::kClosestSolution;
    return primitive_ == Primitive::kPll ? Ip::PllEntry::kPllFrequencies
                                         : Ip::PllEntry::kTsynFrequencies;
  }

  int Calculate() {
    const double first = request_.inputs[0].ToDouble();
    const double second = request_.inputs.size() > 1 ? request_.inputs[1].ToDouble() : 0.0;
    object_->SetLowBandwidth(variant_.bandwidth == Bandwidth::kLow);
    const Port::StringBase frequencies = ListOf(Frequencies(request_));
    const bool is_whole = IsWhole(request_, variant_);
    if (!closest_) {
      return object_->CalculateMinPowerOutFreqs(frequencies, first, second, Count(),
                                                variant_.prefer_max_vco, is_whole, Code(), trace_);
    }
    return object_->GetClosestSolution(frequencies, ListOf(Asked(&Output::phase)),
                                       ListOf(Asked(&Output::duty)), first, second, Count(),
                                       variant_.prefer_max_vco, is_whole, Code(), trace_);
  }

  // 0 of the outputs that ask for none.
  std::vector<double> Asked(std::optional<Rational> Output::*what) const {
    std::vector<double> numbers;
    for (const std::size_t index : used_) {
      const std::optional<Rational>& asked = request_.outputs[index].*what;
      numbers.push_back(asked ? asked->ToDouble() : 0.0);
    }
    return numbers;
  }

  LoopSettings Chosen() const {
    LoopSettings settings;
    settings.primitive = primitive_;
    settings.bandwidth = variant_.bandwidth;
    settings.m = Eighths(object_->GetChosenM());
    settings.d = object_->GetChosenD();
    settings.outputs.resize(request_.outputs.size());
    for (int n = 0; n < Count(); ++n) {
      LoopOutput& output = settings.outputs[used_[static_cast<std::size_t>(n)]];
      output.divider = n == 0 ? Eighths(object_->GetChosenDiv0())
                              : object_->GetChosenDivN(n) * hardware::kEighths;
    }
    if (closest_ && !settings.HasFraction()) {
      for (int n = 0; n < Count(); ++n) Move(n, &settings);
    }
    return settings;
  }

  // Phase and duty cycle of an output as steps. The engine tells them as numbers, which are those
  // of steps but for their rounding.
  void Move(int n, LoopSettings* settings) const {
    const std::size_t index = used_[static_cast<std::size_t>(n)];
    const Output& asked = request_.outputs[index];
    LoopOutput& output = settings->outputs[index];
    if (asked.phase) {
      output.phase = hardware::NearestPhaseStep(Rational::FromDouble(object_->GetChosenPhaseN(n)),
                                                output.divider);
    }
    if (asked.duty) {
      const double fraction = object_->GetChosenDutyCycleN(n);
      // One of 0 is none: the engine has not looked for it.
      const Rational percent = fraction > 0.0 ? 100 * Rational::FromDouble(fraction) : *asked.duty;
      output.high_time = hardware::NearestHighTime(percent, output.divider / hardware::kEighths,
                                                   device_.Loop(primitive_).max_count);
    }
  }

  answer::Searched Searched() const {
    answer::Searched searched;
    searched.vco = object_->GetChosenVCO();
    searched.outputs.resize(request_.outputs.size());
    for (int n = 0; n < Count(); ++n) {
      searched.outputs[used_[static_cast<std::size_t>(n)]] = object_->GetChosenOutFreqN(n);
    }
    return searched;
  }

  const Request& request_;
  const Device& device_;
  const Primitive primitive_;
  const Variant& variant_;
  const bool trace_;
  const std::vector<std::size_t> used_;
  const bool closest_;
  const std::unique_ptr<Ip::VorkelImp> object_;
};

}  // namespace

Variant Effective(const Request& request, const Device& device, Primitive primitive,
                  const Variant& variant) {
  Variant same = variant;
  same.name.clear();
  same.feedback = false;
  // The engine knows bandwidth LOW and no other, and of LOW only the highest PFD frequency. It
  // takes a D that is a whole number but for less than a thousandth, so that no PFD frequency is
  // above the input by more than that; where this is below both limits they are the same to it.
  const Range& low = device.Loop(primitive).PfdOf(Bandwidth::kLow);
  const Rational most = request.inputs.front() * Rational(1001, 1000);
  if (same.bandwidth == Bandwidth::kHigh || most < low.highest) {
    same.bandwidth = Bandwidth::kOptimized;
  }
  same.closest = IsClosest(request, variant);
  // What takes the smallest VCO prefers none.
  same.prefer_max_vco = same.closest && variant.prefer_max_vco;
  same.whole_divider_0 = primitive == Primitive::kTsyn && IsWhole(request, variant);
  return same;
}

Outcome RunLoop(const Request& request, const Device& device, Primitive primitive,
                const Variant& variant, bool trace) {
  return LoopRun(request, device, primitive, variant, trace).Run();
}

}  // namespace planner::engine
