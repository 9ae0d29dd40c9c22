// Checks of the plain KRU_SP and KRU_CLKGEN solvers against results worked out by hand.

#include <gtest/gtest.h>

#include <limits>
#include <string>

#include "plain_kru.h"
#include "plain_kru_clkgen.h"
#include "plain_kru_stages.h"

namespace plain {
namespace {

constexpr double kNan = std::numeric_limits<double>::quiet_NaN();

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

struct KruRun {
  int code = 0;
  RequestLists lists;
  KruState state;
  std::string trace;
};

KruRequest RequestFor(double inFreq, int numOut, const std::string& outFreqs,
                      const std::string& phases, bool feedbackUsed) {
  return {outFreqs, phases, inFreq, numOut, feedbackUsed};
}

KruRun RunKru(const KruRequest& request, const KruLimits& limits = {}) {
  KruRun run;
  Trace trace(true);
  run.code = SolveKru(request, limits, run.lists, run.state, trace);
  run.trace = trace.Text();
  return run;
}

KruRun RunClkgen(const KruRequest& request, const KruLimits& limits = {}) {
  KruRun run;
  Trace trace(true);
  run.code = SolveKruClkgen(request, limits, run.lists, run.state, trace);
  run.trace = trace.Text();
  return run;
}

// Runs the pin assignment alone, with the phase offset given.
struct PinRun {
  KruState state;
  KruClkdvValues clkdv;
  std::string trace;
};

PinRun AssignOne(double inFreq, double f, double p, double off, bool feedbackUsed) {
  PinRun run;
  run.state.phaseOffset = off;
  RequestLists lists;
  lists.outFreq[0] = f;
  lists.phase[0] = p;
  Trace trace(true);
  run.clkdv = AssignKruPins(RequestFor(inFreq, 1, "", "", feedbackUsed), KruLimits{}, lists,
                            run.state, trace);
  run.trace = trace.Text();
  return run;
}

const char kRanges[] =
    "DLL --- KRU output clock valid freq ranges:\n"
    "DLL ------> CLK0, CLK180 min = 5.000; max = 280.112\n"
    "DLL ------> CLK90, CLK270 min = 5.000; max = 200.000\n"
    "DLL ------> CLK2X min = 10.000; max = 374.532\n"
    "DLL ------> CLKDV min = 0.312; max = 185.874\n"
    "DLL ------> CLKFX min = 5.000; max = 374.532\n";

// ---- Whole requests ----

TEST(Kru, InputFrequencyAndItsTrace) {
  const KruRun run = RunKru(RequestFor(100, 1, "100", "0", true));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.m, 0);
  EXPECT_EQ(run.state.d, 0);
  EXPECT_EQ(run.state.clkdv, 0.0);
  EXPECT_FALSE(run.state.divBy2);
  EXPECT_EQ(KruPinName(run.state, 0), "CLK0");
  EXPECT_EQ(KruOutFreq(run.state, 100, 0), 100.0);
  EXPECT_EQ(run.trace, std::string("DLL- starting to calculate KRU actuals \n") + kRanges +
                           "DLL -- determining if a phase offset is used for KRU\n"
                           "DLL ---- all phases have 0 offset\n"
                           "DLL ---- Checking if KRU will work\n"
                           "DLL ------ Clk_Out0 ofreq = 100.000; phase = 0.000\n"
                           "DLL --------- _kruPinsDivBy2False[0] = CLK0\n"
                           "DLL --------- _kruPinsDivBy2True[0] = CLK2X\n"
                           "DLL --    _kruPinsDivBy2F list works!\n"
                           "DLL - for CLK_OUT0, chosen KRU pin = CLK0\n"
                           "DLL - chosen CLKIN_DIVIDE_BY_2 = 0\n"
                           "DLL - chosen M = 0\n"
                           "DLL - chosen D = 0\n"
                           "DLL - chosen phase offset = 0.000000\n"
                           "DLL - chosen PHASE_SHIFT = 0\n");
}

TEST(Kru, HalfFrequencyTakesClkdvAndLeavesClk0ToTheOtherList) {
  const KruRun run = RunKru(RequestFor(100, 1, "50", "0", true));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(KruPinName(run.state, 0), "CLKDV");
  EXPECT_EQ(run.state.clkdv, 2.0);
  EXPECT_EQ(KruOutFreq(run.state, 100, 0), 50.0);
  EXPECT_EQ(run.state.pinsT[0], kPinClk0);
  // One index beyond the outputs reads the other list.
  EXPECT_EQ(KruPinName(run.state, 6), "CLK0");
  EXPECT_EQ(KruOutFreq(run.state, 100, 6), 100.0);
  EXPECT_EQ(KruPinName(run.state, 7), "NONE");
  EXPECT_EQ(KruPinName(run.state, -1), "NONE");
  EXPECT_EQ(KruOutFreq(run.state, 100, 7), 0.0);
  EXPECT_EQ(KruOutFreq(run.state, 0, 0), 0.0);
  EXPECT_TRUE(Contains("DLL - chosen CLKDV = 2.000000\n", run.trace));
}

TEST(Kru, SynthesisedOutputTakesTheSmallestDivisor) {
  const KruRun run = RunKru(RequestFor(100, 1, "150", "0", false));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.m, 3);
  EXPECT_EQ(run.state.d, 2);
  EXPECT_EQ(KruOutFreq(run.state, 100, 0), 150.0);
  EXPECT_TRUE(Contains("DLL ----- looking for M/D for requested ofreq = 150.000000\n"
                       "DLL ----- a possible M = 3, D = 2\n"
                       "DLL ----- a possible M = 6, D = 4\n",
                       run.trace));
  // M = 3, 6, ... 30; the next one, 33, is too large.
  EXPECT_TRUE(Contains("DLL ----- a possible M = 30, D = 20\n"
                       "DLL ----- found 10 possible M and Ds\n"
                       "DLL -- found M = 3, D = 2\n"
                       "DLL --    _kruPinsDivBy2F list works!\n",
                       run.trace));
}

