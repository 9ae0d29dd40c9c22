// Looks for the requests that are most work for a device: climbs from drawn ones, and from some
// that are known to be a lot of work, to ones that are more.
#ifndef VORKEL_TESTS_COST_CLIMB_H_
#define VORKEL_TESTS_COST_CLIMB_H_

#include <cstdint>
#include <string>

#include "tests/compare/RequestGenerator.h"
#include "tests/cost/Device.h"

namespace cost {

// The most that a climb has found, and the request for it.
struct Summit {
  std::uint64_t work = 0;
  compare::Case drawn;
};
// With clocks below 0 a climb has such a second input, by which the VCO has no lower limit, and such
// an output 0, which a shift brings above 0.
enum class Clocks { kAboveZero, kBelowZeroToo };
// Climbs are numbered; those with an even number begin at what is known.
Summit Climb(const Device& device, int number, int steps, Clocks clocks = Clocks::kAboveZero);

// The request with most work of those that ask for phases that nothing makes, so that whatever the
// search finds is refused. All outputs are the same.
Summit AskForNoPhase(const Device& device);

}  // namespace cost

#endif  // VORKEL_TESTS_COST_CLIMB_H_
