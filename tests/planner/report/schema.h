// JSON against a JSON schema: as much of it as the schemas of the planner use.
#ifndef VORKEL_TESTS_PLANNER_REPORT_SCHEMA_H_
#define VORKEL_TESTS_PLANNER_REPORT_SCHEMA_H_

#include <nlohmann/json.hpp>
#include <string>

namespace schema {

// What of a value does not fit, the first fault; empty when all does. Throws std::runtime_error for
// a word of a schema that is not known here, which would else be passed over.
std::string FaultOf(const nlohmann::ordered_json& value, const nlohmann::ordered_json& schema);

// A schema of doc/.
nlohmann::ordered_json Load(const std::string& name);

}  // namespace schema

#endif  // VORKEL_TESTS_PLANNER_REPORT_SCHEMA_H_
