// Tested by front_text_test.cpp.
#include "planner/report/FrontText.h"

#include <algorithm>

#include "planner/answer/Rank.h"
#include "planner/report/Cells.h"
#include "planner/report/Numbers.h"
#include "planner/report/SettingsText.h"
#include "planner/report/Table.h"
#include "planner/report/Why.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using std::string;

// Whether the ranking puts less jitter before a smaller error.
bool IsByJitter(const plan::Plan& plan) {
  return plan.request.rank == Rank::kJitter && !plan.front.empty() && plan.front.front().within;
}

// The error, where that of the frequencies does not tell all of it.
bool HasOtherErrors(const Request& request) {
  return std::any_of(request.outputs.begin(), request.outputs.end(), [&](const Output& output) {
    return output.used &&
           (output.phase || output.duty || output.tolerance || request.MaxJitterOf(output));
  });
}

string ErrorText(const Request& request, const Answer& answer) {
  return HasOtherErrors(request) ? Fixed(answer.worst_error, 2) : PpmCell(answer);
}

// M and D, "-" for a KRU whose pins need none.
std::vector<string> Ratio(const Settings& settings) {
  if (const auto* loop = std::get_if<LoopSettings>(&settings)) {
    return {Eighths(loop->m), std::to_string(loop->d)};
  }
  const auto& kru = std::get<KruSettings>(settings);
  if (kru.m == 0) return {"-", "-"};
  return {std::to_string(kru.m), std::to_string(kru.d)};
}

string Places(const Answer& answer) {
  std::vector<string> places;
  for (std::size_t i = 0; i < answer.outputs.size(); ++i) {
    if (answer.outputs[i].used) places.push_back(Place(answer.settings, static_cast<int>(i)));
  }
  return Join(places, ",");
}

// What the last column has: dividers, pins, or both.
string PlacesHeading(const std::vector<const Answer*>& answers) {
  const auto is_loop = [](const Answer* answer) { return IsLoop(answer->primitive); };
  if (std::all_of(answers.begin(), answers.end(), is_loop)) return "dividers";
  return std::none_of(answers.begin(), answers.end(), is_loop) ? "pins" : "dividers or pins";
}

Row RowOf(const Request& request, const Answer& answer) {
  Row row{{string(Name(answer.primitive)), BandwidthCell(answer)}};
  for (string& cell : Ratio(answer.settings)) row.cells.push_back(std::move(cell));
  row.cells.push_back(PpmCell(answer));
  if (HasOtherErrors(request)) row.cells.push_back(Fixed(answer.worst_error, 2));
  row.cells.push_back(JitterCell(answer.max_jitter));
  row.cells.push_back(Places(answer));
  return row;
}

// The table; the best of the plan is marked, where there is room.
string TradeoffTable(const plan::Plan& plan, const std::vector<const Answer*>& answers,
                     const Style& style) {
  std::vector<Column> columns = {{Align::kLeft, "primitive"},
                                 {Align::kLeft, "loop"},
                                 {Align::kRight, "M"},
                                 {Align::kRight, "D"},
                                 {Align::kRight, "worst ppm"}};
  if (HasOtherErrors(plan.request)) columns.push_back({Align::kRight, "of tolerance"});
  columns.push_back({Align::kRight, "jitter ps"});
  columns.push_back({Align::kLeft, PlacesHeading(answers)});
  std::vector<Row> rows;
  for (const Answer* answer : answers) {
    rows.push_back(RowOf(plan.request, *answer));
    if (answer::SameSettings(*answer, plan.ranked.front())) rows.back().role = Role::kGood;
  }
  std::vector<Column> marked_columns = columns;
  std::vector<Row> marked = rows;
  marked_columns.push_back({Align::kLeft, "mark"});
  bool has_mark = false;
  for (Row& row : marked) {
    row.cells.emplace_back(row.role == Role::kGood ? "best" : "");
    has_mark = has_mark || row.role == Role::kGood;
  }
  if (has_mark && TableWidth(marked_columns, marked) <= style.width) {
    return TableText(style, marked_columns, marked);
  }
  return TableText(style, columns, rows);
}

}  // namespace

std::vector<const Answer*> Tradeoffs(const plan::Plan& plan) {
  std::vector<const Answer*> all;
  for (const Answer& answer : plan.front) all.push_back(&answer);
  if (IsByJitter(plan)) std::reverse(all.begin(), all.end());
  std::vector<const Answer*> shown;
  for (const Answer* answer : all) {
    // What is nowhere near what was asked for is no trade for anything.
    const bool is_best = answer == (IsByJitter(plan) ? &plan.front.back() : &plan.front.front());
    if (!is_best && answer->worst_ppm > Rational(kFarPpm)) continue;
    const bool is_same =
        !shown.empty() &&
        ErrorText(plan.request, *answer) == ErrorText(plan.request, *shown.back()) &&
        JitterCell(answer->max_jitter) == JitterCell(shown.back()->max_jitter);
    if (!is_same) shown.push_back(answer);
  }
  return shown;
}

string FrontText(const plan::Plan& plan, std::size_t most, const Style& style) {
  if (most == 0 || plan.front.empty()) return "";
  std::vector<const Answer*> shown = Tradeoffs(plan);
  const bool is_by_jitter = IsByJitter(plan);
  if (shown.size() == 1) {
    if (!shown.front()->max_jitter) return "trade-offs: none, as the jitter is not known\n";
    return string("trade-offs: none, no other setting has ") +
           (is_by_jitter ? "a smaller error\n" : "less jitter\n");
  }
  const std::size_t all = shown.size();
  shown.resize(std::min(most, all));
  string text =
      string("trade-offs, ") +
      (is_by_jitter ? "a smaller error for more jitter:\n" : "less jitter for a larger error:\n") +
      TradeoffTable(plan, shown, style);
  if (shown.size() < all) {
    text += "and " + std::to_string(all - shown.size()) + " more; --front " + std::to_string(all) +
            " shows all\n";
  }
  return text;
}

}  // namespace planner::report
