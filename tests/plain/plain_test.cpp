// Checks of the plain list parser and of the plain PLL/TSYN solver against results worked out by
// hand.

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <string>

#include "plain_lists.h"
#include "plain_numbers.h"
#include "plain_pll.h"
#include "plain_pll_stages.h"
#include "plain_trace.h"

namespace plain {
namespace {

constexpr double kNan = std::numeric_limits<double>::quiet_NaN();
constexpr double kInfinity = std::numeric_limits<double>::infinity();

int CountOf(const std::string& part, const std::string& text) {
  int count = 0;
  for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1)) {
    ++count;
  }
  return count;
}

bool Contains(const std::string& part, const std::string& text) {
  return text.find(part) != std::string::npos;
}

PllLimits WideLimits() {
  PllLimits limits;
  limits.vcoMin = 400.0;
  limits.vcoMax = 1000.0;
  limits.clkoutMin = 3.125;
  limits.clkoutMax = 400.0;
  limits.clkoutMaxIo = 1000.0;
  limits.pfdMin = 10.0;
  limits.pfdMax = 550.0;
  limits.vcoTarget = 800.0;
  return limits;
}

PllRequest RequestFor(int prim, double inFreq, int count, const std::string& outFreqs) {
  PllRequest request;
  request.prim = prim;
  request.inFreq = inFreq;
  request.count = count;
  request.outFreqs = outFreqs;
  return request;
}

// ---- Numbers and lists ----

TEST(Numbers, WholeNumberTruncatesAndTakesWhatNoIntHoldsAsZero) {
  EXPECT_EQ(WholeNumber(2.9), 2);
  EXPECT_EQ(WholeNumber(-2.9), -2);
  EXPECT_EQ(WholeNumber(2147483647.9), 2147483647);
  EXPECT_EQ(WholeNumber(2147483648.0), 0);
  EXPECT_EQ(WholeNumber(-2147483648.9), -2147483647 - 1);
  EXPECT_EQ(WholeNumber(-2147483649.0), 0);
  EXPECT_EQ(WholeNumber(kNan), 0);
  EXPECT_EQ(WholeNumber(kInfinity), 0);
}

TEST(Lists, ShortListStoresWhatItHasAndFails) {
  double list[kMaxOutputs] = {1, 1, 1, 1, 1, 1, 1};
  EXPECT_FALSE(ParseList("100 200", 3, kMaxOutputs, list));
  EXPECT_EQ(list[0], 100.0);
  EXPECT_EQ(list[1], 200.0);
  EXPECT_EQ(list[2], 1.0);
}

TEST(Lists, BlanksTrimmingWordsAndExtraNumbers) {
  double list[kMaxOutputs]{};
  EXPECT_TRUE(ParseList("   1.5   \t-2e1\n  word 0x10 99", 4, kMaxOutputs, list));
  EXPECT_EQ(list[0], 1.5);
  EXPECT_EQ(list[1], -20.0);
  EXPECT_EQ(list[2], 0.0);
  EXPECT_EQ(list[3], 16.0);
  EXPECT_EQ(list[4], 0.0);
  EXPECT_TRUE(ParseList("inf nan", 2, kMaxOutputs, list));
  EXPECT_TRUE(std::isinf(list[0]));
  EXPECT_TRUE(std::isnan(list[1]));
}

TEST(Lists, OnlyBlanksSeparate) {
  double list[kMaxOutputs]{};
  EXPECT_FALSE(ParseList("1\t2", 2, kMaxOutputs, list));
  EXPECT_EQ(list[0], 1.0);
}

TEST(Lists, NothingIsStoredForAnEmptyTextOrAnImpossibleCount) {
  double list[kMaxOutputs] = {7, 7, 7, 7, 7, 7, 7};
  EXPECT_FALSE(ParseList("", 1, kMaxOutputs, list));
  EXPECT_FALSE(ParseList("   ", 1, kMaxOutputs, list));
  EXPECT_FALSE(ParseList("1 2", 0, kMaxOutputs, list));
  EXPECT_FALSE(ParseList("1 2", -3, kMaxOutputs, list));
  EXPECT_FALSE(ParseList("1 2 3 4 5 6 8 9", 8, kMaxOutputs, list));
  for (double value : list) EXPECT_EQ(value, 7.0);
  EXPECT_TRUE(ParseList("1 2 3 4 5 6 8", 7, kMaxOutputs, list));
  EXPECT_EQ(list[6], 8.0);
}

// ---- Working range ----

struct RangeResult {
  int code;
  PllState state;
  std::string trace;
};

RangeResult PrepareRange(const PllRequest& request, const PllLimits& limits) {
  RequestLists lists;
  RangeResult result;
  Trace trace(true);
  result.code = PrepareVcoRange(request, limits, lists, result.state, trace);
  result.trace = trace.Text();
  return result;
}

TEST(VcoRange, SecondInputClockMovesOneBound) {
  PllRequest request = RequestFor(kPrimPll, 100, 1, "100");
  request.inFreq2 = 200;
  RangeResult result = PrepareRange(request, WideLimits());
  EXPECT_EQ(result.code, kSolved);
  EXPECT_EQ(result.state.minAdjVco, 400.0);
  EXPECT_EQ(result.state.maxAdjVco, 500.0);
  EXPECT_EQ(result.state.minM, 4.0);
  EXPECT_EQ(result.state.maxM, 5.0);
  EXPECT_EQ(result.trace,
            "DLL---- minAdjVco = 400.000000\nDLL---- maxAdjVco = 500.000000\n"
            "DLL---- minM = 4.000000\nDLL---- maxM = 5.000000\n");

  request.inFreq = 200;
  request.inFreq2 = 100;
  result = PrepareRange(request, WideLimits());
  EXPECT_EQ(result.code, kSolved);
  EXPECT_EQ(result.state.minAdjVco, 800.0);
  EXPECT_EQ(result.state.maxAdjVco, 1000.0);

  request.inFreq2 = 200;
  result = PrepareRange(request, WideLimits());
  EXPECT_EQ(result.state.minAdjVco, 400.0);
  EXPECT_EQ(result.state.maxAdjVco, 1000.0);
}

TEST(VcoRange, InputClocksTooFarApart) {
  PllRequest request = RequestFor(kPrimTsyn, 100, 1, "100");
  request.inFreq2 = 251;
  const RangeResult result = PrepareRange(request, WideLimits());
  EXPECT_EQ(result.code, kEmptyRange);
  EXPECT_TRUE(Contains("DLL---- There is no valid working range for either VCO or M!\n",
                       result.trace));
  request.inFreq2 = 250;
  EXPECT_EQ(PrepareRange(request, WideLimits()).code, kSolved);
}

TEST(VcoRange, NegativeInputClockTurnsTheMultiplierRangeRound) {
  EXPECT_EQ(PrepareRange(RequestFor(kPrimPll, -100, 1, "100"), WideLimits()).code, kEmptyRange);
}

