// Tested by report_text_test.cpp.
#include "planner/report/ReportText.h"

#include <algorithm>
#include <cstddef>
#include <functional>
#include <optional>
#include <utility>
#include <vector>

#include "planner/report/FindingText.h"
#include "planner/report/Numbers.h"
#include "planner/report/SettingsText.h"
#include "planner/report/Table.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using std::string;

constexpr const char* kOff = "OFF";

// One answer, in the terms of its tables.
class Report {
 public:
  Report(const Request& request, const Answer& answer, const Style& style)
      : request_(request), answer_(answer), style_(style) {}

  // The frequencies, with the jitter where it is known.
  string Outputs() const;
  // The frequencies with the second input; empty without one. One table with the above would be
  // wider than a terminal.
  string Second() const;
  // The limits of the device with their margins, where these count; else empty.
  string Limits(const Device& device) const;
  // Phases and duty cycles, each if it was asked for or is not as usual; empty without any.
  string Shapes() const;

 private:
  using IsOff = std::function<bool(const OutputAnswer&)>;

  // A table with a row for each output that is used, and a column of marks when there are any.
  string Table(std::vector<Column> columns, const std::function<Row(std::size_t)>& row_of,
               const IsOff& is_off) const;
  bool Any(const IsOff& holds) const;

  const Request& request_;
  const Answer& answer_;
  const Style& style_;
};

bool Misses(const OutputAnswer& output, Quantity quantity) {
  return std::any_of(output.misses.begin(), output.misses.end(),
                     [&](const Finding& miss) { return miss.quantity == quantity; });
}

// Whether an output is outside of the device's limits with an input. What does not depend on the
// input is told with the first one.
bool IsOutside(const OutputAnswer& output, int input) {
  return std::any_of(output.violations.begin(), output.violations.end(),
                     [&](const Finding& violation) { return violation.input == input; });
}

bool Report::Any(const IsOff& holds) const {
  return std::any_of(answer_.outputs.begin(), answer_.outputs.end(),
                     [&](const OutputAnswer& output) { return output.used && holds(output); });
}

string Report::Table(std::vector<Column> columns, const std::function<Row(std::size_t)>& row_of,
                     const IsOff& is_off) const {
  const bool has_marks = Any(is_off);
  if (has_marks) columns.push_back({Align::kLeft, "mark"});
  std::vector<Row> rows;
  for (std::size_t i = 0; i < answer_.outputs.size(); ++i) {
    const OutputAnswer& output = answer_.outputs[i];
    if (!output.used) continue;
    Row row = row_of(i);
    row.cells.insert(row.cells.begin(), std::to_string(i));
    if (has_marks) row.cells.emplace_back(is_off(output) ? kOff : "");
    if (is_off(output)) row.role = Role::kOff;
    rows.push_back(std::move(row));
  }
  columns.insert(columns.begin(), {Align::kRight, "output"});
  return TableText(style_, columns, rows);
}

string Report::Outputs() const {
  const bool has_jitter = HasJitter(answer_);
  bool has_asked = false;
  for (const Output& output : request_.outputs) {
    has_asked = has_asked || (output.used && output.asked);
  }
  std::vector<Column> columns = {IsLoop(answer_.primitive) ? Column{Align::kRight, "divider"}
                                                           : Column{Align::kLeft, "pin"}};
  if (has_asked) columns.push_back({Align::kRight, "requested MHz"});
  columns.push_back({Align::kRight, "actual MHz"});
  if (has_asked) columns.push_back({Align::kRight, "error ppm"});
  if (has_jitter) columns.push_back({Align::kRight, "jitter ps"});
  const auto row_of = [&](std::size_t i) {
    const OutputAnswer& output = answer_.outputs[i];
    const auto place = static_cast<int>(i);
    const Output& asked = RequestedAt(request_, answer_, place);
    Row row{{Place(answer_.settings, place)}};
    const auto add_asked = [&](const Rational& value, int decimals) {
      if (has_asked) row.cells.push_back(asked.asked ? Fixed(value, decimals) : "-");
    };
    add_asked(asked.frequency, kFrequencyDecimals);
    row.cells.push_back(Fixed(output.frequency, kFrequencyDecimals));
    add_asked(output.error_ppm, 2);
    if (has_jitter) row.cells.push_back(output.jitter ? Ps(*output.jitter) : "-");
    return row;
  };
  return Table(std::move(columns), row_of, [](const OutputAnswer& output) {
    return Misses(output, Quantity::kFrequency) || Misses(output, Quantity::kJitter) ||
           IsOutside(output, 0);
  });
}

string Report::Second() const {
  if (!Any([](const OutputAnswer& output) { return output.frequency_second.has_value(); })) {
    return "";
  }
  const auto row_of = [&](std::size_t i) {
    const auto& frequency = answer_.outputs[i].frequency_second;
    return Row{{frequency ? Fixed(*frequency, kFrequencyDecimals) : "-"}};
  };
  return Table({{Align::kRight, "MHz with the second input"}}, row_of,
               [](const OutputAnswer& output) { return IsOutside(output, 1); });
}

