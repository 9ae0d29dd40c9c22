#include "host/bundled/device/DeviceFile.h"

#include <toml++/toml.h>

#include <algorithm>
#include <cmath>
#include <set>
#include <utility>

#include "host/bundled/device/FileText.h"
#include "host/bundled/device/KeywordTable.h"

namespace Device {
namespace {

SourcePosition PositionOf(const toml::source_region& source) {
  return {source.begin.line, source.begin.column};
}

// The key of the coefficients among the keywords of a grade.
constexpr std::string_view kCalculatorKey = "calculator";

std::string Quoted(std::string_view text) { return '"' + std::string(text) + '"'; }

using Entry = std::pair<const toml::key*, const toml::node*>;

// The entries of a table as they follow each other in the file, so that of several mistakes
// the first is reported and grades keep their order. The table itself sorts by key.
std::vector<Entry> InFileOrder(const toml::table& table) {
  std::vector<Entry> entries;
  for (auto&& [key, node] : table) entries.emplace_back(&key, &node);
  std::ranges::stable_sort(entries, {}, [](const Entry& entry) {
    const toml::source_position begin = entry.first->source().begin;
    return std::pair(begin.line, begin.column);
  });
  return entries;
}

// Turns the parsed TOML of one file into a DeviceFile.
class Builder {
 public:
  Builder(const std::string& path, std::string_view device) : expected_device_(device) {
    file_.path = path;
  }

  DeviceFile Build(const toml::table& root) {
    for (const auto& [key, node] : InFileOrder(root)) TakeTopLevel(*key, *node);
    Require(root, "device");
    Require(root, "packages");
    Require(root, "grade");
    if (file_.default_package && !file_.HasPackage(*file_.default_package)) {
      Fail(*root.get("default_package"), Quoted(*file_.default_package) +
                                             " is not in the list of packages, which are " +
                                             JoinNames(file_.packages));
    }
    if (file_.default_grade && file_.FindGrade(*file_.default_grade) == nullptr) {
      Fail(*root.get("default_grade"), Quoted(*file_.default_grade) +
                                           " is not one of the grades, which are " +
                                           JoinNames(file_.GradeNames()));
    }
    return std::move(file_);
  }

 private:
  template <typename Located>
  [[noreturn]] void Fail(const Located& where, const std::string& reason) const {
    throw ErrorAt(file_.path, PositionOf(where.source()), reason);
  }

  void Require(const toml::table& root, std::string_view key) const {
    if (!root.contains(key)) Fail(root, "the key " + Quoted(key) + " is missing");
  }

  void TakeTopLevel(const toml::key& key, const toml::node& node) {
    const std::string_view name = key.str();
    if (name == "device") {
      TakeDevice(node);
    } else if (name == "description") {
      file_.description = Text(name, node);
    } else if (name == "packages") {
      TakePackages(key, node);
    } else if (name == "default_package") {
      file_.default_package = Text(name, node);
    } else if (name == "default_grade") {
      file_.default_grade = Text(name, node);
    } else if (name == "grade") {
      TakeGrades(key, node);
    } else {
      Fail(key, "unknown key " + Quoted(name) +
                    ": must be device, description, packages, default_package, default_grade "
                    "or grade");
    }
  }

  std::string Text(std::string_view key, const toml::node& node) const {
    if (!node.is_string()) Fail(node, Quoted(key) + " must be a text");
    return node.as_string()->get();
  }

  template <typename Located>
  void RequireName(std::string_view what, std::string_view text, const Located& where) const {
    if (IsName(text)) return;
    Fail(where,
         std::string(what) + " name " + Quoted(text) + " must be made of letters, digits and _");
  }

  void TakeDevice(const toml::node& node) {
    file_.device = Text("device", node);
    RequireName("device", file_.device, node);
    if (file_.device != expected_device_) {
      Fail(node, "device " + Quoted(file_.device) + " must be named as its file, " +
                     Quoted(expected_device_));
    }
  }

  void TakePackages(const toml::key& key, const toml::node& node) {
    file_.packages_position = PositionOf(key.source());
    const toml::array* packages = node.as_array();
    if (packages == nullptr) Fail(node, "\"packages\" must be a list of texts");
    if (packages->empty()) Fail(node, "\"packages\" must name at least one package");
    for (const toml::node& element : *packages) {
      std::string package = Text("packages", element);
      RequireName("package", package, element);
      if (file_.HasPackage(package)) Fail(element, "duplicate package " + Quoted(package));
      file_.packages.push_back(std::move(package));
    }
  }

  void TakeGrades(const toml::key& key, const toml::node& node) {
    file_.grades_position = PositionOf(key.source());
    const toml::table* grades = node.as_table();
    if (grades == nullptr) Fail(node, "\"grade\" must be made of [grade.<name>] tables");
    if (grades->empty()) Fail(key, "there must be at least one [grade.<name>] table");
    for (const auto& [grade_name, grade] : InFileOrder(*grades)) TakeGrade(*grade_name, *grade);
  }

