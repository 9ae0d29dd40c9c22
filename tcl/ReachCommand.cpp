// Tested by reach.test.
#include <algorithm>
#include <optional>

#include "planner/reach/Reach.h"
#include "planner/read/MistakeText.h"
#include "planner/read/Units.h"
#include "planner/report/FindingText.h"
#include "planner/report/ReachText.h"
#include "tcl/Commands.h"
#include "tcl/Failure.h"
#include "tcl/Objects.h"

namespace tcl {

namespace {

using planner::Primitive;
using planner::Rational;
using planner::report::ReachQuestion;

constexpr std::size_t kMostOutput = 6;
constexpr std::size_t kUsualNear = 5;
// A dict is in memory as a whole.
constexpr std::size_t kUsualMost = 10'000;

std::optional<Rational> Frequency(const Given& given, const std::string& name) {
  const auto found = given.own.find(name);
  if (found == given.own.end()) return std::nullopt;
  planner::read::Mistakes mistakes;
  planner::read::Place place;
  place.entry = "--" + name;
  const auto value = planner::read::ReadValue(
      Text(found->second), planner::read::ValueKind::kFrequency, place, &mistakes);
  if (!value) throw Failure::OfMistakes(mistakes);
  return value;
}

bool IsSet(const Given& given, const std::string& name) {
  const auto found = given.own.find(name);
  if (found == given.own.end()) return false;
  const auto truth = Boolean(found->second);
  if (truth) return *truth;
  const std::string text = Text(found->second);
  throw Failure::OfUsage("not_a_switch", text, "-" + name + ": \"" + text + "\" must be a boolean");
}

ReachQuestion QuestionOf(const Given& given, std::size_t output) {
  ReachQuestion question;
  question.output = static_cast<int>(output);
  question.from = Frequency(given, "from");
  question.to = Frequency(given, "to");
  const auto near = Frequency(given, "near");
  const bool has_gaps = given.own.count("gaps") > 0;
  const bool counts = IsSet(given, "count");
  if (near.has_value() + has_gaps + counts > 1) {
    throw Failure::OfUsage("contradiction", "",
                           "-near, -gaps and -count are questions of their own");
  }
  if (near) {
    question.kind = ReachQuestion::Kind::kNear;
    question.near = *near;
    question.most = static_cast<std::int64_t>(given.Count("most", 1, kUsualNear));
  } else if (has_gaps) {
    question.kind = ReachQuestion::Kind::kGaps;
    question.most = static_cast<std::int64_t>(given.Count("gaps", 1, 1));
  } else if (counts) {
    question.kind = ReachQuestion::Kind::kCount;
  } else {
    question.most = static_cast<std::int64_t>(given.Count("most", 0, kUsualMost));
  }
  return question;
}

// The place of the output, which is needed before all else is read; it is looked at again there.
std::size_t PlaceOf(Words words) {
  for (std::size_t i = 0; i + 1 < words.size(); ++i) {
    const std::string word = Text(words[i]);
    if (word != "-output" && word != "--output") continue;
    int place = 0;
    if (Tcl_GetIntFromObj(nullptr, words[i + 1], &place) == TCL_OK && place >= 0 &&
        place <= static_cast<int>(kMostOutput)) {
      return static_cast<std::size_t>(place);
    }
    const std::string text = Text(words[i + 1]);
    throw Failure::OfUsage("must_be", text,
                           "-output: \"" + text + "\" must be a whole number from 0 to 6");
  }
  return 0;
}

// The words with an output at its place, whose frequency does not count, and with a value for a
// -count that has none. They live as long as this.
class WithOutput {
 public:
  WithOutput(Words words, std::size_t place) {
    for (std::size_t i = 0; i < words.size(); ++i) {
      words_.push_back(words[i]);
      const std::string word = Text(words[i]);
      if (word != "-count" && word != "--count") continue;
      if (i + 1 == words.size() || Text(words[i + 1]).starts_with("-")) Add("1");
    }
    std::string outputs;
    for (std::size_t i = 0; i < place; ++i) outputs += "- ";
    Add("-out");
    Add(outputs + "100");
  }
  ~WithOutput() {
    for (Tcl_Obj* const word : own_) Tcl_DecrRefCount(word);
  }
  WithOutput(const WithOutput&) = delete;
  WithOutput& operator=(const WithOutput&) = delete;
  Words words() const { return words_; }

 private:
  void Add(const std::string& text) {
    Tcl_Obj* const word = Object(text);
    Tcl_IncrRefCount(word);
    own_.push_back(word);
    words_.push_back(word);
  }

  std::vector<Tcl_Obj*> words_;
  std::vector<Tcl_Obj*> own_;
};

}  // namespace

std::string Reach(Words words) {
  const std::size_t place = PlaceOf(words);
  const WithOutput all(words, place);
  const Given given =
      ReadGiven(all.words(), {"output", "from", "to", "near", "gaps", "count", "most"});
  const ReachQuestion question = QuestionOf(given, place);
  const planner::reach::Askable askable = planner::reach::AskableOf(given.request(), given.device);
  if (askable.primitives.empty()) {
    throw Failure::OfUsage("no_primitive", given.device.part,
                           planner::report::RefusalText(askable.refused.back(), given.device));
  }
  std::string dict;
  WriteReachTcl(given.request(), given.device, question, askable.primitives, &dict);
  return dict;
}

}  // namespace tcl
