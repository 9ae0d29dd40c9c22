#include "tests/golden/golden_cases.h"

namespace {

plain::PllLimits PllDevice() {
  plain::PllLimits limits;
  limits.vcoMin = 400;
  limits.vcoMax = 1080;
  limits.clkoutMin = 3.125;
  limits.clkoutMax = 400;
  limits.pfdMin = 19;
  limits.pfdMax = 500;
  limits.clkoutMaxIo = 1080;
  limits.maxHighLowCount = 64;
  return limits;
}

plain::PllLimits TsynDevice() {
  plain::PllLimits limits;
  limits.vcoMin = 600;
  limits.vcoMax = 1440;
  limits.clkoutMin = 4.6875;
  limits.clkoutMax = 800;
  limits.pfdMin = 10;
  limits.pfdMax = 500;
  limits.vcoTarget = 1000;
  limits.maxHighLowCount = 64;
  limits.maxPfdLowB = 300;
  return limits;
}

plain::PllRequest Request(int prim, double inFreq, const char* outFreqs, int count) {
  plain::PllRequest request;
  request.prim = prim;
  request.inFreq = inFreq;
  request.outFreqs = outFreqs;
  request.count = count;
  return request;
}

plain::PllRequest Closest(plain::PllRequest request, const char* phases, const char* dutyCycles) {
  request.closest = true;
  request.phases = phases;
  request.dutyCycles = dutyCycles;
  return request;
}

template <typename Change>
plain::PllRequest With(plain::PllRequest request, Change change) {
  change(request);
  return request;
}

}  // namespace

std::vector<GoldenCase> GoldenCases() {
  using plain::PllRequest;
  constexpr int kPll = plain::kPrimPll;
  constexpr int kTsyn = plain::kPrimTsyn;
  const plain::PllLimits pll = PllDevice();
  const plain::PllLimits tsyn = TsynDevice();
  plain::PllLimits unreadable;
  unreadable.readable = false;

  return {
      // One output: several VCOs, and exactly one.
      {"pll_one_output", 1, {pll, Request(kPll, 100, "100", 1)}},
      {"pll_one_vco", 1, {pll, Request(kPll, 50, "600", 1)}},
      {"tsyn_one_output", 1, {tsyn, Request(kTsyn, 100, "300", 1)}},
      // Several outputs; on the TSYN also with whole dividers on output 0.
      {"pll_three_outputs", 1, {pll, Request(kPll, 100, "200 100 50", 3)}},
      {"tsyn_three_outputs", 1, {tsyn, Request(kTsyn, 100, "160 80 40", 3)}},
      {"tsyn_six_outputs", 1, {tsyn, Request(kTsyn, 100, "200 100 50 25 40 20", 6)}},
      {"tsyn_int_div0", 1,
       {tsyn, With(Request(kTsyn, 100, "160 80 40", 3),
                   [](PllRequest& r) { r.intDiv0Only = true; })}},
      // A divider only within a tolerance; a fudge upward and one downward.
      {"pll_tolerance", 1, {pll, Request(kPll, 100, "200 66", 2)}},
      {"pll_fudge_up", 1, {pll, Request(kPll, 100, "264.97", 1)}},
      {"pll_fudge_down", 1, {pll, Request(kPll, 100, "370.04", 1)}},
      {"tsyn_fudge", 1, {tsyn, Request(kTsyn, 100, "192.80 50", 2)}},
      // Two input clocks, and low bandwidth.
      {"pll_two_inputs", 1,
       {pll, With(Request(kPll, 100, "100", 1), [](PllRequest& r) { r.inFreq2 = 120; })}},
      {"tsyn_low_bandwidth", 1,
       {tsyn, With(Request(kTsyn, 400, "400", 1), [](PllRequest& r) { r.lowBandwidth = true; })}},
      // Closest solution: one VCO, one close enough on output 0, largest VCO, narrowed to one
      // by the later stages, smallest and target VCO at the end.
      {"closest_one_vco", 1, {pll, Closest(Request(kPll, 50, "600", 1), "90", "25")}},
      {"closest_unique_clk0", 1, {pll, Closest(Request(kPll, 100, "200", 1), "9", "0")}},
      {"closest_prefer_max_vco", 1,
       {pll, With(Closest(Request(kPll, 100, "200 100", 2), "0 0", "50 50"),
                  [](PllRequest& r) { r.preferMaxVco = true; })}},
      {"closest_narrowed_frequency", 1,
       {pll, Closest(Request(kPll, 100, "200 45", 2), "0 0", "50 50")}},
      {"closest_narrowed_phase", 1,
       {pll, Closest(Request(kPll, 100, "200 100", 2), "0 7.5", "50 50")}},
      {"closest_narrowed_duty", 1,
       {pll, Closest(Request(kPll, 100, "200 100", 2), "0 0", "50 31")}},
      {"closest_smallest_vco", 1,
       {pll, Closest(Request(kPll, 100, "200 100", 2), "90 180", "50 50")}},
      {"closest_target_vco", 1,
       {tsyn, With(Closest(Request(kTsyn, 100, "200 100", 2), "90 180", "50 50"),
                   [](PllRequest& r) { r.intDiv0Only = true; })}},
      {"closest_fractional_tsyn", 1,
       {tsyn, Closest(Request(kTsyn, 100, "400 100", 2), "45 90", "40 60")}},
      // Failures: no speed data, clocks too far apart, bad lists.
      {"fail_no_speed_data", 2, {unreadable, Request(kPll, 100, "100", 1)}},
      {"fail_inputs_too_far_apart", 3,
       {pll, With(Request(kPll, 100, "100", 1), [](PllRequest& r) { r.inFreq2 = 300; })}},
      {"fail_short_list", 4, {pll, Request(kPll, 100, "100 50", 3)}},
      {"fail_short_phases", 4, {pll, Closest(Request(kPll, 100, "100 50", 2), "0", "50 50")}},
  };
}
