// What is wrong with a call, and with files, as data: for scripts, which get it with the error.
//
// Tested by error_data_test.cpp.
#ifndef VORKEL_PLANNER_REPORT_ERRORDATA_H_
#define VORKEL_PLANNER_REPORT_ERRORDATA_H_

#include <nlohmann/json_fwd.hpp>
#include <string>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/device/Catalogue.h"
#include "planner/device/Check.h"
#include "planner/read/Mistake.h"
#include "planner/verify/Verify.h"

namespace planner::report {

// `kind`, `entry`, `index`, `key`, `text`, `known` and `message`.
nlohmann::ordered_json MistakeData(const read::Mistake& mistake);
// `kind`, `entry`, `text`, `known` and `message`.
nlohmann::ordered_json PartErrorData(const device::PartError& error);
// Of an answer that is not solved: `primitive`, `message` and `refusals`, which are findings.
nlohmann::ordered_json RefusedData(const Answer& answer, const Device& device);
// `file`, `usable`, `mistakes`, `untold`, `warnings` and `grades`.
nlohmann::ordered_json CheckData(const device::Checked& checked, const std::string& file);
// `path`, `found`, `expected`, `line`, `column` and `message`.
nlohmann::ordered_json DiscrepancyData(const verify::Discrepancy& discrepancy,
                                       const std::string& file);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_ERRORDATA_H_
