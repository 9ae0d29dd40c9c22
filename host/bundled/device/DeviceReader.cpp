// How the text of a device file becomes a DeviceFile, or a list of its mistakes.
//
// Tested by device_file_test.cpp, and examine_test.cpp.
#include <algorithm>
#include <cmath>
#include <set>
#include <utility>

#include "host/bundled/device/DeviceFile.h"
#include "host/bundled/device/FigureText.h"
#include "host/bundled/device/FileText.h"
#include "host/bundled/device/KeywordTable.h"
#include "host/bundled/device/Toml.h"

namespace Device {
namespace {

SourcePosition PositionOf(const toml::source_region& source) {
  return {source.begin.line, source.begin.column};
}

// The key of the coefficients among the keywords of a grade.
constexpr std::string_view kCalculatorKey = "calculator";

constexpr std::string_view kRisingBandwidths[] = {"LOOP_BANDWIDTH_LOW", "LOOP_BANDWIDTH_OPTIMIZED",
                                                  "LOOP_BANDWIDTH_HIGH"};

// "a", "b" and "c".
std::string QuotedAll(const std::vector<std::string_view>& names) {
  std::string text;
  for (std::size_t i = 0; i < names.size(); ++i) {
    if (i > 0) text += i + 1 == names.size() ? " and " : ", ";
    text += Quoted(names[i]);
  }
  return text;
}

using Entry = std::pair<const toml::key*, const toml::node*>;

// The entries of a table as they follow each other in the file, so that mistakes and grades keep
// their order. The table itself sorts by key.
std::vector<Entry> InFileOrder(const toml::table& table) {
  std::vector<Entry> entries;
  for (auto&& [key, node] : table) entries.emplace_back(&key, &node);
  const auto place = [](const Entry& entry) {
    const toml::source_position begin = entry.first->source().begin;
    return std::pair(begin.line, begin.column);
  };
  std::stable_sort(entries.begin(), entries.end(), [&place](const Entry& a, const Entry& b) {
    return place(a) < place(b);
  });
  return entries;
}

// Turns the parsed TOML of one file into a DeviceFile. What is wrong is noted and left out, and
// the rest is read all the same.
class Builder {
 public:
  Builder(std::string_view text, std::string_view device, Examination* result)
      : text_(text),
        expected_device_(device),
        file_(result->file),
        mistakes_(result->mistakes) {}

  void Build(const toml::table& root) {
    for (const auto& [key, node] : InFileOrder(root)) TakeTopLevel(*key, *node);
    Require(root, "device");
    Require(root, "packages");
    Require(root, "grade");
    RequireDefaultPackage(root);
    RequireDefaultGrade(root);
  }

 private:
  template <typename Located>
  void Note(const Located& where, std::string reason, NameKind kind = NameKind::kNone,
            std::string_view unknown = {}) {
    mistakes_.push_back(
        {PositionOf(where.source()), std::move(reason), kind, std::string(unknown)});
  }

  void Require(const toml::table& root, std::string_view key) {
    if (!root.contains(key)) Note(root, "the key " + Quoted(key) + " is missing");
  }

  // Where the list of packages is wrong nobody knows what is not in it; so it is with grades.
  void RequireDefaultPackage(const toml::table& root) {
    if (!has_packages_ || !file_.default_package) return;
    if (file_.HasPackage(*file_.default_package)) return;
    Note(*root.get("default_package"), Quoted(*file_.default_package) +
                                           " is not in the list of packages, which are " +
                                           JoinNames(file_.packages));
    file_.default_package.reset();
  }

  void RequireDefaultGrade(const toml::table& root) {
    if (!has_grades_ || !file_.default_grade) return;
    if (file_.FindGrade(*file_.default_grade) != nullptr) return;
    Note(*root.get("default_grade"), Quoted(*file_.default_grade) +
                                         " is not one of the grades, which are " +
                                         JoinNames(file_.GradeNames()));
    file_.default_grade.reset();
  }

