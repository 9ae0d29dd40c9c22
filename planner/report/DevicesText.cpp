// Tested by devices_text_test.cpp.
#include "planner/report/DevicesText.h"

#include <algorithm>
#include <cstddef>
#include <string_view>

#include "hardware/Kru.h"
#include "hardware/Loop.h"
#include "planner/device/Check.h"
#include "planner/read/Shown.h"
#include "planner/report/DoubtText.h"
#include "planner/report/Limits.h"
#include "planner/report/Numbers.h"
#include "planner/report/PartText.h"
#include "planner/report/Table.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using device::Description;
using device::GradeDescription;
using std::string;

constexpr int kLabelWidth = 10;
// So many grades stand beside each other.
constexpr std::size_t kMostGrades = 5;

// The ranges in which the engine looks for the outputs of a KRU_CLKGEN, MHz. It reads none from
// the device for it.
struct EngineRange {
  std::string_view pin;
  std::string_view lowest;
  std::string_view highest;
};
constexpr EngineRange kClkgenRanges[] = {{"CLKFX", "5", "374.532"},
                                         {"CLKFXDV", "0.156", "187.266"}};

string Note(const Style& style, const string& sentence) { return Prose(style, "note: ", sentence); }

// A range, marked when its ends are the wrong way round.
string Span(const std::optional<Range>& range) {
  if (!range) return "-";
  return General(range->lowest, 6) + " - " + General(range->highest, 6) +
         (range->lowest > range->highest ? " !" : "");
}

const GradeDescription* DefaultGrade(const Description& description) {
  return description.default_grade ? description.Find(*description.default_grade) : nullptr;
}

void AddRows(const Description& description, const GradeDescription& grade,
             std::vector<Row>* rows) {
  string name = description.name;
  string grade_name = grade.name;
  for (const Primitive primitive : grade.primitives) {
    const PrimitiveRanges ranges = RangesOf(grade, primitive);
    rows->push_back({{name, grade_name, string(Name(primitive)), Span(ranges.vco), Span(ranges.pfd),
                      Span(ranges.output),
                      ranges.output_1 ? "to " + General(ranges.output_1->highest, 6) : ""}});
    name.clear();
    grade_name.clear();
  }
}

string DoubtLines(const Style& style, const string& whose,
                  const std::vector<device::Doubt>& doubts) {
  string text;
  for (const device::Doubt& doubt : doubts) {
    text += Prose(style, "warning: ", whose + GradesWords(doubt) + ": " + DoubtText(doubt));
  }
  return text;
}

// A description on one line, without what a terminal would obey, and not without end.
string Described(string about) {
  constexpr std::size_t kMost = 1000;
  std::replace_if(
      about.begin(), about.end(),
      [](char letter) { return letter == '\n' || letter == '\r' || letter == '\t'; }, ' ');
  return read::Shown(about, kMost);
}

bool HasPrimitive(const std::vector<Row>& rows, Primitive primitive) {
  return std::any_of(rows.begin(), rows.end(),
                     [&](const Row& row) { return row.cells[2] == Name(primitive); });
}

// What the table of all devices does not say by itself.
string ListNotes(const std::vector<Row>& rows, const Style& style) {
  string text = "\nThe grade is the device's default; devices NAME shows all limits.\n";
  if (HasPrimitive(rows, Primitive::kPll)) {
    text += Paragraph(style,
                      "The last column is the highest frequency of output 1 of a PLL, which can "
                      "drive an I/O clock.");
    text += Paragraph(style, "With bandwidth LOW the PFD of a PLL goes up to " +
                                 std::to_string(hardware::kPllLowBandwidthPfd) + " MHz.");
  }
  if (HasPrimitive(rows, Primitive::kKruClkgen)) {
    text += Paragraph(
        style, "The engine looks for a KRU_CLKGEN from " + string(kClkgenRanges[1].lowest) +
                   " to " + string(kClkgenRanges[0].highest) + " MHz only, whatever the device.");
  }
  return text;
}

// The packages or grades, with what else is to be said of them.
string Choice(const std::vector<string>& names, const std::optional<string>& usual) {
  return Join(names, ", ") + " (" + (usual ? "default " + *usual : "no default");
}

string GradesChoice(const Description& description) {
  std::vector<string> names;
  for (const GradeDescription& grade : description.grades) names.push_back(grade.name);
  string text = Choice(names, description.default_grade);
  if (const std::optional<string> fastest = FastestGrade(description)) {
    text += fastest == description.default_grade ? ", the fastest"
                                                 : "; " + *fastest + " is the fastest";
  }
  return text + ")";
}

