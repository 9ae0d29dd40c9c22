// Tested by tests/python/test_errors.py and test_evaluate.py.
#include "python/Refused.h"

#include <nlohmann/json.hpp>
#include <string_view>
#include <utility>

#include "planner/read/Options.h"
#include "planner/read/Settings.h"
#include "planner/report/ErrorData.h"
#include "planner/report/JsonText.h"

namespace python {

namespace {

using nlohmann::ordered_json;
using std::string;

// "phase_steps" of "--phase-steps".
string ArgumentOf(std::string_view option) {
  if (option == "--in") return "inputs";
  if (option == "--out") return "outputs";
  string name(option.substr(2));
  for (char& letter : name) letter = letter == '-' ? '_' : letter;
  return name;
}

bool IsOfName(char letter) {
  return letter == '-' || (letter >= 'a' && letter <= 'z') || (letter >= '0' && letter <= '9');
}

const planner::read::OptionFacts* Find(const string& option) {
  const auto* const facts = planner::read::FindSettingOption(option);
  return facts != nullptr ? facts : planner::read::FindOption(option);
}

// A sentence with the arguments in place of options: "such as --m 44" has a value, and a switch is
// True.
string WithArguments(const string& sentence) {
  string text;
  std::size_t done = 0;
  for (std::size_t i = sentence.find("--"); i != string::npos; i = sentence.find("--", done)) {
    std::size_t end = i;
    while (end < sentence.size() && IsOfName(sentence[end])) ++end;
    const string option = sentence.substr(i, end - i);
    text += sentence.substr(done, i - done);
    done = end;
    const auto* const facts = Find(option);
    if (facts == nullptr) {
      text += option;
      continue;
    }
    const bool is_example = text.ends_with("such as ") && sentence.substr(end, 1) == " ";
    text += ArgumentOf(option);
    if (facts->placeholder.empty()) text += "=True";
    if (!is_example) continue;
    text += "=\"" + sentence.substr(end + 1) + "\"";
    done = sentence.size();
  }
  return text + sentence.substr(done);
}

[[noreturn]] void Refuse(const char* function, const ordered_json& data) {
  throw Refused{function, Text(data)};
}

}  // namespace

string Text(const ordered_json& data) {
  return planner::report::JsonText(data);
}

void RefuseMistakes(const planner::read::Mistakes& mistakes) {
  ordered_json data = ordered_json::array();
  for (const auto& mistake : mistakes) data.push_back(planner::report::MistakeData(mistake));
  Refuse("raise_request", data);
}

void RefuseArguments(const planner::read::Mistakes& mistakes) {
  ordered_json data = ordered_json::array();
  for (const auto& mistake : mistakes) {
    ordered_json one = planner::report::MistakeData(mistake);
    if (Find(mistake.place.entry) != nullptr) one["entry"] = ArgumentOf(mistake.place.entry);
    one["message"] = WithArguments(one["message"].get<string>());
    data.push_back(std::move(one));
  }
  Refuse("raise_request", data);
}

void RefuseEntry(const string& kind, const string& entry, const string& text,
                 const string& message) {
  Refuse("raise_request", ordered_json::array({{{"kind", kind},
                                                {"entry", entry},
                                                {"text", text},
                                                {"known", ordered_json::array()},
                                                {"message", message}}}));
}

void RefusePart(const planner::device::PartError& error) {
  Refuse("raise_request", ordered_json::array({planner::report::PartErrorData(error)}));
}

void RefuseUnsolved(const std::vector<planner::Answer>& refused, const planner::Device& device) {
  ordered_json data = ordered_json::array();
  for (const auto& answer : refused) {
    data.push_back(planner::report::RefusedData(answer, device));
  }
  Refuse("raise_unsolved", data);
}

}  // namespace python
