// Tested by csv_test.cpp.
#include "planner/report/Csv.h"

#include <nlohmann/json.hpp>

namespace planner::report {

std::string CsvRow(const std::vector<std::string>& cells) {
  std::string row;
  for (const std::string& cell : cells) {
    if (&cell != &cells.front()) row += ',';
    if (cell.find_first_of(",\"\r\n") == std::string::npos) {
      row += cell;
      continue;
    }
    row += '"';
    for (const char letter : cell) {
      if (letter == '"') row += '"';
      row += letter;
    }
    row += '"';
  }
  return row + "\r\n";
}

std::string CsvNumber(double value) {
  std::string text = nlohmann::json(value).dump();
  // A whole number has no decimals.
  if (text.size() > 2 && text.compare(text.size() - 2, 2, ".0") == 0) text.resize(text.size() - 2);
  return text == "-0" ? "0" : text;
}

}  // namespace planner::report