TEST(VcoRange, BadRequestComesBeforeMissingLimits) {
  PllLimits unreadable = WideLimits();
  unreadable.readable = false;
  EXPECT_EQ(PrepareRange(RequestFor(kPrimPll, 100, 0, "100"), unreadable).code, kBadRequest);
  EXPECT_EQ(PrepareRange(RequestFor(kPrimPll, 100, 2, "100"), unreadable).code, kBadRequest);
  EXPECT_EQ(PrepareRange(RequestFor(kPrimPll, 0, 1, "100"), unreadable).code, kBadRequest);
  EXPECT_EQ(PrepareRange(RequestFor(kPrimPll, 100, 1, "100"), unreadable).code, kNoLimits);
  EXPECT_EQ(PrepareRange(RequestFor(2, 100, 1, "100"), WideLimits()).code, kNoLimits);
}

// ---- VCO candidates ----

TEST(Enumeration, FractionalStepsFillTheTable) {
  PllState state;
  state.minAdjVco = 1.0;
  state.maxAdjVco = 128.0;
  Trace trace(false);
  EXPECT_EQ(EnumerateVcoCandidates(1.0, 0.0, false, state, trace), 1010);
  EXPECT_EQ(state.candidates[0]->div0, 1.0);
  EXPECT_EQ(state.candidates[1]->div0, 2.0);
  EXPECT_EQ(state.candidates[2]->div0, 2.125);
  EXPECT_EQ(state.candidates[1009]->div0, 128.0);
  EXPECT_EQ(state.candidates[1009]->vco, 128.0);
}

TEST(Enumeration, WholeStepsFillTheFirst128Slots) {
  PllState state;
  state.minAdjVco = 0.0;
  state.maxAdjVco = 1000.0;
  Trace trace(false);
  EXPECT_EQ(EnumerateVcoCandidates(1.0, 0.0, true, state, trace), 128);
  EXPECT_EQ(state.candidates[127]->div0, 128.0);
  for (std::size_t k = 128; k < kMaxVcoCandidates; ++k) EXPECT_FALSE(state.candidates[k]);
}

TEST(Enumeration, BothEndsOfTheRangeCountAndOtherSlotsStay) {
  PllState state;
  state.minAdjVco = 400.0;
  state.maxAdjVco = 500.0;
  state.candidates[0] = VcoCandidate{};
  state.candidates[0]->vco = 7.0;
  Trace trace(true);
  EXPECT_EQ(EnumerateVcoCandidates(99.0, 1.0, true, state, trace), 2);
  EXPECT_EQ(trace.Text(),
            "DLL--- Using fudged oFreq = 100.000 (ofreq: 99.000, fudge: 1.000)\n"
            "DLL----- Found valid VCO = 400.000 and div0 = 4.000 (ofreq0_fudge = 1.000)\n"
            "DLL----- Found valid VCO = 500.000 and div0 = 5.000 (ofreq0_fudge = 1.000)\n");
  EXPECT_EQ(state.candidates[0]->vco, 7.0);
  EXPECT_EQ(state.candidates[3]->vco, 400.0);
  EXPECT_EQ(state.candidates[4]->vco, 500.0);

  trace.Clear();
  EXPECT_EQ(EnumerateVcoCandidates(2000.0, -1.5, true, state, trace), 0);
  EXPECT_EQ(trace.Text(),
            "DLL--- Using fudged oFreq = 1998.500 (ofreq: 2000.000, fudge: -1.500)\n"
            "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = -1.500!\n");
}

// ---- Output dividers ----

PllState StateWithVcos(int prim, std::initializer_list<double> vcos) {
  PllState state;
  state.prim = prim;
  std::size_t slot = 2;
  for (double vco : vcos) {
    VcoCandidate candidate;
    candidate.vco = vco;
    candidate.div0 = 4.0;
    state.candidates[slot] = candidate;
    slot += 2;
  }
  return state;
}

TEST(OutputDividers, OneOutputNeedsNone) {
  PllState state = StateWithVcos(kPrimPll, {400});
  Trace trace(true);
  EXPECT_TRUE(FindOutputDividers(1, WideLimits(), RequestLists{}, state, trace));
  EXPECT_EQ(trace.Text(), "");
  EXPECT_TRUE(state.candidates[2]);
}

TEST(OutputDividers, ExactOnesDropTheOthers) {
  PllState state = StateWithVcos(kPrimPll, {400, 500, 600});
  RequestLists lists;
  lists.outFreq[1] = 100.0;
  lists.outFreq[2] = 125.0;
  Trace trace(true);
  EXPECT_TRUE(FindOutputDividers(3, WideLimits(), lists, state, trace));
  EXPECT_FALSE(state.candidates[2]);
  ASSERT_TRUE(state.candidates[4]);
  EXPECT_FALSE(state.candidates[6]);
  EXPECT_EQ(state.candidates[4]->divN[1], 5);
  EXPECT_EQ(state.candidates[4]->divN[2], 4);
  EXPECT_EQ(trace.Text(),
            "DLL----- Looking for valid div1 from remaining VCOs\n"
            "DLL ---------- for VCO = 400.000000: div1 = 4\n"
            "DLL ---------- for VCO = 500.000000: div1 = 5\n"
            "DLL ---------- for VCO = 600.000000: div1 = 6\n"
            "DLL----- Looking for valid div2 from remaining VCOs\n"
            "DLL ---------- for VCO = 500.000000: div2 = 4\n");
}

TEST(OutputDividers, EveryOneWithinTheFirstTolerantPassStays) {
  // 400 / 4 misses 99.5 by 0.5 (0.5 %), 500 / 5 as well; 470 / 5 = 94 misses by 5.5 %.
  PllState state = StateWithVcos(kPrimPll, {400, 470, 500});
  RequestLists lists;
  lists.outFreq[1] = 99.5;
  Trace trace(true);
  EXPECT_TRUE(FindOutputDividers(2, WideLimits(), lists, state, trace));
  EXPECT_TRUE(state.candidates[2]);
  EXPECT_FALSE(state.candidates[4]);
  EXPECT_TRUE(state.candidates[6]);
  EXPECT_EQ(state.candidates[2]->freqDiff[1], 0.5);
  EXPECT_EQ(trace.Text(),
            "DLL----- Looking for valid div1 from remaining VCOs\n"
            "DLL------ Can't find a clkout1_divide, so upping threshold to 0.010!\n"
            "DLL ---------- for VCO = 400.000000: div1 = 4 (diff = 0.500)\n"
            "DLL ---------- for VCO = 500.000000: div1 = 5 (diff = 0.500)\n");
}

TEST(OutputDividers, GivesUpAfter27PassesAndKeepsTheTable) {
  PllState state = StateWithVcos(kPrimPll, {400});
  RequestLists lists;
  lists.outFreq[1] = 1.0;
  Trace trace(true);
  EXPECT_FALSE(FindOutputDividers(2, WideLimits(), lists, state, trace));
  EXPECT_TRUE(state.candidates[2]);
  EXPECT_EQ(CountOf("so upping threshold to", trace.Text()), 27);
  EXPECT_TRUE(Contains("DLL------ Can't find a clkout1_divide, so upping threshold to 0.270!\n"
                       "DLL-- Can't find a clkout1_divide for all possible thresholds!\n",
                       trace.Text()));
}

