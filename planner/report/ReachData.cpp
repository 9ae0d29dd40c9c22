// Tested by reach_text_test.cpp and reach.test.
#include "planner/report/ReachData.h"

#include <cmath>
#include <nlohmann/json.hpp>

#include "hardware/Loop.h"
#include "planner/report/Csv.h"
#include "planner/report/Data.h"
#include "planner/report/Numbers.h"

namespace planner::report {

namespace {

using nlohmann::ordered_json;
using reach::Point;
using reach::Reach;
using std::string;
using Kind = ReachQuestion::Kind;

Rational Ppm(const Rational& difference, const Rational& of) { return difference / of * 1'000'000; }

Rational Width(const Reach& reach, const reach::Gap& gap) {
  return reach.FrequencyOf(gap.above) - reach.FrequencyOf(gap.below);
}

Rational VcoOf(const Request& request, const LoopSettings& settings) {
  return request.inputs.front() * hardware::VcoRatio(settings.m, settings.d);
}

// Numbers that are whole are so as data.
ordered_json EighthsData(int eighths) {
  if (eighths % hardware::kEighths == 0) return eighths / hardware::kEighths;
  return Rational(eighths, hardware::kEighths).ToDouble();
}

const char* KindName(Kind kind) {
  switch (kind) {
    case Kind::kList:
      break;
    case Kind::kCount:
      return "count";
    case Kind::kGaps:
      return "gaps";
    case Kind::kNear:
      return "near";
  }
  return "list";
}

ordered_json SettingsData(const Request& request, const Settings& settings) {
  ordered_json data = ordered_json::object();
  if (const auto* const loop = std::get_if<LoopSettings>(&settings)) {
    const int divider = loop->outputs.back().divider;
    AddExact(&data, "vco", VcoOf(request, *loop));
    data["bandwidth"] = Name(loop->bandwidth);
    data["m"] = EighthsData(loop->m);
    data["m_eighths"] = loop->m;
    data["d"] = loop->d;
    data["divider"] = EighthsData(divider);
    data["divider_eighths"] = divider;
    return data;
  }
  const auto& kru = std::get<KruSettings>(settings);
  const bool is_sp = kru.primitive == Primitive::kKruSp;
  data["pin"] = hardware::FactsOf(kru.pins.back()).name;
  if (is_sp) {
    data["feedback"] = kru.feedback;
    data["clkin_divide_by_2"] = kru.divide_by_2;
  }
  if (kru.m != 0) {
    data["m"] = kru.m;
    data["d"] = kru.d;
  }
  if (kru.divide_halves != 0) {
    data[is_sp ? "clkdv" : "clkfxdv"] = Rational(kru.divide_halves, 2).ToDouble();
    data["divide_halves"] = kru.divide_halves;
  }
  return data;
}

ordered_json Jitter(double jitter) {
  return std::isfinite(jitter) ? ordered_json(jitter) : ordered_json(nullptr);
}

}  // namespace

ordered_json ReachHead(const Request& request, const Device& device,
                       const ReachQuestion& question) {
  ordered_json data = ordered_json::object();
  data["format"] = "vorkel-reach";
  data["version"] = kReachVersion;
  data["device"] = device.part;
  data["inputs"] = ordered_json::array();
  for (const Rational& input : request.inputs) data["inputs"].push_back(WrittenNumber(input));
  data["output"] = question.output;
  data["asked"] = KindName(question.kind);
  data["from"] = question.from ? WrittenNumber(*question.from) : ordered_json(nullptr);
  data["to"] = question.to ? WrittenNumber(*question.to) : ordered_json(nullptr);
  data["near"] =
      question.kind == Kind::kNear ? WrittenNumber(question.near) : ordered_json(nullptr);
  return data;
}

ordered_json PointData(const Reach& reach, const Request& request, const Point& point,
                       const Rational* near) {
  ordered_json data = ordered_json::object();
  const Rational frequency = reach.FrequencyOf(point);
  AddExact(&data, "frequency", frequency);
  data["multiply"] = point.multiply;
  data["divide"] = point.divide;
  if (near != nullptr) {
    AddExact(&data, "error", frequency - *near);
    AddExact(&data, "error_ppm", Ppm(frequency - *near, *near));
  }
  data.update(SettingsData(request, reach.SettingsOf(point)));
  data["jitter"] = Jitter(reach.JitterOf(point));
  return data;
}

ordered_json GapData(const Reach& reach, const Request& request, const reach::Gap& gap) {
  ordered_json data = ordered_json::object();
  AddExact(&data, "width", Width(reach, gap));
  AddExact(&data, "width_ppm", Ppm(Width(reach, gap), reach.FrequencyOf(gap.below)));
  data["below"] = PointData(reach, request, gap.below, nullptr);
  data["above"] = PointData(reach, request, gap.above, nullptr);
  return data;
}

ordered_json CountData(const Reach& reach, const reach::Counted& counted) {
  ordered_json data = ordered_json::object();
  data["count"] = counted.count;
  for (const auto& [name, point] :
       {std::pair("lowest", counted.lowest), std::pair("highest", counted.highest)}) {
    if (point) {
      AddExact(&data, name, reach.FrequencyOf(*point));
    } else {
      data[name] = nullptr;
      data[string(name) + "_exact"] = nullptr;
    }
  }
  return data;
}

std::vector<string> ReachColumns(Kind kind) {
  switch (kind) {
    case Kind::kCount:
      return {"primitive", "count", "lowest", "highest"};
    case Kind::kGaps:
      return {"primitive", "below", "above", "width", "width_ppm", "below_exact", "above_exact"};
    case Kind::kList:
    case Kind::kNear:
      break;
  }
  std::vector<string> columns = {"primitive", "frequency", "frequency_exact", "multiply", "divide"};
  if (kind == Kind::kNear) columns.insert(columns.end(), {"error", "error_ppm"});
  columns.insert(columns.end(), {"vco", "bandwidth", "m", "d", "divider", "pin", "feedback",
                                 "clkin_divide_by_2", "clkdv", "jitter"});
  return columns;
}

std::vector<string> PointCells(const Reach& reach, const Request& request, const Point& point,
                               const Rational* near) {
  const Rational frequency = reach.FrequencyOf(point);
  std::vector<string> cells = {string(Name(reach.primitive())), CsvNumber(frequency.ToDouble()),
                               Quotient(frequency), std::to_string(point.multiply),
                               std::to_string(point.divide)};
  if (near != nullptr) {
    cells.push_back(CsvNumber((frequency - *near).ToDouble()));
    cells.push_back(CsvNumber(Ppm(frequency - *near, *near).ToDouble()));
  }
  const Settings settings = reach.SettingsOf(point);
  if (const auto* const loop = std::get_if<LoopSettings>(&settings)) {
    cells.insert(cells.end(),
                 {CsvNumber(VcoOf(request, *loop).ToDouble()), string(Name(loop->bandwidth)),
                  Eighths(loop->m), std::to_string(loop->d), Eighths(loop->outputs.back().divider),
                  "", "", "", ""});
  } else {
    const auto& kru = std::get<KruSettings>(settings);
    const bool is_sp = kru.primitive == Primitive::kKruSp;
    const auto count = [](int number) { return number == 0 ? "" : std::to_string(number); };
    const auto truth = [&](bool is_so) { return !is_sp ? "" : is_so ? "true" : "false"; };
    cells.insert(cells.end(), {"", "", count(kru.m), count(kru.d), "",
                               string(hardware::FactsOf(kru.pins.back()).name), truth(kru.feedback),
                               truth(kru.divide_by_2),
                               kru.divide_halves == 0 ? "" : CsvNumber(kru.divide_halves / 2.0)});
  }
  const double jitter = reach.JitterOf(point);
  cells.push_back(std::isfinite(jitter) ? CsvNumber(jitter) : "");
  return cells;
}

std::vector<string> GapCells(const Reach& reach, const reach::Gap& gap) {
  const Rational below = reach.FrequencyOf(gap.below);
  const Rational above = reach.FrequencyOf(gap.above);
  const Rational width = above - below;
  return {string(Name(reach.primitive())),
          CsvNumber(below.ToDouble()),
          CsvNumber(above.ToDouble()),
          CsvNumber(width.ToDouble()),
          CsvNumber(Ppm(width, below).ToDouble()),
          Quotient(below),
          Quotient(above)};
}

std::vector<string> CountCells(const Reach& reach, const reach::Counted& counted) {
  const auto cell = [&](const std::optional<Point>& point) {
    return point ? CsvNumber(reach.FrequencyOf(*point).ToDouble()) : "";
  };
  return {string(Name(reach.primitive())), std::to_string(counted.count), cell(counted.lowest),
          cell(counted.highest)};
}

}  // namespace planner::report
