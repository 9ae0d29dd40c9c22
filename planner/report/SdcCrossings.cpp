// Tested by sdc_crossings_test.cpp.
#include "planner/report/SdcCrossings.h"

#include <algorithm>
#include <cstddef>
#include <map>
#include <optional>
#include <utility>
#include <vector>

#include "planner/report/Numbers.h"
#include "planner/report/Relations.h"
#include "planner/report/SdcWords.h"

namespace planner::report {

namespace {

using relations::Clock;
using relations::Crossing;
using relations::Relation;
using relations::Relations;
using std::string;

// --- Uncertainties --------------------------------------------------------------------------

// Down to a ten-thousandth of a fs.
constexpr int kUncertaintyDecimals = 10;

// Of paths from one clock to another, ns; nothing when it is that of the capturing clock.
std::optional<Rational> Between(const Answer& answer, const Clock& from, const Clock& to) {
  // Jitter and phase error are worked out for the first input.
  if (from.input != 0 || to.input != 0) return std::nullopt;
  const bool has_input = from.IsInput() || to.IsInput();
  if (!has_input && IsLoop(answer.primitive)) return std::nullopt;
  if (!from.jitter || !to.jitter || (has_input && !answer.phase_error)) return std::nullopt;
  Rational picoseconds =
      (Rational::FromDouble(*from.jitter) + Rational::FromDouble(*to.jitter)) / 2;
  if (has_input) picoseconds += Rational::FromDouble(*answer.phase_error);
  return picoseconds / 1000;
}

string Uncertainty(const string& value, const std::vector<string>& from,
                   const std::vector<string>& to) {
  return "set_clock_uncertainty " + value + " -from " + SdcClocks(from) + " -to " + SdcClocks(to) +
         "\n";
}

// From or to one clock: those on the other side with the same figure share a command.
string Uncertainties(const Request& request, const Answer& answer, const std::vector<Clock>& clocks,
                     std::size_t one, bool is_from) {
  std::vector<std::pair<string, std::vector<string>>> groups;
  for (std::size_t i = 1; i < clocks.size(); ++i) {
    if (i == one) continue;
    const auto value =
        is_from ? Between(answer, clocks[one], clocks[i]) : Between(answer, clocks[i], clocks[one]);
    if (!value) continue;
    const string text = Short(*value, kUncertaintyDecimals);
    auto group = std::find_if(groups.begin(), groups.end(),
                              [&](const auto& known) { return known.first == text; });
    if (group == groups.end()) group = groups.insert(group, {text, {}});
    group->second.push_back(ClockName(request, clocks[i]));
  }
  const std::vector<string> name = {ClockName(request, clocks[one])};
  string text;
  for (const auto& [value, names] : groups) {
    text += is_from ? Uncertainty(value, name, names) : Uncertainty(value, names, name);
  }
  return text;
}

// --- Crossings ------------------------------------------------------------------------------

// Commands, or the same as comments.
string Commands(const string& commands, bool are_said) {
  if (are_said) return commands;
  string text = "#";
  for (std::size_t i = 0; i < commands.size(); ++i) {
    text += commands[i];
    if (commands[i] == '\n' && i + 1 < commands.size()) text += '#';
  }
  return text;
}

class CrossingsText {
 public:
  CrossingsText(const Request& request, const Answer& answer, const SdcOptions& options)
      : request_(request),
        options_(options),
        relations_(RelationsOf(request, answer, options.rule)) {}

  string Text() const;

 private:
  string Head(bool any) const;
  string Fifo(const Relation& relation) const;
  string Relaxed(const Relation& relation) const;
  string Inputs() const;
  string FromTo(const Relation& relation) const;
  string Gap(const Relation& relation) const;
  const Rational& Shorter(const Relation& relation) const {
    return std::min(relations_.clocks[relation.from].period, relations_.clocks[relation.to].period);
  }
  string NameAt(std::size_t clock) const { return ClockName(request_, relations_.clocks[clock]); }