TEST(Kru, ThreeTimesTheInputIsSynthesised) {
  const KruRun run = RunKru(RequestFor(100, 1, "300", "0", true));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.pinsF[0], kPinClkfx);
  EXPECT_EQ(run.state.pinsT[0], kPinClkfx);
  EXPECT_EQ(run.state.m, 3);
  EXPECT_EQ(run.state.d, 1);
}

TEST(Kru, SecondClkdvValueGoesToClkfx) {
  const KruRun run = RunKru(RequestFor(100, 2, "50 25", "0 0", true));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(KruPinName(run.state, 0), "CLKDV");
  EXPECT_EQ(KruPinName(run.state, 1), "CLKFX");
  EXPECT_EQ(run.state.clkdv, 2.0);
  EXPECT_EQ(run.state.m, 2);
  EXPECT_EQ(run.state.d, 8);
  EXPECT_EQ(KruOutFreq(run.state, 100, 1), 25.0);
  EXPECT_TRUE(Contains("DLL ------ CLKDV is used, with this value: 2.000000\n"
                       "DLL -------- non-matching CLKDVs used: value: 4.000000; changing "
                       "divBy2F[1] to CLKFX\n"
                       "DLL ----- looking for M/D for requested ofreq = 25.000000\n",
                       run.trace));
}

TEST(Kru, EqualClkdvValuesStay) {
  const KruRun run = RunKru(RequestFor(100, 3, "100 40 40", "0 0 0", true));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.clkdv, 2.5);
  EXPECT_EQ(KruPinName(run.state, 2), "CLKDV");
  EXPECT_EQ(CountOf("CLKDV is used, with this value: 2.500000", run.trace), 1);
  EXPECT_FALSE(Contains("non-matching", run.trace));
}

TEST(Kru, OtherListServesWhatTheFirstCannot) {
  KruRun run = RunKru(RequestFor(100, 1, "50", "90", true));
  // 90 is a pin phase, so there is no offset.
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_TRUE(run.state.divBy2);
  EXPECT_EQ(KruPinName(run.state, 0), "CLK90");
  EXPECT_EQ(KruOutFreq(run.state, 100, 0), 50.0);
  EXPECT_TRUE(Contains("DLL -------- _kruPinsDivby2F[0] isn't filled, so KRU won't work for "
                       "DivBy2 = F\n"
                       "DLL ---------- checking 2nd list: _kruPinsDivBy2T \n"
                       "DLL ---------- _kruPinsDivBy2T list works!\n"
                       "DLL - for CLK_OUT0, chosen KRU pin = CLK90\n"
                       "DLL - chosen CLKIN_DIVIDE_BY_2 = 1\n",
                       run.trace));

  run = RunKru(RequestFor(100, 2, "50 100", "90 90", true));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_EQ(KruPinName(run.state, 0), "NONE");
  EXPECT_TRUE(Contains("DLL -------- _kruPinsDivby2T[1] isn't filled, so KRU won't work for "
                       "DivyBy2 = T\n"
                       "DLL ---- KRU won't work!!\n",
                       run.trace));
}

