// Tested by recompute_test.cpp.
#include "planner/verify/Recompute.h"

#include <cmath>
#include <cstddef>
#include <string>
#include <utility>

#include "planner/answer/CalculatorRefusal.h"
#include "planner/answer/Jitter.h"
#include "planner/verify/Formulas.h"

namespace planner::verify {

namespace {

using hardware::Pin;

// A difference that shows in three decimals of a frequency, MHz.
constexpr double kShows = 0.0005;

class Work {
 public:
  Work(const Request& request, const Device& device, const Settings& settings,
       const PlaceOrder& order, const Origin& origin)
      : request_(InOrder(request, order)),
        device_(device),
        order_(order),
        origin_(origin),
        loop_(std::get_if<LoopSettings>(&settings)),
        kru_(std::get_if<KruSettings>(&settings)) {
    answer_.primitive = PrimitiveOf(settings);
    answer_.source = origin.source;
    answer_.solved = true;
    answer_.settings = settings;
    answer_.searched_vco = origin.vco;
    answer_.outputs.resize(request_.outputs.size());
  }

  Answer Do() {
    if (loop_ != nullptr) {
      DoVcoAndPfd();
    }
    for (std::size_t i = 0; i < request_.outputs.size(); ++i) {
      answer_.outputs[i].used = request_.outputs[i].used;
      if (request_.outputs[i].used) DoOutput(i);
      if (i < origin_.outputs.size()) answer_.outputs[i].searched = origin_.outputs[i];
    }
    DoPhaseError();
    DoWhole();
    DoNotes();
    return std::move(answer_);
  }

 private:
  // --- Limits -----------------------------------------------------------------------------

  // What an input makes of a ratio, at both of its corners. `own` is the margin of that alone, if
  // there is one yet.
  void Keep(std::size_t input, const Rational& ratio, const Range& range, Finding finding,
            std::vector<Finding>* violations, std::optional<Rational>* own) {
    const Rational& tolerance = request_.input_tolerance;
    finding.input = static_cast<int>(input);
    finding.range = range;
    for (const Rational& corner : CornersOf(request_.inputs[input], tolerance)) {
      finding.value = corner * ratio;
      const Rational margin = MarginIn(range, finding.value);
      if (!has_margin_ || margin < answer_.margin) answer_.margin = margin;
      has_margin_ = true;
      if (!*own || margin < **own) *own = margin;
      const bool is_low = corner < request_.inputs[input];
      const bool is_high = request_.inputs[input] < corner;
      if (is_low) finding.corner = -tolerance;
      if (is_high) finding.corner = tolerance;
      // What is too high in the low corner is so even more in the high one.
      const bool is_below = !is_high && finding.value < range.lowest;
      const bool is_above = !is_low && range.highest < finding.value;
      if (is_below || is_above) violations->push_back(finding);
    }
  }

  Finding Outside(Quantity quantity) const {
    Finding finding{.kind = FindingKind::kOutsideLimit};
    finding.primitive = answer_.primitive;
    finding.quantity = quantity;
    return finding;
  }

  void DoVcoAndPfd() {
    const LoopLimits& limits = device_.Loop(loop_->primitive);
    std::optional<Rational> vco_margin;
    std::optional<Rational> pfd_margin;
    const Range& pfds = loop_->bandwidth == Bandwidth::kLow ? limits.pfd_low : limits.pfd;
    for (std::size_t i = 0; i < request_.inputs.size(); ++i) {
      const Rational vco = VcoOf(request_.inputs[i], loop_->m, loop_->d);
      const Rational pfd = verify::PfdOf(request_.inputs[i], loop_->d);
      Keep(i, VcoOf(1, loop_->m, loop_->d), limits.vco, Outside(Quantity::kVco),
           &answer_.violations, &vco_margin);
      Keep(i, verify::PfdOf(1, loop_->d), pfds, Outside(Quantity::kPfd), &answer_.violations,
           &pfd_margin);
      if (i > 0) continue;
      answer_.vco = vco;
      answer_.pfd = pfd;
      is_loop_inside_ = limits.vco.lowest <= vco && vco <= limits.vco.highest &&
                        pfds.lowest <= pfd && pfd <= pfds.highest;
    }
    answer_.vco_margin = *vco_margin;
    answer_.pfd_margin = *pfd_margin;
  }

