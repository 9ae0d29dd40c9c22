// The judge of settings: what they make of a request, worked out exactly, however they were found.
//
// Frequencies are rationals of the inputs; "in range" includes both ends and nothing beyond them.
//
// Tested by evaluate_loop_test.cpp and evaluate_kru_test.cpp.
#ifndef VORKEL_PLANNER_ANSWER_EVALUATE_H_
#define VORKEL_PLANNER_ANSWER_EVALUATE_H_

#include <optional>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"

namespace planner::answer {

// What the engine counted with while it searched, MHz, where it says so.
struct Searched {
  std::optional<double> vco;
  std::vector<std::optional<double>> outputs;  // as many as the request has, or none at all
};

// A difference between what the engine counted with and what its settings make is told from here
// on, MHz: below it, it does not show in three decimals.
inline constexpr double kVisible = 0.0005;

// The device has the primitive of the settings, which can be set so (IsM, IsD, pins of the
// primitive); they have as many outputs as the request, and a divider or a pin for each that is
// used. Limits of the device may be broken: the answer says which.
Answer Evaluate(const Request& request, const Device& device, const Settings& settings,
                const Source& source, const Searched& searched = {});

// An answer that says why there is none.
Answer Unsolved(Primitive primitive, const Source& source, std::vector<Finding> refusals);

// Why a primitive cannot be asked at all: it has too few inputs or outputs. Empty when it can.
std::vector<Finding> Refusals(const Request& request, Primitive primitive);

}  // namespace planner::answer

#endif  // VORKEL_PLANNER_ANSWER_EVALUATE_H_
