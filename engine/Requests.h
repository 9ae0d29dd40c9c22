// What a script asks for: one frequency, phase and duty cycle for each output.
#ifndef VORKEL_ENGINE_REQUESTS_H_
#define VORKEL_ENGINE_REQUESTS_H_

#include <array>

namespace Ip {

// Outputs of a primitive, numbered 0 to 6.
inline constexpr int MAX_OUTPUTS = 7;

using RequestList = std::array<double, MAX_OUTPUTS>;

// The lists belong to the object, not to a call: a run that fills one of them leaves the
// others as earlier calls left them, and the solvers read what is there.
struct Requests {
  RequestList reqOutFreq{};    // MHz
  RequestList reqPhase{};      // degrees
  RequestList reqDutyCycle{};  // percent
};

}  // namespace Ip

#endif  // VORKEL_ENGINE_REQUESTS_H_
