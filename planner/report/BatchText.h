// What becomes of the lines of a batch: as lines of JSON, as rows for a spreadsheet, and in
// numbers. doc/batch.md describes them.
//
// Tested by batch_text_test.cpp and batch.test.
#ifndef VORKEL_PLANNER_REPORT_BATCHTEXT_H_
#define VORKEL_PLANNER_REPORT_BATCHTEXT_H_

#include <cstddef>
#include <string>

#include "planner/batch/Outcome.h"
#include "planner/report/Style.h"

namespace planner::report {

struct BatchForm {
  bool csv = false;
  bool all = false;         // all candidates, not only the best
  std::size_t longest = 0;  // the bytes that a line can have at most, for who has more
};

// An outcome as one line of JSON, or as a row for each output; with the ends of the lines.
std::string BatchLines(const batch::Outcome& outcome, const BatchForm& form);
// What comes before the first of them: the names of the columns.
std::string BatchHeading(const BatchForm& form);

// A line that a process has died of, twice.
std::string DiedText();

// How many lines became what, as a table, and the first of each kind that are not within.
std::string BatchSummary(const batch::Counts& counts, const Style& style);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_BATCHTEXT_H_
