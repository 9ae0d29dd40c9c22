// Tested by plan_text_test.cpp.
#include "planner/report/PlanText.h"

#include <algorithm>
#include <set>
#include <utility>
#include <vector>

#include "planner/report/Cells.h"
#include "planner/report/FindingText.h"
#include "planner/report/FrontText.h"
#include "planner/report/Numbers.h"
#include "planner/report/ReportText.h"
#include "planner/report/SettingsText.h"
#include "planner/report/Table.h"
#include "planner/report/Why.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using answer::Criterion;
using std::string;

string NameOf(const Answer& answer) { return string(Name(answer.primitive)); }

string Hint(const string& what, const string& call) {
  return call.empty() ? "" : "hint: " + what + call + "\n";
}

// "smallest VCO, bandwidth HIGH"; empty when there is nothing to tell.
string VariantWords(const Answer& answer) {
  std::vector<string> words;
  if (!answer.source.variant.empty()) words.push_back(answer.source.variant);
  if (IsLoop(answer.primitive)) words.push_back("bandwidth " + BandwidthCell(answer));
  return Join(words, ", ");
}

// One plan, in the terms of its texts.
class Texts {
 public:
  Texts(const plan::Plan& plan, const Device& device, const Style& style, const Calls& calls)
      : plan_(plan), request_(plan.request), device_(device), style_(style), calls_(calls) {}

  // The best of each primitive; empty when there is only one.
  string Contest() const;
  // All candidates, with their numbers.
  string Ranking() const;
  // What the table of candidates does not say by itself.
  string RankingNotes() const;
  // Whether the design flow's own search takes candidate `number`, or what it takes instead.
  string Engine(std::size_t number) const;
  string Why(std::size_t number) const;
  string Refusals() const;
  // Of which primitives some trade-offs are left out.
  string FrontCut() const;
  string Hints(std::size_t number, bool has_front) const;
  // Whose jitter is shown: what kind of figure it is.
  string JitterNote() const;

 private:
  const Answer& At(std::size_t place) const { return plan_.ranked[place]; }
  MarkedRow ContestRow(const plan::Reason& reason) const;
  string Silence(Primitive primitive) const;

  const plan::Plan& plan_;
  const Request& request_;
  const Device& device_;
  const Style& style_;
  const Calls& calls_;
};

MarkedRow Texts::ContestRow(const plan::Reason& reason) const {
  const Answer& first = At(reason.first);
  const Answer& answer = At(reason.second);
  const bool is_best = reason.first == reason.second;
  MarkedRow row{NameOf(answer),
                {NameOf(answer), SourceCell(answer), BandwidthCell(answer), PpmCell(answer),
                 JitterCell(answer.max_jitter)},
                is_best ? "best, but " : "",
                is_best ? "best" : LossCell(first, answer, reason.decided),
                OffWords(answer)};
  return row;
}

string Texts::Contest() const {
  if (plan_.among_primitives.size() + plan_.refused.size() == 0) return "";
  std::vector<MarkedRow> rows = {ContestRow({0, 0, Criterion::kNone})};
  for (const plan::Reason& reason : plan_.among_primitives) rows.push_back(ContestRow(reason));
  for (const Answer& answer : plan_.refused) {
    rows.push_back(
        {NameOf(answer), {NameOf(answer), "-", "-", "-", "-"}, "", "no configuration", {}});
  }
  return MarkedTable(style_,
                     {{Align::kLeft, "primitive"},
                      {Align::kLeft, "source"},
                      {Align::kLeft, "loop"},
                      {Align::kRight, "worst ppm"},
                      {Align::kRight, "jitter ps"}},
                     "result", rows);
}