  void TakeTopLevel(const toml::key& key, const toml::node& node) {
    const std::string_view name = key.str();
    if (name == "device") {
      TakeDevice(node);
    } else if (name == "description") {
      file_.description = Text(name, node).value_or("");
    } else if (name == "packages") {
      TakePackages(key, node);
    } else if (name == "default_package") {
      file_.default_package = Text(name, node);
    } else if (name == "default_grade") {
      file_.default_grade = Text(name, node);
    } else if (name == "grade") {
      TakeGrades(key, node);
    } else {
      Note(key,
           "unknown key " + Quoted(name) +
               ": must be device, description, packages, default_package, default_grade or grade",
           NameKind::kKey, name);
    }
  }

  std::optional<std::string> Text(std::string_view key, const toml::node& node) {
    if (node.is_string()) return node.as_string()->get();
    Note(node, Quoted(key) + " must be a text");
    return std::nullopt;
  }

  template <typename Located>
  bool RequireName(std::string_view what, std::string_view text, const Located& where) {
    if (IsName(text)) return true;
    Note(where,
         std::string(what) + " name " + Quoted(text) + " must be made of letters, digits and _");
    return false;
  }

  void TakeDevice(const toml::node& node) {
    file_.device = expected_device_;
    const auto device = Text("device", node);
    if (!device || !RequireName("device", *device, node)) return;
    if (*device != expected_device_) {
      Note(node, "device " + Quoted(*device) + " must be named as its file, " +
                     Quoted(expected_device_));
    }
  }

  void TakePackages(const toml::key& key, const toml::node& node) {
    file_.packages_position = PositionOf(key.source());
    const std::size_t mistakes = mistakes_.size();
    const toml::array* packages = node.as_array();
    if (packages == nullptr) {
      Note(node, "\"packages\" must be a list of texts");
      return;
    }
    if (packages->empty()) Note(node, "\"packages\" must name at least one package");
    std::set<std::string> seen;
    for (const toml::node& element : *packages) TakePackage(element, &seen);
    has_packages_ = mistakes_.size() == mistakes;
  }

  void TakePackage(const toml::node& element, std::set<std::string>* seen) {
    const auto package = Text("packages", element);
    if (!package || !RequireName("package", *package, element)) return;
    if (!seen->insert(*package).second) {
      Note(element, "duplicate package " + Quoted(*package));
      return;
    }
    file_.packages.push_back(*package);
  }

  void TakeGrades(const toml::key& key, const toml::node& node) {
    file_.grades_position = PositionOf(key.source());
    const toml::table* grades = node.as_table();
    if (grades == nullptr) {
      Note(node, "\"grade\" must be made of [grade.<name>] tables");
      return;
    }
    if (grades->empty()) Note(key, "there must be at least one [grade.<name>] table");
    has_grades_ = !grades->empty();
    for (const auto& [grade_name, grade] : InFileOrder(*grades)) TakeGrade(*grade_name, *grade);
  }

  void TakeGrade(const toml::key& key, const toml::node& node) {
    const bool is_named = RequireName("grade", key.str(), key);
    const toml::table* figures = node.as_table();
    if (figures == nullptr) {
      Note(key, "grade " + Quoted(key.str()) + " must be a [grade.<name>] table");
    }
    if (!is_named || figures == nullptr) has_grades_ = false;
    if (figures == nullptr) return;
    Grade grade;
    grade.name = key.str();
    grade.figures.resize(Keywords().size());
    grade.figure_sources.resize(Keywords().size());
    grade.coefficients.resize(Coefficients().size());
    for (const auto& [keyword, number] : InFileOrder(*figures)) {
      if (keyword->str() == kCalculatorKey) {
        TakeCoefficients(*keyword, *number, &grade);
      } else {
        TakeFigure(*keyword, *number, &grade);
      }
    }
    if (is_named) file_.grades.push_back(std::move(grade));
  }

  void TakeFigure(const toml::key& keyword, const toml::node& number, Grade* grade) {
    const auto index = FindKeyword(keyword.str());
    if (!index) {
      Note(keyword, "unknown keyword " + Quoted(keyword.str()), NameKind::kKeyword,
           keyword.str());
      return;
    }
    const auto figure = Figure(keyword.str(), number);
    if (!figure) return;
    grade->figures[*index] = figure;
    grade->figure_sources[*index] = {DecimalOf(number), PositionOf(number.source())};
  }

