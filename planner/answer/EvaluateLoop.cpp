// What the settings of a PLL or a TSYN make.
//
// Tested by evaluate_loop_test.cpp.
#include <algorithm>
#include <cstddef>
#include <optional>

#include "planner/answer/Jitter.h"
#include "planner/answer/Judge.h"

namespace planner::answer {

namespace {

class LoopJudge {
 public:
  LoopJudge(const Request& request, const Device& device, const LoopSettings& settings,
            Answer* answer)
      : request_(request),
        device_(device),
        settings_(settings),
        limits_(device.Loop(settings.primitive)),
        jitter_(device, request),
        answer_(*answer) {}

  void Run() {
    HoldLoop();
    for (std::size_t i = 0; i < answer_.outputs.size(); ++i) {
      if (request_.outputs[i].used) Judge(i);
    }
    AddPhaseError();
    if (margin_) answer_.margin = *margin_;
    missing_.Note(settings_.primitive, used_, &answer_.notes);
  }

 private:
  // VCO and PFD with each input.
  void HoldLoop() {
    const Rational ratio = hardware::VcoRatio(settings_.m, settings_.d);
    std::optional<Rational> vco_margin;
    std::optional<Rational> pfd_margin;
    for (std::size_t i = 0; i < request_.inputs.size(); ++i) {
      const Rational vco = request_.inputs[i] * ratio;
      const Rational pfd = request_.inputs[i] / settings_.d;
      if (i == 0) {
        answer_.vco = vco;
        answer_.pfd = pfd;
      }
      Lower(Hold(vco, request_.input_tolerance, limits_.vco, About(Quantity::kVco, i),
                 &answer_.violations),
            &vco_margin);
      Lower(Hold(pfd, request_.input_tolerance, limits_.PfdOf(settings_.bandwidth),
                 About(Quantity::kPfd, i), &answer_.violations),
            &pfd_margin);
    }
    answer_.vco_margin = *vco_margin;
    answer_.pfd_margin = *pfd_margin;
    margin_ = std::min(*vco_margin, *pfd_margin);
    is_in_range_ = limits_.vco.Contains(answer_.vco) &&
                   limits_.PfdOf(settings_.bandwidth).Contains(answer_.pfd);
  }

  Finding About(Quantity quantity, std::size_t input) const {
    return {.kind = FindingKind::kOutsideLimit,
            .primitive = settings_.primitive,
            .quantity = quantity,
            .input = static_cast<int>(input)};
  }

  void Judge(std::size_t index) {
    ++used_;
    const LoopOutput& set = settings_.outputs[index];
    OutputAnswer& output = answer_.outputs[index];
    output.ratio = hardware::OutputRatio(settings_.m, settings_.d, set.divider);
    output.frequency = request_.inputs[0] * output.ratio;
    if (request_.inputs.size() > 1) output.frequency_second = request_.inputs[1] * output.ratio;
    // Nothing can be moved beside an M or a divider that changes from period to period.
    const bool moves = !settings_.HasFraction();
    output.phase = moves ? hardware::PhaseOfStep(set.phase, set.divider) : Rational(0);
    output.duty = moves && set.high_time != 0
                      ? hardware::DutyOfHighTime(set.high_time, set.divider / hardware::kEighths)
                      : Rational(50);
    HoldOutput(index, &output);
    AddJitter(static_cast<int>(index), &output);
    JudgeOutput(request_, settings_.primitive, static_cast<int>(index), &output);
  }

  void HoldOutput(std::size_t index, OutputAnswer* output) {
    const int divider = settings_.outputs[index].divider;
    const Range& range = limits_.OutputOf(static_cast<int>(index));
    std::optional<Rational> margin;
    for (std::size_t i = 0; i < request_.inputs.size(); ++i) {
      Finding about = About(Quantity::kFrequency, i);
      about.output = static_cast<int>(index);
      Lower(Hold(request_.inputs[i] * output->ratio, request_.input_tolerance, range, about,
                 &output->violations),
            &margin);
    }
    output->margin = *margin;
    Lower(*margin, &margin_);
    if (divider > hardware::LargestDivider(limits_.max_count) * hardware::kEighths) {
      output->violations.push_back({.kind = FindingKind::kDividerTooLarge,
                                    .primitive = settings_.primitive,
                                    .quantity = Quantity::kDivider,
                                    .output = static_cast<int>(index),
                                    .value = Rational(divider, hardware::kEighths),
                                    .range = {1, limits_.max_count}});
    }
  }

  // In the device's ranges the calculator has nothing to refuse but the input.
  void AddJitter(int index, OutputAnswer* output) {
    if (!is_in_range_ || !jitter_.IsKnown()) {
      const Refusal refusal = LoopJitterRefusal(
          device_, request_, settings_, settings_.outputs[static_cast<std::size_t>(index)].divider);
      if (refusal) {
        missing_.AddJitter(index, *refusal);
        return;
      }
    }
    output->jitter = jitter_.PeakToPeak(settings_.m, settings_.d, settings_.bandwidth);
    output->jitter_rms = jitter_.Rms(settings_.m, settings_.d, settings_.bandwidth);
  }

  void AddPhaseError() {
    if (!is_in_range_ || !jitter_.IsKnown()) {
      const Refusal refusal = LoopPhaseErrorRefusal(device_, request_, settings_);
      if (refusal) {
        missing_.AddPhaseError(*refusal);
        return;
      }
    }
    answer_.phase_error = jitter_.PhaseError(settings_.d, settings_.bandwidth);
  }

  const Request& request_;
  const Device& device_;
  const LoopSettings& settings_;
  const LoopLimits& limits_;
  const LoopJitter jitter_;
  Answer& answer_;
  bool is_in_range_ = false;  // VCO and PFD with the first input
  std::size_t used_ = 0;
  std::optional<Rational> margin_;
  MissingFigures missing_;
};

}  // namespace

void JudgeLoop(const Request& request, const Device& device, const LoopSettings& settings,
               Answer* answer) {
  LoopJudge(request, device, settings, answer).Run();
}

}  // namespace planner::answer