TEST(OutputDividers, FrequencyAboveTheVcoTakesDividerOneWithinToleranceAndLimits) {
  // 1000 / 1 misses 1100 by 9.09 %.
  RequestLists lists;
  lists.outFreq[1] = 1100.0;
  Trace trace(true);
  PllState pll = StateWithVcos(kPrimPll, {1000});
  EXPECT_TRUE(FindOutputDividers(2, WideLimits(), lists, pll, trace));
  EXPECT_EQ(pll.candidates[2]->divN[1], 1);
  EXPECT_TRUE(Contains("upping threshold to 0.100!\nDLL ---------- for VCO", trace.Text()));

  PllState tsyn = StateWithVcos(kPrimTsyn, {1000});
  EXPECT_FALSE(FindOutputDividers(2, WideLimits(), lists, tsyn, trace));
}

TEST(OutputDividers, OnlyOutput1OfAPllMayUseTheIoClockLimit) {
  RequestLists lists;
  for (double& frequency : lists.outFreq) frequency = 500.0;
  Trace trace(false);
  PllState state = StateWithVcos(kPrimPll, {500});
  EXPECT_TRUE(FindOutputDividers(2, WideLimits(), lists, state, trace));
  EXPECT_FALSE(FindOutputDividers(3, WideLimits(), lists, state, trace));
  PllState tsyn = StateWithVcos(kPrimTsyn, {500});
  EXPECT_FALSE(FindOutputDividers(2, WideLimits(), lists, tsyn, trace));
}

TEST(OutputDividers, NegativeRequestIsWithinAnyTolerance) {
  // ratio 1, difference 300 + 100, and 400 / -100 is below 0.
  RequestLists lists;
  lists.outFreq[1] = -100.0;
  Trace trace(false);
  PllState state = StateWithVcos(kPrimPll, {300});
  EXPECT_TRUE(FindOutputDividers(2, WideLimits(), lists, state, trace));
  EXPECT_EQ(state.candidates[2]->divN[1], 1);
  EXPECT_EQ(state.candidates[2]->freqDiff[1], 400.0);
  lists.outFreq[1] = kNan;
  EXPECT_FALSE(FindOutputDividers(2, WideLimits(), lists, state, trace));
}

// ---- M and D ----

struct MAndD {
  bool found = false;
  double m = 0;
  int d = 0;
  std::string trace;
};

MAndD SearchFor(int prim, double inFreq, double vco, const PllLimits& limits,
                bool integerStep = true, bool lowBandwidth = false) {
  PllState state = StateWithVcos(prim, {vco});
  PllRequest request = RequestFor(prim, inFreq, 1, "1");
  request.lowBandwidth = lowBandwidth;
  Trace trace(true);
  MAndD result;
  result.found = CalculateMAndD(request, limits, integerStep, state, trace);
  result.trace = trace.Text();
  EXPECT_EQ(result.found, state.candidates[2].has_value());
  if (state.candidates[2]) {
    result.m = state.candidates[2]->m;
    result.d = state.candidates[2]->d;
  }
  return result;
}

TEST(MultiplierSearch, SmallestMultiplierWithinThePfdLimits) {
  PllLimits limits = WideLimits();
  MAndD result = SearchFor(kPrimPll, 100, 600, limits);
  EXPECT_EQ(result.m, 6.0);
  EXPECT_EQ(result.d, 1);
  EXPECT_EQ(result.trace,
            "DLL------- Calculating M and D\nDLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 600.000000: M = 6.000000, D = (float) 1.000000, (int) 1\n");
  limits.pfdMax = 99.0;
  result = SearchFor(kPrimPll, 100, 600, limits);
  EXPECT_EQ(result.m, 12.0);
  EXPECT_EQ(result.d, 2);
  limits.pfdMax = 49.0;
  result = SearchFor(kPrimPll, 100, 600, limits);
  EXPECT_EQ(result.m, 18.0);
  EXPECT_EQ(result.d, 3);
}

TEST(MultiplierSearch, PfdLimitsAreInclusive) {
  PllLimits limits = WideLimits();
  limits.pfdMin = limits.pfdMax = 100.0;
  EXPECT_EQ(SearchFor(kPrimPll, 100, 600, limits).m, 6.0);
}

TEST(MultiplierSearch, TsynHasNoMultiplierFrom2To4) {
  const PllLimits limits = WideLimits();
  EXPECT_EQ(SearchFor(kPrimTsyn, 100, 600, limits).m, 6.0);
  MAndD result = SearchFor(kPrimPll, 100, 200, limits);
  EXPECT_EQ(result.m, 2.0);
  EXPECT_EQ(result.d, 1);
  result = SearchFor(kPrimTsyn, 100, 200, limits);
  EXPECT_EQ(result.m, 6.0);
  EXPECT_EQ(result.d, 3);
  EXPECT_EQ(SearchFor(kPrimTsyn, 100, 500, limits).m, 5.0);
  EXPECT_EQ(SearchFor(kPrimTsyn, 500, 500, limits).m, 1.0);
}

TEST(MultiplierSearch, MultiplierEndsAt64) {
  const PllLimits limits = WideLimits();
  EXPECT_EQ(SearchFor(kPrimPll, 10, 640, limits).m, 64.0);
  EXPECT_EQ(SearchFor(kPrimTsyn, 10, 640, limits).m, 64.0);
  const MAndD result = SearchFor(kPrimPll, 10, 650, limits);
  EXPECT_FALSE(result.found);
  EXPECT_TRUE(Contains("DLL------------ No valid M and D was found!\n", result.trace));
  EXPECT_FALSE(SearchFor(kPrimTsyn, 10, 650, limits).found);
}

TEST(MultiplierSearch, RemainderBelowFiveTenThousandths) {
  PllLimits limits = WideLimits();
  limits.pfdMin = 90.0;  // D is 1 or nothing
  const MAndD result = SearchFor(kPrimPll, 100.04, 600, limits);
  EXPECT_EQ(result.m, 6.0);
  EXPECT_EQ(result.d, 1);
  EXPECT_TRUE(Contains("DLL-- For VCO = 600.000000: M = 6.000000, D = (float) 1.000400, (int) 1; "
                       "remainder = 0.000400\n",
                       result.trace));
  EXPECT_EQ(SearchFor(kPrimPll, 100.045, 600, limits).m, 6.0);
  EXPECT_FALSE(SearchFor(kPrimPll, 99.949, 600, limits).found);
  EXPECT_FALSE(SearchFor(kPrimPll, 100.051, 600, limits).found);
}

TEST(MultiplierSearch, DividerEndsAt80) {
  PllLimits limits = WideLimits();
  limits.pfdMin = 1.0;
  // 800 MHz x 64 / 640 MHz makes 80; 810 MHz would need 81.
  limits.pfdMax = 10.0;
  MAndD result = SearchFor(kPrimPll, 800, 640, limits);
  EXPECT_EQ(result.m, 64.0);
  EXPECT_EQ(result.d, 80);
  result = SearchFor(kPrimPll, 810, 640, limits);
  EXPECT_FALSE(result.found);
}

TEST(MultiplierSearch, LowBandwidthHasItsOwnPfdMaximum) {
  PllLimits limits = WideLimits();
  limits.maxPfdLowB = 60.0;
  EXPECT_EQ(SearchFor(kPrimTsyn, 100, 600, limits).m, 6.0);
  const MAndD result = SearchFor(kPrimTsyn, 100, 600, limits, true, true);
  EXPECT_EQ(result.m, 12.0);
  EXPECT_EQ(result.d, 2);
  EXPECT_TRUE(Contains("DLL------- Calculating M and D\n"
                       "DLL  --- Using _maxPfdLowB (60.000000) for PFD max\n",
                       result.trace));
}

