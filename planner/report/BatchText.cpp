// Tested by batch_text_test.cpp and batch.test.
#include "planner/report/BatchText.h"

#include <algorithm>
#include <nlohmann/json.hpp>
#include <utility>
#include <vector>

#include "planner/batch/Resumed.h"
#include "planner/report/Csv.h"
#include "planner/report/ErrorData.h"
#include "planner/report/FindingText.h"
#include "planner/report/Json.h"
#include "planner/report/JsonText.h"
#include "planner/report/Numbers.h"
#include "planner/report/PartText.h"
#include "planner/report/SettingsText.h"
#include "planner/report/Table.h"

namespace planner::report {

namespace {

using batch::Outcome;
using batch::Status;
using nlohmann::ordered_json;
using std::string;

// A text as its user has written it; a number, too.
string IdJson(const Outcome& outcome) {
  if (!outcome.id) return "null";
  return outcome.id->type == read::NodeType::kNumber ? outcome.id->text
                                                     : JsonText(outcome.id->text);
}

ordered_json Trouble(const char* kind, const string& message) {
  return {{"kind", kind}, {"message", message}};
}

string TooLongText(const BatchForm& form) {
  return "the line is longer than " + std::to_string(form.longest) + " bytes";
}

string NoPrimitiveText(const Outcome& outcome) {
  return outcome.lacking ? LacksText(*outcome.device, *outcome.lacking)
                         : LacksAllText(*outcome.device);
}

// Why a line has no plan.
ordered_json ErrorsOf(const Outcome& outcome, const BatchForm& form) {
  ordered_json errors = ordered_json::array();
  for (const read::Mistake& mistake : outcome.mistakes) {
    ordered_json error = MistakeData(mistake);
    if (mistake.place.column > 0) error["column"] = mistake.place.column;
    errors.push_back(std::move(error));
  }
  if (outcome.part) errors.push_back(PartErrorData(*outcome.part));
  switch (outcome.trouble) {
    case batch::Trouble::kNone:
      break;
    case batch::Trouble::kTooLong:
      errors.push_back(Trouble("too_long", TooLongText(form)));
      break;
    case batch::Trouble::kNoPrimitive:
      errors.push_back(Trouble("no_primitive", NoPrimitiveText(outcome)));
      break;
  }
  if (outcome.status == Status::kFailed) errors.push_back(Trouble("failed", outcome.failure));
  return errors;
}

ordered_json ReasonsOf(const Outcome& outcome) {
  ordered_json reasons = ordered_json::array();
  for (const Answer& answer : outcome.plan->refused) {
    reasons.push_back(RefusedData(answer, *outcome.device));
  }
  return reasons;
}

string JsonLineOf(const Outcome& outcome, const BatchForm& form) {
  string line = TextOf(batch::Head{outcome.line, outcome.digest, outcome.status, outcome.Best()});
  line += ",\"id\":" + IdJson(outcome);
  if (outcome.Best()) {
    const plan::Plan& plan = *outcome.plan;
    line += ",\"plan\":";
    line += JsonLine(plan.request, *outcome.device,
                     form.all ? CompareEntries(plan) : PlanEntries(plan, 1), plan.front_cut);
  } else if (outcome.plan) {
    line += ",\"reasons\":" + JsonText(ReasonsOf(outcome));
  } else {
    line += ",\"errors\":" + JsonText(ErrorsOf(outcome, form));
  }
  return line + "}\n";
}

// --- For spreadsheets -------------------------------------------------------------------

constexpr const char* kColumns[] = {
    "line",  "id",          "status", "number",     "device", "primitive", "bandwidth", "m",
    "d",     "vco",         "output", "divider",    "pin",    "requested", "actual",    "error_ppm",
    "phase", "phase_error", "duty",   "duty_error", "jitter", "within",    "message"};

// All that is wrong, in one cell.
string MessageOf(const Outcome& outcome, const BatchForm& form) {
  const bool has_plan = outcome.plan.has_value();
  string message;
  for (const ordered_json& one : has_plan ? ReasonsOf(outcome) : ErrorsOf(outcome, form)) {
    message += message.empty() ? "" : "; ";
    if (has_plan) message += one["primitive"].get<string>() + ": ";
    message += one["message"].get<string>();
  }
  return message;
}

string Cell(const std::optional<Rational>& value) {
  return value ? CsvNumber(value->ToDouble()) : "";
}
string Cell(const std::optional<double>& value) { return value ? CsvNumber(*value) : ""; }

// The cells up to the number of the candidate.
std::vector<string> FirstCells(const Outcome& outcome) {
  return {std::to_string(outcome.line), outcome.id ? outcome.id->text : "",
          string(Name(outcome.status))};
}

// Of the settings.
void AddSettings(const Answer& answer, std::vector<string>* cells) {
  if (const auto* loop = std::get_if<LoopSettings>(&answer.settings)) {
    cells->insert(cells->end(), {string(Name(loop->bandwidth)), Eighths(loop->m),
                                 std::to_string(loop->d), Cell(std::optional(answer.vco))});
    return;
  }
  const auto& kru = std::get<KruSettings>(answer.settings);
  const auto count = [](int number) { return number == 0 ? "" : std::to_string(number); };
  cells->insert(cells->end(), {"", count(kru.m), count(kru.d), ""});
}

void AddOutput(const Outcome& outcome, const Answer& answer, std::size_t index,
               std::vector<string>* cells) {
  const OutputAnswer& output = answer.outputs[index];
  const auto place = static_cast<int>(index);
  const Output& asked = RequestedAt(outcome.plan->request, answer, place);
  const bool is_loop = std::holds_alternative<LoopSettings>(answer.settings);
  cells->push_back(std::to_string(index));
  const string where = Place(answer.settings, place);
  cells->push_back(is_loop ? where : "");
  cells->push_back(is_loop ? "" : where);
  for (const string& cell :
       {Cell(std::optional(asked.frequency)), Cell(std::optional(output.frequency)),
        Cell(std::optional(output.error_ppm)), Cell(std::optional(output.phase)),
        Cell(output.phase_error), Cell(std::optional(output.duty)), Cell(output.duty_error),
        Cell(output.jitter), string(output.IsWithin() ? "true" : "false")}) {
    cells->push_back(cell);
  }
}

string CsvOf(const Outcome& outcome, const Answer& answer, std::size_t number) {
  string rows;
  for (std::size_t i = 0; i < answer.outputs.size(); ++i) {
    if (!answer.outputs[i].used) continue;
    std::vector<string> cells = FirstCells(outcome);
    cells.push_back(std::to_string(number));
    cells.push_back(outcome.device->part);
    cells.emplace_back(Name(answer.primitive));
    AddSettings(answer, &cells);
    AddOutput(outcome, answer, i, &cells);
    string message;
    // What is said of the whole answer is said once.
    if (rows.empty()) {
      for (const string& text : FindingTexts(answer.violations, *outcome.device, answer)) {
        message += (message.empty() ? "" : "; ") + text;
      }
    }
    cells.push_back(message);
    rows += CsvRow(cells);
  }
  return rows;
}

string CsvOf(const Outcome& outcome, const BatchForm& form) {
  if (outcome.Best()) {
    string rows;
    const std::vector<Answer>& ranked = outcome.plan->ranked;
    for (std::size_t i = 0; i < (form.all ? ranked.size() : 1); ++i) {
      rows += CsvOf(outcome, ranked[i], i + 1);
    }
    return rows;
  }
  std::vector<string> cells = FirstCells(outcome);
  cells.resize(std::size(kColumns));
  if (outcome.device) cells[4] = outcome.device->part;
  cells.back() = MessageOf(outcome, form);
  return CsvRow(cells);
}

}  // namespace

string BatchLines(const Outcome& outcome, const BatchForm& form) {
  return form.csv ? CsvOf(outcome, form) : JsonLineOf(outcome, form);
}

string BatchHeading(const BatchForm& form) {
  if (!form.csv) return "";
  return CsvRow(std::vector<string>(std::begin(kColumns), std::end(kColumns)));
}

string DiedText() {
  return "the process that worked on the line has died, and so has one that worked on nothing else";
}

string BatchSummary(const batch::Counts& counts, const Style& style) {
  std::vector<Column> columns = {{Align::kLeft, "status"}, {Align::kRight, "requests"}};
  std::vector<std::size_t> shown;
  for (const Primitive primitive : hardware::kPrimitives) {
    const auto place = static_cast<std::size_t>(primitive);
    const bool is_there = std::any_of(counts.of.begin(), counts.of.end(),
                                      [&](const auto& row) { return row[place] != 0; });
    if (!is_there) continue;
    shown.push_back(place);
    columns.push_back({Align::kRight, string(Name(primitive))});
  }
  columns.push_back({Align::kRight, "first line"});
  const auto cell = [](std::int64_t number) { return number == 0 ? "-" : std::to_string(number); };
  std::vector<Row> rows;
  for (const Status status : batch::kStatuses) {
    const auto row = static_cast<std::size_t>(status);
    // The program hardly ever fails.
    if (status == Status::kFailed && counts.Of(status) == 0) continue;
    Row& made = rows.emplace_back();
    made.cells = {string(Name(status)), std::to_string(counts.Of(status))};
    for (const std::size_t place : shown) made.cells.push_back(cell(counts.of[row][place]));
    made.cells.push_back(status == Status::kWithin ? "" : cell(counts.first[row]));
  }
  Row& sum = rows.emplace_back();
  sum.cells = {"all", std::to_string(counts.All())};
  for (const std::size_t place : shown) {
    std::int64_t of_primitive = 0;
    for (const auto& row : counts.of) of_primitive += row[place];
    sum.cells.push_back(cell(of_primitive));
  }
  sum.cells.emplace_back("");
  return TableText(style, columns, rows);
}

}  // namespace planner::report
