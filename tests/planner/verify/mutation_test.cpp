// Every entry of right plans is changed, one at a time: each change must be found and named.
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <functional>
#include <limits>
#include <nlohmann/json.hpp>

#include "planner/read/RequestJson.h"
#include "verify_support.h"

namespace planner::verify_test {

namespace {

using nlohmann::ordered_json;
using std::string;
using verify::Discrepancy;

// What stands in for an entry: other values of its kind, and of others.
std::vector<ordered_json> Others(const string& name, const ordered_json& value) {
  if (value.is_boolean()) return {!value.get<bool>()};
  if (value.is_number_integer()) {
    const auto number = value.get<std::int64_t>();
    std::vector<ordered_json> others = {number + 1, number - 1, "7", nullptr, 1e300};
    if (number != 0) others.emplace_back(-number);
    return others;
  }
  if (value.is_number()) {
    const double number = value.get<double>();
    std::vector<ordered_json> others = {std::nextafter(number, HUGE_VAL),
                                        std::nextafter(number, -HUGE_VAL), number + 1, nullptr};
    if (number != 0) others.emplace_back(-number);
    return others;
  }
  if (value.is_null()) return {1, 0.5};
  if (!value.is_string()) return {};
  const auto text = value.get<string>();
  if (!name.ends_with("_exact")) return {text + "x"};
  string last = text;
  last.back() = last.back() == '9' ? '8' : static_cast<char>(last.back() + 1);
  return {last, text.front() == '-' ? text.substr(1) : "-" + text, text + "/1"};
}

// Calls `change` for every leaf; the document is as it was between the calls.
void ForAllLeaves(ordered_json* value, const string& path, const string& name,
                  const std::function<void(ordered_json*, const string&, const string&)>& change) {
  if (value->is_object()) {
    for (auto& [key, entry] : value->items()) {
      ForAllLeaves(&entry, path.empty() ? key : path + "." + key, key, change);
    }
  } else if (value->is_array()) {
    for (std::size_t i = 0; i < value->size(); ++i) {
      ForAllLeaves(&(*value)[i], path + "[" + std::to_string(i) + "]", name, change);
    }
  } else {
    change(value, path, name);
  }
}

bool Names(const std::vector<Discrepancy>& wrong, const string& path) {
  return std::any_of(wrong.begin(), wrong.end(),
                     [&](const Discrepancy& one) { return one.path == path; });
}

// All candidates where they are few, else some of them with a trade-off.
string ComparedOrBest(const Request& request, const planner::Device& device) {
  constexpr std::size_t kFew = 4;
  const plan::Plan plan = plan::Make(request, device);
  const auto entries = plan.ranked.size() > kFew ? report::BestEntries(plan, 1, 2)
                                                 : report::CompareEntries(plan);
  return report::Json(request, device, entries, plan.front_cut);
}

// The same plan of what the changed request asks for: a change that leaves all answers right.
bool IsRightFor(const ordered_json& document, const planner::Device& device) {
  const string text = document.dump();
  ordered_json answers = document["answers"];
  try {
    std::vector<read::Option> options;
    read::Mistakes mistakes;
    const auto draft = read::ReadJson(document["request"].dump(), "", &mistakes);
    const auto reading = read::Finish(draft, {}, &mistakes);
    if (!reading) return false;
    return ordered_json::parse(ComparedOrBest(reading->request, device))["answers"] == answers;
  } catch (const std::exception&) {
    return false;
  }
}

// Other requests are worked out anew, which takes long for a KRU: `requests` tells whether to.
void ChangeAll(const Request& request, const planner::Device& device, int least,
               bool requests = true) {
  verify::Verifier verifier(device, &report::JsonSentences());
  ordered_json document = ordered_json::parse(ComparedOrBest(request, device));
  ASSERT_EQ(Text(verifier.Verify(document.dump())), Text({}));
  int changed = 0;
  ForAllLeaves(&document, "", "", [&](ordered_json* leaf, const string& path, const string& name) {
    if (!requests && path.starts_with("request.")) return;
    const ordered_json right = *leaf;
    for (const ordered_json& other : Others(name, right)) {
      if (other == right) continue;
      *leaf = other;
      ++changed;
      const auto wrong = verifier.Verify(document.dump());
      if (!path.starts_with("request.")) {
        EXPECT_TRUE(Names(wrong, path))
            << path << " is " << other << ", not " << right << "; said is: " << Text(wrong);
      } else if (wrong.empty()) {
        EXPECT_TRUE(IsRightFor(document, device)) << path << " is " << other << ", not " << right;
      }
    }
    *leaf = right;
  });
  EXPECT_GT(changed, least);
}

TEST(Mutation, Pll) {
  ChangeAll(RequestOf({{"--in", "100"}, {"--out", "200,100"}, {"--phase", "-,90"},
                       {"--device", "small"}}),
            DeviceOf(kOnePll), 500);
}

TEST(Mutation, LoopsWithPhasesDutiesAndAnUnusedOutput) {
  ChangeAll(RequestOf({{"--in", "100"}, {"--out", "200,-,33.3"}, {"--phase", "-90,-,10"},
                       {"--duty", "-,-,30"}, {"--input-jitter", "20"}}),
            DeviceOf(NarrowLoops()), 1000);
}

TEST(Mutation, LoopsWithTwoInputsAndJitter) {
  ChangeAll(RequestOf({{"--in", "100,102"}, {"--out", "206.5,103"}, {"--max-jitter", "150"},
                       {"--rank", "margin"}}),
            DeviceOf(NarrowLoops()), 1000);
}

TEST(Mutation, OutputsInAnyOrder) {
  ChangeAll(RequestOf({{"--in", "100"}, {"--out", "206,82.4,100"}, {"--any-order", "1"},
                       {"--primitive", "tsyn"}}),
            DeviceOf(NarrowLoops()), 1000);
}

TEST(Mutation, Krus) {
  ChangeAll(RequestOf({{"--in", "50"}, {"--out", "83.3,100,20"}, {"--duty", "-,50,-"}}),
            DeviceOf(NarrowKrus()), 1000, false);
}

TEST(Mutation, KruSpWithPhases) {
  ChangeAll(RequestOf({{"--in", "50"}, {"--out", "50,50,100"}, {"--phase", "12,102,-"},
                       {"--primitive", "kru_sp"}}),
            DeviceOf(NarrowKrus()), 1000, false);
}

TEST(Mutation, UnsolvedPrimitives) {
  // Two inputs are too many for a KRU, and no D is 100 MHz.
  ChangeAll(RequestOf({{"--in", "100,200"}, {"--out", "200"}}),
            DeviceOf(string(kOnePll) + NarrowKrus()), 150, false);
}

TEST(Mutation, AnswersThatChangePlaces) {
  const auto device = DeviceOf(NarrowLoops());
  verify::Verifier verifier(device);
  ordered_json document = ordered_json::parse(
      Compared(RequestOf({{"--in", "100"}, {"--out", "206,33.3"}}), device));
  const std::size_t count = document["answers"].size();
  ASSERT_GT(count, 4u);
  // The first two could be those of `best --pick 2`, which lists another one and then the best.
  for (std::size_t i = 1; i + 1 < count; ++i) {
    std::swap(document["answers"][i], document["answers"][i + 1]);
    const auto wrong = verifier.Verify(document.dump());
    ASSERT_EQ(wrong.size(), 1u) << i;
    EXPECT_EQ(wrong[0].kind, verify::DiscrepancyKind::kMisplaced);
    EXPECT_TRUE(wrong[0].path == "answers[" + std::to_string(i) + "]" ||
                wrong[0].path == "answers[" + std::to_string(i + 1) + "]");
    std::swap(document["answers"][i], document["answers"][i + 1]);
  }
  // A candidate less.
  document["answers"].erase(2);
  EXPECT_FALSE(verifier.Verify(document.dump()).empty());
}

TEST(Mutation, EntriesThatGo) {
  const auto device = DeviceOf(kOnePll);
  verify::Verifier verifier(device);
  const ordered_json document = ordered_json::parse(
      Compared(RequestOf({{"--in", "100"}, {"--out", "200"}, {"--duty", "25"}}), device));
  for (const auto& [key, value] : document["answers"][0].items()) {
    ordered_json less = document;
    less["answers"][0].erase(key);
    EXPECT_TRUE(Names(verifier.Verify(less.dump()), "answers[0]." + key)) << key;
  }
  for (const auto& [key, value] : document["answers"][0]["outputs"][0].items()) {
    ordered_json less = document;
    less["answers"][0]["outputs"][0].erase(key);
    EXPECT_TRUE(Names(verifier.Verify(less.dump()), "answers[0].outputs[0]." + key)) << key;
  }
  for (const char* const key : {"format", "version", "units", "request", "answers"}) {
    ordered_json less = document;
    less.erase(key);
    EXPECT_TRUE(Names(verifier.Verify(less.dump()), key)) << key;
  }
}

}  // namespace

}  // namespace planner::verify_test
