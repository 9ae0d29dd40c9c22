// Tested by verify_text_test.cpp.
#include "planner/report/VerifyText.h"

#include <cassert>

#include "planner/read/MistakeText.h"
#include "planner/read/Shown.h"
#include "planner/report/Colour.h"
#include "planner/report/FindingText.h"
#include "planner/report/SettingsText.h"

namespace planner::report {

namespace {

using std::string;
using verify::Discrepancy;
using verify::DiscrepancyKind;

class Written : public verify::Sentences {
 public:
  string Of(const Finding& finding, const Device& device, const Answer& answer) const override {
    return FindingText(finding, device, &answer);
  }
  std::vector<string> All(const std::vector<Finding>& findings, const Device& device,
                          const Answer& answer) const override {
    return FindingTexts(findings, device, answer);
  }
  std::vector<string> Misses(const Answer& answer) const override { return MissTexts(answer); }
  string Reason(const Answer& answer, const Device& device) const override {
    return RefusalText(answer, device);
  }
};

// " is 27.1, and should be 27".
string Instead(const string& found, const string& right) {
  string text = found.empty() ? " is not there" : " is " + found;
  if (!right.empty()) text += (found.empty() ? ", and should be " : ", should be ") + right;
  return text;
}

string WhatIsWrong(const Discrepancy& one) {
  const string found = read::Shown(one.found);
  const string right = read::Shown(one.expected);
  switch (one.kind) {
    case DiscrepancyKind::kMissing:
      return " is missing" + (right.empty() ? "" : ": " + right);
    case DiscrepancyKind::kUnknown:
      return " should not be there";
    case DiscrepancyKind::kWrongType:
      return " must be " + right + ", not " + found;
    case DiscrepancyKind::kAbsurd:
      return " is no number that can be right" + (right.empty() ? "" : ": it is " + right);
    case DiscrepancyKind::kNoSetting:
      return " cannot be " + (found.empty() ? "nothing" : found) +
             (right.empty() ? "" : ": it must be " + right);
    case DiscrepancyKind::kDiffers:
      return Instead(found, right);
    case DiscrepancyKind::kContradicts:
      return Instead(found, right) + " as all else of it says";
    case DiscrepancyKind::kMisplaced:
      return " is not in the order of the ranking" +
             (right.empty() ? "" : ", where it has number " + right);
    case DiscrepancyKind::kRanksBefore:
      return " is not what its number says: " +
             (one.settings ? string(Name(PrimitiveOf(*one.settings))) + " with " +
                                 SettingsWords(*one.settings)
                           : string("another one")) +
             " has that place";
    case DiscrepancyKind::kNotJson:    // not reached: these have a mistake that says it
    case DiscrepancyKind::kNoRequest:  // not reached: as above
      break;                           // not reached: as above
  }
  return (assert(false), "");  // not reached: as above
}

}  // namespace

const verify::Sentences& JsonSentences() {
  static const Written written;
  return written;
}

string DiscrepancyText(const Discrepancy& one, const string& file) {
  if (one.mistake) {
    read::Mistake mistake = *one.mistake;
    mistake.place.file = file;
    return read::TextOf(mistake);
  }
  string text = read::ShownWhole(file);
  if (one.line > 0) text += ":" + std::to_string(one.line) + ":" + std::to_string(one.column);
  return text + ": " + (one.path.empty() ? "the whole" : read::ShownWhole(one.path)) +
         WhatIsWrong(one);
}

string VerifyText(const std::vector<Discrepancy>& discrepancies, const string& file,
                  const Style& style) {
  if (discrepancies.empty()) {
    return Paint(style, Role::kGood, "every number is right") + "\n";
  }
  string text;
  for (const Discrepancy& one : discrepancies) text += DiscrepancyText(one, file) + "\n";
  const std::size_t count = discrepancies.size();
  return text +
         Paint(style, Role::kOff,
               std::to_string(count) + (count == 1 ? " entry is" : " entries are") + " wrong") +
         "\n";
}

}  // namespace planner::report
