#include "schema.h"

#include <algorithm>
#include <fstream>
#include <stdexcept>

namespace schema {

namespace {

using nlohmann::ordered_json;
using std::string;

class Checker {
 public:
  explicit Checker(const ordered_json& root) : root_(root) {}

  string Fault(const ordered_json& value, const ordered_json& schema, const string& where) const {
    for (const auto& [word, rule] : schema.items()) {
      const string fault = FaultOfWord(value, schema, word, rule, where);
      if (!fault.empty()) return fault;
    }
    return "";
  }

 private:
  static bool IsOfType(const ordered_json& value, const string& type) {
    if (type == "object") return value.is_object();
    if (type == "array") return value.is_array();
    if (type == "string") return value.is_string();
    if (type == "number") return value.is_number();
    if (type == "integer") return value.is_number_integer();
    if (type == "boolean") return value.is_boolean();
    return type == "null" && value.is_null();
  }

  static string TypeFault(const ordered_json& value, const ordered_json& rule,
                          const string& where) {
    const ordered_json types = rule.is_array() ? rule : ordered_json::array({rule});
    const bool fits = std::any_of(types.begin(), types.end(), [&](const auto& type) {
      return IsOfType(value, type.template get<string>());
    });
    return fits ? "" : where + " is a " + value.type_name();
  }

  string ObjectFault(const ordered_json& value, const ordered_json& schema, const string& word,
                     const ordered_json& rule, const string& where) const {
    if (!value.is_object()) return "";
    if (word == "required") {
      for (const auto& name : rule) {
        if (!value.contains(name.get<string>())) return where + " lacks " + name.get<string>();
      }
    } else if (word == "properties") {
      for (const auto& [name, own] : rule.items()) {
        if (!value.contains(name)) continue;
        const string fault = Fault(value.at(name), own, where + "." + name);
        if (!fault.empty()) return fault;
      }
    } else if (!rule.get<bool>()) {  // additionalProperties
      for (const auto& [name, one] : value.items()) {
        if (!schema.at("properties").contains(name)) return where + " has " + name;
      }
    }
    return "";
  }

  string ArrayFault(const ordered_json& value, const string& word, const ordered_json& rule,
                    const string& where) const {
    if (!value.is_array()) return "";
    if (word == "minItems" && value.size() < rule.get<std::size_t>()) return where + " is short";
    if (word == "maxItems" && value.size() > rule.get<std::size_t>()) return where + " is long";
    if (word != "items") return "";
    for (std::size_t i = 0; i < value.size(); ++i) {
      const string fault = Fault(value[i], rule, where + "[" + std::to_string(i) + "]");
      if (!fault.empty()) return fault;
    }
    return "";
  }

  // One of several, or all of them.
  string CombinedFault(const ordered_json& value, const string& word, const ordered_json& rule,
                       const string& where) const {
    int count = 0;
    string faults;
    for (const auto& one : rule) {
      const string fault = Fault(value, one, where);
      count += fault.empty() ? 1 : 0;
      if (word == "allOf" && !fault.empty()) return fault;
      if (!fault.empty()) faults += (faults.empty() ? "" : " or ") + fault;
    }
    if (word == "allOf" || count == 1) return "";
    return count == 0 ? faults : where + " is of several kinds";
  }

  string ValueFault(const ordered_json& value, const string& word, const ordered_json& rule,
                    const string& where) const {
    if (word == "const") return value == rule ? "" : where + " is " + value.dump();
    if (word == "enum") {
      const bool fits = std::find(rule.begin(), rule.end(), value) != rule.end();
      return fits ? "" : where + " is " + value.dump();
    }
    if (!value.is_number()) return "";
    const double number = value.get<double>();
    const double least = rule.get<double>();
    return word == "minimum" ? (number >= least ? "" : where + " is too small")
                             : (number > least ? "" : where + " is too small");
  }

  string FaultOfWord(const ordered_json& value, const ordered_json& schema, const string& word,
                     const ordered_json& rule, const string& where) const {
    const auto is_of = [&](std::initializer_list<const char*> words) {
      return std::find(words.begin(), words.end(), word) != words.end();
    };
    if (is_of({"$schema", "title", "description", "$defs", "then"})) return "";
    if (word == "$ref") {
      const string path = rule.get<string>().substr(1);
      return Fault(value, root_.at(ordered_json::json_pointer(path)), where);
    }
    if (word == "type") return TypeFault(value, rule, where);
    if (is_of({"required", "properties", "additionalProperties"})) {
      return ObjectFault(value, schema, word, rule, where);
    }
    if (is_of({"items", "minItems", "maxItems"})) return ArrayFault(value, word, rule, where);
    if (is_of({"oneOf", "allOf"})) return CombinedFault(value, word, rule, where);
    if (is_of({"const", "enum", "minimum", "exclusiveMinimum"})) {
      return ValueFault(value, word, rule, where);
    }
    if (word == "if") {
      return Fault(value, rule, where).empty() ? Fault(value, schema.at("then"), where) : "";
    }
    throw std::runtime_error("The word " + word + " is not known.");
  }

  const ordered_json& root_;
};

}  // namespace

string FaultOf(const ordered_json& value, const ordered_json& schema) {
  return Checker(schema).Fault(value, schema, "");
}

ordered_json Load(const string& name) {
  std::ifstream file(string(VORKEL_DOC_DIR) + "/" + name);
  return ordered_json::parse(file);
}

}  // namespace schema
