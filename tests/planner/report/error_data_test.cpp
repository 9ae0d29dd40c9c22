// What is wrong, as data: the names that scripts tell mistakes apart by, and what stands beside
// them.
#include "planner/report/ErrorData.h"

#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "made.h"

namespace planner::report {
namespace {

using device::PartError;
using nlohmann::ordered_json;
using read::MistakeKind;

TEST(MistakeData, EachKindHasItsName) {
  const std::pair<MistakeKind, const char*> names[] = {
      {MistakeKind::kNotAValue, "not_a_value"},
      {MistakeKind::kNumberTooLarge, "number_too_large"},
      {MistakeKind::kNumberTooSmall, "number_too_small"},
      {MistakeKind::kTooManyDigits, "too_many_digits"},
      {MistakeKind::kDividesByZero, "divides_by_zero"},
      {MistakeKind::kMustBe, "must_be"},
      {MistakeKind::kOutOfRange, "out_of_range"},
      {MistakeKind::kUnknownUnit, "unknown_unit"},
      {MistakeKind::kOtherUnit, "other_unit"},
      {MistakeKind::kNumberMissing, "number_missing"},
      {MistakeKind::kEmptyList, "empty_list"},
      {MistakeKind::kBareBesideUnit, "bare_beside_unit"},
      {MistakeKind::kTooMany, "too_many"},
      {MistakeKind::kCountDiffers, "count_differs"},
      {MistakeKind::kNothingUsed, "nothing_used"},
      {MistakeKind::kNotAName, "not_a_name"},
      {MistakeKind::kNotASwitch, "not_a_switch"},
      {MistakeKind::kContradiction, "contradiction"},
      {MistakeKind::kTwice, "twice"},
      {MistakeKind::kOtherPrimitive, "other_primitive"},
      {MistakeKind::kNoSetting, "no_setting"},
      {MistakeKind::kNotOfPrimitive, "not_of_primitive"},
      {MistakeKind::kUnset, "unset"},
      {MistakeKind::kNotAPlan, "not_a_plan"},
      {MistakeKind::kNoAnswer, "no_answer"},
      {MistakeKind::kMissing, "missing"},
      {MistakeKind::kUnknownEntry, "unknown_entry"},
      {MistakeKind::kUnknownOption, "unknown_option"},
      {MistakeKind::kWrongType, "wrong_type"},
      {MistakeKind::kNoFrequency, "no_frequency"},
      {MistakeKind::kSyntax, "syntax"},
      // A request in Tcl that fails is none that could be read.
      {MistakeKind::kScript, "syntax"},
  };
  for (const auto& [kind, name] : names) {
    read::Mistake mistake;
    mistake.kind = kind;
    // What the sentences of some kinds go by.
    mistake.known = {"one"};
    mistake.primitive = Primitive::kPll;
    EXPECT_EQ(MistakeData(mistake)["kind"], name);
  }
}

TEST(MistakeData, HasThePlaceAndTheText) {
  read::Mistake mistake;
  mistake.kind = MistakeKind::kNotASwitch;
  mistake.place = {"", 0, 0, "outputs", 2, "exact"};
  mistake.text = "perhaps";
  ordered_json data = MistakeData(mistake);
  EXPECT_NE(data["message"].get<std::string>().find("perhaps"), std::string::npos);
  data.erase("message");
  EXPECT_EQ(data, ordered_json::parse(R"({"kind": "not_a_switch", "entry": "outputs", "index": 2,
      "key": "exact", "text": "perhaps", "known": []})"));

  // Of an entry as a whole.
  mistake.place.index = -1;
  mistake.known = {"0", "1"};
  data = MistakeData(mistake);
  EXPECT_TRUE(data["index"].is_null());
  EXPECT_EQ(data["known"], ordered_json({"0", "1"}));
}

TEST(PartErrorData, EachKindHasItsName) {
  const std::pair<PartError::Kind, const char*> names[] = {
      {PartError::Kind::kUnknownDevice, "unknown_device"},
      {PartError::Kind::kUnknownPackage, "unknown_package"},
      {PartError::Kind::kUnknownGrade, "unknown_grade"},
      {PartError::Kind::kNoDefaultGrade, "no_default_grade"},
      {PartError::Kind::kAmbiguous, "ambiguous_device"},
      {PartError::Kind::kBadFile, "bad_file"},
  };
  for (const auto& [kind, name] : names) {
    PartError error(kind);
    error.name = "vk4";
    error.device = "vk40";
    error.candidates = {"vk40", "vk41"};
    error.complaints = {{"vk40", "vk40.toml", 3, 5, "a number is missing"}};
    const ordered_json data = PartErrorData(error);
    EXPECT_EQ(data["kind"], name);
    EXPECT_EQ(data["entry"], "device");
    EXPECT_EQ(data["text"], "vk4");
    EXPECT_EQ(data["known"], ordered_json({"vk40", "vk41"}));
    EXPECT_FALSE(data["message"].get<std::string>().empty());
  }
}

TEST(RefusedData, HasTheFindings) {
  const Answer answer = Refused(Primitive::kTsyn, "no VCO");
  const ordered_json data = RefusedData(answer, MadeDevice());
  EXPECT_EQ(data["primitive"], "TSYN");
  ASSERT_EQ(data["refusals"].size(), 1u);
  EXPECT_EQ(data["refusals"][0]["kind"], "unsolved");
  EXPECT_NE(data["message"].get<std::string>().find("no VCO"), std::string::npos);
}

TEST(CheckData, HasMistakesWarningsAndGrades) {
  device::Checked checked;
  device::Mistake mistake;
  mistake.places = {{7, 14}, {9, 2}};
  mistake.reason = "must be a number";
  mistake.unknown = "Z";
  mistake.known = {"X", "Y"};
  checked.mistakes = {mistake};
  checked.untold = 3;
  device::Doubt doubt;
  doubt.kind = device::DoubtKind::kLowUnused;
  doubt.grades = {"1"};
  doubt.keyword = "ONE";
  doubt.value = Rational(1201, 2);
  doubt.text = "600.5";
  doubt.other = "OTHER";
  doubt.other_text = "500";
  doubt.lines = {12};
  doubt.touched = {Primitive::kPll, Primitive::kTsyn};
  doubt.lost = {Primitive::kTsyn};
  checked.doubts = {doubt};
  device::GradeDescription grade;
  grade.name = "1";
  grade.primitives = {Primitive::kPll};
  checked.description.grades = {grade};

  ordered_json data = CheckData(checked, "a.toml");
  EXPECT_NE(data["warnings"][0]["message"].get<std::string>().find("ONE, 600.5"),
            std::string::npos);
  data["warnings"][0].erase("message");
  EXPECT_EQ(data, ordered_json::parse(R"({"file": "a.toml", "usable": false,
      "mistakes": [{"places": [{"line": 7, "column": 14}, {"line": 9, "column": 2}],
                    "unknown": "Z", "known": ["X", "Y"], "message": "must be a number"}],
      "untold": 3,
      "warnings": [{"keyword": "ONE", "value": 600.5, "value_exact": "1201/2", "other": "OTHER",
                    "grades": ["1"], "lines": [12], "touched": ["PLL", "TSYN"],
                    "lost": ["TSYN"]}],
      "grades": [{"name": "1", "primitives": ["PLL"], "missing": []}]})"));

  checked.mistakes.clear();
  EXPECT_EQ(CheckData(checked, "a.toml")["usable"], true);
}

// Of the keywords that only the VCO of a PLL or TSYN needs, one is there, and so the other is
// missed.
TEST(CheckData, NamesTheKeywordsThatAreMissed) {
  device::Checked checked;
  device::GradeDescription grade;
  grade.name = "1";
  for (const device::Keyword& keyword : device::KeywordsOf(Primitive::kPll)) {
    if (keyword.name != "VCOCLK_FREQ_MIN") grade.limits.push_back({keyword.name, 100, "100"});
  }
  checked.description.grades = {grade};
  const ordered_json missing = CheckData(checked, "a.toml")["grades"][0]["missing"];
  EXPECT_EQ(missing, ordered_json({"VCOCLK_FREQ_MIN"}));
}

TEST(DiscrepancyData, HasWhatStandsThereAndWhatShould) {
  const verify::Discrepancy discrepancy = {.kind = verify::DiscrepancyKind::kDiffers,
                                           .path = "answers[0].d",
                                           .found = "2",
                                           .expected = "1",
                                           .line = 3,
                                           .column = 7};
  EXPECT_EQ(DiscrepancyData(discrepancy, "plan.json"),
            ordered_json::parse(R"({"path": "answers[0].d", "found": "2", "expected": "1",
                "line": 3, "column": 7,
                "message": "plan.json:3:7: answers[0].d is 2, should be 1"})"));
}

}  // namespace
}  // namespace planner::report