  void TakeCoefficients(const toml::key& key, const toml::node& node, Grade* grade) {
    const toml::table* coefficients = node.as_table();
    if (coefficients == nullptr) {
      Note(node, "\"calculator\" must be a [grade.<name>.calculator] table");
      return;
    }
    for (const auto& [name, number] : InFileOrder(*coefficients)) {
      const auto index = FindCoefficient(name->str());
      if (index) {
        grade->coefficients[*index] = Figure(name->str(), *number);
      } else {
        Note(*name, "unknown coefficient " + Quoted(name->str()), NameKind::kCoefficient,
             name->str());
      }
    }
    RequireGroup(key, *coefficients, CoefficientGroup::kLoop);
    RequireGroup(key, *coefficients, CoefficientGroup::kKru);
    RequireRisingBandwidths(*coefficients, *grade);
  }

  // A grade has all coefficients of a group or none.
  void RequireGroup(const toml::key& key, const toml::table& coefficients,
                    CoefficientGroup group) {
    std::string_view given;
    std::vector<std::string_view> missing;
    for (const Coefficient& coefficient : Coefficients()) {
      if (coefficient.group != group) continue;
      if (!coefficients.contains(coefficient.name)) {
        missing.push_back(coefficient.name);
      } else if (given.empty()) {
        given = coefficient.name;
      }
    }
    if (given.empty() || missing.empty()) return;
    const bool one = missing.size() == 1;
    Note(key, (one ? "the coefficient " : "the coefficients ") + QuotedAll(missing) +
                  (one ? " is missing, which goes with " : " are missing, which go with ") +
                  Quoted(given));
  }

  void RequireRisingBandwidths(const toml::table& coefficients, const Grade& grade) {
    std::string_view below;
    for (const std::string_view name : kRisingBandwidths) {
      const auto bandwidth = grade.CoefficientOf(name);
      if (bandwidth && !below.empty() && *bandwidth <= *grade.CoefficientOf(below)) {
        Note(*coefficients.get(name), Quoted(name) + " must be above " + Quoted(below));
      } else if (bandwidth && *bandwidth > kWidestLoop) {
        Note(*coefficients.get(name),
             Quoted(name) + " must be at most 0.1, a tenth of the PFD frequency");
      }
      below = bandwidth ? name : std::string_view();
    }
  }

  std::optional<double> Figure(std::string_view keyword, const toml::node& node) {
    double number = 0;
    if (const auto* real = node.as_floating_point()) {
      number = real->get();
    } else if (const auto* integer = node.as_integer()) {
      number = static_cast<double>(integer->get());
    } else {
      Note(node, Quoted(keyword) + " must be a number");
      return std::nullopt;
    }
    if (std::isfinite(number) && number > 0) return number;
    Note(node, Quoted(keyword) + " must be a finite positive number");
    return std::nullopt;
  }

  std::string DecimalOf(const toml::node& number) const {
    if (const auto* integer = number.as_integer()) return std::to_string(integer->get());
    return text_.DecimalAt(PositionOf(number.source()));
  }

  FigureText text_;
  std::string_view expected_device_;
  DeviceFile& file_;
  std::vector<Mistake>& mistakes_;
  // Whether all packages, and all grades, could be read.
  bool has_packages_ = false;
  bool has_grades_ = false;
};

}  // namespace

Examination DeviceFile::Examine(std::string_view text, const std::string& path,
                                std::string_view device) {
  Examination result;
  result.file.path = path;
  result.file.device = device;
  try {
    RequireParsable(path, text);
    const toml::parse_result parsed = ParseToml(text);
    if (parsed) {
      Builder(text, device, &result).Build(parsed.table());
    } else {
      result.mistakes.push_back({PositionOf(parsed.error().source()),
                                 std::string(parsed.error().description()), NameKind::kNone, {}});
    }
  } catch (const DeviceError& error) {
    result.mistakes.push_back({error.position(), error.reason(), NameKind::kNone, {}});
  }
  return result;
}

}  // namespace Device