TEST(Kru, SecondSynthesisedOutputFiltersMoreTightly) {
  // Same ratio: every pair stays. 150.02 misses D by 0.00027 and more in the first list and by
  // 0.00013 and more in the second.
  KruRun run = RunKru(RequestFor(100, 2, "150 150", "0 0", false));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(CountOf("DLL ----- testing M = ", run.trace), 10);
  EXPECT_EQ(CountOf("removed possible", run.trace), 0);
  run = RunKru(RequestFor(100, 2, "150 150.02", "0 0", false));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_EQ(run.state.m, 0);
  EXPECT_TRUE(Contains("DLL ----- testing M = 3, D = 2\n"
                       "DLL ----- removed possible M = 3, D = 2\n",
                       run.trace));
  EXPECT_TRUE(Contains("DLL ----- couldn't find and M and Ds for clknum 1\n"
                       "DLL -- couldn't find an M and D\n"
                       "DLL ---------- checking 2nd list: _kruPinsDivBy2T \n"
                       "DLL ----- looking for M/D for requested ofreq = 150.000000\n",
                       run.trace));
  // As a first output the same misses still count as matches.
  run = RunKru(RequestFor(100, 1, "150.02", "0", false));
  EXPECT_EQ(run.state.m, 3);
  EXPECT_FALSE(run.state.divBy2);
  // 150.01 misses by 0.00007 in the second list, where D is 1.
  run = RunKru(RequestFor(100, 2, "150 150.01", "0 0", false));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_TRUE(run.state.divBy2);
  EXPECT_EQ(run.state.m, 3);
  EXPECT_EQ(run.state.d, 1);
}

TEST(Kru, ResultCodesInOrder) {
  KruLimits unreadable;
  unreadable.readable = false;
  EXPECT_EQ(RunKru(RequestFor(100, 1, "100", "0", true), unreadable).code, kKruNoLimits);
  EXPECT_EQ(RunKru(RequestFor(0, 1, "100", "0", true), unreadable).code, kKruNoConfiguration);
  EXPECT_EQ(RunKru(RequestFor(100, 2, "100", "0 0", true), unreadable).code, kKruNoConfiguration);
  const KruRun run = RunKru(RequestFor(100, 7, "1 2 3 4 5 6 7", "1 2 3 4 5 6 7", true));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_EQ(run.lists.outFreq[0], 0.0);
  EXPECT_EQ(run.lists.phase[0], 0.0);
  EXPECT_EQ(run.trace,
            "DLL- starting to calculate KRU actuals \nDLL ---- KRU won't work!!\n");
  // The phases are read although the frequencies failed.
  EXPECT_EQ(RunKru(RequestFor(100, 2, "100", "5 6", true)).lists.phase[1], 6.0);
}

// ---- Phase offset ----

TEST(KruPhase, OffsetBesideAnExactPhaseFails) {
  KruRun run = RunKru(RequestFor(100, 2, "100 100", "0 45", true));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_TRUE(Contains("DLL ---- found non-zero offset for clkunm 1 = 45.000000\n"
                       "DLL ---- KRU won't work!!\n",
                       run.trace));
}

TEST(KruPhase, CommonOffset) {
  KruRun run = RunKru(RequestFor(100, 2, "100 100", "45 135", true));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.phaseOffset, 45.0);
  EXPECT_EQ(KruPhaseShift(run.state), 32);
  EXPECT_EQ(KruPinName(run.state, 0), "CLK0");
  EXPECT_EQ(KruPinName(run.state, 1), "CLK90");
  EXPECT_TRUE(Contains("DLL ---- 45.000 offset was used for all outclks\n", run.trace));
  EXPECT_TRUE(Contains("DLL - chosen phase offset = 45.000000\nDLL - chosen PHASE_SHIFT = 32\n",
                       run.trace));

  run = RunKru(RequestFor(100, 4, "100 100 100 100", "270.5 0.5 180.5 90.5", true));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.phaseOffset, 0.5);
  EXPECT_EQ(KruPinName(run.state, 0), "CLK270");
  EXPECT_EQ(KruPinName(run.state, 2), "CLK180");

  // Without feedback CLKFX180 at an unrelated frequency is in the second list only.
  run = RunKru(RequestFor(100, 2, "150 150", "45 225", false));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.phaseOffset, 45.0);
  EXPECT_TRUE(run.state.divBy2);
  EXPECT_EQ(KruPinName(run.state, 0), "CLKFX");
  EXPECT_EQ(KruPinName(run.state, 1), "CLKFX180");
  EXPECT_EQ(run.state.m, 3);
  EXPECT_EQ(run.state.d, 1);
  EXPECT_EQ(KruOutFreq(run.state, 100, 1), 150.0);
  EXPECT_EQ(run.state.pinsF[1], kPinNone);
}

