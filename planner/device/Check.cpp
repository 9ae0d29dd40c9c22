#include "planner/device/Check.h"

#include <algorithm>
#include <map>
#include <utility>

#include "host/bundled/device/DeviceFile.h"

namespace planner::device {
namespace {

// The mistakes, the same ones put together, in the order of their first places.
std::vector<Mistake> Together(const std::vector<::Device::Mistake>& mistakes) {
  std::vector<Mistake> together;
  std::map<std::string, std::size_t> places;
  for (const ::Device::Mistake& one : mistakes) {
    const auto [place, is_new] = places.try_emplace(one.reason, together.size());
    if (is_new) {
      Mistake mistake;
      mistake.reason = one.reason;
      mistake.unknown = one.unknown;
      mistake.kind = one.kind;
      together.push_back(std::move(mistake));
    }
    if (one.position) {
      together[place->second].places.push_back({one.position->line, one.position->column});
    }
  }
  for (Mistake& mistake : together) {
    std::sort(mistake.places.begin(), mistake.places.end());
  }
  const auto first = [](const Mistake& mistake) {
    return mistake.places.empty() ? Mistake::Place{0, 0} : mistake.places.front();
  };
  std::stable_sort(together.begin(), together.end(),
                   [&first](const Mistake& a, const Mistake& b) { return first(a) < first(b); });
  return together;
}

}  // namespace

std::vector<Coverage> CoverageOf(const GradeDescription& grade) {
  std::vector<Coverage> all;
  for (const Primitive primitive : hardware::kPrimitives) {
    Coverage coverage;
    coverage.primitive = primitive;
    for (const Keyword& keyword : KeywordsOf(primitive)) {
      ++coverage.needed;
      if (grade.Find(keyword.name) == nullptr) continue;
      ++coverage.there;
      if (keyword.primitives.size() == 1) ++coverage.own;
    }
    all.push_back(coverage);
  }
  return all;
}

std::vector<Missing> MissingOf(const GradeDescription& grade) {
  std::vector<Primitive> begun;
  for (const Coverage& coverage : CoverageOf(grade)) {
    if (coverage.IsBegun()) begun.push_back(coverage.primitive);
  }
  std::vector<Missing> missing;
  for (const Keyword& keyword : Keywords()) {
    if (grade.Find(keyword.name) != nullptr) continue;
    Missing one{keyword, {}};
    for (const Primitive primitive : begun) {
      if (keyword.IsOf(primitive)) one.costs.push_back(primitive);
    }
    if (!one.costs.empty()) missing.push_back(std::move(one));
  }
  return missing;
}

Checked Check(std::string_view text, const std::string& path, std::string_view device) {
  const ::Device::Examination examination = ::Device::DeviceFile::Examine(text, path, device);
  Checked checked;
  checked.mistakes = Together(examination.mistakes);
  if (checked.mistakes.size() > kMostMistakes) {
    checked.untold = checked.mistakes.size() - kMostMistakes;
    checked.mistakes.resize(kMostMistakes);
  }
  for (Mistake& mistake : checked.mistakes) mistake.known = ::Device::NamesOf(mistake.kind);
  checked.description = Describe(examination.file);
  checked.doubts = Doubts(checked.description);
  return checked;
}

}  // namespace planner::device
