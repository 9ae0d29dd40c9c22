// What constraints say of data between clocks.
//
// A timing tool takes all clocks as related and gives each path the tightest gap between launching
// and capturing edges. That is right for what one primitive makes of one input, and where it is
// not, it asks too much and never too little. So nothing is relaxed unless the user says that it
// may be: a false path that is none hides an error until the design fails in the field, a gap that
// is too small shows in the first report. What may be said is there as comments.
#ifndef VORKEL_PLANNER_REPORT_SDCCROSSINGS_H_
#define VORKEL_PLANNER_REPORT_SDCCROSSINGS_H_

#include <string>

#include "planner/Answer.h"
#include "planner/Request.h"
#include "planner/report/Sdc.h"

namespace planner::report {

// How much nearer than their clocks say the edges of two clocks can be: of input and output half of
// the jitter of each and the phase error of the primitive; of two pins of a KRU half of the jitter
// of each. The outputs of a loop have their jitter from the same VCO and share it, as the edges of
// one clock do. Empty when there is nothing to say.
std::string SdcInterclockUncertainties(const Request& request, const Answer& answer);

// The crossings that cannot be timed, and what to say of them.
std::string SdcCrossings(const Request& request, const Answer& answer, const SdcOptions& options);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_SDCCROSSINGS_H_
