// Frequencies that an output can have, as data.
#ifndef VORKEL_PLANNER_REPORT_REACHDATA_H_
#define VORKEL_PLANNER_REPORT_REACHDATA_H_

#include <nlohmann/json_fwd.hpp>
#include <string>
#include <vector>

#include "planner/report/ReachText.h"

namespace planner::report {

// What stands before the primitives.
nlohmann::ordered_json ReachHead(const Request& request, const Device& device,
                                 const ReachQuestion& question);
// A frequency with its settings; `near` with its distance from that one.
nlohmann::ordered_json PointData(const reach::Reach& reach, const Request& request,
                                 const reach::Point& point, const Rational* near);
nlohmann::ordered_json GapData(const reach::Reach& reach, const Request& request,
                               const reach::Gap& gap);
nlohmann::ordered_json CountData(const reach::Reach& reach, const reach::Counted& counted);

// The names of the columns, and a row, of what is asked for.
std::vector<std::string> ReachColumns(ReachQuestion::Kind kind);
std::vector<std::string> PointCells(const reach::Reach& reach, const Request& request,
                                    const reach::Point& point, const Rational* near);
std::vector<std::string> GapCells(const reach::Reach& reach, const reach::Gap& gap);
std::vector<std::string> CountCells(const reach::Reach& reach, const reach::Counted& counted);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_REACHDATA_H_
