// What a user should know about settings although nothing is wrong with them.
//
// Tested by notes_test.cpp.
#include <algorithm>
#include <cmath>
#include <utility>

#include "planner/answer/Judge.h"

namespace planner::answer {

namespace {

bool IsVisible(double counted, const Rational& made) {
  return std::abs(counted - made.ToDouble()) > kVisible;
}

class Notes {
 public:
  Notes(const Request& request, const Answer& answer) : request_(request), answer_(answer) {}

  std::vector<Finding> Take() {
    if (hardware::IsLoop(answer_.primitive)) {
      AddSearched();
      AddOfLoop();
    } else {
      AddOfKru();
    }
    return std::move(notes_);
  }

 private:
  Finding& Add(FindingKind kind) {
    notes_.push_back({.kind = kind, .primitive = answer_.primitive});
    return notes_.back();
  }

  // The engine looks for a VCO and for outputs that M and D need not make exactly.
  void AddSearched() {
    if (request_.inputs.size() > 1 && answer_.searched_vco &&
        IsVisible(*answer_.searched_vco, answer_.vco)) {
      Finding& note = Add(FindingKind::kSearchedVco);
      note.quantity = Quantity::kVco;
      note.value = Rational::FromDouble(*answer_.searched_vco);
    }
    std::vector<Rational> counted;
    bool is_visible = false;
    for (const OutputAnswer& output : answer_.outputs) {
      if (!output.used) continue;
      if (!output.searched) return;
      counted.push_back(Rational::FromDouble(*output.searched));
      is_visible = is_visible || IsVisible(*output.searched, output.frequency);
    }
    if (is_visible) Add(FindingKind::kSearchedFrequencies).numbers = std::move(counted);
  }

  void AddOfLoop() {
    const auto& settings = std::get<LoopSettings>(answer_.settings);
    const bool asked = request_.AsksForShape();
    if (asked && settings.HasFraction()) Add(FindingKind::kNothingMoves);
    // A variant of the engine with a name chooses by the VCO all the same.
    if (request_.prefer_max_vco && !asked && answer_.source.engine &&
        answer_.source.variant.empty()) {
      Add(FindingKind::kPreferMaxVcoUnused);
    }
    if (request_.whole_divider_0 && answer_.primitive == Primitive::kPll) {
      Add(FindingKind::kWholeDividerUnused);
    }
  }

  void AddOfKru() {
    const Output& first = request_.outputs.front();
    if (answer_.primitive == Primitive::kKruClkgen && first.used && first.phase &&
        *first.phase != Rational(0)) {
      Finding& note = Add(FindingKind::kOutput0Phase);
      note.quantity = Quantity::kPhase;
      note.output = 0;
      note.value = *first.phase;
    }
    if (request_.bandwidth) Add(FindingKind::kBandwidthUnused);
    const bool is_known =
        std::any_of(answer_.outputs.begin(), answer_.outputs.end(),
                    [](const OutputAnswer& output) { return output.jitter.has_value(); });
    if (request_.input_jitter > Rational(0) && is_known) {
      Finding& note = Add(FindingKind::kInputJitterPasses);
      note.quantity = Quantity::kJitter;
      note.value = request_.input_jitter;
    }
  }

  const Request& request_;
  const Answer& answer_;
  std::vector<Finding> notes_;
};

}  // namespace

std::vector<Finding> NotesOn(const Request& request, const Answer& answer) {
  return Notes(request, answer).Take();
}

void MissingFigures::AddJitter(int output, const std::string& reason) {
  const auto found = std::find_if(jitters_.begin(), jitters_.end(),
                                  [&](const Reason& one) { return one.text == reason; });
  if (found != jitters_.end()) {
    found->outputs.push_back(output);
  } else {
    jitters_.push_back({reason, {output}});
  }
}

void MissingFigures::Note(Primitive primitive, std::size_t outputs,
                          std::vector<Finding>* notes) const {
  for (const Reason& reason : jitters_) {
    Finding note = {.kind = FindingKind::kNoJitter,
                    .primitive = primitive,
                    .quantity = Quantity::kJitter,
                    .text = reason.text};
    if (reason.outputs.size() < outputs) note.outputs = reason.outputs;
    notes->push_back(std::move(note));
  }
  if (phase_error_) {
    notes->push_back({.kind = FindingKind::kNoPhaseError,
                      .primitive = primitive,
                      .quantity = Quantity::kPhase,
                      .text = *phase_error_});
  }
}

}  // namespace planner::answer
