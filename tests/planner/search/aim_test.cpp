// Searches that are told what is of use, against whole ones.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <vector>

#include "drawn.h"
#include "planner/search/Search.h"
#include "tests/planner/primitive_names.h"

namespace planner::search {
namespace {

using hardware::Rational;

// The settings with the smallest worst error, one of each bandwidth that has it.
std::vector<Settings> Nearest(const Found& found) {
  std::vector<Settings> nearest;
  Rational least = 0;
  for (const Candidate& candidate : found.best) {
    if (nearest.empty() || candidate.worst_error < least) {
      nearest.clear();
      least = candidate.worst_error;
    }
    if (candidate.worst_error == least) nearest.push_back(candidate.settings);
  }
  return nearest;
}

Rational LeastError(const Found& found) {
  return std::min_element(found.best.begin(), found.best.end(),
                          [](const Candidate& a, const Candidate& b) {
                            return a.worst_error < b.worst_error;
                          })
      ->worst_error;
}

bool AreSomeMet(const Found& found) {
  return std::any_of(found.best.begin(), found.best.end(),
                     [](const Candidate& candidate) { return candidate.within; });
}

class Aims : public testing::TestWithParam<Primitive> {};

// An error that is just reached is of use, and so is all below it.
TEST_P(Aims, WhatIsNoFurtherOffThanTheBoundIsFound) {
  const Device device = drawn::Bundled("vk40", "2");
  int missed = 0;
  std::int64_t judged_of_all = 0;
  std::int64_t judged = 0;
  for (unsigned seed = 0; seed < 150; ++seed) {
    drawn::Random random(seed);
    const Request request =
        drawn::RequestFor(random, device, GetParam(), drawn::Input(random), 4);
    const Found all = Search(request, device, GetParam());
    if (all.best.empty() || AreSomeMet(all)) continue;
    ++missed;
    SCOPED_TRACE("request " + std::to_string(seed) + ": " + drawn::TextOf(request));
    const Rational least = LeastError(all);
    for (const Rational& bound : {least, least * Rational(3, 2)}) {
      const Found near = Search(request, device, GetParam(),
                                {.part = Aim::Part::kNearest, .worst_error = bound});
      EXPECT_EQ(Nearest(near), Nearest(all));
      judged += near.counts.judged;
      judged_of_all += all.counts.judged;
    }
    // Nothing is made up to keep a bound that nothing keeps.
    for (const Candidate& candidate :
         Search(request, device, GetParam(), {.worst_error = least / 2}).best) {
      EXPECT_GE(candidate.worst_error, least);
    }
  }
  EXPECT_GT(missed, 20);
  EXPECT_LT(judged, judged_of_all);  // the bound is of use
}

TEST_P(Aims, WhatMeetsTheDemandsIsFoundAlone) {
  const Device device = drawn::Bundled("vk40", "2");
  int met = 0;
  int missed = 0;
  for (unsigned seed = 0; seed < 150; ++seed) {
    drawn::Random random(seed);
    const Request request =
        drawn::RequestFor(random, device, GetParam(), drawn::Input(random), 4);
    const Found all = Search(request, device, GetParam());
    const Found found = Search(request, device, GetParam(), {.part = Aim::Part::kMet});
    std::vector<Settings> expected;
    for (const Candidate& candidate : all.best) {
      if (candidate.within) expected.push_back(candidate.settings);
    }
    std::vector<Settings> settings;
    for (const Candidate& candidate : found.best) settings.push_back(candidate.settings);
    EXPECT_EQ(settings, expected) << "request " << seed << ": " << drawn::TextOf(request);
    ++(expected.empty() ? missed : met);
  }
  EXPECT_GT(met, 10);
  EXPECT_GT(missed, 10);
}

INSTANTIATE_TEST_SUITE_P(Primitives, Aims, testing::ValuesIn(hardware::kPrimitives));

}  // namespace
}  // namespace planner::search