string Report::Limits(const Device& device) const {
  const bool is_given = !answer_.source.engine && !answer_.source.search;
  if (!is_given && request_.input_tolerance == Rational(0) && request_.rank != Rank::kMargin) {
    return "";
  }
  std::vector<Row> rows;
  const auto add = [&](const string& name, const Range& range, const Rational& value,
                       const Rational& margin, bool is_off) {
    rows.push_back(
        {{name, Short(range.lowest, kFrequencyDecimals), Short(value, kFrequencyDecimals),
          Short(range.highest, kFrequencyDecimals), Fixed(margin * 100, 2), is_off ? kOff : ""},
         is_off ? Role::kOff : Role::kNone});
  };
  const auto is_off = [&](Quantity quantity) {
    return std::any_of(answer_.violations.begin(), answer_.violations.end(),
                       [&](const Finding& one) { return one.quantity == quantity; });
  };
  if (const auto* const loop = std::get_if<LoopSettings>(&answer_.settings)) {
    const LoopLimits& limits = device.Loop(loop->primitive);
    add("VCO", limits.vco, answer_.vco, answer_.vco_margin, is_off(Quantity::kVco));
    add("PFD", limits.PfdOf(loop->bandwidth), answer_.pfd, answer_.pfd_margin,
        is_off(Quantity::kPfd));
  }
  for (std::size_t i = 0; i < answer_.outputs.size(); ++i) {
    const OutputAnswer& output = answer_.outputs[i];
    if (!output.used) continue;
    add("output " + std::to_string(i), OutputRange(device, answer_.settings, i), output.frequency,
        output.margin, !output.violations.empty());
  }
  const bool has_marks = !answer_.violations.empty();
  std::vector<Column> columns = {{Align::kLeft, "limits of"},
                                 {Align::kRight, "lowest MHz"},
                                 {Align::kRight, "actual MHz"},
                                 {Align::kRight, "highest MHz"},
                                 {Align::kRight, "margin %"}};
  if (has_marks) {
    columns.push_back({Align::kLeft, "mark"});
  } else {
    for (Row& row : rows) row.cells.pop_back();
  }
  return TableText(style_, columns, rows);
}

// What was asked for, what comes out, and the difference; "-" where nothing was asked for.
void AddAsked(const std::optional<Rational>& requested, const Rational& actual,
              const std::optional<Rational>& error, Row* row) {
  row->cells.push_back(requested ? Fixed(*requested, 3) : "-");
  row->cells.push_back(Fixed(actual, 3));
  row->cells.push_back(error ? Fixed(*error, 3) : "-");
}

string Report::Shapes() const {
  bool has_phases = Any([](const OutputAnswer& output) { return output.phase != Rational(0); });
  bool has_duties = Any([](const OutputAnswer& output) { return output.duty != Rational(50); });
  for (const Output& output : request_.outputs) {
    has_phases = has_phases || (output.used && output.phase);
    has_duties = has_duties || (output.used && output.duty);
  }
  if (!has_phases && !has_duties) return "";
  std::vector<Column> columns;
  if (has_phases) {
    for (const char* heading : {"phase deg", "actual deg", "error deg"}) {
      columns.push_back({Align::kRight, heading});
    }
  }
  if (has_duties) {
    for (const char* heading : {"duty %", "actual %", "error points"}) {
      columns.push_back({Align::kRight, heading});
    }
  }
  const auto row_of = [&](std::size_t i) {
    const Output& asked = RequestedAt(request_, answer_, static_cast<int>(i));
    const OutputAnswer& output = answer_.outputs[i];
    Row row;
    if (has_phases) AddAsked(asked.phase, output.phase, output.phase_error, &row);
    if (has_duties) AddAsked(asked.duty, output.duty, output.duty_error, &row);
    return row;
  };
  return Table(std::move(columns), row_of, [](const OutputAnswer& output) {
    return Misses(output, Quantity::kPhase) || Misses(output, Quantity::kDuty);
  });
}

// Of which outputs the edges can be off by more than a period, so that they are no clock; or
// nothing.
string JitterRemark(const Answer& answer) {
  constexpr double kPicoseconds = 1e6;  // in a period of 1 MHz
  std::vector<int> outputs;
  for (std::size_t i = 0; i < answer.outputs.size(); ++i) {
    const OutputAnswer& output = answer.outputs[i];
    if (!output.used || !output.jitter) continue;
    if (*output.jitter * output.frequency.ToDouble() > kPicoseconds) {
      outputs.push_back(static_cast<int>(i));
    }
  }
  if (outputs.empty()) return "";
  return Outputs(outputs) + ": the jitter is above the period of the clock";
}

// A blank line and a paragraph for each note, or nothing.
string Notes(const Answer& answer, const Device& device, const Style& style) {
  std::vector<string> remarks = RemarkTexts(answer, device);
  string jitter = JitterRemark(answer);
  if (!jitter.empty()) remarks.push_back(std::move(jitter));
  string text;
  for (const string& remark : remarks) {
    string prose = Prose(style, "note: ", remark);
    prose.pop_back();
    text += (text.empty() ? "\n" : "") + Paint(style, Role::kNote, prose) + "\n";
  }
  return text;
}

}  // namespace

string ReportText(const Request& request, const Device& device, const Answer& answer,
                  const Style& style) {
  const Report report(request, answer, style);
  string text = PairsText(SettingsPairs(request, device, answer)) + "\n" + report.Outputs();
  for (const string& table : {report.Second(), report.Shapes(), report.Limits(device)}) {
    if (!table.empty()) text += "\n" + table;
  }
  return text + Notes(answer, device, style);
}

std::string EvaluationText(const Request& request, const Device& device, const Answer& answer,
                           const Style& style) {
  const std::string text = ReportText(request, device, answer, style);
  if (!answer.max_jitter) return text;
  return text + "\n" + Prose(style, "jitter: ", "peak to peak, at a bit error rate of 1e-12.");
}

}  // namespace planner::report
