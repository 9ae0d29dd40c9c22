// Settings of the user's own: from options, or from the answer of a plan in JSON that may have been
// edited. Of such a plan the settings count, and its request; all its figures do not.
//
// What a primitive cannot be set to is a mistake that says what it can; that settings break a
// limit of the device is none, the judge of settings tells that.
//
// Tested by settings_test.cpp.
#ifndef VORKEL_PLANNER_READ_SETTINGS_H_
#define VORKEL_PLANNER_READ_SETTINGS_H_

#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "planner/Device.h"
#include "planner/Settings.h"
#include "planner/read/Draft.h"
#include "planner/read/Options.h"

namespace planner::read {

// The options of settings, beside --primitive, --bandwidth and --feedback, which requests have,
// too.
std::span<const OptionFacts> SettingOptions();
const OptionFacts* FindSettingOption(std::string_view name);

// What one source says of settings. A number is as it is written: M 41.625.
struct SettingsDraft {
  Entry<Primitive> primitive;
  Entry<Bandwidth> bandwidth;
  Entry<bool> feedback;
  Entry<Rational> m;
  Entry<Rational> d;
  Entry<Values> dividers;     // of each output, nothing for an unused one; of a KRU one value, that
                              // of CLKDV or CLKFXDV
  Entry<Values> phase_steps;  // eighths of a VCO period
  Entry<Values> phases;       // the same in degrees
  Entry<Values> high_times;   // halves of a VCO period
  Entry<Values> duties;       // the same in percent
  Entry<std::vector<std::string>> pins;  // "-" for an unused output
  Entry<bool> divide_by_2;
  Entry<Rational> phase_shift;
};

// Reads those of the options that are of settings; the others are passed over.
SettingsDraft ReadSettingOptions(std::span<const Option> options, Mistakes* mistakes);

struct PlanFile {
  Draft request;
  SettingsDraft settings;
};
// The answer with a number of a plan in JSON, or the first.
PlanFile ReadPlan(std::string_view text, std::string_view file, std::optional<int> number,
                  Mistakes* mistakes);

// What `options` say, and of the rest what `file` says.
SettingsDraft Over(const SettingsDraft& options, const SettingsDraft& file);

// The primitive of settings: the one that is named; with pins a KRU_CLKGEN where CLKFXDV is among
// them, else a KRU_SP; else a TSYN, or a PLL where the device has none.
Primitive PrimitiveOf(const Draft& draft, const SettingsDraft& settings, const Device& device);

// Settings and the request that they are to be compared with. Where no outputs were asked for, it
// has those that the settings make, which are not `asked`.
struct Evaluation {
  Reading reading;
  Settings settings;
};
// The device must have the primitive (PrimitiveOf). What is wrong is added to `mistakes`, and there
// is none then.
std::optional<Evaluation> FinishEvaluation(const Draft& draft, const SettingsDraft& settings,
                                           const Device& device, Mistakes* mistakes);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_SETTINGS_H_