// The settings that a primitive has on every device.
string SettingsNote(Primitive primitive) {
  const auto number = [](int value) { return std::to_string(value); };
  const string largest_d = number(hardware::kLargestD);
  const string dividers = "D 1 to " + largest_d + " and each output divider 1 to " +
                          number(hardware::kLargestDivider) + ", at most twice O_MAX_HT_LT";
  const string kru_most = number(hardware::LargestKruRatioPart(primitive));
  const string kru = "M of CLKFX is " + number(hardware::kSmallestKruM) + " to " + kru_most +
                     ", D 1 to " + kru_most + ". ";
  switch (primitive) {
    case Primitive::kPll:
      return "M is 1 to " + number(hardware::kLargestM) + ", " + dividers +
             "; all are whole. Output 1 can drive an I/O clock and goes up to "
             "CLKOUT_FREQ_MAX_IOCLK, the others to CLKOUT_FREQ_MAX_GCLK.";
    case Primitive::kTsyn:
      return "M is 1 or " + number(hardware::kSmallestTsynM) + " to " +
             number(hardware::kLargestM) + ", " + dividers + ". With fewer than " +
             number(hardware::kWholeOutputs) +
             " outputs, M and the divider of output 0 can go in steps of 1/" +
             number(hardware::kEighths) + ", the divider from " +
             number(hardware::kSmallestFractionalDivider) +
             " on; the engine's search takes whole M, plan takes all.";
    case Primitive::kKruSp:
      return kru + "CLKDV divides by 2 to 8 in steps of 0.5, or by 9 to 17.";
    case Primitive::kKruClkgen:
      break;
  }
  std::vector<string> divides(hardware::kClkfxdvHalves.size());
  std::transform(hardware::kClkfxdvHalves.begin(), hardware::kClkfxdvHalves.end(), divides.begin(),
                 [&number](int halves) { return number(halves / 2); });
  return kru + "CLKFXDV divides CLKFX by " + Enumerated(divides, "or") + ".";
}

string LowBandwidthNote(Primitive primitive) {
  if (primitive == Primitive::kPll) {
    return "with bandwidth LOW the maximum of the PFD is " +
           std::to_string(hardware::kPllLowBandwidthPfd) +
           " MHz for a PLL of any device, or CLKPFD_FREQ_MAX where that is less.";
  }
  return "with bandwidth LOW the maximum of the PFD is TSYN_CLKPFD_FREQ_MAX_LBW.";
}

constexpr std::string_view kCountNote =
    "O_MAX_HT_LT is the largest number of VCO cycles for which an output divider can hold its "
    "output high or low. The further a divider is above it, the nearer to 50 % are the duty cycles "
    "that it has.";

// What holds where a KRU_CLKGEN is planned.
string ClkgenNote() {
  std::vector<string> ranges;
  for (const EngineRange& range : kClkgenRanges) {
    ranges.push_back(string(range.lowest) + " to " + string(range.highest) + " MHz on " +
                     string(range.pin));
  }
  return "the engine does not read these limits to find a KRU_CLKGEN: on every device it takes "
         "outputs from " +
         Join(ranges, " and from ") +
         ". clkgen, plan and compare mark an answer that is then outside the limits above, with "
         "exit status 3.";
}

// The limits of a primitive in some grades; "-" where one has none.
string LimitsTable(Primitive primitive, const std::vector<const GradeDescription*>& grades,
                   const Style& style) {
  std::vector<Column> columns = {{Align::kLeft, string(Name(primitive))}, {Align::kLeft, "unit"}};
  for (const GradeDescription* grade : grades) {
    columns.push_back({Align::kRight, "grade " + grade->name});
  }
  std::vector<Row> rows;
  for (const device::Keyword& keyword : device::KeywordsOf(primitive)) {
    Row row{{string(keyword.name), UnitName(keyword.unit)}};
    for (const GradeDescription* grade : grades) {
      const device::Limit* const limit = grade->Find(keyword.name);
      row.cells.push_back(limit == nullptr ? "-" : limit->text);
    }
    rows.push_back(std::move(row));
  }
  if (primitive == Primitive::kPll) {
    Row row{{"PFD with bandwidth LOW", "MHz"}};
    for (const GradeDescription* grade : grades) {
      const bool is_there = grade->Find("CLKPFD_FREQ_MAX") != nullptr;
      row.cells.push_back(
          is_there ? "to " + General(RangesOf(*grade, primitive).pfd_low->highest, 6) : "-");
    }
    rows.push_back(std::move(row));
  }
  return FittedTable(style, columns, rows);
}

// Grades that do not fit a terminal beside each other follow below.
string LimitsTables(Primitive primitive, const std::vector<const GradeDescription*>& grades,
                    const Style& style) {
  string text;
  for (std::size_t i = 0; i < grades.size(); i += kMostGrades) {
    const auto begin = grades.begin() + static_cast<std::ptrdiff_t>(i);
    const auto end = begin + static_cast<std::ptrdiff_t>(std::min(kMostGrades, grades.size() - i));
    text += LimitsTable(primitive, {begin, end}, style);
  }
  return text;
}