TEST(MultiplierSearch, FractionalStep) {
  const PllLimits limits = WideLimits();
  EXPECT_EQ(SearchFor(kPrimPll, 100, 212.5, limits, false).m, 2.125);
  EXPECT_EQ(SearchFor(kPrimTsyn, 100, 512.5, limits, false).m, 5.125);
  EXPECT_EQ(SearchFor(kPrimPll, 10, 640, limits, false).m, 64.0);
}

// ---- Phases and duty cycles ----

TEST(Phase, NearestStepAndTies) {
  EXPECT_EQ(PhaseForRequest(100, 4), 101.25);
  EXPECT_EQ(PhaseForRequest(90, 4), 90.0);
  EXPECT_EQ(PhaseForRequest(22.5, 1), 45.0);
  EXPECT_EQ(PhaseForRequest(0, 4), 0.0);
  EXPECT_EQ(PhaseForRequest(100, 0), 0.0);
  EXPECT_EQ(PhaseForRequest(5000, 1), 360.0);
  EXPECT_EQ(PhaseForRequest(kInfinity, 1), 360.0);
  EXPECT_EQ(PhaseForRequest(kNan, 1), 0.0);
}

TEST(Phase, NegativeRequestsGoByTheirOwnRule) {
  EXPECT_EQ(PhaseForRequest(-90, 1), -90.0);
  EXPECT_EQ(PhaseForRequest(-360, 1), -360.0);
  EXPECT_EQ(PhaseForRequest(-100, 1), -90.0);
  // -135 is nearer, but -90 is further from it (45) than from the request (30).
  EXPECT_EQ(PhaseForRequest(-120, 1), -90.0);
  EXPECT_EQ(PhaseForRequest(-5000, 1), -360.0);
  EXPECT_EQ(PhaseForRequest(-kInfinity, 1), -360.0);
}

TEST(DutyCycle, RangeStepAndTies) {
  EXPECT_EQ(DutyCycleForRequest(30, 1, 64), 0.5);
  EXPECT_EQ(DutyCycleForRequest(0, 4, 64), 0.0);
  EXPECT_EQ(DutyCycleForRequest(50, 0, 64), 0.0);
  EXPECT_DOUBLE_EQ(DutyCycleForRequest(50, 3, 64), 0.5);
  EXPECT_DOUBLE_EQ(DutyCycleForRequest(99, 3, 64), 5.0 / 6.0);
  EXPECT_DOUBLE_EQ(DutyCycleForRequest(-10, 3, 64), 1.0 / 3.0);
  EXPECT_EQ(DutyCycleForRequest(62.5, 2, 64), 0.75);
  EXPECT_EQ(DutyCycleForRequest(kNan, 2, 64), 0.5);
  EXPECT_EQ(DutyCycleForRequest(kNan, 1, 64), 0.5);
}

TEST(DutyCycle, LongDividersAreBoundByTheHighAndLowCount) {
  EXPECT_EQ(DutyCycleForRequest(30, 128, 64), 0.5);
  EXPECT_EQ(DutyCycleForRequest(60, 128, 64), 0.50390625);
  EXPECT_DOUBLE_EQ(DutyCycleForRequest(1, 100, 64), 0.36);
  EXPECT_EQ(DutyCycleForRequest(50, 4, 0), 0.0);   // from 1 to 0.125: nothing
  EXPECT_EQ(DutyCycleForRequest(50, 4, 4), 0.5);   // 4 is not above 4
}

PllState StateWithOne(double div0, int div1, double m) {
  PllState state;
  VcoCandidate candidate;
  candidate.vco = 800;
  candidate.div0 = div0;
  candidate.divN[1] = div1;
  candidate.m = m;
  candidate.d = 1;
  state.candidates[5] = candidate;
  return state;
}

TEST(PhaseStage, DifferencesPerOutput) {
  PllState state = StateWithOne(4, 8, 8);
  RequestLists lists;
  lists.phase[0] = 100;
  lists.dutyCycle[0] = 55;
  lists.phase[1] = 0.00005;
  lists.dutyCycle[1] = 50.005;
  Trace trace(true);
  GetPhasesAndDutyCycles(RequestFor(kPrimPll, 100, 2, "1 1"), WideLimits(), lists, state, trace);
  EXPECT_EQ(trace.Text(), "DLL ------ getting phases and duty cycles\n");
  const VcoCandidate& candidate = *state.candidates[5];
  EXPECT_EQ(candidate.phase[0], 101.25);
  EXPECT_EQ(candidate.phaseDiff[0], 1.25);
  EXPECT_EQ(candidate.dutyCycle[0], 0.5);
  EXPECT_NEAR(candidate.dutyDiff[0], 0.05, 1e-12);
  EXPECT_EQ(candidate.phase[1], 0.0);
  EXPECT_EQ(candidate.phaseDiff[1], 0.0);
  EXPECT_EQ(candidate.dutyCycle[1], 0.5);
  EXPECT_EQ(candidate.dutyDiff[1], 0.0);
}

TEST(PhaseStage, RequestsOfZeroGiveZero) {
  PllState state = StateWithOne(4, 8, 8);
  Trace trace(false);
  GetPhasesAndDutyCycles(RequestFor(kPrimPll, 100, 1, "1"), WideLimits(), RequestLists{}, state,
                         trace);
  EXPECT_EQ(state.candidates[5]->phase[0], 0.0);
  EXPECT_EQ(state.candidates[5]->phaseDiff[0], 0.0);
  EXPECT_EQ(state.candidates[5]->dutyCycle[0], 0.0);
  EXPECT_EQ(state.candidates[5]->dutyDiff[0], 0.0);
}

TEST(PhaseStage, FractionalTsynSettingFixesEveryOutput) {
  RequestLists lists;
  lists.phase[0] = lists.phase[1] = 90;
  lists.dutyCycle[0] = lists.dutyCycle[1] = 25;
  Trace trace(false);
  for (PllState state : {StateWithOne(2.125, 8, 8), StateWithOne(4, 8, 8.5)}) {
    GetPhasesAndDutyCycles(RequestFor(kPrimTsyn, 100, 2, "1 1"), WideLimits(), lists, state,
                           trace);
    for (int n = 0; n < 2; ++n) {
      EXPECT_EQ(state.candidates[5]->phase[n], 0.0);
      EXPECT_EQ(state.candidates[5]->phaseDiff[n], 0.0);
      EXPECT_EQ(state.candidates[5]->dutyCycle[n], 0.5);
      EXPECT_EQ(state.candidates[5]->dutyDiff[n], 0.0);
    }
  }
  PllRequest integers_only = RequestFor(kPrimTsyn, 100, 2, "1 1");
  integers_only.intDiv0Only = true;
  PllState forced = StateWithOne(2.125, 8, 8);
  GetPhasesAndDutyCycles(integers_only, WideLimits(), lists, forced, trace);
  EXPECT_EQ(forced.candidates[5]->phase[1], 90.0);

  PllState whole = StateWithOne(4, 8, 8);
  GetPhasesAndDutyCycles(RequestFor(kPrimTsyn, 100, 2, "1 1"), WideLimits(), lists, whole, trace);
  EXPECT_EQ(whole.candidates[5]->phase[1], 90.0);
  EXPECT_EQ(whole.candidates[5]->dutyCycle[1], 0.25);
}

