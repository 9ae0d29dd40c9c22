// Requests in TOML, with the entries of those in JSON (RequestJson.h):
//
//     device = "vk40"
//     inputs = ["27MHz"]
//     tolerance = "20ppm"
//     outputs = [148.5, {frequency = "74.25MHz", phase = 90}, 27]
//
// Tested by request_toml_test.cpp.
#ifndef VORKEL_PLANNER_READ_REQUESTTOML_H_
#define VORKEL_PLANNER_READ_REQUESTTOML_H_

#include <string_view>

#include "planner/read/Draft.h"

namespace planner::read {

// Like ReadJson.
Draft ReadToml(std::string_view text, std::string_view file, Mistakes* mistakes);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_REQUESTTOML_H_
