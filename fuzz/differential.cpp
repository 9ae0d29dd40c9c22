// The solvers of PLL, TSYN, KRU_SP and KRU_CLKGEN against the plain ones, bit for bit and with their
// traces. An input is a request in lines:
//
//     pll closest low         what to run, and the flags that are set
//     400 1080 3.125 ...      the limits: those of a loop in the order of kLoopLimits, or the
//                             periods of kKruKeywords; one that is missing or no limit is usual
//     148.5 74.25             frequencies
//     22.5 0                  phases
//     50 37.5                 duty cycles
//     74.25 0                 input clocks
//     2                       outputs
//
// Objects are used again, as scripts do, after a run that leaves nothing of the one before.

#include <array>
#include <cmath>

#include "fuzz/Fuzz.h"
#include "tests/compare/KruPair.h"
#include "tests/compare/PllPair.h"

namespace {

using L = plain::PllLimits;
constexpr std::array kLoopLimits = {
    &L::vcoMin,      &L::vcoMax,          &L::clkoutMin, &L::clkoutMax, &L::pfdMin, &L::pfdMax,
    &L::clkoutMaxIo, &L::maxHighLowCount, &L::vcoTarget, &L::maxPfdLowB};
// Usual periods in ns, in the order of the keywords.
constexpr std::array kPeriods = {3.57, 200.0, 5.33, 5.0,    200.0, 5.33, 2.67,
                                 100.0, 5.38, 3200.0, 8.0, 2.67, 200.0};
// What a plain search can be asked for: no limit of a device is beyond it.
constexpr double kMostLimit = 10'000.0;
constexpr double kMostCount = 64.0;
constexpr double kMostPhase = 720.0;

enum Line { kKind, kLimits, kFrequencies, kPhases, kDuties, kInputs, kCount, kLines };
using Lines = std::vector<std::string>;

bool Has(const Lines& lines, const std::string& flag) {
  return (" " + lines[kKind] + " ").find(" " + flag + " ") != std::string::npos;
}

double NumberAt(const std::string& list, std::size_t index) {
  const std::vector<std::string> words = fuzz::Split(list, ' ');
  return index < words.size() ? std::atof(words[index].c_str()) : 0.0;
}

double LimitAt(const Lines& lines, std::size_t index, double usual) {
  const double limit = NumberAt(lines[kLimits], index);
  return limit > 0.0 && limit <= kMostLimit ? limit : usual;
}

int CountOf(const Lines& lines) {
  return static_cast<int>(std::strtol(lines[kCount].c_str(), nullptr, 10));
}

compare::Case LoopCase(const Lines& lines) {
  compare::Case made;
  for (std::size_t i = 0; i < kLoopLimits.size(); ++i) {
    double& limit = made.limits.*kLoopLimits[i];
    limit = LimitAt(lines, i, limit);
  }
  made.limits.maxHighLowCount = std::fmin(made.limits.maxHighLowCount, kMostCount);
  made.limits.readable = !Has(lines, "unreadable");
  plain::PllRequest& request = made.request;
  request.prim = Has(lines, "pll") ? plain::kPrimPll : plain::kPrimTsyn;
  request.closest = Has(lines, "closest");
  request.preferMaxVco = Has(lines, "max");
  request.intDiv0Only = Has(lines, "int");
  request.lowBandwidth = Has(lines, "low");
  request.outFreqs = lines[kFrequencies];
  request.phases = lines[kPhases];
  request.dutyCycles = lines[kDuties];
  request.inFreq = NumberAt(lines[kInputs], 0);
  request.inFreq2 = NumberAt(lines[kInputs], 1);
  request.count = CountOf(lines);
  return made;
}

compare::KruCase KruCaseOf(const Lines& lines) {
  compare::KruCase made;
  made.clkgen = Has(lines, "clkgen");
  made.readable = !Has(lines, "unreadable");
  for (std::size_t i = 0; i < made.periods.size(); ++i) {
    made.periods[i] = LimitAt(lines, i, kPeriods[i]);
  }
  made.request.outFreqs = lines[kFrequencies];
  made.request.phases = lines[kPhases];
  made.request.inFreq = NumberAt(lines[kInputs], 0);
  made.request.numOut = CountOf(lines);
  made.request.feedbackUsed = Has(lines, "feedback");
  return made;
}

// Phases of many turns are answered, by walks that are long.
bool IsLong(const Lines& lines) {
  for (const std::string& word : fuzz::Split(lines[kPhases], ' ')) {
    if (std::fabs(std::atof(word.c_str())) > kMostPhase) return true;
  }
  return false;
}

int CompareLoops(const Lines& lines) {
  static compare::PllPair pair;
  static const compare::Case usual = LoopCase(
      {"tsyn closest", "", "100 100 100 100 100 100 100", "0 0 0 0 0 0 0", "50 50 50 50 50 50 50",
       "100 0", "7"});
  const compare::Case made = LoopCase(lines);
  if (plain::GoesFar(made.request, made.limits, {})) return -1;
  fuzz::Require(pair.FirstDifference(usual, false).empty(), "the usual request");
  const std::string difference = pair.FirstDifference(made, true);
  fuzz::Require(difference.empty(), difference + "\n" + Describe(made));
  return 0;
}

int CompareKrus(const Lines& lines) {
  static compare::KruPair pair;
  static const compare::KruCase usual =
      KruCaseOf({"kru feedback", "", "100 100 100 100 100 100", "0 0 0 0 0 0", "", "100", "6"});
  const compare::KruCase made = KruCaseOf(lines);
  fuzz::Require(pair.FirstDifference(usual).empty(), "the usual request");
  const std::string difference = pair.FirstDifference(made);
  fuzz::Require(difference.empty(), difference + "\n" + Describe(made));
  return 0;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view text = fuzz::TextOf(data, size);
  // Texts of C have no zeros.
  if (text.find('\0') != std::string_view::npos) return -1;
  Lines lines = fuzz::Split(text, '\n');
  if (lines.size() < kLines || IsLong(lines)) return -1;
  return Has(lines, "kru") || Has(lines, "clkgen") ? CompareKrus(lines) : CompareLoops(lines);
}