// ---- Whole requests, smallest VCO ----

TEST(MinPower, ExactRequestAndItsTrace) {
  PllLimits limits = WideLimits();
  limits.vcoMax = 550;
  RequestLists lists;
  Trace trace(true);
  const PllAnswer answer =
      SolvePll(RequestFor(kPrimPll, 100, 2, "100 50"), limits, lists, trace);
  EXPECT_EQ(answer.code, kSolved);
  EXPECT_TRUE(answer.chosen);
  EXPECT_EQ(answer.vco, 400.0);
  EXPECT_EQ(answer.m, 4.0);
  EXPECT_EQ(answer.d, 1);
  EXPECT_EQ(answer.div0, 4.0);
  EXPECT_EQ(answer.divN[0], 0);
  EXPECT_EQ(answer.divN[1], 8);
  EXPECT_EQ(answer.divN[2], 0);
  EXPECT_EQ(answer.outFreq[0], 100.0);
  EXPECT_EQ(answer.outFreq[1], 50.0);
  EXPECT_EQ(answer.outFreq[2], 0.0);
  EXPECT_EQ(answer.phase[0], 0.0);
  EXPECT_EQ(answer.dutyCycle[0], 0.0);
  EXPECT_EQ(answer.fudge, 0.0);
  EXPECT_EQ(answer.minM, 4.0);
  EXPECT_EQ(answer.maxM, 5.5);
  EXPECT_EQ(trace.Text(),
            "DLL- starting to calculate min power output frequencies\n"
            "DLL---- minAdjVco = 400.000000\n"
            "DLL---- maxAdjVco = 550.000000\n"
            "DLL---- minM = 4.000000\n"
            "DLL---- maxM = 5.500000\n"
            "DLL--- Using fudged oFreq = 100.000 (ofreq: 100.000, fudge: 0.000)\n"
            "DLL----- Found valid VCO = 400.000 and div0 = 4.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 500.000 and div0 = 5.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Looking for valid div1 from remaining VCOs\n"
            "DLL ---------- for VCO = 400.000000: div1 = 8\n"
            "DLL ---------- for VCO = 500.000000: div1 = 10\n"
            "DLL------- Calculating M and D\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 400.000000: M = 4.000000, D = (float) 1.000000, (int) 1\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 500.000000: M = 5.000000, D = (float) 1.000000, (int) 1\n"
            "DLL---- number of valid VCOs: 2\n"
            "DLL------------ finding the smallest VCO\n"
            "DLL - chosen VCO = 400.000000\n"
            "DLL - chosen M = 4.000000\n"
            "DLL - chosen D = 1\n"
            "DLL - chosen CLKOUT0_DIVIDE_F = 4.000000\n"
            "DLL - chosen CLKOUT1_DIVIDE = 8\n"
            "DLL-- chosen clkout0 output freq = 100.000000 (req = 100.000)\n"
            "DLL-- chosen clkout1 output freq = 50.000000 (req = 50.000)\n");
}

TEST(MinPower, OneCandidateTakesPhasesOfAnEarlierRequest) {
  PllLimits limits = WideLimits();
  limits.vcoMax = 450;
  RequestLists lists;
  lists.phase[0] = 22;  // steps of 11.25
  lists.dutyCycle[0] = 30;
  Trace trace(true);
  const PllAnswer answer = SolvePll(RequestFor(kPrimPll, 100, 1, "100"), limits, lists, trace);
  EXPECT_EQ(answer.code, kSolved);
  EXPECT_EQ(answer.phase[0], 22.5);
  EXPECT_EQ(answer.dutyCycle[0], 0.25);  // 0.25 and 0.375, 30 % asked
  EXPECT_TRUE(Contains("DLL---- number of valid VCOs: 1\n"
                       "DLL ------ getting phases and duty cycles\n"
                       "DLL - chosen VCO = 400.000000\n",
                       trace.Text()));
  EXPECT_FALSE(Contains("smallest", trace.Text()));
  EXPECT_FALSE(Contains("chosen clkout0 phase", trace.Text()));
}

PllLimits NarrowLimits() {
  PllLimits limits = WideLimits();
  limits.vcoMin = 399.9;
  limits.vcoMax = 400.1;
  limits.pfdMin = 99.9905;
  limits.pfdMax = 100.0095;
  return limits;
}

TEST(MinPower, FudgeUpward) {
  // VCO = 4 x (99.9 + fudge); PFD = VCO / 4 from 99.9905.
  RequestLists lists;
  Trace trace(true);
  const PllAnswer answer =
      SolvePll(RequestFor(kPrimPll, 100, 1, "99.9"), NarrowLimits(), lists, trace);
  EXPECT_EQ(answer.code, kSolved);
  EXPECT_NEAR(answer.fudge, 0.091, 1e-12);
  EXPECT_NEAR(answer.vco, 399.964, 1e-9);
  EXPECT_EQ(answer.m, 4.0);
  EXPECT_EQ(answer.d, 1);
  EXPECT_EQ(CountOf("so upping div0 fudge to", trace.Text()), 91);
  EXPECT_TRUE(Contains("so upping div0 fudge to 0.091!\n"
                       "DLL--- Using fudged oFreq = 99.991 (ofreq: 99.900, fudge: 0.091)\n",
                       trace.Text()));
  EXPECT_TRUE(Contains("(ofreq: 99.900, fudge: -0.090)\n", trace.Text()));
  EXPECT_FALSE(Contains("fudge: -0.091)\n", trace.Text()));
}

TEST(MinPower, FudgeDownward) {
  RequestLists lists;
  Trace trace(true);
  const PllAnswer answer =
      SolvePll(RequestFor(kPrimPll, 100, 1, "100.1"), NarrowLimits(), lists, trace);
  EXPECT_EQ(answer.code, kSolved);
  EXPECT_NEAR(answer.fudge, 0.091, 1e-12);
  EXPECT_NEAR(answer.vco, 400.036, 1e-9);
  EXPECT_TRUE(Contains("fudge: -0.091)\n", trace.Text()));
}

TEST(MinPower, EveryFudgeFails) {
  RequestLists lists;
  Trace trace(true);
  const PllAnswer answer =
      SolvePll(RequestFor(kPrimPll, 100, 1, "20000"), WideLimits(), lists, trace);
  EXPECT_EQ(answer.code, kNoConfiguration);
  EXPECT_FALSE(answer.chosen);
  EXPECT_EQ(answer.vco, 0.0);
  EXPECT_EQ(answer.outFreq[0], 0.0);
  EXPECT_EQ(answer.fudge, 0.0);
  EXPECT_EQ(answer.maxAdjVco, 1000.0);
  EXPECT_EQ(CountOf("so upping div0 fudge to", trace.Text()), 11000);
  EXPECT_EQ(CountOf("DLL---- number of valid VCOs: 0\n", trace.Text()), 22000);
  const std::string end =
      "DLL--- Using fudged oFreq = 19989.001 (ofreq: 20000.000, fudge: -10.999)\n"
      "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = -10.999!\n"
      "DLL---- number of valid VCOs: 0\n"
      "DLL- NO VALID VCOs found, so upping div0 fudge to 11.000!\n"
      "DLL- NO VALID VCOs found for all possible div0 fudges!\n";
  EXPECT_EQ(trace.Text().substr(trace.Text().size() - end.size()), end);
}

