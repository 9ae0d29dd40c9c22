// Tested by json_test.cpp.
#include "planner/report/Json.h"

#include <algorithm>
#include <nlohmann/json.hpp>

#include "planner/PlanVersion.h"
#include "planner/answer/Moved.h"
#include "planner/answer/Rank.h"
#include "planner/report/Data.h"
#include "planner/report/FrontText.h"
#include "planner/report/JsonText.h"
#include "planner/report/TclDict.h"

namespace planner::report {

namespace {

using nlohmann::ordered_json;
using std::string;

// The units of all numbers of a document.
ordered_json UnitsData() {
  return {{"frequency", "MHz"},
          {"frequency_error", "ppm"},
          {"phase", "degrees"},
          {"duty", "percent"},
          {"jitter", "ps, peak to peak at a bit error rate of 1e-12"},
          {"jitter_rms", "ps, rms of the random part"},
          {"phase_error_of_primitive", "ps"}};
}

ordered_json EntryData(const Request& request, const Device& device, const Entry& entry) {
  ordered_json data = ObjectOf(kMembersOfAnswer + 2);
  data["number"] = entry.number > 0 ? ordered_json(entry.number) : ordered_json(nullptr);
  data["tradeoff"] = entry.is_tradeoff;
  AddAnswer(&data, request, device, *entry.answer);
  return data;
}

ordered_json Document(const Request& request, const Device& device,
                      const std::vector<Entry>& entries, const std::vector<Primitive>& front_cut) {
  ordered_json data = ordered_json::object();
  data["format"] = "vorkel-plan";
  data["version"] = kPlanVersion;
  data["units"] = UnitsData();
  data["request"] = RequestData(request, device);
  data["answers"] = ordered_json::array();
  for (const Entry& entry : entries) data["answers"].push_back(EntryData(request, device, entry));
  data["tradeoffs_cut"] = ordered_json::array();
  for (const Primitive primitive : front_cut) data["tradeoffs_cut"].push_back(Name(primitive));
  return data;
}

// Whether two answers are the same settings, with the outputs at the same places.
bool AreSame(const Request& request, const Answer& a, const Answer& b) {
  return answer::SameSettings(a, b) && answer::OrderOf(request, a) == answer::OrderOf(request, b);
}

// The number in the ranking of an answer with such settings; 0 when there is none.
std::size_t NumberOf(const plan::Plan& plan, const Answer& answer) {
  for (std::size_t i = 0; i < plan.ranked.size(); ++i) {
    if (AreSame(plan.request, plan.ranked[i], answer)) return i + 1;
  }
  return 0;
}

bool IsTradeoff(const plan::Plan& plan, const Answer& answer) {
  return std::any_of(plan.front.begin(), plan.front.end(),
                     [&](const Answer& one) { return AreSame(plan.request, one, answer); });
}

Entry EntryOf(const plan::Plan& plan, std::size_t number) {
  const Answer* answer = plan.Pick(number);
  return {answer, number, IsTradeoff(plan, *answer)};
}

}  // namespace

std::vector<Entry> PlanEntries(const plan::Plan& plan, std::size_t number) {
  return {EntryOf(plan, number)};
}

std::vector<Entry> CompareEntries(const plan::Plan& plan) {
  std::vector<Entry> entries;
  for (std::size_t i = 0; i < plan.ranked.size(); ++i) entries.push_back(EntryOf(plan, i + 1));
  for (const Answer& answer : plan.refused) entries.push_back({&answer});
  return entries;
}

std::vector<Entry> BestEntries(const plan::Plan& plan, std::size_t number, std::size_t most) {
  std::vector<Entry> entries = PlanEntries(plan, number);
  const auto add = [&](const Answer& answer) {
    const bool is_there = std::any_of(entries.begin(), entries.end(), [&](const Entry& entry) {
      return AreSame(plan.request, *entry.answer, answer);
    });
    if (!is_there) entries.push_back({&answer, NumberOf(plan, answer), IsTradeoff(plan, answer)});
  };
  add(plan.ranked.front());
  for (const plan::Reason& reason : plan.among_primitives) add(plan.ranked[reason.second]);
  std::vector<const Answer*> tradeoffs = Tradeoffs(plan);
  tradeoffs.resize(std::min(most, tradeoffs.size()));
  for (const Answer* answer : tradeoffs) add(*answer);
  if (const Answer* engine = plan.FirstOfEngine()) add(*engine);
  return entries;
}

string Json(const Request& request, const Device& device, const std::vector<Entry>& entries,
            const std::vector<Primitive>& front_cut) {
  return JsonText(Document(request, device, entries, front_cut), 2) + "\n";
}

string JsonLine(const Request& request, const Device& device, const std::vector<Entry>& entries,
                const std::vector<Primitive>& front_cut) {
  return JsonText(Document(request, device, entries, front_cut));
}

string Tcl(const Request& request, const Device& device, const std::vector<Entry>& entries,
           const std::vector<Primitive>& front_cut) {
  return TclDict(Document(request, device, entries, front_cut));
}

}  // namespace planner::report
