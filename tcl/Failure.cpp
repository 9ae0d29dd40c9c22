// Tested by requests.test.
#include "tcl/Failure.h"

#include <nlohmann/json.hpp>
#include <utility>

#include "planner/read/MistakeText.h"
#include "planner/read/Options.h"
#include "planner/report/Data.h"
#include "planner/report/FindingText.h"
#include "planner/report/PartText.h"
#include "planner/report/TclDict.h"
#include "tcl/Objects.h"

namespace tcl {

namespace {

using nlohmann::ordered_json;
using planner::device::PartError;
using planner::read::Mistake;
using planner::read::MistakeKind;
using std::string;

string NameOf(MistakeKind kind) {
  switch (kind) {
    case MistakeKind::kNotAValue:
      return "not_a_value";
    case MistakeKind::kNumberTooLarge:
      return "number_too_large";
    case MistakeKind::kNumberTooSmall:
      return "number_too_small";
    case MistakeKind::kTooManyDigits:
      return "too_many_digits";
    case MistakeKind::kDividesByZero:
      return "divides_by_zero";
    case MistakeKind::kMustBe:
      return "must_be";
    case MistakeKind::kOutOfRange:
      return "out_of_range";
    case MistakeKind::kUnknownUnit:
      return "unknown_unit";
    case MistakeKind::kOtherUnit:
      return "other_unit";
    case MistakeKind::kNumberMissing:
      return "number_missing";
    case MistakeKind::kEmptyList:
      return "empty_list";
    case MistakeKind::kBareBesideUnit:
      return "bare_beside_unit";
    case MistakeKind::kTooMany:
      return "too_many";
    case MistakeKind::kCountDiffers:
      return "count_differs";
    case MistakeKind::kNothingUsed:
      return "nothing_used";
    case MistakeKind::kNotAName:
      return "not_a_name";
    case MistakeKind::kNotASwitch:
      return "not_a_switch";
    case MistakeKind::kContradiction:
      return "contradiction";
    case MistakeKind::kTwice:
      return "twice";
    case MistakeKind::kOtherPrimitive:
      return "other_primitive";
    case MistakeKind::kMissing:
      return "missing";
    case MistakeKind::kUnknownEntry:
      return "unknown_entry";
    case MistakeKind::kUnknownOption:
      return "unknown_option";
    case MistakeKind::kWrongType:
      return "wrong_type";
    case MistakeKind::kNoFrequency:
      return "no_frequency";
    case MistakeKind::kSyntax:
    case MistakeKind::kScript:
      break;
  }
  return "syntax";
}

string NameOf(PartError::Kind kind) {
  switch (kind) {
    case PartError::Kind::kUnknownDevice:
      return "unknown_device";
    case PartError::Kind::kUnknownPackage:
      return "unknown_package";
    case PartError::Kind::kUnknownGrade:
      return "unknown_grade";
    case PartError::Kind::kNoDefaultGrade:
      return "no_default_grade";
    case PartError::Kind::kAmbiguous:
      return "ambiguous_device";
    case PartError::Kind::kBadFile:
      break;
  }
  return "bad_file";
}

// Options have one dash here, alone and in sentences.
string WithOneDash(string text) {
  for (const planner::read::OptionFacts& facts : planner::read::RequestOptions()) {
    for (std::size_t i = text.find(facts.name); i != string::npos; i = text.find(facts.name, i)) {
      text.erase(i, 1);
    }
  }
  return text;
}

// A list of dicts with `kind`, and what else an entry has.
string DictsOf(const std::vector<ordered_json>& entries) {
  std::vector<Tcl_Obj*> dicts;
  for (const ordered_json& entry : entries) dicts.push_back(Object(planner::report::TclDict(entry)));
  Tcl_Obj* const list = ListOf(dicts);
  Tcl_IncrRefCount(list);
  string text = Text(list);
  Tcl_DecrRefCount(list);
  return text;
}

ordered_json EntryOf(const Mistake& mistake) {
  ordered_json entry;
  entry["kind"] = NameOf(mistake.kind);
  entry["entry"] = WithOneDash(mistake.place.entry);
  entry["index"] = mistake.place.index < 0 ? ordered_json(nullptr)
                                           : ordered_json(mistake.place.index);
  entry["key"] = mistake.place.key;
  entry["text"] = mistake.text;
  entry["known"] = mistake.known;
  entry["message"] = WithOneDash(TextOf(mistake));
  return entry;
}

Failure UsageOf(const std::vector<ordered_json>& entries) {
  Failure failure;
  for (const ordered_json& entry : entries) {
    failure.sentence += (failure.sentence.empty() ? "" : "\n") + entry["message"].get<string>();
  }
  failure.code = {"VORKEL", "USAGE", DictsOf(entries)};
  return failure;
}

}  // namespace

Failure Failure::OfMistakes(const planner::read::Mistakes& mistakes) {
  std::vector<ordered_json> entries;
  for (const Mistake& mistake : mistakes) entries.push_back(EntryOf(mistake));
  return UsageOf(entries);
}

Failure Failure::OfUsage(const string& kind, const string& text, const string& message) {
  return UsageOf({{{"kind", kind}, {"text", text}, {"message", message}}});
}

Failure Failure::OfPart(const PartError& error) {
  ordered_json entry;
  entry["kind"] = NameOf(error.kind);
  entry["entry"] = "device";
  entry["text"] = error.name;
  entry["known"] = error.candidates;
  entry["message"] = planner::report::PartText(error);
  return UsageOf({entry});
}

Failure Failure::OfUnsolved(const planner::plan::Plan& plan, const planner::Device& device) {
  Failure failure;
  std::vector<ordered_json> reasons;
  for (const planner::Answer& answer : plan.refused) {
    const string message = planner::report::RefusalText(answer, device);
    ordered_json reason;
    reason["primitive"] = Name(answer.primitive);
    reason["message"] = message;
    reason["refusals"] = ordered_json::array();
    for (const planner::Finding& finding : answer.refusals) {
      reason["refusals"].push_back(planner::report::FindingData(finding, device, &answer));
    }
    failure.sentence += (failure.sentence.empty() ? "" : "\n") + string(Name(answer.primitive)) +
                        ": " + message;
    reasons.push_back(std::move(reason));
  }
  failure.code = {"VORKEL", "UNSOLVED", DictsOf(reasons)};
  return failure;
}

int Failure::Set(Tcl_Interp* interp) const {
  std::vector<Tcl_Obj*> words;
  for (const string& word : code) words.push_back(Object(word));
  Tcl_SetObjErrorCode(interp, ListOf(words));
  Tcl_SetObjResult(interp, Object(sentence));
  return TCL_ERROR;
}

}  // namespace tcl