string Texts::Ranking() const {
  const bool has_margin = request_.rank == Rank::kMargin;
  std::vector<MarkedRow> rows;
  for (std::size_t i = 0; i < plan_.ranked.size(); ++i) {
    const Answer& answer = At(i);
    const string number = std::to_string(i + 1);
    rows.push_back({number,
                    {number, NameOf(answer), SourceCell(answer), BandwidthCell(answer),
                     VcoCell(answer), PpmCell(answer), JitterCell(answer.max_jitter)},
                    "",
                    "",
                    OffWords(answer)});
    if (has_margin) rows.back().cells.push_back(Fixed(answer.margin * 100, 2));
  }
  std::vector<Column> columns = {{Align::kRight, "#"},        {Align::kLeft, "primitive"},
                                 {Align::kLeft, "source"},    {Align::kLeft, "loop"},
                                 {Align::kRight, "VCO MHz"},  {Align::kRight, "worst ppm"},
                                 {Align::kRight, "jitter ps"}};
  if (has_margin) columns.push_back({Align::kRight, "margin %"});
  return MarkedTable(style_, std::move(columns), "off", rows);
}

string Texts::RankingNotes() const {
  const auto any = [&](auto holds) {
    return std::any_of(plan_.ranked.begin(), plan_.ranked.end(), holds);
  };
  string text;
  if (any([](const Answer& answer) { return answer.within; })) {
    text += Prose(style_, "order: ", OrderWords(request_) + ".");
  }
  if (any([](const Answer& answer) { return !answer.violations.empty(); })) {
    text +=
        Prose(style_, "", "Rows with something out of the device's range come after all others.");
  }
  if (any([](const Answer& answer) { return !answer.within && answer.violations.empty(); })) {
    text += Prose(style_, "",
                  "Rows that are off are ranked by their worst error, counted in tolerances of "
                  "what was asked for.");
  }
  std::set<string> sources;
  for (const Answer& answer : plan_.ranked) sources.insert(SourceCell(answer));
  std::vector<string> meanings;
  if (sources.count("engine") + sources.count("both") > 0) {
    meanings.emplace_back("engine is what the design flow's own search answers");
  }
  if (sources.count("search") + sources.count("both") > 0) {
    meanings.emplace_back("search is the best of all settings that the device allows");
  }
  if (sources.count("both") > 0) meanings.emplace_back("both is the one as well as the other");
  text += Prose(style_, "source: ", Join(meanings, "; ") + ".");
  return text + JitterNote();
}

string Texts::JitterNote() const {
  const bool is_shown = std::any_of(plan_.ranked.begin(), plan_.ranked.end(), HasJitter);
  return is_shown ? Prose(style_, "jitter: ", "peak to peak, at a bit error rate of 1e-12.") : "";
}

// What the engine says of a primitive for which it has nothing.
string Texts::Silence(Primitive primitive) const {
  for (const Answer& answer : plan_.engine_refused) {
    if (answer.primitive != primitive) continue;
    return "; of the " + NameOf(answer) + " it says: " + RefusalText(answer, device_);
  }
  return ".";
}

string Texts::Engine(std::size_t number) const {
  if (request_.engine_only) return "";
  const string label = "engine: ";
  const string whose = "the design flow's own search ";
  const Answer& chosen = At(number - 1);
  if (chosen.source.engine) {
    const string variant = VariantWords(chosen);
    return Prose(style_, label,
                 whose + "takes these settings" + (variant.empty() ? "" : ": " + variant) + ".");
  }
  const Answer* first = plan_.FirstOfEngine();
  if (first == nullptr) {
    return Prose(style_, label, whose + "has no answer to this" + Silence(chosen.primitive));
  }
  const auto place = static_cast<std::size_t>(first - plan_.ranked.data());
  string text = whose + "does not take these settings; its best answer, number " +
                std::to_string(place + 1) + " of compare, is a " + NameOf(*first) + " with " +
                SettingsWords(first->settings);
  if (place >= number) {
    text += ", " +
            LossText(request_, device_, chosen, *first, answer::Decided(request_, chosen, *first));
  }
  return Prose(style_, label, text + ".");
}

