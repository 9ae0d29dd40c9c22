// A plan as timing constraints in SDC: the clocks at the inputs, those that the primitive makes of
// them, and their uncertainty.
//
// A timing tool takes one description of a clock and refuses two beside each other, so each clock
// has the plainest that says all of it:
//   -multiply_by   a whole multiple of the input; -duty_cycle goes with it, and with nothing else
//   -divide_by     a whole part of the input, high for half of the time
//   -edges and -edge_shift
//                  all else: fractions, phases, and parts with another duty cycle
// The last are three edges of the input and how much later than these the clock rises, falls and
// rises again. The edges of a clock are counted from 1, two in each period, the input's being half
// a period apart. The first rise is in the first period of the clock, from time 0 on: some tools
// overlook gaps between clocks that rise for the first time before or after that. A delay of the
// clock (set_clock_latency) would be no phase: tools then count from the edges as if they were not
// shifted. Of a whole part of the input both rising edges are shifted by the same number, so that
// its period is exactly a multiple of the input's. Else the shift of the second has what the period
// is longer or shorter than whole periods of the input.
//
// All of it is worked out exactly and written with up to 15 decimals; comments have the ratios.
#ifndef VORKEL_PLANNER_REPORT_SDC_H_
#define VORKEL_PLANNER_REPORT_SDC_H_

#include <string>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/relations/Relations.h"

namespace planner::report {

struct SdcOptions {
  bool plain = false;  // create_clock alone, for readers that know nothing else
  // That all data between clocks whose crossing needs a FIFO or a handshake goes through one: what
  // is said of these then stands as commands, and else in comments only.
  bool fifos = false;
  relations::Rule rule;  // by which crossings are told apart
};

// The constraints of an answer that is solved. Outputs on the same pin of a KRU are one clock: a
// second one there would replace it or, added to it, have every path counted twice.
std::string Sdc(const Request& request, const Device& device, const Answer& answer,
                const SdcOptions& options = {});

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_SDC_H_
