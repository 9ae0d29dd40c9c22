// What is wrong in a plan, as text; and the sentences of a document, for who holds them against it.
#ifndef VORKEL_PLANNER_REPORT_VERIFYTEXT_H_
#define VORKEL_PLANNER_REPORT_VERIFYTEXT_H_

#include <string>
#include <vector>

#include "planner/report/Style.h"
#include "planner/verify/Verify.h"

namespace planner::report {

// The sentences as Json.h writes them.
const verify::Sentences& JsonSentences();

// One discrepancy as one line without its end, beginning with its place: "FILE:12:7: ...".
std::string DiscrepancyText(const verify::Discrepancy& discrepancy, const std::string& file);

// All of them, a line each, and how many there are; or that there is none.
std::string VerifyText(const std::vector<verify::Discrepancy>& discrepancies,
                       const std::string& file, const Style& style);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_VERIFYTEXT_H_
