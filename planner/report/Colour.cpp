// Tested by table_test.cpp.
#include "planner/report/Colour.h"

namespace planner::report {

namespace {

// The control sequences (ECMA-48, Select Graphic Rendition).
constexpr const char* kBold = "\033[1m";
constexpr const char* kRed = "\033[31m";
constexpr const char* kGreen = "\033[32m";
constexpr const char* kYellow = "\033[33m";
constexpr const char* kReset = "\033[0m";

std::string Sequence(Role role) {
  switch (role) {
    case Role::kNone:
      break;
    case Role::kHeading:
      return kBold;
    case Role::kOff:
      return std::string(kRed) + kBold;
    case Role::kGood:
      return kGreen;
    case Role::kNote:
      return kYellow;
  }
  return "";
}

}  // namespace

std::string Paint(const Style& style, Role role, const std::string& text) {
  const std::string sequence = style.colour && !text.empty() ? Sequence(role) : "";
  return sequence.empty() ? text : sequence + text + kReset;
}

}  // namespace planner::report
