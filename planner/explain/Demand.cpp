// Tested by demand_test.cpp.
#include "planner/explain/Demand.h"

#include "hardware/Loop.h"

namespace planner::explain {

namespace {

using Kind = DemandKind;

void AddOfLoop(const Request& request, Primitive primitive, std::vector<Demand>* demands) {
  if (request.inputs.size() > 1) demands->push_back({Kind::kSecondInput});
  if (request.bandwidth) demands->push_back({Kind::kBandwidth});
  for (const Kind kind : {Kind::kVco, Kind::kPfd, Kind::kM, Kind::kD, Kind::kDividers}) {
    demands->push_back({kind});
  }
  demands->push_back({Kind::kWhole});
  if (request.AsksForShape() &&
      hardware::HasFractions(primitive, static_cast<int>(request.outputs.size()),
                             request.whole_divider_0)) {
    demands->push_back({Kind::kNothingMoves});
  }
}

void AddOfKru(const Request& request, Primitive primitive, std::vector<Demand>* demands) {
  for (const Kind kind : {Kind::kM, Kind::kD, Kind::kDividers}) demands->push_back({kind});
  if (primitive == Primitive::kKruSp && request.feedback) demands->push_back({Kind::kFeedback});
}

}  // namespace

std::vector<Demand> DemandsOf(const Request& request, Primitive primitive) {
  std::vector<Demand> demands;
  for (int n = 0; n < static_cast<int>(request.outputs.size()); ++n) {
    const Output& output = request.outputs[static_cast<std::size_t>(n)];
    if (!output.used) continue;
    demands.push_back({Kind::kFrequency, n});
    if (output.phase) demands.push_back({Kind::kPhase, n});
    if (output.duty) demands.push_back({Kind::kDuty, n});
    if (request.MaxJitterOf(output)) demands.push_back({Kind::kJitter, n});
    demands.push_back({Kind::kOutputRange, n});
  }
  if (request.input_tolerance > 0) demands.push_back({Kind::kInputTolerance});
  if (hardware::IsLoop(primitive)) {
    AddOfLoop(request, primitive, &demands);
  } else {
    AddOfKru(request, primitive, &demands);
  }
  return demands;
}

void Relax(const Demand& demand, search::Relaxed* relaxed) {
  const auto of_output = [&]() -> search::Relaxed::OfOutput& {
    return relaxed->outputs[static_cast<std::size_t>(demand.output)];
  };
  switch (demand.kind) {
    case Kind::kFrequency:
      of_output().frequency = true;
      break;
    case Kind::kPhase:
      of_output().phase = true;
      break;
    case Kind::kDuty:
      of_output().duty = true;
      break;
    case Kind::kJitter:
      of_output().jitter = true;
      break;
    case Kind::kOutputRange:
      of_output().range = true;
      break;
    case Kind::kVco:
      relaxed->vco = true;
      break;
    case Kind::kPfd:
      relaxed->pfd = true;
      break;
    case Kind::kM:
      relaxed->m = true;
      break;
    case Kind::kD:
      relaxed->d = true;
      break;
    case Kind::kDividers:
      relaxed->dividers = true;
      break;
    case Kind::kWhole:
      relaxed->whole = true;
      break;
    case Kind::kNothingMoves:
      relaxed->nothing_moves = true;
      break;
    case Kind::kBandwidth:
      relaxed->bandwidth = true;
      break;
    case Kind::kFeedback:
      relaxed->feedback = true;
      break;
    case Kind::kSecondInput:
      relaxed->second_input = true;
      break;
    case Kind::kInputTolerance:
      relaxed->input_tolerance = true;
      break;
  }
}

search::Relaxed OnlyWith(const std::vector<Demand>& demands, Set kept) {
  search::Relaxed relaxed;
  for (std::size_t place = 0; place < demands.size(); ++place) {
    if (!Has(kept, place)) Relax(demands[place], &relaxed);
  }
  return relaxed;
}

std::vector<Demand> In(const std::vector<Demand>& demands, Set set) {
  std::vector<Demand> chosen;
  for (std::size_t place = 0; place < demands.size(); ++place) {
    if (Has(set, place)) chosen.push_back(demands[place]);
  }
  return chosen;
}

}  // namespace planner::explain
