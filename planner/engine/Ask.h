// What the design flow's own search makes of a request.
//
// The search knows no more than lists of frequencies, phases and duty cycles and a few switches.
// A request leaves some of these open; each way to fill them in is a variant of the search.
//
// The engine runs on objects of this folder's, made for each run and freed after it. Runs of several
// threads share nothing that changes.
//
// Tested by ask_test.cpp.
#ifndef VORKEL_PLANNER_ENGINE_ASK_H_
#define VORKEL_PLANNER_ENGINE_ASK_H_

#include <string>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"

namespace planner::engine {

// A way to ask the engine. What a primitive does not have is not looked at.
struct Variant {
  std::string name = {};  // "smallest VCO"; empty when there is nothing to tell apart
  Bandwidth bandwidth = Bandwidth::kOptimized;
  bool closest = false;         // choose by phases and duty cycles, even if there are none
  bool prefer_max_vco = false;  // of several, the one with the largest VCO
  bool whole_divider_0 = false;
  bool feedback = false;  // of a KRU_SP
  bool operator==(const Variant&) const = default;
};

// The variant that takes the request as it stands: OPTIMIZED when no bandwidth is named.
Variant AsRequested(const Request& request);
// All that it leaves open for a primitive, in the order in which they are tried.
std::vector<Variant> Variants(const Request& request, Primitive primitive);

// What the engine makes of a request: settings, which are judged as all others are (see
// answer/Evaluate.h), and what it counted with; or one answer that is not solved, whose refusals
// say why. The device has the primitive: std::invalid_argument when not.
//
// With `trace` the engine tells its steps on the standard output of the process.
Answer AskOne(const Request& request, const Device& device, Primitive primitive,
              const Variant& variant, bool trace = false);

// The answers of all variants, in their order; the same settings come once. Where nothing is
// found there is one answer without a variant, which says why.
std::vector<Answer> Ask(const Request& request, const Device& device, Primitive primitive);

}  // namespace planner::engine

#endif  // VORKEL_PLANNER_ENGINE_ASK_H_