TEST(KruPhase, DifferentOffsetsFail) {
  const KruRun run = RunKru(RequestFor(100, 2, "100 100", "10 20", true));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_TRUE(Contains("DLL ---- both 10.000 offset and 20.000 offset were used, so offsets won't "
                       "work!\n"
                       "DLL ---- both -80.000 negOffset and -70.000 negOffset were used, so "
                       "negOffsets won't work!\n"
                       "DLL ---- KRU won't work!!\n",
                       run.trace));
}

TEST(KruPhase, NegativePhaseFindsAnOffsetButNoPin) {
  const KruRun run = RunKru(RequestFor(100, 1, "100", "-30", true));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_EQ(run.state.phaseOffset, 30.0);
  EXPECT_EQ(KruPhaseShift(run.state), 21);
  EXPECT_TRUE(Contains("DLL ---- 30.000 offset was used for all outclks\n", run.trace));
  EXPECT_EQ(run.state.pinsF[0], kPinNone);
}

TEST(KruPhase, NegativeOffsetOfAtMostTwoDegrees) {
  // Offsets 89 and 1 differ; -1 serves both, and its PHASE_SHIFT truncates to 0.
  KruRun run = RunKru(RequestFor(100, 2, "100 100", "89 -1", true));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.phaseOffset, -1.0);
  EXPECT_EQ(KruPhaseShift(run.state), 0);
  EXPECT_EQ(KruPinName(run.state, 0), "CLK90");
  EXPECT_EQ(KruPinName(run.state, 1), "CLK0");
  EXPECT_TRUE(Contains("DLL ---- -1.000 offset (should be negative) was used for all outclks\n",
                       run.trace));

  run = RunKru(RequestFor(100, 2, "100 100", "60 -30", true));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_EQ(run.state.phaseOffset, 0.0);
  EXPECT_TRUE(Contains("DLL ---- PHASE_SHIFT = -20.000 from offset -30.000000 is out of valid "
                       "range!\n",
                       run.trace));
}

TEST(KruPhase, PositiveOffsetOutOfRangeTriesTheNegativeOne) {
  // 700 - 270 = 430 needs 305 steps, 700 - 360 = 340 needs 241.
  const KruRun run = RunKru(RequestFor(100, 1, "100", "700", true));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_EQ(run.state.phaseOffset, 340.0);
  EXPECT_TRUE(Contains("DLL ---- PHASE_SHIFT = 305.000 from offset 430.000000 is out of valid "
                       "range!\n"
                       "DLL ---- 340.000 offset (should be negative) was used for all outclks\n",
                       run.trace));
}

TEST(KruPhase, PhasesWithoutARowCountAsNoOffset) {
  const KruRun run = RunKru(RequestFor(100, 1, "100", "360", false));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_TRUE(Contains("DLL ---- 0.000 offset was used for all outclks\n", run.trace));
  EXPECT_EQ(RunKru(RequestFor(100, 1, "100", "nan", true)).code, kKruNoConfiguration);
}

// ---- Pins ----

