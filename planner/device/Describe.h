// What there is to show of devices: packages, grades, and limits by keyword.
//
// Tested by describe_test.cpp.
#ifndef VORKEL_PLANNER_DEVICE_DESCRIBE_H_
#define VORKEL_PLANNER_DEVICE_DESCRIBE_H_

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "hardware/Exact.h"
#include "planner/device/Catalogue.h"

namespace planner::device {

// What the number of a keyword counts.
enum class Unit { kMegahertz, kNanoseconds, kCount };

// A keyword of the speed data.
struct Keyword {
  std::string_view name;
  Unit unit;
  std::vector<Primitive> primitives;  // those that need it
  bool IsOf(Primitive primitive) const;
};

// All keywords, in the order in which they are listed to users, and those of a primitive.
const std::vector<Keyword>& Keywords();
std::vector<Keyword> KeywordsOf(Primitive primitive);

// A limit that a grade has.
struct Limit {
  std::string_view keyword;
  hardware::Rational value;  // in the unit of the keyword
  std::string text;          // the decimal of the file: digits, maybe a point and an exponent
  unsigned line = 0;         // in the file
};

struct GradeDescription {
  std::string name;
  std::vector<Limit> limits;          // in the order of the keywords
  std::vector<Primitive> primitives;  // those whose limits are all there, in the usual order
  bool has_loop_jitter = false;       // the coefficients of PLL and TSYN are there
  bool has_kru_jitter = false;

  const Limit* Find(std::string_view keyword) const;  // null when there is none
};

struct Description {
  std::string name;
  std::string about;  // a sentence of the file, or nothing
  std::string file;
  std::vector<std::string> packages;
  std::optional<std::string> default_package;
  std::optional<std::string> default_grade;
  std::vector<GradeDescription> grades;  // in the order of the file

  const GradeDescription* Find(std::string_view grade) const;  // null when there is none
};

Description Describe(const ::Device::DeviceFile& file);

// A device of the list: what it is, or why it cannot be used.
struct Listed {
  std::string name;
  std::optional<Description> description;
  std::optional<FileComplaint> complaint;
};
std::vector<Listed> List(const Files& files);

}  // namespace planner::device

#endif  // VORKEL_PLANNER_DEVICE_DESCRIBE_H_