  void TakeGrade(const toml::key& key, const toml::node& node) {
    RequireName("grade", key.str(), key);
    const toml::table* figures = node.as_table();
    if (figures == nullptr) {
      Fail(key, "grade " + Quoted(key.str()) + " must be a [grade.<name>] table");
    }
    Grade grade;
    grade.name = key.str();
    grade.figures.resize(Keywords().size());
    grade.coefficients.resize(Coefficients().size());
    for (const auto& [keyword, number] : InFileOrder(*figures)) {
      if (keyword->str() == kCalculatorKey) {
        TakeCoefficients(*keyword, *number, &grade);
        continue;
      }
      const auto index = FindKeyword(keyword->str());
      if (!index) Fail(*keyword, "unknown keyword " + Quoted(keyword->str()));
      grade.figures[*index] = Figure(keyword->str(), *number);
    }
    file_.grades.push_back(std::move(grade));
  }

  void TakeCoefficients(const toml::key& key, const toml::node& node, Grade* grade) const {
    const toml::table* coefficients = node.as_table();
    if (coefficients == nullptr) {
      Fail(node, "\"calculator\" must be a [grade.<name>.calculator] table");
    }
    for (const auto& [name, number] : InFileOrder(*coefficients)) {
      const auto index = FindCoefficient(name->str());
      if (!index) Fail(*name, "unknown coefficient " + Quoted(name->str()));
      grade->coefficients[*index] = Figure(name->str(), *number);
    }
    RequireGroup(key, *grade, CoefficientGroup::kLoop);
    RequireGroup(key, *grade, CoefficientGroup::kKru);
    if (grade->Has(CoefficientGroup::kLoop)) RequireRisingBandwidths(*coefficients, *grade);
  }

  // A grade has all coefficients of a group or none.
  void RequireGroup(const toml::key& key, const Grade& grade, CoefficientGroup group) const {
    std::string_view given;
    std::string_view missing;
    for (const Coefficient& coefficient : Coefficients()) {
      if (coefficient.group != group) continue;
      std::string_view& name = grade.CoefficientOf(coefficient.name) ? given : missing;
      if (name.empty()) name = coefficient.name;
    }
    if (given.empty() || missing.empty()) return;
    Fail(key, "the coefficient " + Quoted(missing) + " is missing, which goes with " +
                  Quoted(given));
  }

  void RequireRisingBandwidths(const toml::table& coefficients, const Grade& grade) const {
    std::string_view below;
    for (const std::string_view name :
         {"LOOP_BANDWIDTH_LOW", "LOOP_BANDWIDTH_OPTIMIZED", "LOOP_BANDWIDTH_HIGH"}) {
      const double bandwidth = *grade.CoefficientOf(name);
      if (!below.empty() && bandwidth <= *grade.CoefficientOf(below)) {
        Fail(*coefficients.get(name), Quoted(name) + " must be above " + Quoted(below));
      }
      if (bandwidth > kWidestLoop) {
        Fail(*coefficients.get(name),
             Quoted(name) + " must be at most 0.1, a tenth of the PFD frequency");
      }
      below = name;
    }
  }

  double Figure(std::string_view keyword, const toml::node& node) const {
    double number = 0;
    if (const auto* real = node.as_floating_point()) {
      number = real->get();
    } else if (const auto* integer = node.as_integer()) {
      number = static_cast<double>(integer->get());
    } else {
      Fail(node, Quoted(keyword) + " must be a number");
    }
    if (!std::isfinite(number) || number <= 0) {
      Fail(node, Quoted(keyword) + " must be a finite positive number");
    }
    return number;
  }

  DeviceFile file_;
  std::string_view expected_device_;
};

}  // namespace

DeviceFile DeviceFile::Read(const std::string& path, std::string_view device) {
  const std::string text = ReadFileText(path);
  try {
    const toml::table root = toml::parse(std::string_view(text), std::string_view(path));
    return Builder(path, device).Build(root);
  } catch (const toml::parse_error& error) {
    throw ErrorAt(path, PositionOf(error.source()), error.description());
  }
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
  for (const Keyword& keyword : Keywords()) {
    if ((keyword.primitives & primitive) != 0 && !Figure(keyword.name)) return false;
  }
  return true;
}

bool Grade::Has(CoefficientGroup group) const {
  for (const Coefficient& coefficient : Coefficients()) {
    if (coefficient.group == group && !CoefficientOf(coefficient.name)) return false;
  }
  return true;
}

const Grade* DeviceFile::FindGrade(std::string_view grade_name) const {
  const auto found = std::ranges::find(grades, grade_name, &Grade::name);
  return found == grades.end() ? nullptr : &*found;
}

bool DeviceFile::HasPackage(std::string_view package) const {
  return std::ranges::find(packages, package) != packages.end();
}

std::vector<std::string> DeviceFile::GradeNames() const {
  std::vector<std::string> names;
  for (const Grade& grade : grades) names.push_back(grade.name);
  return names;
}

bool IsName(std::string_view text) {
  constexpr std::string_view kNameCharacters =
      "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789_";
  return !text.empty() && text.find_first_not_of(kNameCharacters) == std::string_view::npos;
}

}  // namespace Device
