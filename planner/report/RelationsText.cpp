// Tested by relations_text_test.cpp.
#include <algorithm>
#include <cassert>
#include <cstddef>
#include <set>
#include <vector>

#include "planner/report/FindingText.h"
#include "planner/report/Numbers.h"
#include "planner/report/Relations.h"
#include "planner/report/SettingsText.h"
#include "planner/report/Table.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using relations::Clock;
using relations::Crossing;
using relations::Relation;
using relations::Relations;
using std::string;

constexpr int kTimeDecimals = 6;  // of a ns: down to a fs
constexpr int kPhaseDecimals = 3;

// A time above 0 is never shown as 0.
string Time(const Rational& ns) { return Distinct(ns, 0, kTimeDecimals); }

string CrossingWord(Crossing crossing) {
  switch (crossing) {
    case Crossing::kSingleCycle:
      return "single cycle";
    case Crossing::kMulticycle:
      return "multicycle";
    case Crossing::kPhase:
      return "phase";
    case Crossing::kShort:
      return "short";
    case Crossing::kRelaxed:
      return "relaxed";
    case Crossing::kFifo:
      return "FIFO";
    case Crossing::kUnrelated:  // not reached: clocks of one input are related
      break;                    // not reached: as above
  }
  return (assert(false), "");  // not reached: as above
}

// What such a word means.
string Meaning(Crossing crossing) {
  switch (crossing) {
    case Crossing::kSingleCycle:
      return "the same frequency and phase. As within one clock.";
    case Crossing::kMulticycle:
      return "one is a whole multiple of the other, and they rise together. Timed with a period of "
             "the faster clock; where an enable says which of its edges count, a multicycle path "
             "gives data up to a period of the slower one.";
    case Crossing::kPhase:
      return "the same frequency at another phase. Timed as it stands, with the gap.";
    case Crossing::kShort:
      return "timed as it stands, with less than a period of the faster clock: keep the logic "
             "between short.";
    case Crossing::kRelaxed:
      return "the gap is too small, but the same behind every launch. It needs a relaxed "
             "constraint: a multicycle path of 2 gives data a period of the faster clock more, if "
             "no "
             "path is shorter than the gap; else a FIFO or a handshake.";
    case Crossing::kFifo:
      return "synchronous, but the gap is too small: data needs a FIFO or a handshake.";
    case Crossing::kUnrelated:  // not reached: clocks of one input are related
      break;                    // not reached: as above
  }
  return (assert(false), "");  // not reached: as above
}

class Texts {
 public:
  Texts(const Request& request, const Device& device, const Answer& answer,
        const relations::Rule& rule, const Style& style)
      : request_(request),
        device_(device),
        answer_(answer),
        rule_(rule),
        style_(style),
        relations_(RelationsOf(request, answer, rule)) {}

  string Head() const;
  // All tables of the clocks with one input.
  string WithInput(int input) const;
  string Meanings() const;
  string Fifos() const;
  string TwoInputs() const;

  bool HasTwoInputs() const { return request_.inputs.size() > 1; }

 private:
  string ClockTable(int input) const;
  string RelationTable(int input) const;
  string FallTable(int input) const;
  bool IsOf(const Relation& relation, int input) const;
  // What a clock is called beside others of the same input: "in", "out0".
  string ClockWord(std::size_t clock) const;

  const Request& request_;
  const Device& device_;
  const Answer& answer_;
  const relations::Rule& rule_;
  const Style& style_;
  const Relations relations_;
};

string Texts::ClockWord(std::size_t clock) const {
  const Clock& one = relations_.clocks[clock];
  return one.IsInput() ? "in" : "out" + std::to_string(one.output);
}

bool Texts::IsOf(const Relation& relation, int input) const {
  return relation.IsSynchronous() && relations_.clocks[relation.from].input == input;
}

string Texts::Head() const {
  std::vector<string> inputs;
  for (const Rational& input : request_.inputs) {
    inputs.push_back(Short(input, kFrequencyDecimals) + " MHz");
  }
  const string limit = rule_.gap ? Time(*rule_.gap) + " ns"
                                 : Short(rule_.share * 100, 3) + " % of the shorter period";
  return PairsText({{"device", device_.part + " " + string(Name(answer_.primitive))},
                    {"input", Enumerated(inputs)},
                    {"settings", SettingsWords(answer_.settings)},
                    {"least gap", limit}});
}

string Texts::ClockTable(int input) const {
  std::vector<Row> rows;
  for (std::size_t i = 0; i < relations_.clocks.size(); ++i) {
    const Clock& clock = relations_.clocks[i];
    if (clock.input != input) continue;
    std::vector<string> names = {ClockWord(i)};
    for (const int output : clock.also) names.push_back("out" + std::to_string(output));
    rows.push_back({{Join(names, ","), Fixed(Rational(1000) / clock.period, kFrequencyDecimals),
                     Time(clock.period), Time(clock.rise), Time(clock.Fall())}});
  }
  return FittedTable(style_,
                     {{Align::kLeft, "clock"},
                      {Align::kRight, "MHz"},
                      {Align::kRight, "period ns"},
                      {Align::kRight, "rises ns"},
                      {Align::kRight, "falls ns"}},
                     rows);
}

