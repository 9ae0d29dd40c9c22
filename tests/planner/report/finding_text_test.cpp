#include <gmock/gmock.h>

#include "made.h"
#include "planner/report/FindingText.h"

namespace planner::report {
namespace {

using ::testing::ElementsAre;

std::string Text(const Finding& finding) { return FindingText(finding, MadeDevice()); }

TEST(FindingText, FrequenciesOutsideOfTheirRanges) {
  EXPECT_EQ(Text(Outside(Quantity::kVco, -1, 0, Rational(399996, 1000), {400, 1000})),
            "the VCO is at 399.996 MHz, outside the device's range of 400 to 1000 MHz");
  EXPECT_EQ(Text(Outside(Quantity::kPfd, -1, 1, Rational(39, 4), {10, 500})),
            "the PFD with the second input is at 9.75 MHz, outside the device's range of 10 to 500 "
            "MHz");
  EXPECT_EQ(Text(Outside(Quantity::kFrequency, 2, 0, 1000, {5, 800})),
            "output 2 is at 1000 MHz, outside the device's range of 5 to 800 MHz");
  // What is out of a range by little does not read like its end.
  EXPECT_EQ(
      Text(Outside(Quantity::kVco, -1, 0, Rational(400) - Rational(1, 100000000), {400, 1000})),
      "the VCO is at 399.99999999 MHz, outside the device's range of 400 to 1000 MHz");
}

TEST(FindingText, PinsOutsideOfTheirRanges) {
  Finding finding = Outside(Quantity::kFrequency, 1, 0, 130, {5, 125});
  finding.pin = "CLK90";
  EXPECT_EQ(Text(finding),
            "output 1 is at 130 MHz, outside the device's range for CLK90 of 5 to 125 MHz");
  finding.feedback_2x = true;
  EXPECT_EQ(Text(finding),
            "output 1 is at 130 MHz, outside the device's range for CLK90 with feedback from CLK2X "
            "of 5 to 125 MHz");
}

TEST(FindingText, DividersBeyondTheCounters) {
  EXPECT_EQ(
      Text({.kind = FindingKind::kDividerTooLarge, .output = 0, .value = 125, .range = {1, 16}}),
      "output 0: divider 125 needs a high or low time above 16 VCO periods, the device's most");
}

Finding Off(Quantity quantity, int output, const Rational& error, const Rational& allowed) {
  return {.kind = FindingKind::kOffTarget,
          .quantity = quantity,
          .output = output,
          .value = error,
          .range = {0, allowed}};
}

TEST(FindingText, ErrorsAboveTheirTolerances) {
  EXPECT_EQ(Text(Off(Quantity::kFrequency, 0, Rational(1000000, 999), 100)),
            "output 0: the frequency is off by 1001.00 ppm, with 100 allowed");
  EXPECT_EQ(Text(Off(Quantity::kPhase, 3, -90, Rational(1, 2))),
            "output 3: the phase is off by -90.00 degrees, with 0.5 allowed");
  EXPECT_EQ(Text(Off(Quantity::kDuty, 1, 20, Rational(1, 2))),
            "output 1: the duty cycle is off by 20.00 percent points, with 0.5 allowed");
  EXPECT_EQ(Text(Off(Quantity::kJitter, 1, Rational(128815, 1000), 100)),
            "output 1: the jitter is 128.815 ps, with 100 allowed");
  EXPECT_EQ(Text(Off(Quantity::kJitter, 1, 0, 100)),
            "output 1: the jitter is not known, with 100 allowed");
  EXPECT_EQ(Text(Off(Quantity::kJitter, 1, Rational(1000001, 10000), 100)),
            "output 1: the jitter is 100.0001 ps, with 100 allowed");
}

TEST(FindingText, ErrorsNeverReadLikeNoneOrLikeWhatIsAllowed) {
  EXPECT_EQ(Text(Off(Quantity::kFrequency, 0, Rational(1, 10000000), 0)),
            "output 0: the frequency is off by 1e-07 ppm, with 0 allowed");
  EXPECT_EQ(Text(Off(Quantity::kFrequency, 0, Rational(1000001, 10000), 100)),
            "output 0: the frequency is off by 100.0001 ppm, with 100 allowed");
  EXPECT_EQ(Text(Off(Quantity::kPhase, 0, Rational(-5001, 10000), Rational(1, 2))),
            "output 0: the phase is off by -0.5001 degrees, with 0.5 allowed");
}

TEST(FindingText, TheMissesOfAnOutputAreOneSentence) {
  const Request request = MadeRequest({100}, {160, 80});
  Answer answer = MadeLoop(request, Primitive::kTsyn, Bandwidth::kLow, 80, 1, {50, 100}, 100);
  Miss(&answer, 0, Quantity::kPhase, -90, Rational(1, 2));
  Miss(&answer, 0, Quantity::kDuty, 20, Rational(1, 2));
  Miss(&answer, 1, Quantity::kPhase, 7, Rational(1, 2));
  EXPECT_THAT(
      MissTexts(answer),
      ElementsAre("output 0: the phase is off by -90.00 degrees, with 0.5 allowed; the duty "
                  "cycle is off by 20.00 percent points, with 0.5 allowed",
                  "output 1: the phase is off by 7.00 degrees, with 0.5 allowed"));
}

TEST(FindingText, TheMissThatWeighsMost) {
  const Request request = MadeRequest({100}, {160, 80, 40});
  Answer answer = MadeLoop(request, Primitive::kTsyn, Bandwidth::kLow, 80, 1, {50, 100, 200}, 100);
  Miss(&answer, 0, Quantity::kFrequency, 900, 100);
  EXPECT_EQ(WorstMissText(answer),
            "output 0: the frequency is off by 900.00 ppm, with 100 allowed");
  // 10 degrees are 20 tolerances, 900 ppm are 9.
  Miss(&answer, 1, Quantity::kPhase, -10, Rational(1, 2));
  EXPECT_EQ(WorstMissText(answer),
            "output 1: the phase is off by -10.00 degrees, with 0.5 allowed, and 1 more output is "
            "off");
  // A tolerance of 0 counts as 0.5 points: 11 are 22.
  Miss(&answer, 2, Quantity::kDuty, 11, 0);
  EXPECT_EQ(WorstMissText(answer),
            "output 2: the duty cycle is off by 11.00 percent points, with 0 allowed, and 2 more "
            "outputs are off");
  // 115 ps are 23 times 5.
  Miss(&answer, 0, Quantity::kJitter, 115, 5);
  EXPECT_EQ(WorstMissText(answer).substr(0, 47), "output 0: the jitter is 115.000 ps, with 5 allo");
}

TEST(FindingText, NotesOnTheEngine) {
  EXPECT_EQ(Text({.kind = FindingKind::kSearchedVco, .value = Rational(816734, 1000)}),
            "the search took the VCO as 816.734 MHz");
  EXPECT_EQ(Text({.kind = FindingKind::kSearchedFrequencies, .numbers = {100, 50}}),
            "the search counted with 100.000, 50.000 MHz, which M and D do not make");
  EXPECT_EQ(Text({.kind = FindingKind::kPreferMaxVcoUnused}),
            "--prefer-max-vco counts only with --phase or --duty");
  EXPECT_EQ(Text({.kind = FindingKind::kWholeDividerUnused}),
            "--int-div0 changes nothing: all dividers of a PLL are whole numbers");
}

TEST(FindingText, NotesOnAKru) {
  EXPECT_EQ(Text({.kind = FindingKind::kOutput0Phase}),
            "output 0 is at phase 0: a KRU_CLKGEN has it on CLKFX whatever its phase");
  EXPECT_EQ(Text({.kind = FindingKind::kBandwidthUnused}),
            "--bandwidth changes nothing: a KRU has no such setting");
  EXPECT_EQ(Text({.kind = FindingKind::kInputJitterPasses, .value = 80}),
            "the jitter of each output is with all of the input's, 80 ps, which passes through a "
            "KRU");
}

TEST(FindingText, WhatIsAFractionIsNamed) {
  const Request request = MadeRequest({100}, {160});
  const Finding note = {.kind = FindingKind::kNothingMoves};
  const auto text = [&](int m, int divider) {
    const Answer answer =
        MadeLoop(request, Primitive::kTsyn, Bandwidth::kLow, m, 1, {divider}, 100);
    return FindingText(note, MadeDevice(), &answer);
  };
  EXPECT_EQ(
      text(80, 50),
      "with a fractional divider all phases are 0 and all duty cycles 50 %; --int-div0 avoids "
      "it");
  EXPECT_EQ(text(81, 48),
            "with a fractional M all phases are 0 and all duty cycles 50 %; --int-div0 avoids it");
  EXPECT_EQ(text(95, 95),
            "with a fractional M and divider all phases are 0 and all duty cycles 50 %; --int-div0 "
            "avoids it");
}

std::vector<std::string> Missing(const std::vector<Finding>& findings, const Device& device) {
  return FindingTexts(findings, device, {});
}

TEST(FindingText, FiguresThatThereAreNotAreToldOnceForEachReason) {
  EXPECT_THAT(
      Missing({{.kind = FindingKind::kNoPhaseError, .text = "reason"},
               {.kind = FindingKind::kNoJitter, .outputs = {0, 2}, .text = "reason"},
               {.kind = FindingKind::kNoJitter, .outputs = {1}, .text = "CLKFX is too slow"}},
              MadeDevice()),
      ElementsAre("no jitter of outputs 0 and 2 and no phase error: reason",
                  "no jitter of output 1: CLKFX is too slow"));
}

TEST(FindingText, ADeviceWithoutCoefficients) {
  const std::vector<Finding> none = {{.kind = FindingKind::kNoJitter},
                                     {.kind = FindingKind::kNoPhaseError}};
  Device device = MadeDevice();
  device.has_kru_jitter = false;
  EXPECT_THAT(Missing(none, device),
              ElementsAre("no jitter and no phase error: Device vk40-2 has no calculator "
                          "coefficients for KRU_SP and KRU_CLKGEN"));
  device.has_loop_jitter = false;
  EXPECT_THAT(
      Missing(none, device),
      ElementsAre("no jitter and no phase error: vk40b484-2 has no calculator coefficients"));
}

TEST(FindingText, OutputsThatHaveChangedPlaces) {
  EXPECT_EQ(Text({.kind = FindingKind::kMoved, .outputs = {1, 0, 2}}),
            "outputs have changed places: output 0 is what was asked for as output 1 and output 1 "
            "is what was asked for as output 0");
}

TEST(FindingText, RefusalsAreWholeSentences) {
  Answer answer = Refused(Primitive::kKruSp, "The KRU_SP cannot support this.");
  answer.refusals.push_back({.kind = FindingKind::kNoSettings});
  EXPECT_EQ(RefusalText(answer, MadeDevice()),
            "The KRU_SP cannot support this. No setting has everything in the device's ranges.");
  EXPECT_EQ(Text({.kind = FindingKind::kTooManyInputs,
                  .primitive = Primitive::kKruSp,
                  .value = 2,
                  .range = {1, 1}}),
            "A KRU_SP has 1 input clock, not 2.");
  EXPECT_EQ(Text({.kind = FindingKind::kTooManyOutputs,
                  .primitive = Primitive::kKruSp,
                  .value = 7,
                  .range = {1, 6}}),
            "A KRU_SP has at most 6 outputs, not 7.");
}

TEST(FindingText, RemarksAreMissesThenViolationsThenNotes) {
  const Request request = MadeRequest({100}, {333});
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 80, 1, {24}, 100);
  answer.notes.push_back({.kind = FindingKind::kSearchedVco, .value = 999});
  Break(&answer, Outside(Quantity::kVco, -1, 0, 1000, {400, 900}));
  Miss(&answer, 0, Quantity::kFrequency, Rational(1000000, 999), 100);
  EXPECT_THAT(RemarkTexts(answer, MadeDevice()),
              ElementsAre("output 0: the frequency is off by 1001.00 ppm, with 100 allowed",
                          "the VCO is at 1000 MHz, outside the device's range of 400 to 900 MHz",
                          "the search took the VCO as 999.000 MHz"));
}

}  // namespace
}  // namespace planner::report
