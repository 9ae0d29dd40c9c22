// Tested by cells_test.cpp.
#include "planner/report/Cells.h"

#include <algorithm>
#include <cstddef>
#include <utility>

#include "planner/report/Numbers.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using std::string;

constexpr const char* kNone = "-";
constexpr const char* kOff = "OFF";

string OffCell(const MarkedRow& row, bool is_short) {
  if (row.off.empty()) return row.otherwise;
  if (is_short) return row.before + kOff;
  return row.before + Enumerated(row.off) + " " + kOff;
}

std::vector<Row> RowsOf(const std::vector<MarkedRow>& marked, bool is_short) {
  std::vector<Row> rows;
  for (const MarkedRow& one : marked) {
    Row row{one.cells, Role::kNone, one.off.empty() ? Role::kNone : Role::kOff};
    if (rows.empty() && one.off.empty()) row.role = Role::kGood;
    row.cells.push_back(OffCell(one, is_short));
    rows.push_back(std::move(row));
  }
  return rows;
}

// The names of rows at rising places; three and more that follow each other are one: "2 to 5".
std::vector<string> NamesOf(const std::vector<MarkedRow>& rows,
                            const std::vector<std::size_t>& places) {
  std::vector<string> names;
  for (std::size_t i = 0; i < places.size();) {
    std::size_t end = i + 1;
    while (end < places.size() && places[end] == places[end - 1] + 1) ++end;
    if (end - i >= 3) {
      names.push_back(rows[places[i]].name + " to " + rows[places[end - 1]].name);
      i = end;
    } else {
      names.push_back(rows[places[i++]].name);
    }
  }
  return names;
}

// What is off, for a table without room for it: "OFF: frequency of 2 and 3; phase of 4".
string OffLine(const Style& style, const std::vector<MarkedRow>& rows) {
  std::vector<std::pair<std::vector<string>, std::vector<std::size_t>>> groups;
  for (std::size_t i = 0; i < rows.size(); ++i) {
    if (rows[i].off.empty()) continue;
    const auto group = std::find_if(groups.begin(), groups.end(),
                                    [&](const auto& one) { return one.first == rows[i].off; });
    if (group == groups.end()) {
      groups.push_back({rows[i].off, {i}});
    } else {
      group->second.push_back(i);
    }
  }
  std::vector<string> parts;
  for (const auto& [off, places] : groups) {
    parts.push_back(Enumerated(off) + " of " + Enumerated(NamesOf(rows, places)));
  }
  return Prose(style, string(kOff) + ": ", Join(parts, "; "));
}

}  // namespace

string BandwidthCell(const Answer& answer) {
  if (!answer.solved) return kNone;
  const auto* loop = std::get_if<LoopSettings>(&answer.settings);
  return loop == nullptr ? kNone : string(Name(loop->bandwidth));
}

string VcoCell(const Answer& answer) {
  return answer.solved && IsLoop(answer.primitive) ? General(answer.vco, 6) : kNone;
}

string PpmCell(const Answer& answer) {
  if (!answer.solved) return kNone;
  // So many digits would be in the way.
  if (answer.worst_ppm >= Rational(1000000)) return General(answer.worst_ppm, 3);
  return Fixed(answer.worst_ppm, 2);
}

string JitterCell(const std::optional<double>& jitter) { return jitter ? Ps(*jitter) : kNone; }

string SourceCell(const Answer& answer) {
  if (!answer.solved) return kNone;
  if (answer.source.engine && answer.source.search) return "both";
  if (answer.source.engine) return "engine";
  return answer.source.search ? "search" : "given";
}

std::vector<string> OffWords(const Answer& answer) {
  const auto misses = [&](Quantity quantity) {
    return std::any_of(answer.outputs.begin(), answer.outputs.end(), [&](const auto& output) {
      return std::any_of(output.misses.begin(), output.misses.end(),
                         [&](const Finding& miss) { return miss.quantity == quantity; });
    });
  };
  std::vector<string> words;
  if (misses(Quantity::kFrequency)) words.emplace_back("frequency");
  if (misses(Quantity::kPhase)) words.emplace_back("phase");
  if (misses(Quantity::kDuty)) words.emplace_back("duty");
  if (misses(Quantity::kJitter)) words.emplace_back("jitter");
  if (!answer.violations.empty()) words.emplace_back("range");
  return words;
}

string MarkedTable(const Style& style, std::vector<Column> columns, const string& heading,
                   const std::vector<MarkedRow>& rows) {
  columns.push_back({Align::kLeft, heading});
  const std::vector<Row> full = RowsOf(rows, false);
  if (TableWidth(columns, full) <= style.width) return TableText(style, columns, full);
  return TableText(style, columns, RowsOf(rows, true)) + OffLine(style, rows);
}

}  // namespace planner::report