string Texts::RelationTable(int input) const {
  std::vector<Row> rows;
  for (const Relation& one : relations_.all) {
    if (!IsOf(one, input)) continue;
    rows.push_back(
        {{ClockWord(one.from), ClockWord(one.to), Quotient(one.ratio),
          Fixed(one.phase, kPhaseDecimals), Time(one.gaps.rise_rise), Time(one.hyperperiod),
          Quotient(one.launches) + ":" + Quotient(one.captures), CrossingWord(one.crossing)}});
    if (one.NeedsFifo()) rows.back().last = Role::kOff;
  }
  return FittedTable(style_,
                     {{Align::kLeft, "from"},
                      {Align::kLeft, "to"},
                      {Align::kRight, "ratio"},
                      {Align::kRight, "phase deg"},
                      {Align::kRight, "gap ns"},
                      {Align::kRight, "hyperperiod ns"},
                      {Align::kRight, "edges"},
                      {Align::kLeft, "crossing"}},
                     rows);
}

string Texts::FallTable(int input) const {
  std::vector<Row> rows;
  for (const Relation& one : relations_.all) {
    if (!IsOf(one, input)) continue;
    rows.push_back({{ClockWord(one.from), ClockWord(one.to), Time(one.gaps.rise_fall),
                     Time(one.gaps.fall_rise), Time(one.gaps.fall_fall), Time(one.hold)}});
  }
  return FittedTable(style_,
                     {{Align::kLeft, "from"},
                      {Align::kLeft, "to"},
                      {Align::kRight, "rise to fall"},
                      {Align::kRight, "fall to rise"},
                      {Align::kRight, "fall to fall"},
                      {Align::kRight, "hold"}},
                     rows);
}

string Texts::WithInput(int input) const {
  string text = "\n";
  if (HasTwoInputs()) {
    text += "with input " + std::to_string(input + 1) + ", " +
            Short(request_.inputs[static_cast<std::size_t>(input)], kFrequencyDecimals) +
            " MHz:\n\n";
  }
  return text + ClockTable(input) + "\n" + RelationTable(input) + "\n" + FallTable(input);
}

string Texts::Meanings() const {
  std::set<Crossing> there;
  for (const Relation& one : relations_.all) {
    if (one.IsSynchronous()) there.insert(one.crossing);
  }
  string text;
  for (const Crossing crossing : there) {
    text += Prose(style_, CrossingWord(crossing) + ": ", Meaning(crossing));
  }
  return text + Prose(style_, "hold: ",
                      "by how much a capturing edge is before a launch at least; 0 is the usual "
                      "hold check.");
}

// A pair that needs one in both directions is named once.
string Texts::Fifos() const {
  const auto needs = [&](std::size_t from, std::size_t to) {
    return std::any_of(relations_.all.begin(), relations_.all.end(), [&](const Relation& one) {
      return one.from == from && one.to == to && one.crossing == Crossing::kFifo;
    });
  };
  std::vector<string> pairs;
  for (const Relation& one : relations_.all) {
    if (one.crossing != Crossing::kFifo) continue;
    const bool is_both = needs(one.to, one.from);
    if (is_both && one.from > one.to) continue;
    string pair = ClockWord(one.from) + (is_both ? " and " : " to ") + ClockWord(one.to);
    if (HasTwoInputs()) {
      pair += " with input " + std::to_string(relations_.clocks[one.from].input + 1);
    }
    pairs.push_back(pair);
  }
  if (pairs.empty()) return "FIFO or handshake: no crossing needs one\n";
  return Prose(style_, "FIFO or handshake: ", Join(pairs, "; "));
}

string Texts::TwoInputs() const {
  return Prose(
      style_, "two inputs: ",
      "they are not related, unless both come from one oscillator: data from one input to "
      "the other, or to the outputs while they follow the other, needs a FIFO. The outputs "
      "with one input and those with the other are never there together.");
}

}  // namespace

string RelationsText(const Request& request, const Device& device, const Answer& answer,
                     const relations::Rule& rule, const Style& style) {
  const Texts texts(request, device, answer, rule, style);
  string text = texts.Head();
  for (std::size_t input = 0; input < request.inputs.size(); ++input) {
    text += texts.WithInput(static_cast<int>(input));
  }
  text += "\n" + texts.Meanings() + texts.Fifos();
  if (texts.HasTwoInputs()) text += texts.TwoInputs();
  // What is off has its crossings all the same.
  for (const std::vector<string>& off :
       {MissTexts(answer), FindingTexts(answer.violations, device, answer)}) {
    for (const string& one : off) text += Prose(style, "note: ", one);
  }
  return text;
}

}  // namespace planner::report