string Texts::Why(std::size_t number) const {
  if (number == 1) return Prose(style_, "why: ", WhyText(plan_, device_));
  const Answer& chosen = At(number - 1);
  const Answer& first = At(0);
  const string text =
      "this is number " + std::to_string(number) + " of " + std::to_string(plan_.ranked.size()) +
      "; the best is a " + NameOf(first) + " with " + SettingsWords(first.settings) +
      ", and this is behind it, " +
      LossText(request_, device_, first, chosen, answer::Decided(request_, first, chosen));
  return Prose(style_, "why: ", text + ".");
}

string Texts::FrontCut() const {
  string text;
  for (const Primitive primitive : plan_.front_cut) {
    text += Prose(style_, "note: ",
                  "the " + string(Name(primitive)) +
                      " has more trade-offs than are kept; those with the larger errors are not "
                      "there");
  }
  return text;
}

string Texts::Refusals() const {
  string text;
  for (const Answer& answer : plan_.refused) {
    text += Prose(style_, NameOf(answer) + ": ", RefusalText(answer, device_));
  }
  return text;
}

string Texts::Hints(std::size_t number, bool has_front) const {
  const Answer& chosen = At(number - 1);
  string text;
  if (!chosen.within) {
    text += Hint("what stands in the way: ", calls_.explain);
  } else if (!plan_.refused.empty()) {
    std::vector<string> names;
    for (const Answer& answer : plan_.refused) names.push_back(NameOf(answer));
    text += Hint("more on " + Enumerated(names) + ": ", calls_.explain);
  }
  if (has_front && Tradeoffs(plan_).size() > 1) {
    text += Hint("trade-offs between error and jitter: ", calls_.best);
  }
  if (IsLoop(chosen.primitive) && request_.input_jitter == Rational(0) && chosen.max_jitter) {
    text += Prose(style_, "hint: ",
                  "this is for an input clock without jitter; --input-jitter PS tells that of "
                  "yours, which can make another bandwidth the best");
  }
  return text;
}

string Body(const plan::Plan& plan, const Device& device, std::size_t number, const Style& style,
            const Texts& texts, const string& front, bool has_front) {
  string text = ReportText(plan.request, device, *plan.Pick(number), style);
  const string contest = texts.Contest();
  if (!contest.empty()) text += "\n" + contest;
  text += "\n" + texts.Why(number) + texts.Engine(number) + texts.JitterNote();
  if (!front.empty()) text += "\n" + front + texts.FrontCut() + "\n";
  return text + texts.Refusals() + texts.Hints(number, has_front);
}

}  // namespace

string PlanText(const plan::Plan& plan, const Device& device, std::size_t number,
                const Style& style, const Calls& calls) {
  const Texts texts(plan, device, style, calls);
  return Body(plan, device, number, style, texts, "", true);
}

string BestText(const plan::Plan& plan, const Device& device, std::size_t number, std::size_t most,
                const Style& style, const Calls& calls) {
  const Texts texts(plan, device, style, calls);
  return Body(plan, device, number, style, texts, FrontText(plan, most, style), false);
}

string CompareText(const plan::Plan& plan, const Device& device, const Style& style,
                   const Calls& calls) {
  const Texts texts(plan, device, style, calls);
  return texts.Ranking() + "\n" + texts.RankingNotes() + texts.Refusals() +
         Hint("the report on a row: ", calls.pick) + texts.Hints(1, true);
}

string UnsolvedText(const plan::Plan& plan, const Device& device, const Style& style,
                    const Calls& calls) {
  const Texts texts(plan, device, style, calls);
  return "no primitive of " + device.part + " has a configuration for this\n" + texts.Refusals() +
         Hint("", calls.explain);
}

string UnsolvedText(const Answer& answer, const Device& device, const string& cause,
                    const Style& style, const Calls& calls) {
  string text = RefusalText(answer, device) + "\n";
  if (!cause.empty()) text += Prose(style, "", cause);
  return text + Hint("what stands in the way: ", calls.explain);
}

}  // namespace planner::report
