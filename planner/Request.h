// What a user asks for: input clocks, output clocks with their demands, and how to choose.
#ifndef VORKEL_PLANNER_REQUEST_H_
#define VORKEL_PLANNER_REQUEST_H_

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "hardware/Exact.h"
#include "hardware/Primitive.h"

namespace planner {

using hardware::Bandwidth;
using hardware::Primitive;
using hardware::Range;
using hardware::Rational;

// By what settings that meet all demands are ranked: the least jitter, the smallest error, the
// largest margin to the device's limits, or the lowest VCO (with prefer_max_vco the highest).
enum class Rank { kJitter, kError, kMargin, kVco };

// Outputs, used and unused, of a request.
inline constexpr std::size_t kMostPlaces = 7;

// One requested output.
struct Output {
  bool used = true;    // false: the place stays empty, and nothing else of it counts
  Rational frequency;  // MHz, above 0
  // false: nobody asked for the frequency; settings that are evaluated make it, exactly, and no
  // error of it is told.
  bool asked = true;
  std::optional<Rational> phase;  // degrees, -360 to 360
  std::optional<Rational> duty;   // percent, above 0 and up to 100
  // How far each may be off, either way; where not given, that of the request.
  std::optional<Rational> tolerance;        // ppm
  std::optional<Rational> phase_tolerance;  // degrees
  std::optional<Rational> duty_tolerance;   // percent points
  std::optional<Rational> max_jitter;       // ps, peak to peak
  bool operator==(const Output&) const = default;
};

struct Request {
  std::vector<Rational> inputs;  // one or two, MHz, above 0
  std::vector<Output> outputs;   // one to seven, at least one of them used
  Rational input_jitter = 0;     // ps, peak to peak
  // How far the inputs can be from their frequencies over temperature and age, ppm either way, 0 to
  // 100,000. Settings have to keep every limit of the device with all that the inputs can be;
  // demands are made of what the frequencies as they stand here make.
  Rational input_tolerance = 0;

  Rational tolerance = 100;                   // ppm
  Rational phase_tolerance = Rational(1, 2);  // degrees
  Rational duty_tolerance = Rational(1, 2);   // percent points
  std::optional<Rational> max_jitter;         // ps, peak to peak

  std::optional<Bandwidth> bandwidth;  // the only one to look at
  std::optional<Primitive> primitive;  // likewise
  bool feedback = false;               // a KRU_SP must have its feedback connected
  bool whole_divider_0 = false;        // no fraction of M or of the divider of output 0
  bool prefer_max_vco = false;
  bool any_order = false;    // outputs may change places
  bool engine_only = false;  // only what the design flow's own search answers
  Rank rank = Rank::kJitter;

  // The effective demands of an output.
  const Rational& ToleranceOf(const Output& output) const {
    return output.tolerance ? *output.tolerance : tolerance;
  }
  const Rational& PhaseToleranceOf(const Output& output) const {
    return output.phase_tolerance ? *output.phase_tolerance : phase_tolerance;
  }
  const Rational& DutyToleranceOf(const Output& output) const {
    return output.duty_tolerance ? *output.duty_tolerance : duty_tolerance;
  }
  const std::optional<Rational>& MaxJitterOf(const Output& output) const {
    return output.max_jitter ? output.max_jitter : max_jitter;
  }
  std::size_t CountOfUsed() const {
    std::size_t count = 0;
    for (const Output& output : outputs) count += output.used ? 1 : 0;
    return count;
  }
  // Whether some used output asks for a phase or a duty cycle.
  bool AsksForShape() const {
    for (const Output& output : outputs) {
      if (output.used && (output.phase || output.duty)) return true;
    }
    return false;
  }
};

}  // namespace planner

#endif  // VORKEL_PLANNER_REQUEST_H_
