// Whether there are settings that meet all demands and keep all limits, and whether there would be
// without some of them.
//
// This is asked thousands of times for one request, when an explanation looks for the smallest sets
// of demands and limits that do not go together. So a question that has a "yes" ends with the first
// settings that are found, and a "no" comes from intervals: the demands of an output leave, for
// each of its dividers, an interval of the VCO; where those of all outputs meet, M / D has to be.
//
// Tested by within_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_WITHIN_H_
#define VORKEL_PLANNER_SEARCH_WITHIN_H_

#include <array>
#include <memory>
#include <optional>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"

namespace planner::search {

inline constexpr int kMostOutputs = 7;

// How far the ranges of M, D and the dividers go that do not count: from 1 to this. What lies
// beyond is not looked at.
inline constexpr int kRelaxedM = 1024;
inline constexpr int kRelaxedD = 1024;
inline constexpr int kRelaxedDivider = 1024;

// The demands of the request and the limits of the hardware that do not count.
struct Relaxed {
  struct OfOutput {
    bool frequency = false;  // it can have any frequency
    bool phase = false;      // and any phase,
    bool duty = false;       // any duty cycle
    bool jitter = false;     // and any jitter
    bool range = false;      // also outside of the device's range for this output
    bool operator==(const OfOutput&) const = default;
  };
  std::array<OfOutput, kMostOutputs> outputs{};  // by the index in the request

  // Of a PLL or a TSYN.
  bool vco = false;           // the range of the VCO
  bool pfd = false;           // the range of the PFD
  bool bandwidth = false;     // the bandwidth that the request names
  bool second_input = false;  // what the second input makes
  // That M and dividers are whole: they can be in eighths, also with a PLL, with six outputs and
  // more, and for each output.
  bool whole = false;
  bool nothing_moves = false;  // that beside a fraction phases are 0 and duty cycles 50 percent

  // Of all primitives: what the inputs can be beside their frequencies.
  bool input_tolerance = false;

  // Likewise: whole numbers (of M and dividers eighths, where there are fractions) from 1
  // to kRelaxedM, kRelaxedD and kRelaxedDivider in place of what the hardware has. Of a KRU
  // `dividers` is the divide of CLKDV, any half from 1, or of CLKFXDV, any whole number.
  bool m = false;
  bool d = false;
  bool dividers = false;

  // Of a KRU_SP: that the request wants the feedback connected.
  bool feedback = false;

  bool operator==(const Relaxed&) const = default;
};

// A request to one primitive of a device, prepared for many questions. Keeps what it needs of both.
// May be asked from several threads at once.
class Within {
 public:
  // `like` was made for the same primitive, or is null: what is the same there is prepared once.
  Within(const Request& request, const Device& device, Primitive primitive,
         const Within* like = nullptr);
  ~Within();

  // Whether settings meet all demands and keep all limits, but for those that do not count.
  bool Exists(const Relaxed& relaxed = {}) const;
  // Such settings: the first that are found, not the best; always the same for the same question.
  // With relaxed ranges they can be beyond what planner::answer::Evaluate takes as hardware.
  std::optional<Settings> Find(const Relaxed& relaxed = {}) const;

 private:
  struct Implementation;
  std::unique_ptr<const Implementation> implementation_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_WITHIN_H_