TEST(MinPower, CodesBeforeAnySearch) {
  RequestLists lists;
  Trace trace(true);
  PllAnswer answer = SolvePll(RequestFor(kPrimPll, 100, 8, "1 2 3 4 5 6 7 8"), WideLimits(), lists,
                              trace);
  EXPECT_EQ(answer.code, kBadRequest);
  EXPECT_EQ(answer.minAdjVco, 400.0);
  EXPECT_EQ(answer.maxAdjVco, 1200.0);
  EXPECT_EQ(lists.outFreq[0], 0.0);
  EXPECT_EQ(trace.Text(), "DLL- starting to calculate min power output frequencies\n");
  answer = SolvePll(RequestFor(kPrimPll, 0, 1, "55"), WideLimits(), lists, trace);
  EXPECT_EQ(answer.code, kBadRequest);
  EXPECT_EQ(lists.outFreq[0], 55.0);
}

TEST(MinPower, TsynOutput0IsFractionalBelowSixOutputs) {
  PllLimits limits = WideLimits();
  limits.vcoMin = 849;
  limits.vcoMax = 851;
  RequestLists lists;
  Trace trace(false);
  // 400 x 2.125 = 850 = 100 x 17 / 2.
  PllAnswer answer =
      SolvePll(RequestFor(kPrimTsyn, 100, 5, "400 85 85 85 85"), limits, lists, trace);
  EXPECT_EQ(answer.code, kSolved);
  EXPECT_EQ(answer.div0, 2.125);
  EXPECT_EQ(answer.m, 17.0);
  EXPECT_EQ(answer.d, 2);
  EXPECT_EQ(answer.outFreq[0], 400.0);
  EXPECT_EQ(answer.dutyCycle[0], 0.5);

  limits.vcoMax = 1250;
  // With six outputs 400 x 2.125 is out, although it alone makes 85 exactly.
  answer = SolvePll(RequestFor(kPrimTsyn, 100, 6, "400 85 85 85 85 85"), limits, lists, trace);
  EXPECT_EQ(answer.code, kSolved);
  EXPECT_EQ(answer.div0, 3.0);

  PllRequest whole = RequestFor(kPrimTsyn, 100, 1, "400");
  whole.intDiv0Only = true;
  answer = SolvePll(whole, limits, lists, trace);
  EXPECT_EQ(answer.div0, 3.0);
  whole.intDiv0Only = false;
  answer = SolvePll(whole, limits, lists, trace);
  EXPECT_EQ(answer.div0, 2.125);
}

// ---- Single passes ----

TEST(SolverPass, WithoutFudgeTheSecondAttemptRepeatsTheChecks) {
  PllLimits limits = WideLimits();
  limits.vcoMax = 450;
  const PllRequest request = RequestFor(kPrimPll, 100, 2, "100 0.5");
  RequestLists lists;
  PllState state;
  Trace trace(true);
  ASSERT_EQ(PrepareVcoRange(request, limits, lists, state, trace), kSolved);
  trace.Clear();
  EXPECT_FALSE(SolverPass(0.0, request, limits, lists, state, trace));
  EXPECT_FALSE(state.chosen);
  EXPECT_EQ(CountOf("DLL--- Using fudged oFreq", trace.Text()), 1);
  EXPECT_EQ(CountOf("DLL----- Looking for valid div1 from remaining VCOs\n", trace.Text()), 2);
  EXPECT_EQ(CountOf("number of valid VCOs", trace.Text()), 0);
}

TEST(SolverPass, WithoutCandidatesTheCountIsStillGiven) {
  const PllRequest request = RequestFor(kPrimPll, 100, 1, "2000");
  RequestLists lists;
  PllState state;
  Trace trace(true);
  ASSERT_EQ(PrepareVcoRange(request, WideLimits(), lists, state, trace), kSolved);
  trace.Clear();
  EXPECT_FALSE(SolverPass(0.0, request, WideLimits(), lists, state, trace));
  EXPECT_EQ(trace.Text(),
            "DLL--- Using fudged oFreq = 2000.000 (ofreq: 2000.000, fudge: 0.000)\n"
            "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = 0.000!\n"
            "DLL---- number of valid VCOs: 0\n"
            "DLL---- number of valid VCOs: 0\n");
}

TEST(SolverPass, WhatTheFirstAttemptLeftWithoutMAndDIsNeverChosen) {
  // Upward 4 x 100.05 = 400.2 is in range and gets no divider for output 1; downward there is no
  // VCO at all.
  PllLimits limits = WideLimits();
  limits.vcoMax = 400.3;
  const PllRequest request = RequestFor(kPrimPll, 100, 2, "100 0.5");
  RequestLists lists;
  PllState state;
  Trace trace(true);
  ASSERT_EQ(PrepareVcoRange(request, limits, lists, state, trace), kSolved);
  trace.Clear();
  EXPECT_FALSE(SolverPass(0.05, request, limits, lists, state, trace));
  EXPECT_FALSE(state.chosen);
  EXPECT_TRUE(state.candidates[3]);
  EXPECT_EQ(CountOf("DLL---- number of valid VCOs: 0\n", trace.Text()), 1);
  EXPECT_FALSE(Contains("chosen", trace.Text()));
}

TEST(SolverPass, WhatTheFirstAttemptLeftTakesPartInTheSecond) {
  // Upward: 400.2 makes output 1 exactly and output 2 not at all. Downward: 499.75 would serve
  // both, output 1 at a wide tolerance, but the left-over fits output 1 better and drives it out.
  PllLimits limits = WideLimits();
  limits.vcoMin = 400.1;
  limits.vcoMax = 499.8;
  limits.clkoutMin = 230;
  limits.pfdMin = 1;
  const PllRequest request = RequestFor(kPrimPll, 99.95, 3, "100 400.2 249.875");
  RequestLists lists;
  PllState state;
  Trace trace(true);
  ASSERT_EQ(PrepareVcoRange(request, limits, lists, state, trace), kSolved);
  trace.Clear();
  EXPECT_FALSE(SolverPass(0.05, request, limits, lists, state, trace));
  EXPECT_EQ(CountOf("DLL ---------- for VCO = 400.200000: div1 = 1\n", trace.Text()), 2);
  EXPECT_TRUE(Contains("Found valid VCO = 499.750 and div0 = 5.000 (ofreq0_fudge = -0.050)\n"
                       "DLL----- Looking for valid div1 from remaining VCOs\n"
                       "DLL ---------- for VCO = 400.200000: div1 = 1\n"
                       "DLL----- Looking for valid div2 from remaining VCOs\n",
                       trace.Text()));

  state.minAdjVco = 450;
  EXPECT_TRUE(SolverPass(0.05, request, limits, lists, state, trace));
  ASSERT_TRUE(state.chosen);
  EXPECT_NEAR(state.candidates[*state.chosen]->vco, 499.75, 1e-9);
  EXPECT_EQ(state.candidates[*state.chosen]->m, 5.0);
  EXPECT_EQ(state.candidates[*state.chosen]->divN[1], 1);
  EXPECT_EQ(state.candidates[*state.chosen]->divN[2], 2);
}

