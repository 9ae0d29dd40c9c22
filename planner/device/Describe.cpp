#include "planner/device/Describe.h"

#include <algorithm>

#include "host/bundled/device/DeviceError.h"
#include "host/bundled/device/KeywordTable.h"
#include "planner/device/Decimal.h"

namespace planner::device {
namespace {

Unit UnitOf(::Device::Unit unit) {
  switch (unit) {
    case ::Device::Unit::kMegahertz:
      return Unit::kMegahertz;
    case ::Device::Unit::kNanoseconds:
      return Unit::kNanoseconds;
    case ::Device::Unit::kCount:
      break;
  }
  return Unit::kCount;
}

std::vector<Keyword> MakeKeywords() {
  std::vector<Keyword> keywords;
  for (const ::Device::Keyword& one : ::Device::Keywords()) {
    Keyword keyword{one.name, UnitOf(one.unit), {}};
    for (const Primitive primitive : hardware::kPrimitives) {
      if ((one.primitives & HostPrimitive(primitive)) != 0) keyword.primitives.push_back(primitive);
    }
    keywords.push_back(std::move(keyword));
  }
  return keywords;
}

GradeDescription DescribeGrade(const ::Device::Grade& grade) {
  GradeDescription description;
  description.name = grade.name;
  const auto keywords = ::Device::Keywords();
  for (std::size_t i = 0; i < keywords.size(); ++i) {
    const auto figure = ExactFigure(grade, i);
    if (!figure) continue;
    const ::Device::FigureSource& source = grade.figure_sources[i];
    description.limits.push_back({keywords[i].name, *figure, source.decimal, source.position.line});
  }
  for (const Primitive primitive : hardware::kPrimitives) {
    if (grade.Has(HostPrimitive(primitive))) description.primitives.push_back(primitive);
  }
  description.has_loop_jitter = grade.Has(::Device::CoefficientGroup::kLoop);
  description.has_kru_jitter = grade.Has(::Device::CoefficientGroup::kKru);
  return description;
}

}  // namespace

const std::vector<Keyword>& Keywords() {
  static const std::vector<Keyword> keywords = MakeKeywords();
  return keywords;
}

std::vector<Keyword> KeywordsOf(Primitive primitive) {
  std::vector<Keyword> keywords;
  for (const Keyword& keyword : Keywords()) {
    if (keyword.IsOf(primitive)) keywords.push_back(keyword);
  }
  return keywords;
}

bool Keyword::IsOf(Primitive primitive) const {
  return std::find(primitives.begin(), primitives.end(), primitive) != primitives.end();
}

const Limit* GradeDescription::Find(std::string_view keyword) const {
  for (const Limit& limit : limits) {
    if (limit.keyword == keyword) return &limit;
  }
  return nullptr;
}

const GradeDescription* Description::Find(std::string_view grade) const {
  for (const GradeDescription& one : grades) {
    if (one.name == grade) return &one;
  }
  return nullptr;
}

Description Describe(const ::Device::DeviceFile& file) {
  Description description;
  description.name = file.device;
  description.about = file.description;
  description.file = file.path;
  description.packages = file.packages;
  description.default_package = file.default_package;
  description.default_grade = file.default_grade;
  for (const ::Device::Grade& grade : file.grades) {
    description.grades.push_back(DescribeGrade(grade));
  }
  return description;
}

std::vector<Listed> List(const Files& files) {
  std::vector<Listed> list;
  for (const std::string& name : files.Names()) {
    Listed listed;
    listed.name = name;
    try {
      listed.description =
          Describe(::Device::DeviceFile::Parse(files.TextOf(name), files.PathOf(name), name));
    } catch (const ::Device::DeviceError& error) {
      listed.complaint = ComplaintOf(name, error);
    }
    list.push_back(std::move(listed));
  }
  return list;
}

}  // namespace planner::device