TEST(KruPins, WithoutFeedbackOnlySynthesisedPins) {
  for (const double f : {50.0, 100.0, 200.0}) {
    EXPECT_EQ(AssignOne(100, f, 0, 0, false).state.pinsF[0], kPinClkfx);
    EXPECT_EQ(AssignOne(100, f, 0, 0, false).state.pinsT[0], kPinClkfx);
    EXPECT_EQ(AssignOne(100, f, 180, 0, false).state.pinsF[0], kPinClkfx180);
    EXPECT_EQ(AssignOne(100, f, 180, 0, false).state.pinsT[0], kPinClkfx180);
    for (const double p : {90.0, 270.0}) {
      EXPECT_EQ(AssignOne(100, f, p, 0, false).state.pinsF[0], kPinNone);
      EXPECT_EQ(AssignOne(100, f, p, 0, false).state.pinsT[0], kPinNone);
    }
  }
  const PinRun out_of_range = AssignOne(4, 4, 180, 0, false);
  EXPECT_EQ(out_of_range.state.pinsF[0], kPinNone);
  EXPECT_TRUE(Contains("DLL -!!!!!! Can't potentially use CLKFX180 because requested freq 4.000 is "
                       "out of range\n",
                       out_of_range.trace));
}

TEST(KruPins, WithFeedbackByFrequencyAndPhase) {
  struct Row {
    double f;
    double p;
    int pinF;
    int pinT;
  };
  const Row rows[] = {
      {100, 10, kPinClk0, kPinClk2x},   {100, 100, kPinClk90, kPinNone},
      {100, 190, kPinClk180, kPinClk2x180}, {100, 280, kPinClk270, kPinNone},
      {50, 10, kPinClkdv, kPinClk0},    {50, 100, kPinNone, kPinClk90},
      {50, 190, kPinNone, kPinClk180},  {50, 280, kPinNone, kPinClk270},
      {200, 10, kPinClk2x, kPinClkfx},  {200, 100, kPinNone, kPinNone},
      {200, 190, kPinClk2x180, kPinNone},   {200, 280, kPinNone, kPinNone},
      {130, 10, kPinClkfx, kPinClkfx},  {130, 100, kPinNone, kPinNone},
      {130, 190, kPinClkfx180, kPinClkfx180}, {130, 280, kPinNone, kPinNone},
      {100, 55, kPinNone, kPinNone},    {130, 55, kPinNone, kPinNone},
  };
  for (const Row& row : rows) {
    const PinRun run = AssignOne(100, row.f, row.p, 10, true);
    EXPECT_EQ(run.state.pinsF[0], row.pinF) << row.f << " " << row.p;
    EXPECT_EQ(run.state.pinsT[0], row.pinT) << row.f << " " << row.p;
  }
}

TEST(KruPins, FrequencyTolerance) {
  EXPECT_EQ(AssignOne(100, 100.0009, 0, 0, true).state.pinsF[0], kPinClk0);
  EXPECT_EQ(AssignOne(100, 100.0011, 0, 0, true).state.pinsF[0], kPinClkfx);
}

// CLK0 before CLKDV at half the input frequency, else the first list before the second.
TEST(KruPins, BothTestsOfAFailedRowAreTold) {
  // 4 MHz is below every minimum but that of CLKDV.
  PinRun run = AssignOne(4, 4, 0, 0, true);
  EXPECT_TRUE(Contains("DLL ------ Clk_Out0 ofreq = 4.000; phase = 0.000\n"
                       "DLL -!!!!!! Can't use CLK0 because requested freq 4.000 is out of range\n"
                       "DLL -!!!!!! Can't use CLK2X because requested freq 4.000 is out of range\n"
                       "DLL --------- _kruPinsDivBy2False[0] = NONE\n",
                       run.trace));
  run = AssignOne(0.5, 0.25, 0, 0, true);
  EXPECT_TRUE(Contains("DLL -!!!!!! Can't use CLK0 because requested freq 0.250 is out of range\n"
                       "DLL -!!!!!! Can't use CLKDV because requested freq 0.250 is out of range\n",
                       run.trace));
  EXPECT_EQ(run.clkdv.f[0], 2.0);
  run = AssignOne(2, 4, 0, 0, true);
  EXPECT_TRUE(Contains("DLL -!!!!!! Can't use CLK2X because requested freq 4.000 is out of range\n"
                       "DLL -!!!!!! Can't potentially use CLKFX because requested freq 4.000 is "
                       "out of range\n",
                       run.trace));
}

