// What leaves the planner as data, with names for the outside; Json.h and TclDict.h write it.
#ifndef VORKEL_PLANNER_REPORT_DATA_H_
#define VORKEL_PLANNER_REPORT_DATA_H_

#include <cstddef>
#include <nlohmann/json_fwd.hpp>
#include <string>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Finding.h"
#include "planner/Request.h"

namespace planner::report {

// An empty object with room for so many members: where it grows beyond, all that is in it is copied.
nlohmann::ordered_json ObjectOf(std::size_t members);

// A number as a double, and exactly under the name with "_exact" behind it.
void AddExact(nlohmann::ordered_json* object, const std::string& name, const Rational& value);

// A number as a request file has it: as a number when its decimals are short enough for every
// reader, else as a text such as "100/3".
nlohmann::ordered_json WrittenNumber(const Rational& value);

// A range with both ends, doubles and exact.
nlohmann::ordered_json RangeData(const Range& range);

// A request as a request file has it. What was not asked for is left out.
nlohmann::ordered_json RequestData(const Request& request, const Device& device);

// A finding: its kind, what it is about, its numbers, and the sentence. `answer` is the one that it
// is about, where there is one.
nlohmann::ordered_json FindingData(const Finding& finding, const Device& device,
                                   const Answer* answer = nullptr);

// Adds the members of an answer to an object, without what it is there for.
inline constexpr std::size_t kMembersOfAnswer = 27;  // at most
void AddAnswer(nlohmann::ordered_json* data, const Request& request, const Device& device,
               const Answer& answer);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_DATA_H_
