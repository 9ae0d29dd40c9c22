// Tested by devices_text_test.cpp.
#include "planner/report/Limits.h"

#include <algorithm>
#include <string_view>
#include <vector>

#include "hardware/Loop.h"

namespace planner::report {

namespace {

Rational ValueOf(const device::GradeDescription& grade, std::string_view keyword) {
  const device::Limit* const limit = grade.Find(keyword);
  return limit == nullptr ? Rational(0) : limit->value;
}

PrimitiveRanges PllRanges(const device::GradeDescription& grade) {
  const auto value = [&](std::string_view keyword) { return ValueOf(grade, keyword); };
  PrimitiveRanges ranges;
  ranges.vco = {value("VCOCLK_FREQ_MIN"), value("VCOCLK_FREQ_MAX")};
  ranges.pfd = {value("CLKPFD_FREQ_MIN"), value("CLKPFD_FREQ_MAX")};
  ranges.pfd_low = {ranges.pfd->lowest,
                    std::min(ranges.pfd->highest, Rational(hardware::kPllLowBandwidthPfd))};
  ranges.output = {value("CLKOUT_FREQ_MIN_GCLK"), value("CLKOUT_FREQ_MAX_GCLK")};
  ranges.output_1 = {ranges.output.lowest, value("CLKOUT_FREQ_MAX_IOCLK")};
  return ranges;
}

PrimitiveRanges TsynRanges(const device::GradeDescription& grade) {
  const auto value = [&](std::string_view keyword) { return ValueOf(grade, keyword); };
  PrimitiveRanges ranges;
  ranges.vco = {value("TSYN_VCOCLK_FREQ_MIN"), value("TSYN_VCOCLK_FREQ_MAX")};
  ranges.pfd = {value("TSYN_CLKPFD_FREQ_MIN"), value("TSYN_CLKPFD_FREQ_MAX")};
  ranges.pfd_low = {ranges.pfd->lowest,
                    std::min(ranges.pfd->highest, value("TSYN_CLKPFD_FREQ_MAX_LBW"))};
  ranges.output = {value("TSYN_CLKOUT_FREQ_MIN"), value("TSYN_CLKOUT_FREQ_MAX")};
  return ranges;
}

// The limits of a KRU are periods of its pins, ns.
PrimitiveRanges KruRanges(const device::GradeDescription& grade, Primitive primitive) {
  std::vector<Rational> frequencies;
  for (const device::Keyword& keyword : device::KeywordsOf(primitive)) {
    const Rational period = ValueOf(grade, keyword.name);
    if (period > Rational(0)) frequencies.push_back(Rational(1000) / period);
  }
  PrimitiveRanges ranges;
  if (frequencies.empty()) return ranges;
  ranges.output = {*std::min_element(frequencies.begin(), frequencies.end()),
                   *std::max_element(frequencies.begin(), frequencies.end())};
  return ranges;
}

}  // namespace

const char* UnitName(device::Unit unit) {
  switch (unit) {
    case device::Unit::kMegahertz:
      return "MHz";
    case device::Unit::kNanoseconds:
      return "ns";
    case device::Unit::kCount:
      break;
  }
  return "count";
}

PrimitiveRanges RangesOf(const device::GradeDescription& grade, Primitive primitive) {
  switch (primitive) {
    case Primitive::kPll:
      return PllRanges(grade);
    case Primitive::kTsyn:
      return TsynRanges(grade);
    default:
      return KruRanges(grade, primitive);
  }
}

}  // namespace planner::report
