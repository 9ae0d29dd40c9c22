// Tested by json_test.cpp.
#include "planner/report/Json.h"

#include <algorithm>
#include <nlohmann/json.hpp>

#include "planner/answer/Rank.h"
#include "planner/report/Data.h"
#include "planner/report/FrontText.h"
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
  ordered_json data;
  data["number"] = entry.number > 0 ? ordered_json(entry.number) : ordered_json(nullptr);
  data["tradeoff"] = entry.is_tradeoff;
  data.update(AnswerData(request, device, *entry.answer));
  return data;
}

ordered_json Document(const Request& request, const Device& device,
                      const std::vector<Entry>& entries,
                      const std::vector<plan::BoundWork>& bound) {
  ordered_json data;
  data["format"] = "vorkel-plan";
  data["version"] = kPlanVersion;
  data["units"] = UnitsData();
  data["request"] = RequestData(request, device);
  data["answers"] = ordered_json::array();
  for (const Entry& entry : entries) data["answers"].push_back(EntryData(request, device, entry));
  data["not_tried"] = ordered_json::array();
  for (const plan::BoundWork& work : bound) {
    data["not_tried"].push_back({{"primitive", Name(work.primitive)},
                                 {"orders_tried", work.tried},
                                 {"orders", work.all}});
  }
  return data;
}

bool IsThere(const std::vector<Entry>& entries, const Answer& answer) {
  return std::any_of(entries.begin(), entries.end(), [&](const Entry& entry) {
    return answer::SameSettings(*entry.answer, answer);
  });
}

// The number in the ranking of an answer with such settings; 0 when there is none.
std::size_t NumberOf(const plan::Plan& plan, const Answer& answer) {
  for (std::size_t i = 0; i < plan.ranked.size(); ++i) {
    if (answer::SameSettings(plan.ranked[i], answer)) return i + 1;
  }
  return 0;
}

bool IsTradeoff(const plan::Plan& plan, const Answer& answer) {
  return std::any_of(plan.front.begin(), plan.front.end(), [&](const Answer& one) {
    return answer::SameSettings(one, answer);
  });
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
    if (!IsThere(entries, answer)) {
      entries.push_back({&answer, NumberOf(plan, answer), IsTradeoff(plan, answer)});
    }
  };
  add(plan.ranked.front());
  for (const plan::Reason& reason : plan.among_primitives) add(plan.ranked[reason.second]);
  std::vector<const Answer*> tradeoffs = Tradeoffs(plan);
  tradeoffs.resize(std::min(most, tradeoffs.size()));
  for (const Answer* answer : tradeoffs) add(*answer);
  const auto engine = std::find_if(plan.ranked.begin(), plan.ranked.end(),
                                   [](const Answer& answer) { return answer.source.engine; });
  if (engine != plan.ranked.end()) add(*engine);
  return entries;
}

string Json(const Request& request, const Device& device, const std::vector<Entry>& entries,
            const std::vector<plan::BoundWork>& bound) {
  // What is no UTF-8 in a text of others is replaced.
  return Document(request, device, entries, bound)
             .dump(2, ' ', false, ordered_json::error_handler_t::replace) +
         "\n";
}

string Tcl(const Request& request, const Device& device, const std::vector<Entry>& entries,
           const std::vector<plan::BoundWork>& bound) {
  return TclDict(Document(request, device, entries, bound));
}

}  // namespace planner::report
