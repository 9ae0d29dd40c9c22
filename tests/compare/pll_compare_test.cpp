// The product's PLL/TSYN search against the plain one, over generated requests.
//
// Every request is drawn from a seed and its number; a failure names both and the request.
// VORKEL_TEST_LONG in the environment asks for the long comparison.

#include <gtest/gtest.h>

#include <cstdlib>
#include <ostream>
#include <string>

#include "tests/compare/PllPair.h"

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
    if (plain::GoesFar(drawn.request, drawn.limits, {})) {
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

// Requests that a single VCO frequency serves, or serves best, where it is at an end of the range
// of one output and at one of another, of the VCO range or of a divider. 1000 MHz, say, is twice
// 500 MHz and 2.5 times 400 MHz, the highest outputs.
TEST(PllCompare, ProductAnswersAsThePlainSearchWhereEndsMeet) {
  const plain::PllLimits slow = {.vcoMin = 400, .vcoMax = 1000, .clkoutMin = 3.125,
                                 .clkoutMax = 375, .pfdMin = 19, .pfdMax = 400,
                                 .clkoutMaxIo = 1000, .maxHighLowCount = 64, .vcoTarget = 0,
                                 .maxPfdLowB = 300};
  plain::PllLimits fast = slow;
  fast.vcoMax = fast.clkoutMaxIo = 1080;
  fast.clkoutMax = 400;
  fast.pfdMax = 500;
  auto with = [&](double plain::PllLimits::*limit, double value, plain::PllLimits limits) {
    limits.*limit = value;
    return limits;
  };
  using L = plain::PllLimits;
  const struct {
    plain::PllLimits limits;
    const char* outFreqs;
    int count;
    double inFreq;
  } requests[] = {
      {fast, "100.25 3.125 400", 3, 100},
      {fast, "80.25 3.125 400", 3, 25},
      {fast, "4.698 100 500", 3, 125},
      {slow, "62.501 500 400", 3, 250},
      {slow, "74.445 187.5 500 62.5", 4, 100},
      {slow, "8.725 75 500 300 350", 5, 250},
      // Output range of one value; the VCO range ends at, or is, the value of an output's end.
      {with(&L::clkoutMin, 100, with(&L::clkoutMax, 100, with(&L::clkoutMaxIo, 100, fast))),
       "100.25 100", 2, 100},
      {with(&L::vcoMax, 480, with(&L::clkoutMax, 100, fast)), "100.25 50 100", 3, 100},
      {with(&L::vcoMin, 330, with(&L::vcoMax, 400, with(&L::clkoutMin, 100, fast))),
       "100.25 100", 2, 100},
      {with(&L::vcoMax, 400, with(&L::clkoutMax, 100, fast)), "100.25 50 100", 3, 100},
      {with(&L::vcoMin, 396, with(&L::vcoMax, 450,
            with(&L::clkoutMin, 10, with(&L::clkoutMax, 100, fast)))),
       "100.25 50 110 10", 4, 100},
      // Both below 0.
      {with(&L::vcoMin, -500, with(&L::vcoMax, -500, with(&L::pfdMin, -1000, fast))), "-100.001",
       1, -100},
  };
  PllPair pair;
  int shifted = 0;
  for (const auto& request : requests) {
    Case drawn;
    drawn.limits = request.limits;
    drawn.request.prim = plain::kPrimPll;
    drawn.request.outFreqs = request.outFreqs;
    drawn.request.count = request.count;
    drawn.request.inFreq = request.inFreq;
    EXPECT_EQ(pair.FirstDifference(drawn, false), "") << Describe(drawn);
    if (pair.Answer().code == plain::kSolved && pair.Answer().fudge != 0.0) ++shifted;
  }
  EXPECT_EQ(shifted, 12);  // all of them need a fudge
}

INSTANTIATE_TEST_SUITE_P(
    Kinds, PllCompare,
    testing::Values(Load{Kind::kCommon, 500, 5, 20000, 60, 3},
                    Load{Kind::kConstructed, 700, 3, 40000, 60, 2},
                    Load{Kind::kShifted, 250, 9, 15000, 200, 5},
                    Load{Kind::kRangeEnds, 400, 3, 15000, 30, 3},
                    Load{Kind::kMeetingEnds, 180, 4, 10000, 60, 4},
                    Load{Kind::kRoundFigures, 200, 4, 10000, 60, 4},
                    Load{Kind::kInfeasible, 100, 8, 4000, 200, 6},
                    Load{Kind::kLowOutput, 60, 2, 5000, 150, 4},
                    Load{Kind::kSlowVco, 300, 5, 10000, 100, 3},
                    Load{Kind::kBelowZero, 50, 3, 3000, 60, 5},
                    Load{Kind::kWild, 800, 3, 15000, 20, 3}),
    [](const testing::TestParamInfo<Load>& parameter) {
      return KindName(parameter.param.kind);
    });

}  // namespace
}  // namespace compare
