// Tested by relations_data_test.cpp.
#include <nlohmann/json.hpp>
#include <optional>
#include <string_view>
#include <vector>

#include "planner/report/Data.h"
#include "planner/report/JsonText.h"
#include "planner/report/Relations.h"
#include "planner/report/TclDict.h"

namespace planner::report {

namespace {

using nlohmann::ordered_json;
using relations::Clock;
using relations::Crossing;
using relations::Relation;
using relations::Relations;
using std::string;

std::string_view CrossingName(Crossing crossing) {
  switch (crossing) {
    case Crossing::kSingleCycle:
      return "single_cycle";
    case Crossing::kMulticycle:
      return "multicycle";
    case Crossing::kPhase:
      return "phase";
    case Crossing::kShort:
      return "short";
    case Crossing::kRelaxed:
      return "relaxed";
    case Crossing::kFifo:
      return "fifo";
    case Crossing::kUnrelated:
      break;
  }
  return "unrelated";
}

ordered_json UnitsData() {
  return {{"frequency", "MHz"},
          {"time", "ns"},
          {"phase", "degrees of the capturing clock"},
          {"jitter", "ps, peak to peak at a bit error rate of 1e-12"}};
}

ordered_json OrNull(const std::optional<double>& value) {
  return value ? ordered_json(*value) : ordered_json(nullptr);
}

void AddExactOrNull(ordered_json* data, const string& name, const std::optional<Rational>& value) {
  if (value) return AddExact(data, name, *value);
  (*data)[name] = nullptr;
  (*data)[name + "_exact"] = nullptr;
}

ordered_json ClockData(const Request& request, const Clock& clock) {
  ordered_json data = ordered_json::object();
  data["name"] = ClockName(request, clock);
  data["input"] = clock.input;
  data["outputs"] = ordered_json::array();
  if (!clock.IsInput()) data["outputs"].push_back(clock.output);
  for (const int output : clock.also) data["outputs"].push_back(output);
  AddExact(&data, "frequency", Rational(1000) / clock.period);
  AddExact(&data, "period", clock.period);
  AddExact(&data, "rise", clock.rise);
  AddExact(&data, "fall", clock.Fall());
  data["jitter"] = OrNull(clock.jitter);
  return data;
}

// A whole number, of any size: as a text where it does not fit.
ordered_json WholeData(const Rational& value) {
  if (const auto whole = value.Whole()) return *whole;
  return value.NumeratorText();
}

ordered_json RelationData(const Request& request, const Relations& relations,
                          const Relation& relation) {
  const bool is_synchronous = relation.IsSynchronous();
  const auto known = [&](const Rational& value) {
    return is_synchronous ? std::optional(value) : std::nullopt;
  };
  ordered_json data = ordered_json::object();
  data["from"] = ClockName(request, relations.clocks[relation.from]);
  data["to"] = ClockName(request, relations.clocks[relation.to]);
  data["synchronous"] = is_synchronous;
  data["crossing"] = CrossingName(relation.crossing);
  data["fifo"] = relation.NeedsFifo();
  AddExactOrNull(&data, "ratio", known(relation.ratio));
  AddExactOrNull(&data, "hyperperiod", known(relation.hyperperiod));
  data["launches"] = is_synchronous ? WholeData(relation.launches) : ordered_json(nullptr);
  data["captures"] = is_synchronous ? WholeData(relation.captures) : ordered_json(nullptr);
  data["cycles"] = is_synchronous && relation.cycles != Rational(0) ? WholeData(relation.cycles)
                                                                    : ordered_json(nullptr);
  AddExactOrNull(&data, "phase", known(relation.phase));
  AddExactOrNull(&data, "gap", known(relation.gaps.rise_rise));
  AddExactOrNull(&data, "gap_rise_fall", known(relation.gaps.rise_fall));
  AddExactOrNull(&data, "gap_fall_rise", known(relation.gaps.fall_rise));
  AddExactOrNull(&data, "gap_fall_fall", known(relation.gaps.fall_fall));
  AddExactOrNull(&data, "hold", known(relation.hold));
  AddExactOrNull(&data, "limit", known(relation.limit));
  return data;
}

ordered_json Document(const Request& request, const Device& device, const Answer& answer,
                      const relations::Rule& rule) {
  const Relations relations = RelationsOf(request, answer, rule);
  ordered_json data = ordered_json::object();
  data["format"] = "vorkel-relations";
  data["version"] = kRelationsVersion;
  data["units"] = UnitsData();
  data["request"] = RequestData(request, device);
  data["answer"] = ObjectOf(kMembersOfAnswer);
  AddAnswer(&data["answer"], request, device, answer);
  data["rule"] = ordered_json::object();
  AddExactOrNull(&data["rule"], "gap", rule.gap);
  AddExactOrNull(&data["rule"], "share",
                 rule.gap ? std::nullopt : std::optional<Rational>(rule.share));
  data["clocks"] = ordered_json::array();
  for (const Clock& clock : relations.clocks) data["clocks"].push_back(ClockData(request, clock));
  data["relations"] = ordered_json::array();
  for (const Relation& one : relations.all) {
    data["relations"].push_back(RelationData(request, relations, one));
  }
  return data;
}

}  // namespace

string ClockName(const Request& request, const Clock& clock) {
  const string input = "in" + std::to_string(clock.input + 1);
  if (clock.IsInput()) return "clk_" + input;
  const string output = "clk_out" + std::to_string(clock.output);
  return request.inputs.size() > 1 ? output + "_" + input : output;
}

string RelationsJson(const Request& request, const Device& device, const Answer& answer,
                     const relations::Rule& rule) {
  return JsonText(Document(request, device, answer, rule), 2) + "\n";
}

string RelationsTcl(const Request& request, const Device& device, const Answer& answer,
                    const relations::Rule& rule) {
  return TclDict(Document(request, device, answer, rule));
}

}  // namespace planner::report
