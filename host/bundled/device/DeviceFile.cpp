#include "host/bundled/device/DeviceFile.h"

#include <algorithm>
#include <utility>

#include "host/bundled/device/FileText.h"
#include "host/bundled/device/KeywordTable.h"

namespace Device {

DeviceFile DeviceFile::Read(const std::string& path, std::string_view device) {
  return Parse(ReadFileText(path), path, device);
}

DeviceFile DeviceFile::Parse(std::string_view text, const std::string& path,
                             std::string_view device) {
  Examination examination = Examine(text, path, device);
  if (!examination.mistakes.empty()) {
    const Mistake& first = examination.mistakes.front();
    throw DeviceError(path, first.position, first.reason);
  }
  return std::move(examination.file);
}

std::optional<double> Grade::Figure(std::string_view keyword) const {
  const auto index = FindKeyword(keyword);
  return index ? figures[*index] : std::nullopt;
}

std::optional<double> Grade::CoefficientOf(std::string_view coefficient_name) const {
  const auto index = FindCoefficient(coefficient_name);
  return index ? coefficients[*index] : std::nullopt;
}

bool Grade::Has(Primitive primitive) const {
  const auto keywords = Keywords();
  for (std::size_t i = 0; i < keywords.size(); ++i) {
    if ((keywords[i].primitives & primitive) != 0 && !figures[i]) return false;
  }
  return true;
}

bool Grade::Has(CoefficientGroup group) const {
  const auto all = Coefficients();
  for (std::size_t i = 0; i < all.size(); ++i) {
    if (all[i].group == group && !coefficients[i]) return false;
  }
  return true;
}

const Grade* DeviceFile::FindGrade(std::string_view grade_name) const {
  for (const Grade& grade : grades) {
    if (grade.name == grade_name) return &grade;
  }
  return nullptr;
}

bool DeviceFile::HasPackage(std::string_view package) const {
  return std::find(packages.begin(), packages.end(), package) != packages.end();
}

std::vector<std::string> DeviceFile::GradeNames() const {
  std::vector<std::string> names;
  for (const Grade& grade : grades) names.push_back(grade.name);
  return names;
}

std::vector<std::string> NamesOf(NameKind kind) {
  std::vector<std::string> names;
  switch (kind) {
    case NameKind::kNone:
      break;
    case NameKind::kKey:
      names = {"device", "description", "packages", "default_package", "default_grade", "grade"};
      break;
    case NameKind::kKeyword:
      for (const Keyword& keyword : Keywords()) names.emplace_back(keyword.name);
      break;
    case NameKind::kCoefficient:
      for (const Coefficient& one : Coefficients()) names.emplace_back(one.name);
      break;
  }
  return names;
}

bool IsName(std::string_view text) {
  constexpr std::string_view kNameCharacters =
      "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789_";
  return !text.empty() && text.find_first_not_of(kNameCharacters) == std::string_view::npos;
}

}  // namespace Device