// ---- Choice by phases and duty cycles ----

VcoCandidate AcceptedCandidate(double vco) {
  VcoCandidate candidate;
  candidate.vco = vco;
  candidate.div0 = 4;
  candidate.m = 8;
  candidate.d = 1;
  return candidate;
}

PllRequest ClosestRequest(int prim, int count) {
  PllRequest request;
  request.closest = true;
  request.prim = prim;
  request.count = count;
  return request;
}

TEST(Closest, ExactOnesAreGatheredAtOnceAndTheVcoDecides) {
  PllState state;
  state.candidates[3] = AcceptedCandidate(500);
  state.candidates[5] = AcceptedCandidate(450);
  state.candidates[8] = AcceptedCandidate(780);
  state.candidates[9] = VcoCandidate{};  // no M and D: not a solution
  Trace trace(true);
  std::optional<std::size_t> chosen =
      SelectPhaseSolution(ClosestRequest(kPrimPll, 1), WideLimits(), state, trace);
  EXPECT_EQ(chosen, 5U);
  const std::string listing =
      "DLL  _solutions[0] VCO = 500.000; clk0 phase = 0.000, dc = 0.000\n"
      "DLL  _solutions[1] VCO = 450.000; clk0 phase = 0.000, dc = 0.000\n"
      "DLL  _solutions[2] VCO = 780.000; clk0 phase = 0.000, dc = 0.000\n";
  EXPECT_EQ(trace.Text(),
            "DLL---- looking for the clk0 phase solutions with threshold = 0.000000\n"
            "DLL------- 3 solutions for clk0; no other oclks used\n"
            "DLL------ Multiple solutions found, so pick the best for clk0.\n" +
                listing +
                "DLL-------- looking for best clk0 solution\n"
                "DLL- narrowing down top choices for clk0\n"
                "DLL------ have 3 solutions after clk0 phase check\n" +
                listing + "DLL------ have 3 solutions after clk0 duty cycle check\n" + listing +
                "DLL------------ finding the smallest VCO\n");

  trace.Clear();
  chosen = SelectPhaseSolution(ClosestRequest(kPrimTsyn, 1), WideLimits(), state, trace);
  EXPECT_EQ(chosen, 8U);  // 780 is nearest to the target of 800
  EXPECT_TRUE(Contains("DLL------------ finding the target VCO (closest to 800.000)\n",
                       trace.Text()));

  trace.Clear();
  PllRequest largest = ClosestRequest(kPrimPll, 1);
  largest.preferMaxVco = true;
  chosen = SelectPhaseSolution(largest, WideLimits(), state, trace);
  EXPECT_EQ(chosen, 8U);
  EXPECT_TRUE(Contains("DLL-------- looking for best clk0 solution\n"
                       "DLL----------- finding the largest VCO\n",
                       trace.Text()));
  EXPECT_FALSE(Contains("narrowing", trace.Text()));
}

TEST(Closest, OnlyOneWithinTheToleranceIsUsedWithoutMore) {
  PllState state;
  state.candidates[3] = AcceptedCandidate(500);
  state.candidates[3]->phaseDiff[0] = 2;
  state.candidates[7] = AcceptedCandidate(700);
  state.candidates[7]->phaseDiff[0] = 0.0005;
  state.candidates[7]->phaseDiff[1] = 1000;  // not looked at
  Trace trace(true);
  EXPECT_EQ(SelectPhaseSolution(ClosestRequest(kPrimPll, 2), WideLimits(), state, trace), 7U);
  EXPECT_EQ(trace.Text(),
            "DLL---- looking for the clk0 phase solutions with threshold = 0.000000\n"
            "DLL------- no matches for clk0, so try with higher threshold\n"
            "DLL---- looking for the clk0 phase solutions with threshold = 0.001000\n"
            "DLL------- only one exact solution for clk0, so use it\n");
}

TEST(Closest, GivesUpAfterSixtyTolerances) {
  PllState state;
  state.candidates[3] = AcceptedCandidate(500);
  state.candidates[3]->phaseDiff[0] = 28.5;
  state.candidates[4] = AcceptedCandidate(600);
  state.candidates[4]->phaseDiff[0] = kNan;
  Trace trace(true);
  EXPECT_FALSE(SelectPhaseSolution(ClosestRequest(kPrimPll, 1), WideLimits(), state, trace));
  EXPECT_EQ(CountOf("so try with higher threshold", trace.Text()), 60);
  EXPECT_TRUE(Contains("with threshold = 1.000000\n", trace.Text()));
  EXPECT_TRUE(Contains("with threshold = 28.000000\n", trace.Text()));
  EXPECT_FALSE(Contains("with threshold = 28.500000\n", trace.Text()));
}

TEST(Closest, OnlyTheFirstHundredAreGathered) {
  PllState state;
  for (std::size_t k = 0; k < 150; ++k) {
    state.candidates[k] = AcceptedCandidate(1000.0 - static_cast<double>(k));
  }
  Trace trace(true);
  EXPECT_EQ(SelectPhaseSolution(ClosestRequest(kPrimPll, 1), WideLimits(), state, trace), 99U);
  EXPECT_TRUE(Contains("DLL------- 100 solutions for clk0; no other oclks used\n", trace.Text()));
}

TEST(Closest, FurtherOutputsStartWithAWideTolerance) {
  // Both within 0.5 of output 1, so both pass its filter at the first attempt.
  PllState state;
  state.candidates[3] = AcceptedCandidate(500);
  state.candidates[3]->phaseDiff[1] = 0.4;
  state.candidates[4] = AcceptedCandidate(600);
  state.candidates[4]->freqDiff[1] = 0.3;
  state.candidates[5] = AcceptedCandidate(700);
  state.candidates[5]->phaseDiff[1] = 3;
  Trace trace(true);
  // Output 1 narrows by frequency first: 500 with difference 0.
  EXPECT_EQ(SelectPhaseSolution(ClosestRequest(kPrimPll, 2), WideLimits(), state, trace), 3U);
  EXPECT_TRUE(Contains("DLL------- 3 solutions for clk0, so check other outclks\n"
                       "DLL-------- looking for clk1 phase solutions with threshold2 = 0.000000\n"
                       "DLL--------- 2 solutions for clk1, so test other oclks\n",
                       trace.Text()));
  EXPECT_TRUE(Contains("DLL------ using the unique clk1 solution with the closest outFreq\n",
                       trace.Text()));
}

TEST(Closest, FilterWidensAndGoesOnWithOneSolution) {
  PllState state;
  state.candidates[3] = AcceptedCandidate(500);
  state.candidates[3]->phaseDiff[1] = 1.5;
  state.candidates[4] = AcceptedCandidate(600);
  state.candidates[4]->phaseDiff[1] = 3;
  Trace trace(true);
  EXPECT_EQ(SelectPhaseSolution(ClosestRequest(kPrimPll, 3), WideLimits(), state, trace), 3U);
  // 0.5, 0.001, 0.01, 0.1, 0.5 and 1.0 find nothing, 1.5 does.
  EXPECT_EQ(CountOf("DLL--------- no matches for clk1, so try with higher threshold\n",
                    trace.Text()),
            6);
  EXPECT_TRUE(Contains("DLL--------- only one exact solution left, so use it\n"
                       "DLL-------- looking for clk2 phase solutions with threshold2 = 0.000000\n"
                       "DLL--------- only one exact solution left, so use it\n"
                       "DLL------ Multiple solutions found, so pick the best for clk0.\n"
                       "DLL  _solutions[0] VCO = 500.000",
                       trace.Text()));
}