bool HasLimits(const std::vector<const GradeDescription*>& grades, Primitive primitive) {
  return std::any_of(grades.begin(), grades.end(), [&](const GradeDescription* grade) {
    return std::find(grade->primitives.begin(), grade->primitives.end(), primitive) !=
           grade->primitives.end();
  });
}

// The doubts that concern some of the grades, told of these alone.
std::vector<device::Doubt> DoubtsOf(const Description& description,
                                    const std::vector<string>& grades) {
  std::vector<device::Doubt> doubts = device::Doubts(description);
  for (device::Doubt& doubt : doubts) {
    std::vector<string> kept;
    for (const string& grade : doubt.grades) {
      if (std::find(grades.begin(), grades.end(), grade) != grades.end()) kept.push_back(grade);
    }
    doubt.grades = std::move(kept);
  }
  doubts.erase(std::remove_if(doubts.begin(), doubts.end(),
                              [](const device::Doubt& doubt) { return doubt.grades.empty(); }),
               doubts.end());
  return doubts;
}

}  // namespace

string DevicesText(const std::vector<device::Listed>& devices, const Style& style) {
  std::vector<Row> rows;
  string troubles;
  for (const device::Listed& listed : devices) {
    if (listed.complaint) {
      troubles += Prose(style, read::ShownWhole(listed.name) + " cannot be used: ",
                        ComplaintText(*listed.complaint));
      continue;
    }
    const GradeDescription* const grade = DefaultGrade(*listed.description);
    if (grade == nullptr) {
      std::vector<string> names;
      for (const GradeDescription& one : listed.description->grades) names.push_back(one.name);
      troubles += Prose(style, listed.name + " cannot be used: ",
                        listed.name + " has no default grade; it has " + Join(names, ", "));
      continue;
    }
    AddRows(*listed.description, *grade, &rows);
    troubles += DoubtLines(style, listed.name + ", ", DoubtsOf(*listed.description, {grade->name}));
  }
  const string text = TableText(style,
                                {{Align::kLeft, "device"},
                                 {Align::kLeft, "grade"},
                                 {Align::kLeft, "primitive"},
                                 {Align::kLeft, "VCO MHz"},
                                 {Align::kLeft, "PFD MHz"},
                                 {Align::kLeft, "outputs MHz"},
                                 {Align::kLeft, "output 1"}},
                                rows);
  return text + (troubles.empty() ? "" : "\n" + troubles) + ListNotes(rows, style);
}

string DeviceText(const Description& description, const std::vector<string>& grades,
                  const Style& style) {
  string text;
  for (const auto& [label, value] :
       Pairs{{"device", description.name},
             {"about", Described(description.about)},
             {"file", read::ShownWhole(description.file)},
             {"packages", Choice(description.packages, description.default_package) + ")"},
             {"grades", GradesChoice(description)}}) {
    text += Labelled(style, kLabelWidth, label, value);
  }
  std::vector<const GradeDescription*> shown;
  for (const string& grade : grades) {
    if (const GradeDescription* one = description.Find(grade)) shown.push_back(one);
  }
  bool is_counted = false;
  for (const Primitive primitive : hardware::kPrimitives) {
    if (!HasLimits(shown, primitive)) continue;
    text += "\n" + LimitsTables(primitive, shown, style) + Note(style, SettingsNote(primitive));
    if (IsLoop(primitive)) {
      text += Note(style, LowBandwidthNote(primitive));
      if (!is_counted) text += Note(style, string(kCountNote));
      is_counted = true;
    }
    if (primitive == Primitive::kKruClkgen) text += Note(style, ClkgenNote());
  }
  const string doubts = DoubtLines(style, "", DoubtsOf(description, grades));
  return text + (doubts.empty() ? "" : "\n" + doubts);
}

std::optional<string> FastestGrade(const Description& description) {
  // Whether one grade is faster than another in some limit and slower in none.
  const auto is_faster = [](const GradeDescription& a, const GradeDescription& b) {
    bool is_ahead = false;
    for (const device::Keyword& keyword : device::Keywords()) {
      const bool is_highest = keyword.unit == device::Unit::kMegahertz &&
                              keyword.name.find("_MAX") != std::string_view::npos;
      const bool is_shortest = keyword.name.find("_MINPERIOD") != std::string_view::npos;
      if (!is_highest && !is_shortest) continue;
      const device::Limit* const own = a.Find(keyword.name);
      const device::Limit* const other = b.Find(keyword.name);
      if ((own == nullptr) != (other == nullptr)) return false;
      if (own == nullptr || own->value == other->value) continue;
      if ((own->value > other->value) != is_highest) return false;
      is_ahead = true;
    }
    return is_ahead;
  };
  for (const GradeDescription& grade : description.grades) {
    const bool is_fastest =
        description.grades.size() > 1 &&
        std::all_of(description.grades.begin(), description.grades.end(),
                    [&](const auto& other) { return &other == &grade || is_faster(grade, other); });
    if (is_fastest) return grade.name;
  }
  return std::nullopt;
}

}  // namespace planner::report
