// One device, as its device file describes it.
//
// A device file is TOML; devices/README.md describes its layout. Reading one checks all of it:
// a DeviceFile that was read is complete and free of contradictions.
//
// Tested by device_file_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_DEVICEFILE_H_
#define VORKEL_HOST_BUNDLED_DEVICE_DEVICEFILE_H_

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "host/bundled/device/CoefficientTable.h"
#include "host/bundled/device/DeviceError.h"
#include "host/bundled/device/KeywordTable.h"

namespace Device {

// A figure as its file has it, which can say more than a double: 187.617 is no double.
struct FigureSource {
  // The decimal: digits, maybe with a point among them, maybe with an exponent ("4e2"). Without
  // sign and underscores. Whole numbers of another base are written to base 10.
  std::string decimal;
  SourcePosition position;  // of the number
};

// The speed data of one speed grade.
struct Grade {
  // The figure of a keyword; none when the file does not give it, or there is no such keyword.
  std::optional<double> Figure(std::string_view keyword) const;
  // The same for a coefficient of the calculator.
  std::optional<double> CoefficientOf(std::string_view coefficient_name) const;
  // Whether the grade has all keywords of the primitive.
  bool Has(Primitive primitive) const;
  // Whether the grade has the coefficients of the group.
  bool Has(CoefficientGroup group) const;

  std::string name;
  // By keyword index, in the unit of the keyword, finite and positive; none for a keyword
  // that the file does not give.
  std::vector<std::optional<double>> figures;
  // The same by coefficient index.
  std::vector<std::optional<double>> coefficients;
  // Where the figures come from, by keyword index; empty for those that the file does not give.
  std::vector<FigureSource> figure_sources;
};

struct Examination;

struct DeviceFile {
  // Reads the file at `path`, which must describe the device `device`. Throws DeviceError,
  // with line and column wherever the file could be read, when there is anything wrong.
  static DeviceFile Read(const std::string& path, std::string_view device);

  // The same for a text that is in memory; `path` is for messages.
  static DeviceFile Parse(std::string_view text, const std::string& path,
                          std::string_view device);

  // All that is wrong with a text. Throws nothing.
  static Examination Examine(std::string_view text, const std::string& path,
                             std::string_view device);

  const Grade* FindGrade(std::string_view grade_name) const;  // null when there is none
  bool HasPackage(std::string_view package) const;
  std::vector<std::string> GradeNames() const;

  std::string path;
  std::string device;
  std::string description;            // empty when the file gives none
  std::vector<std::string> packages;  // at least one
  std::optional<std::string> default_package;
  std::vector<Grade> grades;  // at least one, in the order of the file
  std::optional<std::string> default_grade;
  // Where the lists of packages and grades begin, for complaints about part names.
  SourcePosition packages_position;
  SourcePosition grades_position;
};

// What a name in a device file is to be one of.
enum class NameKind { kNone, kKey, kKeyword, kCoefficient };

// Something for which a device file is refused.
struct Mistake {
  std::optional<SourcePosition> position;  // none: the file as a whole
  std::string reason;
  // A name that there is not, when it is that, and of which kind.
  NameKind kind = NameKind::kNone;
  std::string unknown;
};

struct Examination {
  // In the order in which they were found; the first is the one that Parse throws. What only
  // follows from another one is not among them.
  std::vector<Mistake> mistakes;
  // The device; with mistakes, as far as it could be read: what is wrong is left out.
  DeviceFile file;
};

// All names of a kind.
std::vector<std::string> NamesOf(NameKind kind);

// Names of devices, packages and grades are made of letters, digits and _.
bool IsName(std::string_view text);

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_DEVICEFILE_H_