TEST(Closest, FilterThatFindsNothingLeavesNothing) {
  PllState state;
  state.candidates[3] = AcceptedCandidate(500);
  state.candidates[3]->phaseDiff[1] = 90;
  state.candidates[4] = AcceptedCandidate(600);
  state.candidates[4]->phaseDiff[1] = 90;
  Trace trace(true);
  EXPECT_FALSE(SelectPhaseSolution(ClosestRequest(kPrimTsyn, 3), WideLimits(), state, trace));
  EXPECT_EQ(CountOf("DLL--------- no matches for clk1", trace.Text()), 60);
  EXPECT_EQ(CountOf("DLL--------- no matches for clk2", trace.Text()), 60);
  EXPECT_TRUE(Contains("DLL------ Multiple solutions found, so pick the best for clk0.\n"
                       "DLL-------- looking for best clk0 solution\n"
                       "DLL- narrowing down top choices for clk0\n"
                       "DLL- narrowing down top choices for clk1\n"
                       "DLL- narrowing down top choices for clk2\n"
                       "DLL------------ finding the target VCO (closest to 800.000)\n",
                       trace.Text()));
}

TEST(Closest, PhasePassOfFurtherOutputsGoesOnFromTheBestFrequency) {
  // Frequencies exact, phases 0.3 and 0.2 off: 0 stays the best value, nothing is marked, and the
  // smallest VCO decides.
  PllState state;
  state.candidates[3] = AcceptedCandidate(700);
  state.candidates[3]->phaseDiff[1] = 0.2;
  state.candidates[4] = AcceptedCandidate(600);
  state.candidates[4]->phaseDiff[1] = 0.3;
  Trace trace(true);
  EXPECT_EQ(SelectPhaseSolution(ClosestRequest(kPrimPll, 2), WideLimits(), state, trace), 4U);
  EXPECT_TRUE(Contains("DLL--------- have 2 solutions after clk1 divN check\n", trace.Text()));
  EXPECT_FALSE(Contains("after clk1 phase check", trace.Text()));
  EXPECT_TRUE(Contains("DLL------------ finding the smallest VCO\n", trace.Text()));
}

TEST(Closest, UniqueSolutionMayBeTheOneThatEqualsTheBest) {
  // The phase pass starts at 0, the best frequency difference: 700 equals it, 600 does not.
  PllState state;
  state.candidates[3] = AcceptedCandidate(600);
  state.candidates[3]->phaseDiff[1] = 0.3;
  state.candidates[4] = AcceptedCandidate(700);
  Trace trace(true);
  EXPECT_EQ(SelectPhaseSolution(ClosestRequest(kPrimPll, 2), WideLimits(), state, trace), 4U);
  EXPECT_TRUE(Contains("DLL------ using the unique clk1 solution with the closest phase\n",
                       trace.Text()));
}

TEST(Closest, DutyCyclePassDecidesBetweenEqualPhases) {
  PllState state;
  state.candidates[3] = AcceptedCandidate(500);
  state.candidates[3]->dutyDiff[0] = 0.00009;
  state.candidates[4] = AcceptedCandidate(600);
  state.candidates[4]->dutyDiff[0] = 0.0;
  state.candidates[5] = AcceptedCandidate(700);
  state.candidates[5]->dutyDiff[0] = 0.0001;
  Trace trace(true);
  // All are within 0.0001 of each other in turn: 0.00009 first, then 0 is within 0.0001 of it, and
  // 0.0001 as well.
  EXPECT_EQ(SelectPhaseSolution(ClosestRequest(kPrimPll, 1), WideLimits(), state, trace), 3U);
  EXPECT_TRUE(Contains("DLL------ have 3 solutions after clk0 duty cycle check\n", trace.Text()));

  state.candidates[3]->dutyDiff[0] = 0.0009;
  state.candidates[4]->dutyDiff[0] = 0.0005;
  state.candidates[5]->dutyDiff[0] = 0.0009;
  trace.Clear();
  EXPECT_EQ(SelectPhaseSolution(ClosestRequest(kPrimPll, 1), WideLimits(), state, trace), 4U);
  EXPECT_TRUE(Contains("DLL------ using the unique clk0 solution with the closest phase and "
                       "closest duty cycle\n",
                       trace.Text()));
}

TEST(Closest, WholeRequest) {
  // VCO 400 and 500 both serve 100 MHz; 90 degrees need a divider with 45 / divider steps: 4 makes
  // 11.25 x 8, 5 makes 9 x 10. 30 %: 4 makes 0.25 (0.05 off), 5 makes 0.3.
  PllLimits limits = WideLimits();
  limits.vcoMax = 550;
  PllRequest request = RequestFor(kPrimPll, 100, 1, "100");
  request.closest = true;
  request.phases = "90";
  request.dutyCycles = "30";
  RequestLists lists;
  Trace trace(true);
  const PllAnswer answer = SolvePll(request, limits, lists, trace);
  EXPECT_EQ(answer.code, kSolved);
  EXPECT_EQ(answer.vco, 500.0);
  EXPECT_EQ(answer.phase[0], 90.0);
  EXPECT_DOUBLE_EQ(answer.dutyCycle[0], 0.3);
  EXPECT_TRUE(Contains("DLL---- number of valid VCOs: 2\n"
                       "DLL ------ getting phases and duty cycles\n"
                       "DLL---- looking for the clk0 phase solutions with threshold = 0.000000\n"
                       "DLL------- only one exact solution for clk0, so use it\n"
                       "DLL - chosen VCO = 500.000000\n"
                       "DLL - chosen M = 5.000000\n"
                       "DLL - chosen D = 1\n"
                       "DLL - chosen CLKOUT0_DIVIDE_F = 5.000000\n"
                       "DLL-- chosen clkout0 output freq = 100.000000 (req = 100.000)\n"
                       "DLL -   chosen clkout0 phase = 90.000000 (req = 90.000)\n"
                       "DLL -   chosen clkout0 duty cycle = 0.300000 (req = 30.000)\n",
                       trace.Text()));
}

TEST(Closest, BothListsAreParsedBeforeEitherFails) {
  PllRequest request = RequestFor(kPrimPll, 100, 2, "100 50");
  request.closest = true;
  request.phases = "90";
  request.dutyCycles = "30 40";
  RequestLists lists;
  Trace trace(true);
  EXPECT_EQ(SolvePll(request, WideLimits(), lists, trace).code, kBadRequest);
  EXPECT_EQ(trace.Text(), "DLL- starting to get closest solution\n");
  EXPECT_EQ(lists.phase[0], 90.0);
  EXPECT_EQ(lists.dutyCycle[1], 40.0);
  EXPECT_EQ(lists.outFreq[0], 0.0);
}

}  // namespace
}  // namespace plain