  // --- One output -------------------------------------------------------------------------

  void DoOutput(std::size_t i) {
    OutputAnswer& output = answer_.outputs[i];
    if (loop_ != nullptr) {
      DoLoopOutput(i, &output);
    } else {
      DoKruOutput(i, &output);
    }
    DoDemands(i, &output);
  }

  // What each input makes of `ratio` has to be in the range.
  void KeepOutput(std::size_t i, const Range& range, Finding finding, OutputAnswer* output) {
    output->frequency = request_.inputs[0] * output->ratio;
    if (request_.inputs.size() > 1) output->frequency_second = request_.inputs[1] * output->ratio;
    finding.output = static_cast<int>(i);
    std::optional<Rational> margin;
    for (std::size_t input = 0; input < request_.inputs.size(); ++input) {
      Keep(input, output->ratio, range, finding, &output->violations, &margin);
    }
    output->margin = *margin;
  }

  void DoLoopOutput(std::size_t i, OutputAnswer* output) {
    const LoopLimits& limits = device_.Loop(loop_->primitive);
    const LoopOutput& set = loop_->outputs[i];
    output->ratio = FrequencyOf(VcoOf(1, loop_->m, loop_->d), set.divider);
    const bool is_still = loop_->m % 8 != 0 || loop_->outputs[0].divider % 8 != 0;
    output->phase = is_still ? Rational(0) : verify::PhaseOf(set.phase, set.divider);
    output->duty =
        is_still || set.high_time == 0 ? Rational(50) : verify::DutyOf(set.high_time, set.divider);
    KeepOutput(i, i == 1 ? limits.output_1 : limits.output, Outside(Quantity::kFrequency), output);
    if (set.divider > 8 * hardware::LargestDivider(limits.max_count)) {
      Finding finding{.kind = FindingKind::kDividerTooLarge};
      finding.primitive = answer_.primitive;
      finding.quantity = Quantity::kDivider;
      finding.output = static_cast<int>(i);
      finding.value = Rational(set.divider, 8);
      finding.range = {1, limits.max_count};
      output->violations.push_back(std::move(finding));
    }
    const answer::LoopJitter model(device_, request_);
    std::optional<std::string> refusal;
    if (!is_loop_inside_ || !model.IsKnown()) {
      refusal = answer::LoopJitterRefusal(device_, request_, *loop_, set.divider);
    }
    if (refusal) {
      Miss(i, *refusal);
    } else {
      output->jitter = model.PeakToPeak(loop_->m, loop_->d, loop_->bandwidth);
      output->jitter_rms = model.Rms(loop_->m, loop_->d, loop_->bandwidth);
    }
  }

  void DoKruOutput(std::size_t i, OutputAnswer* output) {
    const PinLimits& limits = device_.Pins(kru_->primitive);
    const Pin pin = kru_->pins[i];
    const bool doubled = kru_->pins[0] == Pin::kClk2x;
    output->ratio = FrequencyOf(1, pin, kru_->Ratios());
    output->phase = verify::PhaseOf(pin, kru_->phase_shift);
    output->duty = verify::DutyOf(pin, kru_->divide_halves);
    Finding finding = Outside(Quantity::kFrequency);
    finding.pin = std::string(hardware::FactsOf(pin).name);
    finding.feedback_2x = doubled && !(limits.Of(pin, true) == limits.Of(pin, false));
    KeepOutput(i, limits.Of(pin, doubled), std::move(finding), output);
    const answer::KruJitter model(device_, request_, kru_->primitive);
    const double jitter = model.PeakToPeak(*kru_, pin);
    if (jitter == answer::kUnknownJitter) {
      Miss(i, answer::KruJitterRefusal(device_, request_, *kru_, pin).value_or(""));
    } else {
      output->jitter = jitter;
      output->jitter_rms = model.Rms(*kru_, pin);
    }
  }

  // The jitter of an output is not known. Outputs with the same reason share a note.
  void Miss(std::size_t i, const std::string& reason) {
    for (Finding& note : unknown_) {
      if (note.text == reason) return note.outputs.push_back(static_cast<int>(i));
    }
    Finding note{.kind = FindingKind::kNoJitter};
    note.primitive = answer_.primitive;
    note.quantity = Quantity::kJitter;
    note.text = reason;
    note.outputs = {static_cast<int>(i)};
    unknown_.push_back(std::move(note));
  }

