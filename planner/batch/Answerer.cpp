// Tested by answerer_test.cpp.
#include "planner/batch/Answerer.h"

#include <algorithm>
#include <exception>
#include <string_view>
#include <utility>

#include "planner/read/JsonTree.h"
#include "planner/read/RequestTree.h"

namespace planner::batch {

namespace {

constexpr std::string_view kId = "id";

// Takes the id out of a request, which knows none.
std::optional<read::Node> TakeId(read::Node* root, const std::string& file,
                                 read::Mistakes* mistakes) {
  const auto found = std::find_if(root->members.begin(), root->members.end(),
                                  [](const read::Member& one) { return one.name == kId; });
  if (found == root->members.end()) return std::nullopt;
  read::Node id = std::move(found->value);
  root->members.erase(found);
  if (id.type == read::NodeType::kString || id.type == read::NodeType::kNumber) return id;
  if (id.type == read::NodeType::kNull) return std::nullopt;
  read::Mistake mistake;
  mistake.kind = read::MistakeKind::kWrongType;
  mistake.place.file = file;
  mistake.place.line = id.position.line;
  mistake.place.column = id.position.column;
  mistake.place.entry = kId;
  mistake.other = Name(id.type);
  mistake.known = {std::string(Name(read::NodeType::kString)),
                   std::string(Name(read::NodeType::kNumber))};
  mistakes->push_back(std::move(mistake));
  return std::nullopt;
}

// Each line is read as a file of its own, whose only line is line `number` of the batch.
void PlaceInBatch(std::int64_t number, read::Mistakes* mistakes) {
  for (read::Mistake& mistake : *mistakes) {
    if (mistake.place.IsInFile()) mistake.place.line = static_cast<int>(number);
    if (mistake.kind != read::MistakeKind::kMissing) continue;
    // Here no option can say it.
    mistake.place.entry = mistake.place.entry == "--in" ? "inputs" : "outputs";
  }
}

}  // namespace

Outcome Answerer::Answer(const Line& line) {
  Outcome outcome;
  outcome.line = line.number;
  outcome.digest = line.digest;
  try {
    Make(line, &outcome);
  } catch (const std::exception& error) {
    outcome.plan.reset();
    outcome.status = Status::kFailed;
    outcome.failure = error.what();
  }
  return outcome;
}

void Answerer::Make(const Line& line, Outcome* outcome) {
  outcome->status = Status::kWrong;
  if (line.is_too_long) {
    outcome->trouble = Trouble::kTooLong;
    return;
  }
  std::optional<read::Node> root = read::ReadJsonTree(line.text, task_.file, &outcome->mistakes);
  std::optional<read::Reading> reading;
  if (root) {
    outcome->id = TakeId(&*root, task_.file, &outcome->mistakes);
    const read::Draft draft =
        ReadTree(*root, task_.file, read::Naming::kEntries, &outcome->mistakes);
    reading = Finish(Over(task_.options, draft), {{}, task_.file}, &outcome->mistakes);
  }
  PlaceInBatch(line.number, &outcome->mistakes);
  if (!reading || !outcome->mistakes.empty() || !FindDevice(*reading, outcome)) return;
  outcome->plan = plan::Make(reading->request, *outcome->device, task_.plan);
  outcome->status = !outcome->plan->IsSolved()             ? Status::kUnsolved
                    : outcome->plan->ranked.front().within ? Status::kWithin
                                                           : Status::kOff;
}

// The device must have what the request asks for.
bool Answerer::FindDevice(const read::Reading& reading, Outcome* outcome) {
  try {
    outcome->device = devices_.Find(reading.device ? reading.device->value : task_.device);
  } catch (const device::PartError& error) {
    outcome->part = error;
    return false;
  }
  const std::optional<Primitive>& asked = reading.request.primitive;
  const bool has = asked ? outcome->device->Has(*asked) : !outcome->device->primitives.empty();
  if (has) return true;
  outcome->trouble = Trouble::kNoPrimitive;
  outcome->lacking = asked;
  return false;
}

}  // namespace planner::batch
