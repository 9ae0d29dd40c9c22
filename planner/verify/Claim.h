// What an answer of a document claims to be, typed: its settings, and how its outputs stand.
//
// Tested by mutation_test.cpp.
#ifndef VORKEL_PLANNER_VERIFY_CLAIM_H_
#define VORKEL_PLANNER_VERIFY_CLAIM_H_

#include <optional>
#include <string>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"
#include "planner/read/Tree.h"
#include "planner/verify/Difference.h"
#include "planner/verify/Recompute.h"

namespace planner::verify {

struct Claim {
  const read::Node* node = nullptr;
  std::string path;  // "answers[0]"
  Primitive primitive = Primitive::kPll;
  bool solved = false;
  // Of a solved one:
  Settings settings;
  PlaceOrder order;
  bool is_engine = false;  // its source is the engine, or both
  std::string variant;
  std::optional<std::size_t> number;
  bool is_tradeoff = false;
};

// Nothing when there are no settings that can be judged: something is missing or of a wrong type,
// the device has no such primitive, or cannot be set so. All of that is among the discrepancies.
std::optional<Claim> ReadClaim(const Request& request, const Device& device, const read::Node& node,
                               const std::string& path, Discrepancies* discrepancies);

}  // namespace planner::verify

#endif  // VORKEL_PLANNER_VERIFY_CLAIM_H_
