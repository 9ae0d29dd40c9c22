// Tested by why_test.cpp.
#include "planner/report/Why.h"

#include <algorithm>
#include <cstddef>
#include <vector>

#include "planner/report/FindingText.h"
#include "planner/report/Numbers.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using answer::Criterion;
using std::string;

string NameOf(const Answer& answer) { return string(Name(answer.primitive)); }

// Whether all tolerances are that of the request, and nothing but frequencies is asked for.
bool AsksForFrequenciesAlone(const Request& request) {
  return !request.AsksForShape() &&
         std::none_of(request.outputs.begin(), request.outputs.end(), [&](const Output& output) {
           return output.used && (output.tolerance || request.MaxJitterOf(output));
         });
}

bool HasOwnTolerances(const Request& request) {
  return std::any_of(request.outputs.begin(), request.outputs.end(),
                     [](const Output& output) { return output.used && output.tolerance; });
}

// The worst error of an answer, as it is ranked by.
string ErrorFigure(const Request& request, const Answer& answer) {
  if (AsksForFrequenciesAlone(request)) return Fixed(answer.worst_ppm, 2) + " ppm";
  return Fixed(answer.worst_error, 2) + " times its tolerance";
}

string Percent(const Rational& part) { return Fixed(part * 100, 2) + " %"; }
string Megahertz(const Rational& frequency) { return General(frequency, 6) + " MHz"; }

// By what answers that are as good as this one are ranked first.
Criterion FirstCriterion(const Request& request, const Answer& answer) {
  if (!answer.within) return Criterion::kWorstError;
  switch (request.rank) {
    case Rank::kJitter:
      return Criterion::kJitter;
    case Rank::kError:
      return Criterion::kWorstError;
    case Rank::kMargin:
      return Criterion::kMargin;
    case Rank::kVco:
      break;
  }
  return Criterion::kVco;
}

// What is the same where something else has decided.
string SameWords(const Request& request, const Answer& answer, Criterion decided) {
  const Criterion first = FirstCriterion(request, answer);
  if (decided == first || (decided == Criterion::kKnownJitter && first == Criterion::kJitter)) {
    return "";
  }
  switch (first) {
    case Criterion::kJitter:
      return answer.max_jitter ? "with the same jitter " : "without a known jitter ";
    case Criterion::kWorstError:
      return "with the same error ";
    case Criterion::kMargin:
      return "with the same margin ";
    default:
      return "with the same VCO ";
  }
}

// What an answer has before another one, behind its name; `verb` is has or have. `whose` is the
// name of the other.
string Advantage(const Request& request, const Answer& best, const Answer& other, Criterion decided,
                 const string& verb, const string& whose) {
  const string start = SameWords(request, best, decided) + verb + " ";
  switch (decided) {
    case Criterion::kKnownJitter:
      return start + "a jitter that is known, " + Ps(*best.max_jitter) + " ps";
    case Criterion::kJitter:
      return start + "the least jitter, " + Ps(*best.max_jitter) + " ps; " + whose + " has " +
             Ps(*other.max_jitter) + " ps";
    case Criterion::kWorstError:
      return start + "the smallest error, " + ErrorFigure(request, best) + "; " + whose + " has " +
             ErrorFigure(request, other);
    case Criterion::kMargin:
      return start + "the largest margin to the device's limits, " + Percent(best.margin) + "; " +
             whose + " has " + Percent(other.margin);
    case Criterion::kVco:
      return start + (request.prefer_max_vco ? "the highest" : "the lowest") + " VCO, " +
             Megahertz(best.vco);
    default:
      return string(verb == "has" ? "comes" : "come") + " first, with all that counts the same";
  }
}

// What the frequencies of all outputs are, behind "are" or "have".
string NearWords(const Request& request, bool are_all) {
  const string all = are_all ? "all " : "";
  if (HasOwnTolerances(request)) return "are " + all + "within their tolerances";
  if (request.tolerance == Rational(0)) return all + "have exact frequencies";
  return "are " + all + "within " + Short(request.tolerance, 6) + " ppm";
}

// The best answer of each primitive, the first of all first, with why they are behind it.
struct Best {
  const Answer* answer;
  Criterion decided;
};

std::vector<Best> BestOfEach(const plan::Plan& plan) {
  std::vector<Best> best = {{&plan.ranked.front(), Criterion::kNone}};
  for (const plan::Reason& reason : plan.among_primitives) {
    best.push_back({&plan.ranked[reason.second], reason.decided});
  }
  return best;
}

std::vector<string> NamesOf(const std::vector<Best>& best) {
  std::vector<string> names;
  for (const Best& one : best) names.push_back(NameOf(*one.answer));
  return names;
}

// Whether an answer that is not as asked for has all frequencies near enough.
bool HasFrequencies(const Answer& answer) {
  return std::all_of(answer.outputs.begin(), answer.outputs.end(), [](const auto& output) {
    return std::none_of(output.misses.begin(), output.misses.end(),
                        [](const Finding& miss) { return miss.quantity == Quantity::kFrequency; });
  });
}

// What is before other settings of the primitive.
string WhyOwn(const plan::Plan& plan) {
  if (!plan.among_own || plan.among_own->decided == Criterion::kClass) return "";
  const Answer& first = plan.ranked.front();
  const Answer& second = plan.ranked[plan.among_own->second];
  const string which = first.source.search ? "" : " that the engine answers";
  return ". Of the settings of the " + NameOf(first) + which + ", these " +
         Advantage(plan.request, first, second, plan.among_own->decided, "have", "the next");
}

