// One run of the engine: numbers in, settings out.
//
// The engine takes its requests as texts of decimal numbers and counts with doubles. A Rational
// goes to it as the double that is nearest, with all 17 digits. Outputs that are not used are left
// out of its lists, and put back into what it answers.
//
// Tested by run_test.cpp.
#ifndef VORKEL_PLANNER_ENGINE_RUN_H_
#define VORKEL_PLANNER_ENGINE_RUN_H_

#include <string>
#include <variant>
#include <vector>

#include "planner/Device.h"
#include "planner/Settings.h"
#include "planner/answer/Evaluate.h"
#include "planner/engine/Ask.h"

namespace planner::engine {

// What the engine has found, and what it counted with; or the sentence with which it refuses.
struct Found {
  Settings settings;
  answer::Searched searched;
};
struct Refused {
  std::string sentence;
};
using Outcome = std::variant<Found, Refused>;

// A PLL or a TSYN that the device has.
Outcome RunLoop(const Request& request, const Device& device, Primitive primitive,
                const Variant& variant, bool trace);

// A variant without what makes no difference to the run of a PLL or a TSYN: variants that are then
// the same have the same outcome, but for the bandwidth of the settings.
Variant Effective(const Request& request, const Device& device, Primitive primitive,
                  const Variant& variant);

// A KRU that the device has; with one phase for each output of the request, of which those of
// unused ones do not count.
Outcome RunKru(const Request& request, const Device& device, Primitive primitive,
               const Variant& variant, const std::vector<double>& phases, bool trace);

}  // namespace planner::engine

#endif  // VORKEL_PLANNER_ENGINE_RUN_H_
