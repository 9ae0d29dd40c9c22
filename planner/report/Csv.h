// Rows for spreadsheets (RFC 4180).
//
// Tested by csv_test.cpp.
#ifndef VORKEL_PLANNER_REPORT_CSV_H_
#define VORKEL_PLANNER_REPORT_CSV_H_

#include <string>
#include <vector>

namespace planner::report {

// Cells with commas between them, and the end of the line: CR and LF. One that has a comma, a quote
// or an end of a line in it stands in quotes.
std::string CsvRow(const std::vector<std::string>& cells);

// A finite number with as few digits as tell it from every other double.
std::string CsvNumber(double value);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_CSV_H_
