#include "tests/golden/kru_golden_cases.h"

#include <array>

namespace {

using compare::KruCase;

// CLK0 5 to 250 MHz (200 with 2X feedback), CLK90 4 to 200 (125), CLK2X 10 to 400, CLKDV 0.3125
// to 160 (100) and CLKFX 8 to 500, as periods in the order of the keywords.
constexpr std::array<double, 13> kPeriods = {4,   200,  5,    5,  250, 8,  2.5,
                                             100, 6.25, 3200, 10, 2,   125};

KruCase Request(double inFreq, int numOut, const char* outFreqs, const char* phases) {
  KruCase run;
  run.periods = kPeriods;
  run.request.inFreq = inFreq;
  run.request.numOut = numOut;
  run.request.outFreqs = outFreqs;
  run.request.phases = phases;
  return run;
}

KruCase Kru(double inFreq, int numOut, const char* outFreqs, const char* phases) {
  KruCase run = Request(inFreq, numOut, outFreqs, phases);
  run.request.feedbackUsed = true;
  return run;
}

KruCase KruWithoutFeedback(double inFreq, int numOut, const char* outFreqs, const char* phases) {
  return Request(inFreq, numOut, outFreqs, phases);
}

KruCase Clkgen(double inFreq, int numOut, const char* outFreqs, const char* phases) {
  KruCase run = Request(inFreq, numOut, outFreqs, phases);
  run.clkgen = true;
  return run;
}

KruCase Unreadable(KruCase run) {
  run.readable = false;
  return run;
}

// The shortest period of CLKDV with 2X feedback.
KruCase With2xClkdv(double period, KruCase run) {
  run.periods[10] = period;
  return run;
}

std::vector<KruGoldenCase> SolvedKruCases() {
  return {
      // Without the halved input: each pin family, with and without feedback.
      {"kru_clk0_family", 1, {Kru(100, 4, "100 100 100 100", "0 90 180 270")}},
      {"kru_clkdv", 1, {Kru(100, 3, "100 40 40", "0 0 0")}},
      {"kru_clk2x", 1, {Kru(100, 3, "200 100 200", "0 0 180")}},
      {"kru_clkfx", 1, {Kru(100, 2, "350 350", "0 180")}},
      {"kru_filtered_m_and_d", 1, {Kru(100, 2, "150 150.003", "0 0")}},
      {"kru_no_feedback", 1, {KruWithoutFeedback(100, 2, "50 50", "0 180")}},
      // With it, as list F lacks a pin: for a phase, for a frequency, for M and D.
      {"kru_divide_by_2", 1, {Kru(100, 4, "50 50 50 50", "0 90 180 270")}},
      {"kru_divide_by_2_clk2x", 1, {Kru(100, 4, "100 100 50 20", "0 180 90 0")}},
      {"kru_divide_by_2_clkfx", 1, {KruWithoutFeedback(100, 2, "350 350", "0 180")}},
      // 100 x 31 / 34 needs too large a D, 50 x 31 / 17 does not.
      {"kru_divide_by_2_m_and_d", 1, {Kru(100, 1, "91.17647058823529", "0")}},
      // 2X feedback with a maximum of 50 MHz for CLKDV sends 80 MHz to CLKFX.
      {"kru_2x_feedback", 1, {With2xClkdv(20, Kru(200, 2, "400 80", "0 0"))}},
      // Several CLKDV values.
      {"kru_clkdv_conflict", 1, {Kru(100, 3, "50 25 50", "0 0 0")}},
      {"kru_clkdv_conflict_of_list_t", 1, {Kru(100, 3, "50 20 12.5", "90 0 0")}},
      // Phase offsets: common, negative, and one beyond the range of PHASE_SHIFT.
      {"kru_phase_offset", 1, {Kru(100, 3, "100 100 350", "45 135 225")}},
      {"kru_negative_offset", 1, {Kru(100, 2, "100 100", "-1 89")}},
      {"kru_offset_of_a_later_turn", 1, {Kru(100, 1, "100", "360")}},
  };
}

std::vector<KruGoldenCase> FailedKruCases() {
  return {
      {"kru_fail_m_and_d", 3, {Kru(100, 2, "350 330", "0 0")}},
      {"kru_fail_offsets_differ", 3, {Kru(100, 2, "100 100", "10 20")}},
      {"kru_fail_offset_beside_0", 3, {Kru(100, 2, "100 100", "0 45")}},
      {"kru_fail_offset_range", 3, {Kru(100, 2, "100 100", "-30 60"), Kru(100, 1, "100", "1000")}},
      // 150 MHz on CLK90 after output 0 took CLK2X in list T; before it there is a pin.
      {"kru_fail_clk90_with_2x_feedback", 3,
       {Kru(150, 2, "150 150", "90 0"), Kru(150, 2, "150 150", "0 90")}},
      {"kru_fail_no_pin", 3, {Kru(100, 2, "100 20", "0 90")}},
      {"kru_fail_ranges", 3,
       {Kru(300, 6, "300 300 600 600 150 2", "0 180 0 180 270 0"),
        Kru(1000, 3, "500 1000 500", "90 270 0"),
        KruWithoutFeedback(1000, 4, "1000 500 2000 7", "0 180 0 180")}},
      {"kru_fail_no_speed_data", 2, {Unreadable(Kru(100, 1, "100", "0"))}},
      {"kru_fail_short_list", 3, {Kru(100, 2, "100 50", "0")}},
      {"kru_fail_no_input", 3, {Kru(0, 1, "100", "0")}},
      {"kru_fail_seven_outputs", 3, {Kru(100, 7, "1 2 3 4 5 6 7", "0 0 0 0 0 0 0")}},
  };
}

// 127 MHz out of 64 have two pairs of M and D.
std::vector<KruGoldenCase> ClkgenCases() {
  return {
      {"clkgen_one_output", 1, {Clkgen(100, 1, "150", "90")}},
      {"clkgen_clkfx180", 1, {Clkgen(64, 3, "127 127 126.99984", "0 180 0")}},
      {"clkgen_clkfxdv", 1, {Clkgen(64, 4, "127 31.75 127 31.75", "0 0 180 0")}},
      {"clkgen_below_clkfx", 1, {Clkgen(64, 2, "127 3.96875", "0 0")}},
      {"clkgen_fail_dv", 3, {Clkgen(64, 3, "127 63.5 31.75", "0 0 0")}},
      {"clkgen_fail_no_dv", 3, {Clkgen(64, 2, "127 80", "0 0")}},
      {"clkgen_fail_phase", 3, {Clkgen(64, 2, "127 63.5", "0 180")}},
      {"clkgen_fail_phase_and_range", 3, {Clkgen(64, 2, "127 1000", "0 90")}},
      {"clkgen_fail_output0_range", 3, {Clkgen(100, 1, "400", "0")}},
      {"clkgen_fail_output0_pair", 3, {Clkgen(100, 1, "100.3", "0")}},
      {"clkgen_fail_short_list", 3, {Clkgen(100, 2, "150", "0 0")}},
      // 400 MHz is in range after a KRU_SP run has read the limits of CLKFX.
      {"clkgen_after_kru", 1,
       {Clkgen(100, 1, "400", "0"), Kru(100, 1, "100", "0"), Clkgen(100, 1, "400", "0")}},
  };
}

}  // namespace

std::vector<KruGoldenCase> KruGoldenCases() {
  std::vector<KruGoldenCase> all = SolvedKruCases();
  for (const auto& more : {FailedKruCases(), ClkgenCases()}) {
    all.insert(all.end(), more.begin(), more.end());
  }
  return all;
}
