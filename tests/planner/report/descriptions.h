// A device as a file describes it: one with a PLL in two grades.
#ifndef VORKEL_TESTS_PLANNER_REPORT_DESCRIPTIONS_H_
#define VORKEL_TESTS_PLANNER_REPORT_DESCRIPTIONS_H_

#include <algorithm>
#include <cstddef>
#include <string>
#include <string_view>

#include "planner/device/Describe.h"

namespace planner::report {

// The value of a decimal such as "3.125".
inline hardware::Rational ValueOf(const std::string& text) {
  std::string digits = text;
  const std::size_t point = digits.find('.');
  if (point == std::string::npos) return hardware::Rational::FromDecimal(digits, 0);
  digits.erase(point, 1);
  return hardware::Rational::FromDecimal(digits, -static_cast<int>(text.size() - point - 1));
}

// Limits stand in the order of the keywords.
inline void SetLimit(device::Description* description, std::string_view grade,
                     std::string_view keyword, const std::string& text, unsigned line = 0) {
  for (device::GradeDescription& one : description->grades) {
    if (one.name != grade) continue;
    for (device::Limit& limit : one.limits) {
      if (limit.keyword != keyword) continue;
      limit.value = ValueOf(text);
      limit.text = text;
      return;
    }
    for (const device::Keyword& known : device::Keywords()) {
      if (known.name == keyword) one.limits.push_back({known.name, ValueOf(text), text, line});
    }
    const auto place = [](const device::Limit& limit) {
      const auto& all = device::Keywords();
      return std::find_if(all.begin(), all.end(),
                          [&](const auto& known) { return known.name == limit.keyword; });
    };
    std::sort(one.limits.begin(), one.limits.end(),
              [&](const auto& a, const auto& b) { return place(a) < place(b); });
  }
}

inline device::Description Round() {
  device::Description description;
  description.name = "round";
  description.about = "A device of tests";
  description.file = "/d/round.toml";
  description.packages = {"p1", "p2"};
  description.default_package = "p2";
  description.default_grade = "b";
  for (const char* grade : {"a", "b"}) {
    description.grades.push_back({grade, {}, {Primitive::kPll}, true, false});
    const bool is_fast = description.grades.size() == 2;
    unsigned line = is_fast ? 20 : 10;
    const auto set = [&](std::string_view keyword, const std::string& text) {
      SetLimit(&description, grade, keyword, text, line++);
    };
    set("O_MAX_HT_LT", "64");
    set("VCOCLK_FREQ_MIN", "400");
    set("VCOCLK_FREQ_MAX", is_fast ? "1000" : "900");
    set("CLKOUT_FREQ_MIN_GCLK", "3.125");
    set("CLKOUT_FREQ_MAX_GCLK", "400");
    set("CLKOUT_FREQ_MAX_IOCLK", "1000");
    set("CLKPFD_FREQ_MIN", "19");
    set("CLKPFD_FREQ_MAX", is_fast ? "500" : "250");
  }
  return description;
}

}  // namespace planner::report

#endif  // VORKEL_TESTS_PLANNER_REPORT_DESCRIPTIONS_H_