TEST(KruPins, ClkdvValues) {
  PinRun run = AssignOne(100, 40, 0, 0, true);
  EXPECT_EQ(run.state.pinsF[0], kPinClkdv);
  EXPECT_EQ(run.clkdv.f[0], 2.5);
  EXPECT_EQ(run.state.pinsT[0], kPinClkfx);
  EXPECT_EQ(run.clkdv.t[0], 0.0);

  run = AssignOne(100, 20, 0, 0, true);
  EXPECT_EQ(run.state.pinsF[0], kPinClkdv);
  EXPECT_EQ(run.clkdv.f[0], 5.0);
  EXPECT_EQ(run.state.pinsT[0], kPinClkdv);
  EXPECT_EQ(run.clkdv.t[0], 2.5);

  // 17 is a value; 8.5 and 1.5 are not.
  run = AssignOne(153, 9, 0, 0, true);
  EXPECT_EQ(run.clkdv.f[0], 17.0);
  EXPECT_EQ(run.state.pinsT[0], kPinClkfx);
  run = AssignOne(153, 102, 0, 0, true);
  EXPECT_EQ(run.state.pinsF[0], kPinClkfx);
}

TEST(KruPins, ClkdvPhaseMismatchIsToldForTheSecondListOnly) {
  // 25 = 50 / 2 in the second list, 100 / 4 in the first.
  const PinRun run = AssignOne(100, 25, 180, 0, true);
  EXPECT_EQ(CountOf("Can't use CLKDV because requested freq 25.000 is out of range\n", run.trace),
            1);
  EXPECT_EQ(run.state.pinsF[0], kPinClkfx180);
  EXPECT_EQ(run.state.pinsT[0], kPinClkfx180);
}

TEST(KruPins, ClkdvOutOfRangeIsToldForTheFirstListOnly) {
  // 0.3 is below CLKDV and CLKFX: 3 / 10 in the first list, 1.5 / 5 in the second.
  const PinRun run = AssignOne(3, 0.3, 0, 0, true);
  EXPECT_EQ(CountOf("Can't use CLKDV because requested freq 0.300 is out of range\n", run.trace),
            1);
  EXPECT_EQ(CountOf("Can't potentially use CLKFX because requested freq 0.300 is out of range\n",
                    run.trace),
            1);
}

TEST(KruPins, Clk90GoesByTheSecondListsFlag) {
  // Output 0 takes CLK2X in the second list. 190 is above the 2X maximum of CLK90 and CLK270, and
  // the first list has no 2X feedback.
  KruRun run = RunKru(RequestFor(190, 2, "190 190", "0 270", true));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(KruPinName(run.state, 1), "CLK270");
  run = RunKru(RequestFor(190, 2, "190 190", "0 90", true));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_TRUE(Contains("DLL -!!!!!! Can't use CLK90 because requested freq 190.000 is out of "
                       "range\n",
                       run.trace));
  // The flag is output 0's alone.
  run = RunKru(RequestFor(190, 3, "190 190 190", "270 0 90", true));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.pinsT[1], kPinClk2x);
  EXPECT_EQ(KruPinName(run.state, 2), "CLK90");
}

TEST(KruPins, FeedbackAt2xLowersTheMaximaOfItsList) {
  KruLimits limits;
  limits.clk0Max2x = 90;
  KruRun run = RunKru(RequestFor(100, 2, "200 100", "0 0", true), limits);
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.pinsF[0], kPinClk2x);
  EXPECT_EQ(run.state.pinsF[1], kPinNone);
  EXPECT_TRUE(run.state.divBy2);
  EXPECT_EQ(KruPinName(run.state, 0), "CLKFX");
  EXPECT_EQ(KruPinName(run.state, 1), "CLK2X");
  EXPECT_EQ(run.state.m, 4);
  EXPECT_EQ(run.state.d, 1);
  EXPECT_EQ(KruOutFreq(run.state, 100, 0), 200.0);
  EXPECT_EQ(KruOutFreq(run.state, 100, 1), 100.0);
  // As output 1, CLK2X does not change them.
  run = RunKru(RequestFor(100, 3, "100 200 100", "0 0 0", true), limits);
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.pinsF[1], kPinClk2x);
  EXPECT_EQ(run.state.pinsF[2], kPinClk0);
  EXPECT_FALSE(run.state.divBy2);
}

TEST(KruValues, ZeroDividersGiveZero) {
  KruState state;
  state.pinsT[0] = kPinClkdv;
  EXPECT_EQ(KruOutFreq(state, 100, 6), 0.0);
  state.pinsT[0] = kPinClkfx;
  EXPECT_EQ(KruOutFreq(state, 100, 6), 0.0);
  state.chosenPin[0] = kPinClkfxdv;
  EXPECT_EQ(KruOutFreq(state, 100, 0), 0.0);
  EXPECT_EQ(KruPinName(state, 0), "CLKFXDV");
  state.chosenPin[0] = 11;
  EXPECT_EQ(KruPinName(state, 0), "NONE");
  state.phaseOffset = kNan;
  EXPECT_EQ(KruPhaseShift(state), 0);
}

