// Tested by check_text_test.cpp.
#include "planner/report/CheckText.h"

#include <algorithm>
#include <cstddef>
#include <vector>

#include "planner/read/Shown.h"
#include "planner/report/DoubtText.h"
#include "planner/report/Limits.h"
#include "planner/report/Table.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using device::Checked;
using device::Doubt;
using device::GradeDescription;
using device::Mistake;
using std::string;

// The same mistake at more places than these is told once.
constexpr std::size_t kMostPlaces = 3;

string PlaceText(const string& path, const Mistake::Place& place) {
  return path + ":" + std::to_string(place.line) + ":" + std::to_string(place.column) + ": ";
}

// The host names the keys that there are, but not the many keywords.
string ReasonText(const Mistake& mistake) {
  if (mistake.kind == ::Device::NameKind::kKey) return mistake.reason;
  return mistake.reason + read::DidYouMean(mistake.unknown, mistake.known);
}

// "; the same in lines 19, 31 and 43".
string MorePlaces(const Mistake& mistake) {
  std::vector<string> lines;
  for (std::size_t i = 1; i < mistake.places.size(); ++i) {
    lines.push_back(std::to_string(mistake.places[i].line));
  }
  return "; the same in lines " + Enumerated(lines);
}

struct PlacedLine {
  Mistake::Place place;
  string text;
};

bool Has(const std::vector<Primitive>& all, Primitive primitive) {
  return std::find(all.begin(), all.end(), primitive) != all.end();
}

// What is doubtful, a line each, with the line of its keyword.
string Warnings(const Checked& checked, const string& path, const Style& style) {
  string text;
  for (const Doubt& doubt : checked.doubts) {
    string place = path;
    if (!doubt.lines.empty()) place += ":" + std::to_string(doubt.lines.front());
    text += Prose(style, place + ": warning: ", GradesWords(doubt) + ": " + DoubtText(doubt));
  }
  for (const GradeDescription& grade : checked.description.grades) {
    if (!grade.primitives.empty() || !checked.mistakes.empty()) continue;
    text += Prose(
        style, path + ": warning: ",
        "grade " + grade.name + " has all limits of no primitive: nothing can be planned for it");
  }
  return text;
}

// Whether a grade has a primitive, and what is to be said of it.
string Verdict(const GradeDescription& grade, const device::Coverage& coverage,
               const std::vector<Doubt>& doubts) {
  if (coverage.IsBegun()) return "NO";
  if (!coverage.IsComplete()) return "left out";
  bool is_touched = false;
  for (const Doubt& doubt : doubts) {
    if (Has(doubt.lost, coverage.primitive)) return "NO, there is no " + NothingWords(doubt);
    is_touched = is_touched || Has(doubt.touched, coverage.primitive);
  }
  const bool has_jitter = IsLoop(coverage.primitive) ? grade.has_loop_jitter : grade.has_kru_jitter;
  return string("yes, ") + (has_jitter ? "with jitter" : "without jitter") +
         (is_touched ? "; see below" : "");
}

// The keywords that keep primitives away of which others are there.
string MissingTable(const GradeDescription& grade, const Style& style) {
  std::vector<Row> rows;
  for (const device::Missing& missing : device::MissingOf(grade)) {
    if (missing.costs.empty()) continue;
    std::vector<string> names;
    for (const Primitive primitive : missing.costs) names.emplace_back(Name(primitive));
    rows.push_back(
        {{string(missing.keyword.name), UnitName(missing.keyword.unit), Join(names, ", ")}});
  }
  if (rows.empty()) return "";
  return "\n" +
         FittedTable(style,
                     {{Align::kLeft, "missing"}, {Align::kLeft, "unit"}, {Align::kLeft, "costs"}},
                     rows);
}

// The primitives of a grade, and the keywords that it lacks.
string GradeTable(const GradeDescription& grade, const Style& style) {
  const std::vector<Doubt> doubts = device::Doubts(grade);
  std::vector<Row> rows;
  for (const device::Coverage& coverage : device::CoverageOf(grade)) {
    rows.push_back({{string(Name(coverage.primitive)),
                     std::to_string(coverage.there) + " of " + std::to_string(coverage.needed),
                     Verdict(grade, coverage, doubts)}});
  }
  return TableText(style,
                   {{Align::kLeft, "grade " + grade.name},
                    {Align::kRight, "keywords"},
                    {Align::kLeft, ""}},
                   rows) +
         MissingTable(grade, style);
}

string DefaultNote(const char* kind, const Style& style) {
  return Prose(style, "note: ",
               string("there is no default_") + kind + ": a part name must have the " + kind);
}

}  // namespace

string MistakesText(const Checked& checked, const string& path, const Style& style) {
  string whole;
  std::vector<PlacedLine> lines;
  for (const Mistake& mistake : checked.mistakes) {
    const string reason = ReasonText(mistake);
    if (mistake.places.empty()) whole += path + ": " + reason + "\n";
    const bool is_merged = mistake.places.size() > kMostPlaces;
    for (const Mistake::Place& place : mistake.places) {
      lines.push_back(
          {place, PlaceText(path, place) + reason + (is_merged ? MorePlaces(mistake) : "") + "\n"});
      if (is_merged) break;
    }
  }
  std::stable_sort(lines.begin(), lines.end(),
                   [](const PlacedLine& a, const PlacedLine& b) { return a.place < b.place; });
  for (const PlacedLine& line : lines) whole += line.text;
  if (checked.untold > 0) {
    whole += path + ": " + std::to_string(checked.untold) + " more " +
             (checked.untold > 1 ? "mistakes" : "mistake") + "\n";
  }
  return whole + Warnings(checked, path, style);
}

string CheckText(const Checked& checked, const string& path, const Style& style) {
  const device::Description& description = checked.description;
  string text = path + ": device " + description.name + ", packages " +
                Join(description.packages, ", ") + "\n";
  if (!description.default_package) text += DefaultNote("package", style);
  if (!description.default_grade) text += DefaultNote("grade", style);
  for (const GradeDescription& grade : description.grades) {
    text += "\n" + GradeTable(grade, style);
  }
  const string warnings = Warnings(checked, path, style);
  return text + (warnings.empty() ? "" : "\n" + warnings);
}

}  // namespace planner::report
