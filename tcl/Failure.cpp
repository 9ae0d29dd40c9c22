// Tested by requests.test.
#include "tcl/Failure.h"

#include <nlohmann/json.hpp>
#include <utility>

#include "planner/read/Options.h"
#include "planner/read/Settings.h"
#include "planner/report/ErrorData.h"
#include "planner/report/TclDict.h"
#include "tcl/Objects.h"

namespace tcl {

namespace {

using nlohmann::ordered_json;
using planner::device::PartError;
using planner::read::Mistake;
using std::string;

// Options have one dash here, alone and in sentences.
string WithOneDash(string text) {
  for (const auto options : {planner::read::RequestOptions(), planner::read::SettingOptions()}) {
    for (const planner::read::OptionFacts& facts : options) {
      for (std::size_t i = text.find(facts.name); i != string::npos; i = text.find(facts.name, i)) {
        text.erase(i, 1);
      }
    }
  }
  return text;
}

// A list of dicts with `kind`, and what else an entry has.
string DictsOf(const std::vector<ordered_json>& entries) {
  std::vector<Tcl_Obj*> dicts;
  for (const ordered_json& entry : entries)
    dicts.push_back(Object(planner::report::TclDict(entry)));
  Tcl_Obj* const list = ListOf(dicts);
  Tcl_IncrRefCount(list);
  string text = Text(list);
  Tcl_DecrRefCount(list);
  return text;
}

ordered_json EntryOf(const Mistake& mistake) {
  ordered_json entry = planner::report::MistakeData(mistake);
  for (const char* const name : {"entry", "message"}) {
    entry[name] = WithOneDash(entry[name].get<string>());
  }
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
  return UsageOf({planner::report::PartErrorData(error)});
}

Failure Failure::OfUnsolved(const planner::plan::Plan& plan, const planner::Device& device) {
  Failure failure;
  std::vector<ordered_json> reasons;
  for (const planner::Answer& answer : plan.refused) {
    ordered_json reason = planner::report::RefusedData(answer, device);
    failure.sentence += (failure.sentence.empty() ? "" : "\n") + string(Name(answer.primitive)) +
                        ": " + reason["message"].get<string>();
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
