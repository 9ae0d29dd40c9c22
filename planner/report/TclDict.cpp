// Tested by tcl_dict_test.cpp.
#include "planner/report/TclDict.h"

#include <algorithm>
#include <cctype>
#include <nlohmann/json.hpp>
#include <string_view>

namespace planner::report {

namespace {

using nlohmann::ordered_json;
using std::string;

constexpr const char* kStep = "  ";

bool IsPlain(char letter) {
  constexpr std::string_view kSigns = "_-+./:,=@%*()'&<>|~^?!";
  return std::isalnum(static_cast<unsigned char>(letter)) != 0 ||
         (static_cast<unsigned char>(letter) & 0x80U) != 0 ||
         kSigns.find(letter) != std::string_view::npos;
}

string Escaped(const string& text) {
  string word;
  for (const char letter : text) {
    switch (letter) {
      case '\n':
        word += "\\n";
        break;
      case '\t':
        word += "\\t";
        break;
      case '\r':
        word += "\\r";
        break;
      default:
        if (!IsPlain(letter) && static_cast<unsigned char>(letter) >= ' ') word += '\\';
        word += letter;
    }
  }
  return word;
}

string Block(const ordered_json& object, const string& indent);

bool HasObjects(const ordered_json& array) {
  return std::any_of(array.begin(), array.end(), [](const auto& one) { return one.is_object(); });
}

string Word(const ordered_json& value) {
  if (value.is_null()) return "{}";
  if (value.is_string()) return TclWord(value.get<string>());
  if (!value.is_array()) return value.dump();
  string list;
  for (const ordered_json& element : value) {
    if (!list.empty()) list += ' ';
    list += Word(element);
  }
  return "{" + list + "}";
}

// The entries of an object, a line each behind `indent`.
string Entries(const ordered_json& object, const string& indent) {
  string text;
  for (const auto& [key, value] : object.items()) {
    text += indent + TclWord(key) + " ";
    if (value.is_object()) {
      text += Block(value, indent);
    } else if (value.is_array() && HasObjects(value)) {
      text += "{\n";
      for (const ordered_json& element : value) {
        const string inner = indent + kStep;
        text += inner + (element.is_object() ? Block(element, inner) : Word(element)) + "\n";
      }
      text += indent + "}";
    } else {
      text += Word(value);
    }
    text += "\n";
  }
  return text;
}

// Words stay whole between braces.
string Block(const ordered_json& object, const string& indent) {
  return "{\n" + Entries(object, indent + kStep) + indent + "}";
}

}  // namespace

string TclDict(const ordered_json& object) { return Entries(object, ""); }

string TclWord(const string& text) {
  if (text.empty()) return "{}";
  if (std::all_of(text.begin(), text.end(), IsPlain)) return text;
  // Braces keep all but braces and backslashes as they are.
  if (text.find_first_of("{}\\") == string::npos) return "{" + text + "}";
  return Escaped(text);
}

}  // namespace planner::report
