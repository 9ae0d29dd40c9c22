#include "planner/report/ErrorData.h"

#include <nlohmann/json.hpp>
#include <string_view>
#include <utility>

#include "planner/read/MistakeText.h"
#include "planner/report/Data.h"
#include "planner/report/DoubtText.h"
#include "planner/report/FindingText.h"
#include "planner/report/PartText.h"
#include "planner/report/VerifyText.h"

namespace planner::report {

namespace {

using device::PartError;
using nlohmann::ordered_json;
using read::MistakeKind;
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
    case MistakeKind::kNoSetting:
      return "no_setting";
    case MistakeKind::kNotOfPrimitive:
      return "not_of_primitive";
    case MistakeKind::kUnset:
      return "unset";
    case MistakeKind::kNotAPlan:
      return "not_a_plan";
    case MistakeKind::kNoAnswer:
      return "no_answer";
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

ordered_json FileMistakeData(const device::Mistake& mistake) {
  ordered_json data = ordered_json::object();
  data["places"] = ordered_json::array();
  for (const auto& place : mistake.places) {
    data["places"].push_back({{"line", place.line}, {"column", place.column}});
  }
  data["unknown"] = mistake.unknown;
  data["known"] = mistake.known;
  data["message"] = mistake.reason;
  return data;
}

ordered_json DoubtData(const device::Doubt& doubt) {
  ordered_json data = ordered_json::object();
  data["keyword"] = doubt.keyword;
  AddExact(&data, "value", doubt.value);
  data["other"] = doubt.other;
  data["grades"] = doubt.grades;
  data["lines"] = doubt.lines;
  data["touched"] = ordered_json::array();
  for (const Primitive one : doubt.touched) data["touched"].push_back(Name(one));
  data["lost"] = ordered_json::array();
  for (const Primitive one : doubt.lost) data["lost"].push_back(Name(one));
  data["message"] = DoubtText(doubt);
  return data;
}

ordered_json GradeData(const device::GradeDescription& grade) {
  ordered_json data = ordered_json::object();
  data["name"] = grade.name;
  data["primitives"] = ordered_json::array();
  for (const Primitive one : grade.primitives) data["primitives"].push_back(Name(one));
  data["missing"] = ordered_json::array();
  for (const device::Missing& one : device::MissingOf(grade)) {
    data["missing"].push_back(one.keyword.name);
  }
  return data;
}

}  // namespace

ordered_json MistakeData(const read::Mistake& mistake) {
  ordered_json data = ordered_json::object();
  data["kind"] = NameOf(mistake.kind);
  data["entry"] = mistake.place.entry;
  data["index"] =
      mistake.place.index < 0 ? ordered_json(nullptr) : ordered_json(mistake.place.index);
  data["key"] = mistake.place.key;
  data["text"] = mistake.text;
  data["known"] = mistake.known;
  data["message"] = read::TextOf(mistake);
  return data;
}

ordered_json PartErrorData(const PartError& error) {
  ordered_json data = ordered_json::object();
  data["kind"] = NameOf(error.kind);
  data["entry"] = "device";
  data["text"] = error.name;
  data["known"] = error.candidates;
  data["message"] = PartText(error);
  return data;
}

ordered_json RefusedData(const Answer& answer, const Device& device) {
  ordered_json data = ordered_json::object();
  data["primitive"] = Name(answer.primitive);
  data["message"] = RefusalText(answer, device);
  data["refusals"] = ordered_json::array();
  for (const Finding& finding : answer.refusals) {
    data["refusals"].push_back(FindingData(finding, device, &answer));
  }
  return data;
}

ordered_json CheckData(const device::Checked& checked, const string& file) {
  ordered_json data = ordered_json::object();
  data["file"] = file;
  data["usable"] = checked.mistakes.empty();
  data["mistakes"] = ordered_json::array();
  for (const auto& mistake : checked.mistakes) data["mistakes"].push_back(FileMistakeData(mistake));
  data["untold"] = checked.untold;
  data["warnings"] = ordered_json::array();
  for (const auto& doubt : checked.doubts) data["warnings"].push_back(DoubtData(doubt));
  data["grades"] = ordered_json::array();
  for (const auto& grade : checked.description.grades) data["grades"].push_back(GradeData(grade));
  return data;
}

ordered_json DiscrepancyData(const verify::Discrepancy& discrepancy, const string& file) {
  ordered_json data = ordered_json::object();
  data["path"] = discrepancy.path;
  data["found"] = discrepancy.found;
  data["expected"] = discrepancy.expected;
  data["line"] = discrepancy.line;
  data["column"] = discrepancy.column;
  data["message"] = DiscrepancyText(discrepancy, file);
  return data;
}

}  // namespace planner::report
