// Findings as sentences. This is the only place that makes them; nothing reads them back.
#ifndef VORKEL_PLANNER_REPORT_FINDINGTEXT_H_
#define VORKEL_PLANNER_REPORT_FINDINGTEXT_H_

#include <string>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Finding.h"

namespace planner::report {

// What a finding says, without a full stop at its end but where the sentence is the engine's.
// `answer` is the one that it is about, where there is one.
std::string FindingText(const Finding& finding, const Device& device,
                        const Answer* answer = nullptr);

// All of them in their order; the figures that there are not for the same reason are one sentence.
std::vector<std::string> FindingTexts(const std::vector<Finding>& findings, const Device& device,
                                      const Answer& answer);

// What of the outputs of an answer is not as asked for, a sentence for each of them.
std::vector<std::string> MissTexts(const Answer& answer);

// The miss that weighs most, in units of its tolerance, and how many other outputs miss something.
// The answer misses something.
std::string WorstMissText(const Answer& answer);

// All that a user should know about an answer: what is not as asked for, what is outside of the
// device's limits, and the notes.
std::vector<std::string> RemarkTexts(const Answer& answer, const Device& device);

// Why an answer is not solved.
std::string RefusalText(const Answer& answer, const Device& device);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_FINDINGTEXT_H_
