// The requests that are timed, in sets by how far the search has to go for them.
//
// Every set but the last has requests to both primitives, with one, three and seven outputs, with
// output 0 low (a few MHz: many dividers reach the VCO range, and a TSYN adds the steps of 1/8)
// and high, for the smallest VCO and for the closest solution. The device is that of kPllLimits
// and kTsynLimits. What a set says of its requests is checked before anything is timed.
#ifndef VORKEL_BENCH_REQUESTS_H_
#define VORKEL_BENCH_REQUESTS_H_

#include <limits>
#include <span>

#include "tests/plain/plain_pll.h"

namespace bench {

inline constexpr int kTsyn = plain::kPrimTsyn;
inline constexpr int kPll = plain::kPrimPll;

// A device as they are built: MHz, and VCO cycles for the high or low count.
inline constexpr plain::PllLimits kTsynLimits = {
    .vcoMin = 600, .vcoMax = 1440, .clkoutMin = 4.6875, .clkoutMax = 800, .pfdMin = 10,
    .pfdMax = 500, .clkoutMaxIo = 1000, .maxHighLowCount = 64, .vcoTarget = 1000,
    .maxPfdLowB = 300};
inline constexpr plain::PllLimits kPllLimits = {
    .vcoMin = 400, .vcoMax = 1080, .clkoutMin = 3.125, .clkoutMax = 400, .pfdMin = 19,
    .pfdMax = 500, .clkoutMaxIo = 1080, .maxHighLowCount = 64, .vcoTarget = 0,
    .maxPfdLowB = 300};

struct Request {
  const char* name;
  int prim;
  int count;             // outputs
  const char* outFreqs;  // MHz
  double inFreq;         // MHz
  double inFreq2 = 0;    // MHz; 0: no second input clock
  const char* phases = nullptr;  // degrees; null: the smallest VCO is asked for, not the closest
                                 // solution. All duty cycles are 50 percent.
  const plain::PllLimits* limits = nullptr;  // of a device of its own
  bool lowBandwidth = false;
  bool preferMaxVco = false;
};

// --- Nothing serves them --------------------------------------------------------------------
//
// The input clock is below the PFD range; two input clocks leave hardly any VCO range; an output
// is out of reach of every divider; output 0 is above all VCO frequencies. In the others, which
// end in "conflict", each output could be served, but the VCO frequencies that fit them best
// have no M and D.
inline constexpr Request kInfeasible[] = {
    {"TSYN 1 low, input below PFD", kTsyn, 1, "11.25", 8},
    {"TSYN 1 low closest, two inputs", kTsyn, 1, "10", 48, 20, "90"},
    {"TSYN 1 high, two inputs", kTsyn, 1, "148.5", 20, 48},
    {"TSYN 1 high closest, above VCO", kTsyn, 1, "1460", 100, 0, "90"},
    {"TSYN 3 low, output 2 too low", kTsyn, 3, "11.25 50 2", 100},
    {"TSYN 3 low, conflict", kTsyn, 3, "12 155.52 40", 19.2},
    {"TSYN 3 low, conflict at the end", kTsyn, 3, "10 297 5", 100},
    {"TSYN 3 low closest, conflict", kTsyn, 3, "10 150 312.5", 26, 0, "0 225 0"},
    {"TSYN 3 high, output 1 too high", kTsyn, 3, "200 1100 50", 100},
    {"TSYN 3 high, conflict", kTsyn, 3, "65 175 148.5", 24},
    {"TSYN 3 high closest, conflict", kTsyn, 3, "133.333 297 65", 26, 0, "315 0 270"},
    {"TSYN 7 low, conflict", kTsyn, 7, "12 48 108 65 5 66.667 54", 133},
    {"TSYN 7 low closest, conflict", kTsyn, 7, "12.288 74.25 148.5 60 30 5 156.25", 40, 0,
     "0 0 0 0 135 90 0"},
    {"TSYN 7 high, conflict", kTsyn, 7, "148.5 156.25 54 25 300 108 5", 27},
    {"TSYN 7 high closest, conflict", kTsyn, 7, "175 156.25 250 333 54 155.52 5", 74.25, 0,
     "270 0 0 180 135 135 45"},
    {"PLL 1 low, two inputs", kPll, 1, "8", 74.25, 200},
    {"PLL 1 low closest, input below PFD", kPll, 1, "12", 12, 0, "90"},
    {"PLL 1 high, two inputs", kPll, 1, "300", 74.25, 148.5},
    {"PLL 1 high closest, two inputs", kPll, 1, "390", 50, 20, "90"},
    {"PLL 3 low, output 1 too high", kPll, 3, "12 1500 50", 100},
    {"PLL 3 low, conflict", kPll, 3, "12 100 133.333", 37},
    {"PLL 3 low closest, conflict", kPll, 3, "6.25 12.288 65", 33, 0, "45 0 0"},
    {"PLL 3 high, conflict", kPll, 3, "156.25 48 125", 36},
    {"PLL 3 high closest, conflict", kPll, 3, "300 65 390", 48, 0, "0 0 180"},
    {"PLL 7 low, conflict", kPll, 7, "5 33.333 80 65 12.288 74.25 148.5", 27},
    {"PLL 7 low closest, conflict", kPll, 7, "8 156.25 66.667 60 12.288 390 37.125", 156.25, 0,
     "315 135 315 270 180 0 225"},
    {"PLL 7 high, output 4 too high", kPll, 7, "200 100 50 25 600 100 100", 100},
    {"PLL 7 high, conflict", kPll, 7, "222.2 175 44.1 200 200 333 5", 25},
    {"PLL 7 high closest, conflict", kPll, 7, "80 8 20 297 20 390 12.288", 37, 0,
     "0 225 0 135 225 315 0"},
};

// --- Solved as they are ---------------------------------------------------------------------
//
// Multiples and parts of the input clock, and video clocks.
inline constexpr Request kFudgeNone[] = {
    {"TSYN 1 low", kTsyn, 1, "11.25", 100},
    {"TSYN 1 low closest", kTsyn, 1, "11.25", 100, 0, "90"},
    {"TSYN 1 low, two inputs", kTsyn, 1, "12", 50, 40},
    {"TSYN 1 high", kTsyn, 1, "200", 100},
    {"TSYN 1 high closest", kTsyn, 1, "148.5", 27, 0, "45"},
    {"TSYN 3 low", kTsyn, 3, "12 48 100", 100},
    {"TSYN 3 low closest", kTsyn, 3, "12 48 100", 100, 0, "0 90 180"},
    {"TSYN 3 high", kTsyn, 3, "148.5 74.25 27", 27},
    {"TSYN 3 high closest", kTsyn, 3, "200 100 50", 100, 0, "0 90 180"},
    {"TSYN 7 low", kTsyn, 7, "10 20 25 40 50 100 200", 100},
    {"TSYN 7 low closest", kTsyn, 7, "10 20 25 40 50 100 200", 100, 0, "0 45 90 135 180 225 270"},
    {"TSYN 7 high", kTsyn, 7, "200 100 50 25 40 80 10", 50},
    {"TSYN 7 high closest", kTsyn, 7, "200 100 50 25 40 80 10", 50, 0, "0 0 0 90 90 180 180"},
    {"PLL 1 low", kPll, 1, "8", 100},
    {"PLL 1 low closest", kPll, 1, "8", 100, 0, "90"},
    {"PLL 1 high", kPll, 1, "200", 100},
    {"PLL 1 high closest", kPll, 1, "148.5", 27, 0, "45"},
    {"PLL 1 high, two inputs", kPll, 1, "200", 100, 80},
    {"PLL 3 low", kPll, 3, "8 40 100", 100},
    {"PLL 3 low closest", kPll, 3, "8 40 100", 100, 0, "0 90 180"},
    {"PLL 3 high", kPll, 3, "148.5 74.25 27", 27},
    {"PLL 3 high closest", kPll, 3, "200 100 50", 100, 0, "0 90 180"},
    {"PLL 7 low", kPll, 7, "10 20 25 40 50 100 200", 100},
    {"PLL 7 low closest", kPll, 7, "10 20 25 40 50 100 200", 100, 0, "0 45 90 135 180 225 270"},
    {"PLL 7 high", kPll, 7, "200 100 50 25 40 80 10", 50},
    {"PLL 7 high closest", kPll, 7, "200 100 50 25 40 80 10", 50, 0, "0 0 0 90 90 180 180"},
};

// --- Solved with a fudge up to 0.1 MHz ------------------------------------------------------
//
// Clocks of different families: crystal, video, audio and network frequencies.
inline constexpr Request kFudgeSmall[] = {
    {"TSYN 1 low, two inputs", kTsyn, 1, "5", 36, 33.333},
    {"TSYN 1 low closest, two inputs", kTsyn, 1, "6.25", 66.667, 50, "90"},
    {"TSYN 1 high", kTsyn, 1, "297", 200},
    {"TSYN 1 high closest", kTsyn, 1, "148.5", 200, 0, "45"},
    {"TSYN 3 low", kTsyn, 3, "6.25 312.5 50", 30},
    {"TSYN 3 low closest", kTsyn, 3, "12.288 5 156.25", 24, 0, "0 90 180"},
    {"TSYN 3 high", kTsyn, 3, "80 50 333", 19.2},
    {"TSYN 3 high closest", kTsyn, 3, "74.25 37.125 148.5", 48, 0, "0 90 180"},
    {"TSYN 7 low", kTsyn, 7, "12.288 30 99.5 5 100 200 50", 48},
    {"TSYN 7 low closest", kTsyn, 7, "12 40 156.25 175 74.25 74.25 12", 156.25, 0,
     "0 0 90 90 0 45 0"},
    {"TSYN 7 high", kTsyn, 7, "74.25 250 133.333 156.25 10 300 25", 30},
    {"TSYN 7 high closest", kTsyn, 7, "108 65 99.5 300 66.667 156.25 100", 133, 0,
     "0 45 90 135 180 225 270"},
    {"PLL 1 low", kPll, 1, "12.288", 74.25},
    {"PLL 1 low closest", kPll, 1, "12.288", 156.25, 0, "90"},
    {"PLL 1 high", kPll, 1, "74.25", 125},
    {"PLL 1 high closest", kPll, 1, "148.5", 200, 0, "45"},
    {"PLL 3 low", kPll, 3, "12 40 156.25", 19.2},
    {"PLL 3 low closest", kPll, 3, "8 16 222.2", 33, 0, "0 90 180"},
    {"PLL 3 high", kPll, 3, "65 44.1 27", 66.667},
    {"PLL 3 high closest", kPll, 3, "66.667 10 12.5", 27, 0, "0 90 180"},
    {"PLL 7 low", kPll, 7, "10 16 148.5 200 300 133.333 12.288", 33},
    {"PLL 7 low closest", kPll, 7, "12.288 30 99.5 5 100 200 50", 48, 0, "0 0 90 90 0 45 0"},
    {"PLL 7 high", kPll, 7, "65 390 44.1 27 25 20 12.288", 133},
    {"PLL 7 high closest", kPll, 7, "155.52 333 148.5 48 6.25 24 74.25", 200, 0,
     "0 45 90 135 180 225 270"},
};

// --- Solved with a fudge above 0.1 MHz ------------------------------------------------------
//
// An input clock that the PFD range lets divide by one or two only leaves few VCO frequencies;
// so do two input clocks. The more outputs, the fewer of them fit.
inline constexpr Request kFudgeLarge[] = {
    {"TSYN 1 low, two inputs", kTsyn, 1, "5", 36, 25},
    {"TSYN 1 low closest, two inputs", kTsyn, 1, "5", 148.5, 74.25, "270"},
    {"TSYN 1 high", kTsyn, 1, "297", 37},
    {"TSYN 1 high closest", kTsyn, 1, "390", 24, 0, "90"},
    {"TSYN 3 low", kTsyn, 3, "10 27 333", 26},
    {"TSYN 3 low closest", kTsyn, 3, "12.288 99.5 155.52", 30, 0, "0 90 180"},
    {"TSYN 3 high", kTsyn, 3, "155.52 40 12", 19.2},
    {"TSYN 3 high closest", kTsyn, 3, "150 25 60", 27, 0, "270 270 225"},
    {"TSYN 7 low", kTsyn, 7, "12 12.5 48 250 390 300 30", 37},
    {"TSYN 7 low closest", kTsyn, 7, "12 27 65 200 148.5 8 20", 26, 0, "90 180 0 0 0 0 45"},
    {"TSYN 7 high", kTsyn, 7, "108 16 37.125 27 20 155.52 16", 19.2},
    {"TSYN 7 high closest", kTsyn, 7, "60 66.667 125 20 333 66.667 148.5", 25, 0,
     "315 0 0 0 0 0 0"},
    {"PLL 1 low, two inputs", kPll, 1, "5", 66.667, 33},
    {"PLL 1 low closest, two inputs", kPll, 1, "5", 40, 20, "90"},
    {"PLL 1 high", kPll, 1, "148.5", 30},
    {"PLL 1 high closest", kPll, 1, "333", 200, 0, "45"},
    {"PLL 3 low", kPll, 3, "12.5 33.333 312.5", 27},
    {"PLL 3 low closest", kPll, 3, "8 37.125 222.2", 36, 0, "0 0 90"},
    {"PLL 3 high", kPll, 3, "66.667 74.25 6.25", 36},
    {"PLL 3 high closest", kPll, 3, "155.52 222.2 80", 37, 0, "180 0 0"},
    {"PLL 7 low", kPll, 7, "10 20 65 155.52 20 155.52 12", 19.2},
    {"PLL 7 low closest", kPll, 7, "10 133.333 312.5 16 12.288 5 312.5", 24, 0,
     "0 90 0 225 90 270 0"},
    {"PLL 7 high", kPll, 7, "156.25 150 48 66.667 12 297 155.52", 36},
    {"PLL 7 high closest", kPll, 7, "74.25 24 297 250 390 8 100", 19.2, 0, "0 0 45 0 0 90 0"},
};

// --- Hard ones ------------------------------------------------------------------------------
//
// What climbs from random requests towards slower ones have come to. Output 0 is low, the others
// are clocks that several VCO frequencies fit about as well, and the one that fits best changes
// from fudge to fudge. Some have a solution, far out, and some have none. In those with multiples,
// many VCO frequencies are multiples of an output, exactly or nearly so.
inline constexpr plain::PllLimits kWideLimits = {
    .vcoMin = 555.384, .vcoMax = 2192.97177, .clkoutMin = 4.691085506, .clkoutMax = 800,
    .pfdMin = 10, .pfdMax = 328, .clkoutMaxIo = 1000, .maxHighLowCount = 103.7,
    .vcoTarget = 826.2, .maxPfdLowB = 300};
inline constexpr Request kHard[] = {
    {"TSYN 3, fits from fudge to fudge", kTsyn, 3, "16.569 54.75 225.851", 25.425, 0, "0 0 0"},
    {"TSYN 3, output 2 at its low end", kTsyn, 3, "12.288 297 5", 100, 0, "0 0 315"},
    {"TSYN 4, output 3 at its low end", kTsyn, 4, "12.288 75 80 5", 24},
    {"TSYN 4, output 1 near output 0", kTsyn, 4, "16.939 15.359 143.593 133", 25.425, 0,
     "0 0 0 0"},
    {"TSYN 4, solved", kTsyn, 4, "19.787 10 233.485 282.25", 27.267},
    {"TSYN 5, one input, solved", kTsyn, 5, "15 14.475 135.25 255.63 282.75", 14.5, 0,
     "0 0 0 0 0"},
    {"TSYN 5, one input", kTsyn, 5, "9.35 33.375 56.88 296.107 359.25", 49.94, 0, "0 0 0 0 0"},
    {"TSYN 5, two inputs, solved", kTsyn, 5, "19.393 25 277 326 133.385", 277.25, 267},
    {"TSYN 5, two inputs", kTsyn, 5, "17.899 16.97 290 245 8", 291.47, 258.5, "0 0 0 0 0"},
    {"TSYN 7", kTsyn, 7, "13.765 16.55 266.862 63 226 6.415 368.875", 160.93},
    {"PLL 3", kPll, 3, "15.789 8.248 182.344", 37.25, 0, "0 0 0"},
    {"PLL 7, solved", kPll, 7, "11 14.75 358.62 222.875 85.125 42.435 339.75", 22.075},
    {"TSYN 4, multiples, two inputs", kTsyn, 4, "17.44 13.167 57.25 52.323", 16.841, 17},
    {"TSYN 5, multiples", kTsyn, 5, "17.113 68.877 34.5 27.001 19.63", 13.5},
    {"TSYN 5, multiples, solved", kTsyn, 5, "11.838 7.725 22.84 6.093 42.156", 10.842, 13.067},
    {"TSYN 4, multiples, nearly", kTsyn, 4, "13.5 12 24.01 24.264", 12.003, 12.044},
    {"TSYN 5, multiples, nearly", kTsyn, 5, "15.06 15.6 19.012 23 25.01563953", 11.69937457},
    {"TSYN 5, multiples, many", kTsyn, 5, "16.384 11 11.4 28.601 29.5", 10.48094136},
    {"TSYN 4, output 1 at output 0", kTsyn, 4, "12.29 12.288 25 47.37942019", 12.288},
    {"TSYN 5, wide VCO range", kTsyn, 5, "14.1 12 13.86837577 24.122 24.29169079", 11.99664573, 0,
     "0 0 0 0 0", &kWideLimits, true, true},
    {"TSYN 5, LOW, closest", kTsyn, 5, "14.825 15 11.13 11.27671473 29", 10.109888333432261, 0,
     "0 315 225 180 180", nullptr, true},
    {"TSYN 5, LOW, largest VCO", kTsyn, 5, "15.292 13 11.293 27.40933841 27", 10.476609765730593, 0,
     nullptr, nullptr, true, true},
    {"TSYN 5, LOW, two inputs", kTsyn, 5, "16 16.072 32.211 16.37792548 16.328", 11.307785365771325,
     11.267403751829223, "180 180 0 270 270", nullptr, true},
};

// --- The sets -------------------------------------------------------------------------------

inline constexpr double kNoGoal = 0.0;
inline constexpr int kAnyCode = 0;
inline constexpr double kFudgeStep = 0.001;  // MHz

struct RequestSet {
  const char* name;
  const char* title;
  std::span<const Request> requests;
  int code;            // result code of all of them, or kAnyCode
  double lowestFudge;  // MHz; the range of their fudges; 0 where there is no solution
  double highestFudge;
  int rounds;          // timings of each request
  double geometricMeanGoal;  // how many times faster than the plain search, on average
  double everyRatioGoal;     // and at least
};

inline constexpr RequestSet kSets[] = {
    {"infeasible", "nothing serves the request", kInfeasible, plain::kNoConfiguration, 0, 0, 3,
     300, kNoGoal},
    {"none", "solved at fudge 0", kFudgeNone, plain::kSolved, 0, 0, 15, kNoGoal, 1},
    {"small", "fudge up to 0.1 MHz", kFudgeSmall, plain::kSolved, kFudgeStep, 0.1, 9, kNoGoal,
     kNoGoal},
    {"large", "fudge above 0.1 MHz", kFudgeLarge, plain::kSolved, 0.1 + kFudgeStep,
     std::numeric_limits<double>::infinity(), 5, 20, kNoGoal},
    {"hard", "hard ones, solved or not", kHard, kAnyCode, 0,
     std::numeric_limits<double>::infinity(), 3, kNoGoal, kNoGoal},
};

}  // namespace bench

#endif  // VORKEL_BENCH_REQUESTS_H_
