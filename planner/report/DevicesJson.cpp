// Tested by devices_text_test.cpp.
#include <algorithm>
#include <nlohmann/json.hpp>

#include "planner/device/Check.h"
#include "planner/report/Data.h"
#include "planner/report/DevicesText.h"
#include "planner/report/DoubtText.h"
#include "planner/report/JsonText.h"
#include "planner/report/Limits.h"
#include "planner/report/TclDict.h"

namespace planner::report {

namespace {

using device::Description;
using device::GradeDescription;
using nlohmann::ordered_json;
using std::string;

ordered_json RangeOrNull(const std::optional<Range>& range) {
  return range ? RangeData(*range) : ordered_json(nullptr);
}

template <typename T>
ordered_json OrNull(const std::optional<T>& value) {
  return value ? ordered_json(*value) : ordered_json(nullptr);
}

ordered_json PrimitiveData(const GradeDescription& grade, Primitive primitive) {
  const PrimitiveRanges ranges = RangesOf(grade, primitive);
  ordered_json data = ordered_json::object();
  data["primitive"] = Name(primitive);
  data["vco"] = RangeOrNull(ranges.vco);
  data["pfd"] = RangeOrNull(ranges.pfd);
  data["pfd_low"] = RangeOrNull(ranges.pfd_low);
  data["output"] = RangeData(ranges.output);
  data["output_1"] = RangeOrNull(ranges.output_1);
  data["has_jitter"] = IsLoop(primitive) ? grade.has_loop_jitter : grade.has_kru_jitter;
  return data;
}

const char* UnitOf(std::string_view keyword) {
  const std::vector<device::Keyword>& all = device::Keywords();
  const auto found = std::find_if(all.begin(), all.end(),
                                  [&](const device::Keyword& one) { return one.name == keyword; });
  return UnitName(found->unit);
}

ordered_json GradeData(const GradeDescription& grade) {
  ordered_json data = ordered_json::object();
  data["name"] = grade.name;
  data["primitives"] = ordered_json::array();
  for (const Primitive primitive : grade.primitives) {
    data["primitives"].push_back(PrimitiveData(grade, primitive));
  }
  data["limits"] = ordered_json::array();
  for (const device::Limit& limit : grade.limits) {
    ordered_json entry = ordered_json::object();
    entry["keyword"] = limit.keyword;
    entry["unit"] = UnitOf(limit.keyword);
    AddExact(&entry, "value", limit.value);
    data["limits"].push_back(std::move(entry));
  }
  data["warnings"] = ordered_json::array();
  for (const device::Doubt& doubt : device::Doubts(grade)) {
    data["warnings"].push_back(DoubtText(doubt));
  }
  return data;
}

ordered_json DescriptionData(const Description& description, const std::vector<string>* grades) {
  ordered_json data = ordered_json::object();
  data["name"] = description.name;
  data["usable"] = true;
  data["about"] = description.about;
  data["file"] = description.file;
  data["packages"] = description.packages;
  data["default_package"] = OrNull(description.default_package);
  data["default_grade"] = OrNull(description.default_grade);
  data["fastest_grade"] = OrNull(FastestGrade(description));
  data["grades"] = ordered_json::array();
  for (const GradeDescription& grade : description.grades) {
    const bool is_shown =
        grades == nullptr || std::find(grades->begin(), grades->end(), grade.name) != grades->end();
    if (is_shown) data["grades"].push_back(GradeData(grade));
  }
  return data;
}

ordered_json ComplaintData(const device::Listed& listed) {
  const device::FileComplaint& complaint = *listed.complaint;
  ordered_json data = ordered_json::object();
  data["name"] = listed.name;
  data["usable"] = false;
  data["file"] = complaint.file;
  data["line"] = OrNull(complaint.line);
  data["column"] = OrNull(complaint.column);
  data["reason"] = complaint.reason;
  return data;
}

ordered_json Document(ordered_json devices) {
  ordered_json data = ordered_json::object();
  data["format"] = "vorkel-devices";
  data["version"] = kDevicesVersion;
  data["devices"] = std::move(devices);
  return data;
}

ordered_json DevicesData(const std::vector<device::Listed>& devices) {
  ordered_json data = ordered_json::array();
  for (const device::Listed& listed : devices) {
    data.push_back(listed.description ? DescriptionData(*listed.description, nullptr)
                                      : ComplaintData(listed));
  }
  return Document(std::move(data));
}

ordered_json DeviceData(const Description& description, const std::vector<string>& grades) {
  return Document(ordered_json::array({DescriptionData(description, &grades)}));
}

string Text(const ordered_json& data) { return JsonText(data, 2) + "\n"; }

}  // namespace

string DevicesJson(const std::vector<device::Listed>& devices) {
  return Text(DevicesData(devices));
}

string DeviceJson(const Description& description, const std::vector<string>& grades) {
  return Text(DeviceData(description, grades));
}

string DevicesTcl(const std::vector<device::Listed>& devices) {
  return TclDict(DevicesData(devices));
}

string DeviceTcl(const Description& description, const std::vector<string>& grades) {
  return TclDict(DeviceData(description, grades));
}

}  // namespace planner::report
