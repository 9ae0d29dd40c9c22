// What there is to say beside numbers: limits that are broken, demands that are not met, notes,
// conflicts and proposals. Findings are data; report/ makes sentences of them.
#ifndef VORKEL_PLANNER_FINDING_H_
#define VORKEL_PLANNER_FINDING_H_

#include <optional>
#include <string>
#include <vector>

#include "planner/Request.h"

namespace planner {

// What a finding is about.
enum class Quantity { kNone, kVco, kPfd, kFrequency, kPhase, kDuty, kJitter, kDivider };

enum class FindingKind {
  // Limits of the device that settings break.
  kOutsideLimit,     // quantity, value and range, MHz; input, and output of a frequency
  kDividerTooLarge,  // output; value: the divider; range.highest: the largest high or low time
  // Demands that settings do not meet.
  kOffTarget,  // quantity, output; value: the error; range.highest: what is allowed
  // What a user should know beside that.
  kSearchedVco,          // with two inputs: the engine counted with a VCO of `value` MHz
  kSearchedFrequencies,  // the engine counted with other frequencies (numbers, MHz)
  kNothingMoves,         // beside a fraction, all phases are 0 and all duty cycles 50 %
  kPreferMaxVcoUnused,   // the engine counts it only with a phase or a duty cycle
  kWholeDividerUnused,   // a PLL has no fractions
  kOutput0Phase,         // a KRU_CLKGEN has output 0 on CLKFX whatever its phase
  kBandwidthUnused,      // a KRU has no bandwidth
  kInputJitterPasses,    // a KRU passes the jitter of the input on: value, ps
  kNoJitter,             // no jitter of `outputs`, or of all when empty: text says why, or
                         // nothing when the device has no coefficients
  kNoPhaseError,         // no phase error: likewise
  kMoved,                // any_order: outputs[i] tells which output of the request stands at
                         // place i; the whole answer goes by places (answer/Moved.h)
  // Why a primitive has no settings.
  kTooManyInputs,  // value of them, range.highest allowed
  kTooManyOutputs,
  kUnsolved,    // the engine's own sentence: text
  kNoSettings,  // no settings keep the device's limits
};

struct Finding {
  FindingKind kind;
  std::optional<Primitive> primitive = {};
  Quantity quantity = Quantity::kNone;
  int output = -1;  // the index in the request; -1: none
  int input = 0;    // 0 or 1
  // Of kOutsideLimit with a tolerance of the input: by how much this is off where the limit is
  // broken, ppm; `value` is what it is there.
  Rational corner = 0;
  Rational value = 0;
  Range range{0, 0};
  std::string pin = {};      // of a KRU: whose range it is
  bool feedback_2x = false;  // and that it is the one with feedback from CLK2X
  std::vector<int> outputs = {};
  std::vector<Rational> numbers = {};
  std::string text = {};  // words of others: the engine, the calculator
};

}  // namespace planner

#endif  // VORKEL_PLANNER_FINDING_H_
