// A document held against how it would have to stand there.
//
// Tested by difference_test.cpp.
#ifndef VORKEL_PLANNER_VERIFY_DIFFERENCE_H_
#define VORKEL_PLANNER_VERIFY_DIFFERENCE_H_

#include <nlohmann/json_fwd.hpp>
#include <optional>
#include <string>
#include <vector>

#include "hardware/Exact.h"
#include "planner/read/Tree.h"
#include "planner/verify/Verify.h"

namespace planner::verify {

using Discrepancies = std::vector<Discrepancy>;

// A number as a document has it, exactly; nothing for one with more digits or a larger exponent
// than a double has.
std::optional<hardware::Rational> NumberOf(const std::string& text);

// A value as it stands in a document; of an object and an array only what it is.
std::string Shown(const read::Node& node);
std::string Shown(const nlohmann::ordered_json& value);

// A discrepancy at a node.
Discrepancy At(const read::Node& node, DiscrepancyKind kind, std::string path,
               std::string expected);

// Adds what differs. A number is right when a reader of JSON takes it for the expected double.
void Differ(const nlohmann::ordered_json& expected, const read::Node& found,
            const std::string& path, Discrepancies* discrepancies);

}  // namespace planner::verify

#endif  // VORKEL_PLANNER_VERIFY_DIFFERENCE_H_
