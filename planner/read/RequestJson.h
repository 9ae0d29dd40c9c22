// Requests in JSON:
//
//     {"device": "vk40", "inputs": ["27MHz"],
//      "outputs": [148.5, {"frequency": "74.25MHz", "phase": 90, "duty": "50%",
//                          "tolerance": 20, "phase_tolerance": 1, "duty_tolerance": 1,
//                          "max_jitter": "150ps"}, "-"],
//      "input_jitter": 50, "bandwidth": "LOW", "primitive": "TSYN", "rank": "jitter",
//      "tolerance": "50ppm", "phase_tolerance": 0.5, "duty_tolerance": 0.5, "max_jitter": 200,
//      "exact": false, "feedback": false, "prefer_max_vco": false, "int_div0": false,
//      "engine": false, "any_order": false}
//
// Numbers are taken as their decimals stand there. A request in TOML has the same entries.
//
// Tested by request_json_test.cpp.
#ifndef VORKEL_PLANNER_READ_REQUESTJSON_H_
#define VORKEL_PLANNER_READ_REQUESTJSON_H_

#include <string_view>

#include "planner/read/Draft.h"

namespace planner::read {

// What a text says. `file` names it in places. All that is wrong in it is added to `mistakes`, in
// the order in which it stands there; of a text that is no JSON the first thing.
Draft ReadJson(std::string_view text, std::string_view file, Mistakes* mistakes);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_REQUESTJSON_H_
