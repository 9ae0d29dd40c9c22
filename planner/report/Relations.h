// How the clocks of an answer relate, as text and as data: doc/relations.md describes both, and
// doc/relations.schema.json is the schema of the JSON.
//
// Tested by relations_text_test.cpp and relations_data_test.cpp.
#ifndef VORKEL_PLANNER_REPORT_RELATIONS_H_
#define VORKEL_PLANNER_REPORT_RELATIONS_H_

#include <string>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/relations/Relations.h"
#include "planner/report/Style.h"

namespace planner::report {

// Counts up when an entry goes, is added, or changes its meaning or type.
inline constexpr int kRelationsVersion = 1;

// What a clock is called in constraints and data: "clk_in1", "clk_out0", and with two inputs
// "clk_out0_in2".
std::string ClockName(const Request& request, const relations::Clock& clock);

// The relations of an answer that is solved.
std::string RelationsText(const Request& request, const Device& device, const Answer& answer,
                          const relations::Rule& rule, const Style& style);
std::string RelationsJson(const Request& request, const Device& device, const Answer& answer,
                          const relations::Rule& rule);
// The same as a Tcl dict. What is null in JSON is empty here.
std::string RelationsTcl(const Request& request, const Device& device, const Answer& answer,
                         const relations::Rule& rule);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_RELATIONS_H_
