#include "tests/model/Step.h"

#include "tests/binding/ScriptCalls.h"

namespace model {

std::string List(const Words& words) {
  std::vector<const char*> texts;
  for (const std::string& word : words) texts.push_back(word.c_str());
  char* const list = Tcl_Merge(static_cast<int>(texts.size()), texts.data());
  const std::string text = list;
  Tcl_Free(list);
  return text;
}

std::string TextOf(const Step& step) {
  const std::string variable = "h" + std::to_string(step.handle);
  switch (step.kind) {
    case Step::Kind::kCreate:
      return "set " + variable + " [Ip::Vorkel::Init]";
    case Step::Kind::kRename:
      return "rename $" + variable + " " + List(step.words) + "; set " + variable + " " +
             List(step.words);
    case Step::Kind::kDestroy:
      return "rename $" + variable + " {}";
    case Step::Kind::kCall:
      break;
  }
  return "$" + variable + (step.words.empty() ? "" : " " + List(step.words));
}

}  // namespace model