  // --- Demands ----------------------------------------------------------------------------

  void Demand(std::size_t i, Quantity quantity, const Rational& error, const Rational& allowed,
              bool is_met, const Rational& in_units, OutputAnswer* output) {
    if (answer_.worst_error < in_units) answer_.worst_error = in_units;
    if (is_met) return;
    Finding finding{.kind = FindingKind::kOffTarget};
    finding.primitive = answer_.primitive;
    finding.quantity = quantity;
    finding.output = static_cast<int>(i);
    finding.value = error;
    finding.range = {0, allowed};
    output->misses.push_back(std::move(finding));
  }

  void DoDemands(std::size_t i, OutputAnswer* output) {
    const Output& asked = request_.outputs[i];
    const Rational tolerance = asked.tolerance.value_or(request_.tolerance);
    output->error_ppm = Ppm(output->frequency, asked.frequency);
    if (answer_.worst_ppm < output->error_ppm.Absolute()) {
      answer_.worst_ppm = output->error_ppm.Absolute();
    }
    Demand(i, Quantity::kFrequency, output->error_ppm, tolerance,
           output->error_ppm.Absolute() <= tolerance, PpmInUnits(output->error_ppm, tolerance),
           output);
    if (asked.phase) {
      const Rational allowed = asked.phase_tolerance.value_or(request_.phase_tolerance);
      const Rational error = Turned(output->phase - *asked.phase);
      output->phase_error = error;
      Demand(i, Quantity::kPhase, error, allowed, error.Absolute() <= allowed,
             DegreesInUnits(error, allowed), output);
    }
    if (asked.duty) {
      const Rational allowed = asked.duty_tolerance.value_or(request_.duty_tolerance);
      const Rational error = output->duty - *asked.duty;
      output->duty_error = error;
      Demand(i, Quantity::kDuty, error, allowed, error.Absolute() <= allowed,
             PointsInUnits(error, allowed), output);
    }
    const std::optional<Rational> allowed =
        asked.max_jitter ? asked.max_jitter : request_.max_jitter;
    if (!allowed) return;
    // One that is not known does not meet the demand, and has no size to be weighed by.
    const Rational jitter = output->jitter ? Rational::FromDouble(*output->jitter) : Rational(0);
    Demand(i, Quantity::kJitter, jitter, *allowed, output->jitter && jitter <= *allowed,
           PsInUnits(jitter, *allowed), output);
  }

  // --- The whole --------------------------------------------------------------------------

  void DoPhaseError() {
    if (loop_ != nullptr) {
      const answer::LoopJitter model(device_, request_);
      if (!is_loop_inside_ || !model.IsKnown()) {
        no_phase_error_ = answer::LoopPhaseErrorRefusal(device_, request_, *loop_);
      }
      if (!no_phase_error_) answer_.phase_error = model.PhaseError(loop_->d, loop_->bandwidth);
    } else {
      no_phase_error_ = answer::KruPhaseErrorRefusal(device_);
      if (!no_phase_error_) {
        answer_.phase_error = answer::KruJitter(device_, request_, kru_->primitive).PhaseError();
      }
    }
  }

  void DoWhole() {
    answer_.within = true;
    double largest = 0;
    bool is_known = true;
    for (const OutputAnswer& output : answer_.outputs) {
      if (!output.used) continue;
      ++used_;
      for (const Finding& one : output.violations) answer_.violations.push_back(one);
      if (!output.misses.empty()) answer_.within = false;
      if (!output.jitter) is_known = false;
      if (output.jitter && *output.jitter > largest) largest = *output.jitter;
    }
    if (!answer_.violations.empty()) answer_.within = false;
    if (is_known) answer_.max_jitter = largest;
  }

  // --- Notes ------------------------------------------------------------------------------

  Finding& Note(FindingKind kind) {
    Finding note{.kind = kind};
    note.primitive = answer_.primitive;
    answer_.notes.push_back(std::move(note));
    return answer_.notes.back();
  }

