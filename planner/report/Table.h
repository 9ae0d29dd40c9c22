// Tables and prose for a terminal. Every line ends in a newline and has no blanks before it.
#ifndef VORKEL_PLANNER_REPORT_TABLE_H_
#define VORKEL_PLANNER_REPORT_TABLE_H_

#include <string>
#include <utility>
#include <vector>

#include "planner/report/Colour.h"
#include "planner/report/Style.h"

namespace planner::report {

enum class Align { kLeft, kRight };

struct Column {
  Align align;
  std::string heading;
};

struct Row {
  std::vector<std::string> cells;  // one for each column
  Role role = Role::kNone;         // of the whole row
  Role last = Role::kNone;         // of its last cell, where the row has none
};

using Pairs = std::vector<std::pair<std::string, std::string>>;

// A table, with its headings.
std::string TableText(const Style& style, const std::vector<Column>& columns,
                      const std::vector<Row>& rows);
// How many columns of a terminal it takes.
int TableWidth(const std::vector<Column>& columns, const std::vector<Row>& rows);

// The same where it fits. Else the texts of the first column have lines of their own, above the
// rest of their rows.
std::string FittedTable(const Style& style, const std::vector<Column>& columns,
                        const std::vector<Row>& rows);

// Labels and their values, a line for each, with the values below each other.
std::string PairsText(const Pairs& pairs);

// Words, in lines of at most so many letters; a longer word has a line of its own. Without a
// newline at the end.
std::string Filled(const std::string& words, int width);

// A label and its value behind a column of labels, broken where it would be too wide.
std::string Labelled(const Style& style, int label_width, const std::string& label,
                     const std::string& value);

// A sentence behind a label, broken where it would be too wide, with the further lines indented.
std::string Prose(const Style& style, const std::string& label, const std::string& sentence);

// Sentences, broken where they would be too wide.
std::string Paragraph(const Style& style, const std::string& sentences);

// Labels and what they mean, each line indented, with the meanings below each other and broken
// where they would be too wide.
std::string Described(const Style& style, const Pairs& lines);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_TABLE_H_
