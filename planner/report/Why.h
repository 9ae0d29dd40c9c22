// Why one answer ranks before another, in words.
#ifndef VORKEL_PLANNER_REPORT_WHY_H_
#define VORKEL_PLANNER_REPORT_WHY_H_

#include <string>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/answer/Rank.h"
#include "planner/plan/Plan.h"

namespace planner::report {

// With a larger error of a frequency, ppm, there is nothing near what was asked for.
inline constexpr int kFarPpm = 100000;

// Why the first of a solved plan is the first: before other primitives, and before the other
// settings of its own.
std::string WhyText(const plan::Plan& plan, const Device& device);

// By what answers to a request that meet all demands are ranked: "least jitter, then smallest
// error, then lowest VCO".
std::string OrderWords(const Request& request);

// What an answer lacks beside a better one, as the end of a sentence: "with 15.779 ps more jitter,
// 144.594 ps", "but output 0: the frequency is off by ...". `decided` is why it is behind.
std::string LossText(const Request& request, const Device& device, const Answer& better,
                     const Answer& answer, answer::Criterion decided);

// The same in a few words, for the cell of a table: "15.779 ps more".
std::string LossCell(const Answer& better, const Answer& answer, answer::Criterion decided);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_WHY_H_
