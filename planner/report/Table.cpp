// Tested by table_test.cpp.
#include "planner/report/Table.h"

#include <algorithm>
#include <cstddef>
#include <string_view>

namespace planner::report {

namespace {

constexpr std::string_view kGap = "  ";

// The letters of a text in UTF-8: all bytes but those that go on with a letter.
int Length(std::string_view text) {
  return static_cast<int>(std::count_if(text.begin(), text.end(), [](char byte) {
    return (static_cast<unsigned char>(byte) & 0xC0U) != 0x80U;
  }));
}

std::string Padded(const std::string& text, int width, Align align) {
  const auto missing = static_cast<std::size_t>(std::max(0, width - Length(text)));
  return align == Align::kLeft ? text + std::string(missing, ' ')
                               : std::string(missing, ' ') + text;
}

std::string Trimmed(std::string text) {
  text.erase(text.find_last_not_of(' ') + 1);
  return text;
}

std::vector<int> Widths(const std::vector<Column>& columns, const std::vector<Row>& rows) {
  std::vector<int> widths;
  for (std::size_t i = 0; i < columns.size(); ++i) {
    int width = Length(columns[i].heading);
    for (const Row& row : rows) width = std::max(width, Length(row.cells[i]));
    widths.push_back(width);
  }
  return widths;
}

// One line of a table, without the last cell when `without_last`.
std::string Line(const std::vector<Column>& columns, const std::vector<int>& widths,
                 const std::vector<std::string>& cells, bool without_last) {
  std::string line;
  const std::size_t count = cells.size() - (without_last ? 1 : 0);
  for (std::size_t i = 0; i < count; ++i) {
    if (i > 0) line += kGap;
    line += Padded(cells[i], widths[i], columns[i].align);
  }
  return line;
}

std::string RowText(const Style& style, const std::vector<Column>& columns,
                    const std::vector<int>& widths, const Row& row) {
  if (row.role == Role::kNone && row.last != Role::kNone && !row.cells.back().empty()) {
    return Line(columns, widths, row.cells, true) + std::string(kGap) +
           Paint(style, row.last, row.cells.back()) + "\n";
  }
  return Paint(style, row.role, Trimmed(Line(columns, widths, row.cells, false))) + "\n";
}

std::vector<std::string> Words(const std::string& text) {
  constexpr const char* kBlanks = " \t\r\n";
  std::vector<std::string> words;
  std::size_t begin = text.find_first_not_of(kBlanks);
  while (begin != std::string::npos) {
    const std::size_t end = std::min(text.find_first_of(kBlanks, begin), text.size());
    words.push_back(text.substr(begin, end - begin));
    begin = text.find_first_not_of(kBlanks, end);
  }
  return words;
}

// The text with so many blanks before each line but the first.
std::string Indented(const std::string& text, int blanks) {
  const std::string indent(static_cast<std::size_t>(blanks), ' ');
  std::string result;
  for (const char letter : text) {
    result += letter;
    if (letter == '\n') result += indent;
  }
  return result;
}

}  // namespace

std::string TableText(const Style& style, const std::vector<Column>& columns,
                      const std::vector<Row>& rows) {
  const std::vector<int> widths = Widths(columns, rows);
  Row headings{{}, Role::kHeading, Role::kNone};
  for (const Column& column : columns) headings.cells.push_back(column.heading);
  std::string text = RowText(style, columns, widths, headings);
  for (const Row& row : rows) text += RowText(style, columns, widths, row);
  return text;
}

int TableWidth(const std::vector<Column>& columns, const std::vector<Row>& rows) {
  int total = 0;
  for (const int width : Widths(columns, rows)) total += width + static_cast<int>(kGap.size());
  return total - static_cast<int>(kGap.size());
}

std::string FittedTable(const Style& style, const std::vector<Column>& columns,
                        const std::vector<Row>& rows) {
  if (TableWidth(columns, rows) <= style.width) return TableText(style, columns, rows);
  std::vector<Row> rest = rows;
  for (Row& row : rest) row.cells.front().clear();
  const std::vector<int> widths = Widths(columns, rest);
  Row headings{{}, Role::kHeading, Role::kNone};
  for (const Column& column : columns) headings.cells.push_back(column.heading);
  std::string text = RowText(style, columns, widths, headings);
  for (std::size_t i = 0; i < rows.size(); ++i) {
    text += rows[i].cells.front() + "\n" + RowText(style, columns, widths, rest[i]);
  }
  return text;
}

std::string PairsText(const Pairs& pairs) {
  int width = 0;
  for (const auto& [label, value] : pairs) width = std::max(width, Length(label));
  std::string text;
  for (const auto& [label, value] : pairs) {
    text += Padded(label, width, Align::kLeft) + std::string(kGap) + value + "\n";
  }
  return text;
}

std::string Filled(const std::string& words, int width) {
  std::string text;
  int used = 0;
  for (const std::string& word : Words(words)) {
    const int length = Length(word);
    if (used > 0) {
      const bool fits = used + 1 + length <= width;
      text += fits ? ' ' : '\n';
      used = fits ? used + 1 : 0;
    }
    text += word;
    used += length;
  }
  return text;
}

std::string Labelled(const Style& style, int label_width, const std::string& label,
                     const std::string& value) {
  const std::string text = Indented(Filled(value, style.width - label_width), label_width);
  return Trimmed(Padded(label, label_width, Align::kLeft) + text) + "\n";
}

std::string Prose(const Style& style, const std::string& label, const std::string& sentence) {
  const std::string text = label + sentence;
  if (Length(text) <= style.width) return text + "\n";
  return Indented(Filled(text, style.width - 2), 2) + "\n";
}

std::string Paragraph(const Style& style, const std::string& sentences) {
  return Filled(sentences, style.width) + "\n";
}

std::string Described(const Style& style, const Pairs& lines) {
  const int gap = static_cast<int>(kGap.size());
  int width = 0;
  for (const auto& [label, meaning] : lines) width = std::max(width, Length(label));
  std::string text;
  for (const auto& [label, meaning] : lines) {
    const std::string filled =
        Indented(Filled(meaning, style.width - width - 2 * gap), width + 2 * gap);
    text += Trimmed(std::string(kGap) + Padded(label, width, Align::kLeft) + std::string(kGap) +
                    filled) +
            "\n";
  }
  return text;
}

}  // namespace planner::report
