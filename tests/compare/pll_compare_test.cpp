// The product's PLL/TSYN search against the plain one, over generated requests.
//
// Every request is drawn from a seed and its number; a failure names both and the request.
// VORKEL_TEST_LONG in the environment asks for the long comparison.

#include <gtest/gtest.h>

#include <cstdlib>
#include <ostream>
#include <string>

#include "tests/compare/PllPair.h"
#include "tests/plain/plain_lists.h"

namespace compare {
namespace {

struct Load {
  Kind kind;
  int requests;      // in the normal run
  int far;           // among them, those whose search goes far
  int longRequests;  // in the long run
  int longFar;
  int traceEvery;    // one in so many is compared with its trace

  // What GoogleTest shows of a load.
  friend void PrintTo(const Load& load, std::ostream* out) { *out << KindName(load.kind); }
};

// True when the plain search finds nothing within the first fudges: it would go on for up to
// seconds, and its trace for tens of megabytes, so that a run can afford few of these.
bool GoesFar(const Case& drawn) {
  plain::RequestLists lists;
  plain::PllState state;
  plain::Trace trace(false);
  const int prepared =
      plain::PrepareVcoRange(drawn.request, drawn.limits, lists, state, trace);
  if (prepared != plain::kSolved) return false;
  if (drawn.request.closest) {
    plain::ParseList(drawn.request.phases, drawn.request.count, plain::kMaxOutputs, lists.phase);
    plain::ParseList(drawn.request.dutyCycles, drawn.request.count, plain::kMaxOutputs,
                     lists.dutyCycle);
  }
  double fudge = 0.0;
  for (int pass = 0; pass < 100; ++pass, fudge += 0.001) {
    if (plain::SolverPass(fudge, drawn.request, drawn.limits, lists, state, trace)) return false;
  }
  return true;
}

class PllCompare : public testing::TestWithParam<Load> {};

TEST_P(PllCompare, ProductAnswersAsThePlainSearch) {
  const Load& load = GetParam();
  const bool longRun = std::getenv("VORKEL_TEST_LONG") != nullptr;
  const int requests = longRun ? load.longRequests : load.requests;
  int farLeft = longRun ? load.longFar : load.far;
  int farTracesLeft = 2;
  PllPair pair;
  int compared = 0;
  int solved = 0;
  int differences = 0;
  for (int i = 0; compared < requests && i < 10 * requests && differences < 5; ++i) {
    Random random(static_cast<std::uint64_t>(load.kind) * 1'000'003 + static_cast<unsigned>(i));
    const Case drawn = DrawCase(load.kind, random);
    bool traced = i % load.traceEvery == 0;
    if (GoesFar(drawn)) {
      if (farLeft-- <= 0) continue;
      traced = traced && farTracesLeft-- > 0;
    } else if (load.kind == Kind::kInfeasible) {
      continue;
    }
    const std::string difference = pair.FirstDifference(drawn, traced);
    ++compared;
    if (!difference.empty()) {
      ++differences;
      ADD_FAILURE() << KindName(load.kind) << " request " << i << ": " << difference << "\n  "
                    << Describe(drawn);
    }
    if (pair.Answer().code == plain::kSolved) ++solved;
  }
  std::printf("%d requests compared, %d of them have a solution\n", compared, solved);
  // The kinds are what their names say; else the comparison would not reach what it is for.
  if (load.kind == Kind::kInfeasible) {
    EXPECT_EQ(compared, longRun ? load.longFar : load.far);
    EXPECT_LT(solved, compared / 2);
  } else {
    EXPECT_GT(compared, requests / 2);
    EXPECT_GT(solved, compared / 8);
  }
}

INSTANTIATE_TEST_SUITE_P(
    Kinds, PllCompare,
    testing::Values(Load{Kind::kCommon, 800, 8, 20000, 60, 3},
                    Load{Kind::kConstructed, 1500, 4, 40000, 60, 2},
                    Load{Kind::kShifted, 400, 16, 15000, 200, 5},
                    Load{Kind::kRangeEnds, 600, 4, 15000, 30, 3},
                    Load{Kind::kInfeasible, 100, 12, 4000, 200, 6},
                    Load{Kind::kLowOutput, 200, 6, 5000, 150, 4},
                    Load{Kind::kWild, 800, 4, 15000, 20, 3}),
    [](const testing::TestParamInfo<Load>& parameter) {
      return KindName(parameter.param.kind);
    });

}  // namespace
}  // namespace compare
