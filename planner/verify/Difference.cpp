// Tested by difference_test.cpp.
#include "planner/verify/Difference.h"

#include <cstddef>
#include <nlohmann/json.hpp>
#include <string_view>
#include <utility>

#include "planner/verify/Entries.h"

namespace planner::verify {

namespace {

using nlohmann::ordered_json;
using read::Node;
using read::NodeType;
using std::string;

// A double has 17 digits, and 767 of them when it is written out; its exponents go to 308.
constexpr std::size_t kMostDigits = 800;
constexpr int kLargestExponent = 400;

NodeType TypeOf(const ordered_json& value) {
  if (IsAnyText(value) || value.is_string()) return NodeType::kString;
  if (IsAnyTexts(value) || value.is_array()) return NodeType::kArray;
  if (value.is_object()) return NodeType::kObject;
  if (value.is_boolean()) return NodeType::kBoolean;
  return value.is_number() ? NodeType::kNumber : NodeType::kNull;
}

void Add(const Node& node, DiscrepancyKind kind, const string& path, string expected,
         Discrepancies* discrepancies) {
  discrepancies->push_back(At(node, kind, path, std::move(expected)));
}

bool IsSameNumber(const hardware::Rational& found, const ordered_json& expected) {
  if (expected.is_number_integer()) {
    return found == hardware::Rational(expected.get<std::int64_t>());
  }
  return found.ToDouble() == expected.get<double>();
}

void DifferNumber(const ordered_json& expected, const Node& found, const string& path,
                  Discrepancies* discrepancies) {
  const auto number = NumberOf(found.text);
  if (!number) {
    Add(found, DiscrepancyKind::kAbsurd, path, Shown(expected), discrepancies);
  } else if (!IsSameNumber(*number, expected)) {
    Add(found, DiscrepancyKind::kDiffers, path, Shown(expected), discrepancies);
  }
}

void DifferObject(const ordered_json& expected, const Node& found, const string& path,
                  Discrepancies* discrepancies) {
  const string prefix = path.empty() ? "" : path + ".";
  for (const read::Member& member : found.members) {
    const auto wanted = expected.find(member.name);
    if (wanted != expected.end()) {
      Differ(*wanted, member.value, prefix + member.name, discrepancies);
    } else {
      Add(member.value, DiscrepancyKind::kUnknown, prefix + member.name, "", discrepancies);
    }
  }
  for (const auto& [name, value] : expected.items()) {
    if (found.Find(name) != nullptr) continue;
    Add(found, DiscrepancyKind::kMissing, prefix + name, Shown(value), discrepancies);
    discrepancies->back().found.clear();
  }
}

void DifferArray(const ordered_json& expected, const Node& found, const string& path,
                 Discrepancies* discrepancies) {
  const auto at = [&](std::size_t i) { return path + "[" + std::to_string(i) + "]"; };
  for (std::size_t i = 0; i < found.items.size(); ++i) {
    if (i < expected.size()) {
      Differ(expected[i], found.items[i], at(i), discrepancies);
    } else {
      Add(found.items[i], DiscrepancyKind::kUnknown, at(i), "", discrepancies);
    }
  }
  for (std::size_t i = found.items.size(); i < expected.size(); ++i) {
    Add(found, DiscrepancyKind::kMissing, at(i), Shown(expected[i]), discrepancies);
    discrepancies->back().found.clear();
  }
}

void DifferTexts(const Node& found, const string& path, Discrepancies* discrepancies) {
  for (std::size_t i = 0; i < found.items.size(); ++i) {
    Differ(AnyText(), found.items[i], path + "[" + std::to_string(i) + "]", discrepancies);
  }
}

}  // namespace

std::optional<hardware::Rational> NumberOf(const string& text) {
  string digits;
  int exponent = 0;
  bool is_fraction = false;
  std::size_t i = !text.empty() && text[0] == '-' ? 1 : 0;
  for (; i < text.size() && text[i] != 'e' && text[i] != 'E'; ++i) {
    if (text[i] == '.') {
      is_fraction = true;
      continue;
    }
    digits += text[i];
    if (is_fraction) --exponent;
  }
  if (digits.empty() || digits.size() > kMostDigits) return std::nullopt;
  if (i < text.size()) {
    const bool is_negative = i + 1 < text.size() && text[i + 1] == '-';
    int power = 0;
    for (++i; i < text.size(); ++i) {
      if (text[i] == '-' || text[i] == '+') continue;
      power = power * 10 + (text[i] - '0');
      if (power > kLargestExponent) return std::nullopt;
    }
    exponent += is_negative ? -power : power;
  }
  const auto number = hardware::Rational::FromDecimal(digits, exponent);
  return text[0] == '-' ? -number : number;
}

string Shown(const Node& node) {
  switch (node.type) {
    case NodeType::kString:
      return ordered_json(node.text).dump(-1, ' ', false, ordered_json::error_handler_t::replace);
    case NodeType::kNumber:
      return node.text;
    case NodeType::kBoolean:
      return node.truth ? "true" : "false";
    case NodeType::kNull:
      return "null";
    default:
      return string(read::Name(node.type));
  }
}

string Shown(const ordered_json& value) {
  if (IsAnyText(value)) return "string";
  if (IsAnyTexts(value) || value.is_object() || value.is_array()) {
    return string(read::Name(TypeOf(value)));
  }
  return value.dump(-1, ' ', false, ordered_json::error_handler_t::replace);
}

Discrepancy At(const Node& node, DiscrepancyKind kind, string path, string expected) {
  return {.kind = kind,
          .path = std::move(path),
          .found = Shown(node),
          .expected = std::move(expected),
          .line = node.position.line,
          .column = node.position.column};
}

void Differ(const ordered_json& expected, const Node& found, const string& path,
            Discrepancies* discrepancies) {
  const NodeType type = TypeOf(expected);
  if (found.type != type) {
    // That there is something, or nothing, is no matter of types.
    const bool is_null = type == NodeType::kNull || found.type == NodeType::kNull;
    return Add(found, is_null ? DiscrepancyKind::kDiffers : DiscrepancyKind::kWrongType, path,
               Shown(expected), discrepancies);
  }
  if (IsAnyText(expected)) return;
  if (IsAnyTexts(expected)) return DifferTexts(found, path, discrepancies);
  switch (type) {
    case NodeType::kObject:
      return DifferObject(expected, found, path, discrepancies);
    case NodeType::kArray:
      return DifferArray(expected, found, path, discrepancies);
    case NodeType::kNumber:
      return DifferNumber(expected, found, path, discrepancies);
    case NodeType::kString:
      if (found.text == expected.get<string>()) return;
      break;
    case NodeType::kBoolean:
      if (found.truth == expected.get<bool>()) return;
      break;
    default:
      return;
  }
  Add(found, DiscrepancyKind::kDiffers, path, Shown(expected), discrepancies);
}

}  // namespace planner::verify
