// What a row of a table of answers says of one, and how such a table tells what is off.
#ifndef VORKEL_PLANNER_REPORT_CELLS_H_
#define VORKEL_PLANNER_REPORT_CELLS_H_

#include <optional>
#include <string>
#include <vector>

#include "planner/Answer.h"
#include "planner/report/Style.h"
#include "planner/report/Table.h"

namespace planner::report {

// "-" stands for what there is not, or is not known.
std::string BandwidthCell(const Answer& answer);
std::string VcoCell(const Answer& answer);  // MHz
std::string PpmCell(const Answer& answer);  // the largest error of a frequency
std::string JitterCell(const std::optional<double>& jitter);
// Who answers with these settings: "engine", "search" or "both".
std::string SourceCell(const Answer& answer);

// What of an answer is not as asked for or out of the device's range: of "frequency", "phase",
// "duty", "jitter" and "range" those that are so.
std::vector<std::string> OffWords(const Answer& answer);

// A row of a table of answers, whose last column tells what is off.
struct MarkedRow {
  std::string name;                // of the answer, where the table has no room
  std::vector<std::string> cells;  // without the last one
  std::string before;              // before the mark, such as "best, but "
  std::string otherwise;           // the last cell where nothing is off
  std::vector<std::string> off;    // see OffWords
};

// A table of some answers, of which the first is the best: its row is coloured when nothing of it
// is off. Of the others only the marks are: to be off can be a fair price for something else. A
// mark is such as "phase OFF"; where that would be too wide it is OFF, and a line below the table
// says what is.
std::string MarkedTable(const Style& style, std::vector<Column> columns, const std::string& heading,
                        const std::vector<MarkedRow>& rows);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_CELLS_H_