  const Request& request_;
  const SdcOptions& options_;
  const Relations relations_;
};

string CrossingsText::Head(bool any) const {
  const string limit = options_.rule.gap
                           ? SdcFigure(*options_.rule.gap) + " ns"
                           : SdcFigure(options_.rule.share * 100) + " % of the shorter period";
  if (!any) {
    return SdcComment(
        "Crossings: every path between two clocks is timed with the tightest gap between a "
        "launching and a capturing edge. No gap is below " +
        limit + ", and nothing has to be relaxed.");
  }
  string text =
      "Crossings: every path between two clocks is timed with the tightest gap between a launching "
      "and a capturing edge. The gaps below are less than " +
      limit + ", too small for a path. ";
  if (options_.fifos) {
    text +=
        "That all data which crosses there goes through a FIFO or a handshake has been said, "
        "and not been checked.";
  } else {
    text +=
        "The commands in comments are right where all data that crosses goes through a FIFO or "
        "a handshake; else they would hide paths that fail. They keep its bits within a period "
        "of the faster clock of each other.";
  }
  return SdcComment(text);
}

string CrossingsText::FromTo(const Relation& relation) const {
  return " -from " + SdcClocks({NameAt(relation.from)}) + " -to " +
         SdcClocks({NameAt(relation.to)}) + "\n";
}

string CrossingsText::Gap(const Relation& relation) const {
  return NameAt(relation.from) + " to " + NameAt(relation.to) + ": a gap of " +
         Distinct(relation.gaps.rise_rise, 0, 6) + " ns";
}

// No more than one period of the faster clock: then the bits of a pointer in Gray code, of which
// one changes at a time, come in their order. Hold has nothing to protect there.
string CrossingsText::Fifo(const Relation& relation) const {
  return SdcComment(Gap(relation) + ": a FIFO or a handshake.") +
         Commands("set_max_delay " + SdcExact(Shorter(relation)) + FromTo(relation) +
                      "set_false_path -hold" + FromTo(relation),
                  options_.fifos);
}

// One period of the faster clock more. The hold check moves along, to the near edge, which must be
// over before data comes: the tool then sees to that.
string CrossingsText::Relaxed(const Relation& relation) const {
  const bool by_capture = relation.captures >= relation.launches;
  return SdcComment(
             Gap(relation) +
             ", the same behind every launch. Where the design counts on data one "
             "period of the faster clock later, " +
             SdcFigure(relation.gaps.rise_rise + Shorter(relation)) +
             " ns, and so does its simulation, this says it; the hold check then asks every path "
             "to take more than the gap.") +
         Commands(string("set_multicycle_path 2 -setup ") + (by_capture ? "-end" : "-start") +
                      FromTo(relation),
                  false);
}

// Each input with what follows it.
string CrossingsText::Inputs() const {
  string groups = "set_clock_groups -asynchronous";
  for (int input = 0; input < 2; ++input) {
    std::vector<string> names;
    for (const Clock& clock : relations_.clocks) {
      if (clock.input == input) names.push_back(ClockName(request_, clock));
    }
    groups += " -group " + SdcClocks(names);
  }
  return "\n" +
         SdcComment(options_.fifos
                        ? "The inputs are taken as those of two oscillators."
                        : "The inputs are timed as if they came from one oscillator, which relaxes "
                          "nothing. Where each has its own, their edges are in no relation, all "
                          "data between them needs a FIFO or a handshake, and this says it.") +
         Commands(groups + "\n", options_.fifos);
}

string CrossingsText::Text() const {
  string list;
  for (const Relation& relation : relations_.all) {
    if (relation.crossing == Crossing::kFifo) list += Fifo(relation);
    if (relation.crossing == Crossing::kRelaxed) list += Relaxed(relation);
  }
  string text = "\n" + Head(!list.empty()) + list;
  return request_.inputs.size() > 1 ? text + Inputs() : text;
}

}  // namespace

string SdcInterclockUncertainties(const Request& request, const Answer& answer) {
  const std::vector<Clock> clocks = relations::ClocksOf(request, answer);
  string text = Uncertainties(request, answer, clocks, 0, true);
  for (std::size_t i = 0; i < clocks.size(); ++i) {
    text += Uncertainties(request, answer, clocks, i, false);
  }
  if (text.empty()) return "";
  const string off =
      " the edges of both can be off, each by half of its jitter, and those of an output also by "
      "the phase error to the input.";
  if (!IsLoop(answer.primitive)) return "\n" + SdcComment("Between two clocks" + off) + text;
  return "\n" +
         SdcComment("Between the input and an output" + off +
                    " All outputs follow one VCO: between two of them it is the uncertainty of the "
                    "capturing clock.") +
         text;
}

string SdcCrossings(const Request& request, const Answer& answer, const SdcOptions& options) {
  return CrossingsText(request, answer, options).Text();
}

}  // namespace planner::report