string WhyMet(const plan::Plan& plan, const std::vector<Best>& best) {
  const Request& request = plan.request;
  const Answer& first = plan.ranked.front();
  std::vector<Best> met;
  std::copy_if(best.begin(), best.end(), std::back_inserter(met),
               [](const Best& one) { return one.answer->within; });
  if (best.size() + plan.refused.size() == 1) {
    return "all outputs of the " + NameOf(first) + " " + NearWords(request, false);
  }
  if (met.size() == 1) {
    const bool is_rivalled =
        std::any_of(plan.ranked.begin(), plan.ranked.end(), [&](const Answer& other) {
          return other.primitive != first.primitive && HasFrequencies(other);
        });
    return NameOf(first) + " is the only primitive " +
           (is_rivalled ? "with everything as asked for and in the device's range"
                        : "whose outputs " + NearWords(request, true));
  }
  return "of " + Enumerated(NamesOf(met)) + ", whose outputs " + NearWords(request, true) + ", " +
         NameOf(first) + " " +
         Advantage(request, first, *met[1].answer, met[1].decided, "has",
                   "the " + NameOf(*met[1].answer));
}

string WhyMissed(const plan::Plan& plan, const std::vector<Best>& best) {
  const Answer& first = plan.ranked.front();
  std::vector<Best> equal;
  std::copy_if(best.begin(), best.end(), std::back_inserter(equal), [](const Best& one) {
    return one.decided != Criterion::kClass && one.decided != Criterion::kWorstError;
  });
  string text = "nothing is as asked for; of all ";
  text += first.source.search ? "settings in the device's range" : "that the engine answers";
  if (equal.size() == 1) {
    return text + " those of the " + NameOf(first) + " come nearest: " + WorstMissText(first);
  }
  return text + " those of " + Enumerated(NamesOf(equal)) + " come equally near, and the " +
         NameOf(first) + " " +
         Advantage(plan.request, first, *equal[1].answer, equal[1].decided, "has",
                   "the " + NameOf(*equal[1].answer));
}

// Whether nothing of an answer is near what was asked for.
bool IsFar(const Answer& answer) { return answer.worst_ppm > Rational(kFarPpm); }

string WhyBroken(const Answer& first, const Device& device) {
  string text = "nothing is as asked for and in the device's range: with the " + NameOf(first) +
                ", " + FindingText(first.violations.front(), device);
  const std::size_t more = first.violations.size() - 1;
  if (more > 0) {
    text += " (" + std::to_string(more) + " more such " + (more > 1 ? "notes are" : "note is") +
            " above)";
  }
  return text + ". What is out of range ranks behind all that is only off";
}

}  // namespace

string WhyText(const plan::Plan& plan, const Device& device) {
  const Answer& first = plan.ranked.front();
  if (!first.violations.empty()) return WhyBroken(first, device) + ".";
  const std::vector<Best> best = BestOfEach(plan);
  if (!first.within) {
    const string far = " No setting comes near what is asked for; explain tells why.";
    return WhyMissed(plan, best) + "." + (IsFar(first) ? far : "");
  }
  return WhyMet(plan, best) + WhyOwn(plan) + ".";
}

string OrderWords(const Request& request) {
  const string vco = request.prefer_max_vco ? "highest VCO" : "lowest VCO";
  std::vector<string> words = {"least jitter", "smallest error", vco};
  switch (request.rank) {
    case Rank::kJitter:
      break;
    case Rank::kError:
      words = {"smallest error", "least jitter", vco};
      break;
    case Rank::kMargin:
      words.insert(words.begin(), "largest margin to the device's limits");
      break;
    case Rank::kVco:
      words = {vco, "least jitter", "smallest error"};
      break;
  }
  return Join(words, ", then ");
}

string LossText(const Request& request, const Device& device, const Answer& better,
                const Answer& answer, Criterion decided) {
  switch (decided) {
    case Criterion::kClass:
      if (!answer.violations.empty()) {
        return "but " + FindingText(answer.violations.front(), device);
      }
      return "but " + WorstMissText(answer);
    case Criterion::kWorstError:
      return "with an error of " + ErrorFigure(request, answer) + " instead of " +
             ErrorFigure(request, better);
    case Criterion::kKnownJitter:
      return "with a jitter that is not known";
    case Criterion::kJitter:
      return "with " + Ps(*answer.max_jitter - *better.max_jitter) + " ps more jitter, " +
             Ps(*answer.max_jitter) + " ps";
    case Criterion::kMargin:
      return "with a margin of " + Percent(answer.margin) + " instead of " + Percent(better.margin);
    case Criterion::kVco:
      return "with a VCO of " + Megahertz(answer.vco) + " instead of " + Megahertz(better.vco);
    default:
      return "as good in all that counts";
  }
}

string LossCell(const Answer& better, const Answer& answer, Criterion decided) {
  switch (decided) {
    case Criterion::kKnownJitter:
      return "jitter not known";
    case Criterion::kJitter: {
      const bool is_visible = Ps(*answer.max_jitter) != Ps(*better.max_jitter);
      return is_visible ? Ps(*answer.max_jitter - *better.max_jitter) + " ps more"
                        : "the same jitter";
    }
    case Criterion::kWorstError:
      return "larger error";
    case Criterion::kMargin:
      return "smaller margin";
    case Criterion::kVco:
      return answer.vco > better.vco ? "higher VCO" : "lower VCO";
    default:
      return "as good";
  }
}

}  // namespace planner::report