// ---- KRU_CLKGEN ----

TEST(Clkgen, OneOutputAndItsTrace) {
  const KruRun run = RunClkgen(RequestFor(100, 1, "150", "90", false));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.m, 3);
  EXPECT_EQ(run.state.d, 2);
  EXPECT_EQ(run.state.clkdv, 0.0);
  EXPECT_EQ(KruPinName(run.state, 0), "CLKFX");
  // M = 3, 6, ... 255
  EXPECT_EQ(run.trace,
            "DLL- starting to calculate KRU_CLKGEN actuals \n"
            "DLL --- KRU_CLKGEN output clock valid freq ranges:\n"
            "DLL ------> CLKFX min = 5.000; max = 374.532\n"
            "DLL ------> CLKFXDV min = 0.156; max = 187.266\n"
            "DLL ---- Calculating KRU_CLKGEN actuals \n"
            "DLL ------ Clk_Out0 ofreq = 150.000\n"
            "DLL ----- found 85 possible M and Ds\n"
            "DLL -- found M = 3, D = 2, DV = 0\n"
            "DLL - for CLK_OUT0, chosen KRU_CLKGEN pin = CLKFX\n"
            "DLL - chosen M = 3\n"
            "DLL - chosen D = 2\n");
}

TEST(Clkgen, DividedOutput) {
  const KruRun run = RunClkgen(RequestFor(100, 2, "150 75", "0 0", false));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.m, 3);
  EXPECT_EQ(run.state.d, 2);
  EXPECT_EQ(run.state.clkdv, 2.0);
  EXPECT_EQ(KruPinName(run.state, 1), "CLKFXDV");
  EXPECT_TRUE(Contains("DLL -- Found 85 possible M/D pairs for CLK_OUT1\n"
                       "DLL ------ Clk_Out1 ofreq = 75.000; phase = 0.000\n"
                       "DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n"
                       "DLL ----- found 85 possible M and Ds\n"
                       "DLL -- found M = 3, D = 2, DV = 2\n",
                       run.trace));
  EXPECT_TRUE(Contains("DLL - chosen D = 2\nDLL - chosen DV = 2.000000\n", run.trace));
}

TEST(Clkgen, DividedOutputBelowTheClkfxRange) {
  // 128 = 100 x 32 / 25, and 4 = 128 / 32.
  const KruRun run = RunClkgen(RequestFor(100, 2, "128 4", "0 0", false));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(run.state.m, 32);
  EXPECT_EQ(run.state.d, 25);
  EXPECT_EQ(run.state.clkdv, 32.0);
  EXPECT_TRUE(Contains("DLL -!!!!!! Can't use CLKFX because requested freq 4.000 is out of range\n"
                       "DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n",
                       run.trace));
}

TEST(Clkgen, OneDvForAllDividedOutputs) {
  KruRun run = RunClkgen(RequestFor(100, 3, "150 75 75", "0 0 0", false));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(KruPinName(run.state, 2), "CLKFXDV");
  run = RunClkgen(RequestFor(100, 3, "150 75 37.5", "0 0 0", false));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_EQ(run.state.m, 0);
  EXPECT_EQ(run.state.clkdv, 0.0);
  EXPECT_TRUE(Contains("DLL ----- for clk 2, existing DV = 2 didn't work, so remove M = 3, D = 2\n",
                       run.trace));
  EXPECT_TRUE(Contains("so remove M = 255, D = 170\n"
                       "DLL --- couldn't find any M and Ds for clknum 2\n"
                       "DLL -- couldn't find an M and D\n"
                       "DLL ---- KRU_CLKGEN won't work!!\n",
                       run.trace));
}

TEST(Clkgen, NoDvFits) {
  const KruRun run = RunClkgen(RequestFor(100, 2, "150 80", "0 0", false));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_TRUE(Contains("DLL ----- for clk 1, not a CLKFXDV solution, so remove M = 3, D = 2\n",
                       run.trace));
}