  void DoNotes() {
    if (loop_ != nullptr) {
      NoteCounted();
      NoteLoop();
    } else {
      NoteKru();
    }
    for (Finding& note : unknown_) {
      if (note.outputs.size() == used_) note.outputs.clear();
      answer_.notes.push_back(std::move(note));
    }
    if (no_phase_error_) {
      Finding& note = Note(FindingKind::kNoPhaseError);
      note.quantity = Quantity::kPhase;
      note.text = *no_phase_error_;
    }
    for (std::size_t i = 0; i < order_.size(); ++i) {
      if (order_[i] == static_cast<int>(i)) continue;
      Note(FindingKind::kMoved).outputs = order_;
      break;
    }
  }

  // The engine can have counted with other frequencies than its settings make.
  void NoteCounted() {
    if (request_.inputs.size() == 2 && origin_.vco &&
        std::abs(*origin_.vco - answer_.vco.ToDouble()) > kShows) {
      Finding& note = Note(FindingKind::kSearchedVco);
      note.quantity = Quantity::kVco;
      note.value = Rational::FromDouble(*origin_.vco);
    }
    std::vector<Rational> counted;
    bool shows = false;
    for (const OutputAnswer& output : answer_.outputs) {
      if (!output.used) continue;
      if (!output.searched) return;
      counted.push_back(Rational::FromDouble(*output.searched));
      if (std::abs(*output.searched - output.frequency.ToDouble()) > kShows) shows = true;
    }
    if (shows) Note(FindingKind::kSearchedFrequencies).numbers = counted;
  }

  void NoteLoop() {
    bool has_shape = false;
    for (const Output& output : request_.outputs) {
      if (output.used && (output.phase || output.duty)) has_shape = true;
    }
    const bool is_still = loop_->m % 8 != 0 || loop_->outputs[0].divider % 8 != 0;
    if (has_shape && is_still) Note(FindingKind::kNothingMoves);
    if (request_.prefer_max_vco && !has_shape && answer_.source.engine &&
        answer_.source.variant.empty()) {
      Note(FindingKind::kPreferMaxVcoUnused);
    }
    if (request_.whole_divider_0 && loop_->primitive == Primitive::kPll) {
      Note(FindingKind::kWholeDividerUnused);
    }
  }

  void NoteKru() {
    const Output& first = request_.outputs[0];
    if (kru_->primitive == Primitive::kKruClkgen && first.used && first.phase &&
        !(*first.phase == Rational(0))) {
      Finding& note = Note(FindingKind::kOutput0Phase);
      note.quantity = Quantity::kPhase;
      note.output = 0;
      note.value = *first.phase;
    }
    if (request_.bandwidth) Note(FindingKind::kBandwidthUnused);
    bool is_any_known = false;
    for (const OutputAnswer& output : answer_.outputs) {
      if (output.jitter) is_any_known = true;
    }
    if (is_any_known && Rational(0) < request_.input_jitter) {
      Finding& note = Note(FindingKind::kInputJitterPasses);
      note.quantity = Quantity::kJitter;
      note.value = request_.input_jitter;
    }
  }

  const Request request_;
  const Device& device_;
  const PlaceOrder order_;
  const Origin& origin_;
  const LoopSettings* const loop_;
  const KruSettings* const kru_;
  Answer answer_;
  bool has_margin_ = false;
  bool is_loop_inside_ = false;  // VCO and PFD with the first input
  std::size_t used_ = 0;
  std::vector<Finding> unknown_;  // notes on figures of jitter that there are not
  std::optional<std::string> no_phase_error_;
};

}  // namespace

PlaceOrder OwnPlaces(const Request& request) {
  PlaceOrder order;
  for (std::size_t i = 0; i < request.outputs.size(); ++i) order.push_back(static_cast<int>(i));
  return order;
}

Request InOrder(const Request& request, const PlaceOrder& order) {
  Request placed = request;
  for (std::size_t i = 0; i < order.size(); ++i) {
    placed.outputs[i] = request.outputs[static_cast<std::size_t>(order[i])];
  }
  return placed;
}

Answer Recompute(const Request& request, const Device& device, const Settings& settings,
                 const PlaceOrder& order, const Origin& origin) {
  return Work(request, device, settings, order, origin).Do();
}

}  // namespace planner::verify
