#include "host/bundled/calculator/Argument.h"

#include <charconv>
#include <cmath>
#include <iterator>

namespace Calculator {
namespace {

constexpr int kFrequencyDigits = 6;

std::string SixDigits(double number) {
  char text[32];
  const auto result = std::to_chars(std::begin(text), std::end(text), number,
                                    std::chars_format::general, kFrequencyDigits);
  return std::string(std::begin(text), result.ptr);
}

}  // namespace

std::string NumberText(double number) {
  if (std::isnan(number)) return "nan";  // whatever its sign
  char text[32];
  const auto result = std::to_chars(std::begin(text), std::end(text), number);
  return std::string(std::begin(text), result.ptr);
}

std::string FrequencyText(double megahertz) { return SixDigits(megahertz) + " MHz"; }

std::string FrequencyRange(double lowest, double highest) {
  return "from " + SixDigits(lowest) + " to " + FrequencyText(highest);
}

std::string Statement(std::string_view what, double value, std::string_view unit) {
  std::string text(what);
  text += " is ";
  text += NumberText(value);
  if (!unit.empty()) {
    text += ' ';
    text += unit;
  }
  return text;
}

void Refuse(std::string_view statement, std::string_view range) {
  std::string text(statement);
  text += ", but must be ";
  text += range;
  text += '.';
  throw ArgumentError(text);
}

bool IsWithin(double value, double lowest, double highest) {
  return value >= lowest && value <= highest;
}

bool IsMultiple(double value, double step) { return std::fmod(value, step) == 0.0; }

bool IsWhole(double value, double lowest, double highest) {
  return IsWithin(value, lowest, highest) && IsMultiple(value, 1.0);
}

void CheckWithin(std::string_view what, double value, std::string_view unit, double lowest,
                 double highest) {
  if (IsWithin(value, lowest, highest)) return;
  std::string range = "from " + NumberText(lowest) + " to " + NumberText(highest);
  if (!unit.empty()) {
    range += ' ';
    range += unit;
  }
  Refuse(Statement(what, value, unit), range);
}

void CheckWhole(std::string_view what, double value, double lowest, double highest) {
  if (IsWhole(value, lowest, highest)) return;
  Refuse(Statement(what, value),
         "a whole number from " + NumberText(lowest) + " to " + NumberText(highest));
}

void CheckInputFrequency(double megahertz) {
  CheckWithin("Input frequency", megahertz, "MHz", kLowestInput, kHighestInput);
}

}  // namespace Calculator