TEST(Clkgen, PhasesOfFurtherOutputs) {
  KruRun run = RunClkgen(RequestFor(100, 2, "150 150", "0 180", false));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(KruPinName(run.state, 1), "CLKFX180");
  EXPECT_TRUE(Contains("DLL ----- for clk1, found match: CLKFX180\n"
                       "DLL ----- for clk1, found 85 possible M/D pairs that work for CLKFX\n",
                       run.trace));
  run = RunClkgen(RequestFor(100, 2, "150 150", "0 90", false));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_TRUE(Contains("DLL -!!!!!! Can't use CLKFXDV because phase is set to 90.000, not 0\n"
                       "DLL --- couldn't find any M and Ds for clknum 1\n",
                       run.trace));
  // Phase and range are told independently.
  run = RunClkgen(RequestFor(100, 2, "200 200", "0 90", false));
  EXPECT_TRUE(Contains("DLL -!!!!!! Can't use CLKFXDV because phase is set to 90.000, not 0\n"
                       "DLL -!!!!!! Can't use CLKFXDV because requested freq 200.000 is out of "
                       "range\n"
                       "DLL --- couldn't find any M and Ds for clknum 1\n",
                       run.trace));
}

TEST(Clkgen, NearFrequencyKeepsThePairsThatStillFit) {
  // M = 3k misses D = 2k by k x 0.0000133: seven pairs are within 0.0001.
  const KruRun run = RunClkgen(RequestFor(100, 2, "150 150.001", "0 0", false));
  EXPECT_EQ(run.code, kKruSolved);
  EXPECT_EQ(CountOf("DLL ----- removed possible M = ", run.trace), 78);
  EXPECT_TRUE(Contains("DLL ----- removed possible M = 24, D = 16\n", run.trace));
  EXPECT_FALSE(Contains("DLL ----- removed possible M = 21, D = 14\n", run.trace));
  EXPECT_TRUE(Contains("DLL ----- for clk1, found 7 possible M/D pairs that work for CLKFX\n",
                       run.trace));
}

TEST(Clkgen, NothingForOutput0) {
  KruRun run = RunClkgen(RequestFor(100, 1, "400", "0", false));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_TRUE(Contains("DLL ------ Clk_Out0 ofreq = 400.000\n"
                       "DLL -!!!!!! Can't use CLKFX because requested freq 400.000 is out of "
                       "range\n"
                       "DLL -- couldn't find an M and D\n"
                       "DLL ---- KRU_CLKGEN won't work!!\n",
                       run.trace));
  EXPECT_EQ(KruPinName(run.state, 0), "NONE");
  // 100.3 / 100: no M up to 256 makes a whole D.
  run = RunClkgen(RequestFor(100, 1, "100.3", "0", false));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_TRUE(Contains("DLL ------ Clk_Out0 ofreq = 100.300\nDLL -- couldn't find an M and D\n",
                       run.trace));
  EXPECT_EQ(RunClkgen(RequestFor(100, 1, "nan", "0", false)).code, kKruNoConfiguration);
}

TEST(Clkgen, LimitsNeedNotBeReadableAndBadRequestsFail) {
  KruLimits unreadable;
  unreadable.readable = false;
  EXPECT_EQ(RunClkgen(RequestFor(100, 1, "150", "0", false), unreadable).code, kKruSolved);
  EXPECT_EQ(RunClkgen(RequestFor(0, 1, "150", "0", false)).code, kKruNoConfiguration);
  const KruRun run = RunClkgen(RequestFor(100, 2, "150", "0 7", false));
  EXPECT_EQ(run.code, kKruNoConfiguration);
  EXPECT_EQ(run.lists.phase[1], 7.0);
  EXPECT_EQ(run.trace,
            "DLL- starting to calculate KRU_CLKGEN actuals \nDLL ---- KRU_CLKGEN won't work!!\n");
}

TEST(Clkgen, ClearsThePinsOfAnEarlierRequest) {
  KruState state;
  RequestLists lists;
  Trace trace(false);
  EXPECT_EQ(SolveKru(RequestFor(100, 2, "50 25", "0 0", true), {}, lists, state, trace),
            kKruSolved);
  EXPECT_EQ(KruPinName(state, 6), "CLK0");
  EXPECT_EQ(SolveKruClkgen(RequestFor(100, 1, "150", "0", false), {}, lists, state, trace),
            kKruSolved);
  EXPECT_EQ(KruPinName(state, 6), "NONE");
  EXPECT_EQ(KruPinName(state, 1), "NONE");
  EXPECT_EQ(state.clkdv, 0.0);
}

}  // namespace
}  // namespace plain
