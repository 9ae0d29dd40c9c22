// The filter of the fudge loop: no pass that it leaves out would have succeeded.
//
// Every pass that the filter says "no" to is run by the plain search, for requests that a
// first pass has not answered.

#include "engine/pll/filter/PassFilter.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>

#include "engine/pll/Fudges.h"
#include "engine/pll/OutputDividers.h"
#include "tests/compare/PllPair.h"
#include "tests/engine/EngineTest.h"
#include "tests/plain/plain_lists.h"

namespace compare {
namespace {

constexpr int kPasses = Ip::Pll::kPasses;

struct Counts {
  int requests = 0;
  int hopeless = 0;
  long toRun = 0;    // passes
  long leftOut = 0;
  long checked = 0;  // of those that are left out
};

// Goes through all passes of one request, if the first one does not answer it. Of those that are
// left out, it runs the first `checked` and as many of the others. Returns false at the first pass
// that is wrongly left out.
bool CheckRequest(const Case& drawn, int checked, Random& random, Ip::VorkelImp& imp,
                  Counts& counts) {
  const plain::PllRequest& request = drawn.request;
  plain::PllLimits limits = PublishLimits(drawn.limits, request.prim);
  if (request.prim == plain::kPrimPll) limits.maxPfdLowB = imp.pllLimits._maxPfdLowB;

  plain::RequestLists lists;
  plain::PllState state;
  plain::Trace plainTrace(false);
  if (plain::PrepareVcoRange(request, limits, lists, state, plainTrace) != plain::kSolved) {
    return true;
  }
  imp.requests = Ip::Requests{};
  if (request.closest) {
    const int count = request.count;
    if (!imp.ParsePhases(count, request.phases.c_str()) ||
        !imp.ParseDutyCycles(count, request.dutyCycles.c_str())) {
      return true;
    }
    plain::ParseList(request.phases, count, plain::kMaxOutputs, lists.phase);
    plain::ParseList(request.dutyCycles, count, plain::kMaxOutputs, lists.dutyCycle);
  }

  const Ip::Trace trace(false);
  const Ip::Pll::Run run = {request.inFreq, request.count, request.prim, trace};
  imp.SetLowBandwidth(request.lowBandwidth);
  imp.pll._preferMaxVco = request.preferMaxVco;
  imp.pll._intDiv0Only = request.intDiv0Only;
  imp.pll._minPowerMode = !request.closest;
  EXPECT_EQ(PrepareVcoRange(imp, request.outFreqs.c_str(), request.inFreq2, run),
            Ip::Pll::kSolved);
  if (SolverPass(imp, 0.0, run)) return true;

  ++counts.requests;
  Ip::Pll::PassFilter filter(imp, run);
  if (filter.IsHopeless()) ++counts.hopeless;
  // The loop may begin to ask for any pass.
  const int first = random.OneIn(2) ? 1 : random.Int(1, 100);
  int toRun = filter.NextFrom(first);
  for (int pass = first; pass < kPasses; ++pass) {
    if (pass == toRun) {
      ++counts.toRun;
      toRun = filter.NextFrom(pass + 1);
      continue;
    }
    ++counts.leftOut;
    if (pass >= first + checked && !random.OneIn(kPasses / checked)) continue;
    ++counts.checked;
    const double fudge = Ip::Pll::FudgeOf(pass);
    if (plain::SolverPass(fudge, request, limits, lists, state, plainTrace)) {
      ADD_FAILURE() << "left out the pass at " << fudge << " of " << Describe(drawn);
      return false;
    }
  }
  return true;
}

// 100 MHz into a PLL with a VCO of 400 to 1080 MHz; 197 and 70 MHz asked for. 5 x 197 = 985 MHz
// is within one percent of 14 x 70 MHz, and 591 and 788 MHz are not; so it is for all output-0
// frequencies from 194.04 to 197.96 MHz. From 980 MHz on, M and D accept nothing there but 979.902
// to 980.098 MHz (100 x 49 / 5): output 0 from 195.9804 to 196.0196 MHz.
TEST(PassFilter, FindsTheOnlyFudgesOfAnExample) {
  const plain::PllLimits limits = {.vcoMin = 400, .vcoMax = 1080, .clkoutMin = 3.125,
                                   .clkoutMax = 400, .pfdMin = 19, .pfdMax = 500,
                                   .clkoutMaxIo = 1080, .maxHighLowCount = 64, .vcoTarget = 0,
                                   .maxPfdLowB = 300};
  PublishLimits(limits, plain::kPrimPll);
  Ip::VorkelImp& imp = engine_test::NewImp();
  imp.SetDevice(kComparedPart);
  const Ip::Trace trace(false);
  const Ip::Pll::Run run = {100.0, 2, plain::kPrimPll, trace};
  ASSERT_EQ(PrepareVcoRange(imp, "197 70", 0.0, run), Ip::Pll::kSolved);
  ASSERT_FALSE(SolverPass(imp, 0.0, run));
  Ip::Pll::PassFilter filter(imp, run);
  ASSERT_FALSE(filter.IsHopeless());
  // 197.96 MHz and more, upward, meets ranges of the next percent.
  const int early = filter.NextFrom(1);
  EXPECT_GE(early, 960);
  EXPECT_LE(early, 981);
  for (int pass = 981; pass <= 1019; ++pass) EXPECT_EQ(filter.NextFrom(pass), pass);
}

// A VCO of 600 to 1440 MHz, a PFD of 10 to 500 MHz and outputs of 4.6875 to 800 MHz.
constexpr plain::PllLimits kTsynLimits = {.vcoMin = 600, .vcoMax = 1440, .clkoutMin = 4.6875,
                                          .clkoutMax = 800, .pfdMin = 10, .pfdMax = 500,
                                          .clkoutMaxIo = 1000, .maxHighLowCount = 64,
                                          .vcoTarget = 1000, .maxPfdLowB = 300};

// Prepares a run for a TSYN.
Ip::VorkelImp& PrepareTsyn(const char* outFreqs, double inFreq2, const Ip::Pll::Run& run,
                           const plain::PllLimits& limits = kTsynLimits) {
  PublishLimits(limits, plain::kPrimTsyn);
  Ip::VorkelImp& imp = engine_test::NewImp();
  imp.SetDevice(kComparedPart);
  EXPECT_EQ(PrepareVcoRange(imp, outFreqs, inFreq2, run), Ip::Pll::kSolved);
  return imp;
}

// Many candidates of this request are nearly, but not exactly, multiples of 12, 24.01 or 24.264
// MHz. Taken for multiples, they would let hundreds of passes through before the one that succeeds.
TEST(PassFilter, IsNotTakenInByWhatIsNearlyAMultiple) {
  const Ip::Trace trace(false);
  const Ip::Pll::Run run = {12.003, 4, plain::kPrimTsyn, trace};
  Ip::VorkelImp& imp = PrepareTsyn("13.5 12 24.01 24.264", 12.044, run);
  imp.pll._minPowerMode = true;
  Ip::Pll::PassFilter filter(imp, run);
  int failed = 0;
  int pass = filter.NextFrom(1);
  while (pass < kPasses && !SolverPass(imp, Ip::Pll::FudgeOf(pass), run)) {
    ++failed;
    pass = filter.NextFrom(pass + 1);
  }
  EXPECT_EQ(pass, 8809);
  EXPECT_LT(failed, 10);
}

bool IsHopeless(const char* outFreqs, double inFreq,
                const plain::PllLimits& limits = kTsynLimits) {
  const Ip::Trace trace(false);
  const Ip::Pll::Run run = {inFreq, 2, plain::kPrimTsyn, trace};
  return IsHopelessAtOnce(PrepareTsyn(outFreqs, 0.0, run, limits), run);
}

// Below the PFD range an input has no D. For 1100 MHz, 800 MHz are 27 percent too little, and for
// 3.5 MHz, 4.6875 are 34 too much; for 900 MHz, 800 are 11 too little.
TEST(PassFilter, TellsAtOnceWhatIsOutOfReach) {
  EXPECT_FALSE(IsHopeless("100 50", 100.0));
  EXPECT_FALSE(IsHopeless("100 900", 100.0));
  EXPECT_TRUE(IsHopeless("100 1100", 100.0));
  EXPECT_TRUE(IsHopeless("100 3.5", 100.0));
  EXPECT_TRUE(IsHopeless("100 50", 9.0));
  EXPECT_TRUE(IsHopeless("1460 50", 100.0));
  EXPECT_FALSE(IsHopeless("1440 50", 100.0));
}

// Fudges go from -11 to 11 MHz: 1451 MHz becomes 1440, and -11 can become 0 at most.
TEST(PassFilter, TellsAtOnceWhatNoFudgeBringsIntoTheRange) {
  EXPECT_FALSE(IsHopeless("1451 50", 100.0));
  EXPECT_TRUE(IsHopeless("1451.5 50", 100.0));
  EXPECT_FALSE(IsHopeless("-10.5 50", 100.0));
  EXPECT_TRUE(IsHopeless("-11.5 50", 100.0));
}

// Of a second output that is not above 0 nothing is told at once, and of a slow one the same as of
// others: a VCO of 20 MHz divided by 128 is 0.15625 MHz, which is 56 percent more than 0.1 and 12
// more than 0.14.
TEST(PassFilter, TellsNothingAtOnceOfWhatIsNotAboveZero) {
  EXPECT_FALSE(IsHopeless("100 0", 100.0));
  EXPECT_FALSE(IsHopeless("100 -5", 100.0));
  EXPECT_TRUE(IsHopeless("100 0.5", 100.0));
  plain::PllLimits slow = kTsynLimits;
  slow.vcoMin = 20;
  slow.vcoMax = 60;
  slow.clkoutMin = 0.1;
  EXPECT_TRUE(IsHopeless("10 0.1", 10.0, slow));
  EXPECT_FALSE(IsHopeless("10 0.14", 10.0, slow));
}

// An input and a VCO that are both below 0 can have an M and a D; else they cannot. Below 0 a range
// of M is none but where it is a single one.
TEST(PassFilter, TellsNothingAtOnceBelowZero) {
  plain::PllLimits limits = kTsynLimits;
  const auto isHopeless = [&](double vco, double inFreq) {
    limits.vcoMin = limits.vcoMax = vco;
    return IsHopeless("100 50", inFreq, limits);
  };
  EXPECT_FALSE(isHopeless(-600, -100.0));
  EXPECT_TRUE(isHopeless(600, -100.0));
  EXPECT_TRUE(isHopeless(0, -100.0));
  limits.vcoMin = -600;
  limits.vcoMax = 1440;
  EXPECT_FALSE(IsHopeless("100 50", 100.0, limits));
  EXPECT_TRUE(IsHopeless("100 50", 0.5, limits));
}

// 800 MHz are the highest output. Beyond the widest tolerance of them, rounding may still bring
// what is a billionth or two off.
TEST(PassFilter, LeavesRoundingAMargin) {
  const double highest = 800.0 / (1.0 - Ip::Pll::Tolerance(Ip::Pll::kTolerances - 1));
  const auto isHopeless = [&](double beyond) {
    char outFreqs[40];
    std::snprintf(outFreqs, sizeof outFreqs, "100 %.17g", highest * (1.0 + beyond));
    return IsHopeless(outFreqs, 100.0);
  };
  EXPECT_FALSE(isHopeless(1.5e-9));
  EXPECT_TRUE(isHopeless(3e-9));
}

class PassFilterProperty : public testing::TestWithParam<Kind> {};

TEST_P(PassFilterProperty, LeavesOutNoPassThatSucceeds) {
  const bool longRun = std::getenv("VORKEL_TEST_LONG") != nullptr;
  const int requests = longRun ? 4000 : 250;
  const int checked = longRun ? 200 : 60;
  Ip::VorkelImp& imp = engine_test::NewImp();
  imp.SetDevice(kComparedPart);
  Counts counts;
  int wrong = 0;
  for (int i = 0; i < requests && wrong < 3; ++i) {
    Random random(static_cast<std::uint64_t>(GetParam()) * 7'000'003 + static_cast<unsigned>(i));
    const Case drawn = DrawCase(GetParam(), random);
    if (!drawn.limits.readable) continue;
    if (!CheckRequest(drawn, checked, random, imp, counts)) ++wrong;
  }
  std::printf("%d requests, %d hopeless; %ld passes to be run, %ld left out, %ld of them checked\n",
              counts.requests, counts.hopeless, counts.toRun, counts.leftOut, counts.checked);
  EXPECT_GT(counts.requests, counts.hopeless + 10);
  EXPECT_GT(counts.leftOut, counts.toRun);
  EXPECT_GT(counts.checked, counts.requests * checked);
}

INSTANTIATE_TEST_SUITE_P(Kinds, PassFilterProperty,
                         testing::Values(Kind::kCommon, Kind::kConstructed, Kind::kShifted,
                                         Kind::kRangeEnds, Kind::kMeetingEnds,
                                         Kind::kRoundFigures, Kind::kInfeasible, Kind::kLowOutput,
                                         Kind::kSlowVco, Kind::kBelowZero, Kind::kWild),
                         [](const testing::TestParamInfo<Kind>& parameter) {
                           return KindName(parameter.param);
                         });

}  // namespace
}  // namespace compare
