#include "tests/compare/KruGenerator.h"

#include <cstdlib>

namespace compare {

const std::array<const char*, 13> kKruKeywords = {
    "D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD",
    "D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD",
    "D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD",
    "D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD",
    "D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD",
    "D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD",
    "D_KRU_CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD",
    "D_KRU_CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD",
    "D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD",
    "D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD",
    "D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD",
    "D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD",
    "D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD",
};

namespace {

const std::vector<double> kInputs = {10, 20, 25, 27, 33, 33.333, 40, 50, 66, 66.667,
                                     75, 80, 100, 125, 133, 150, 180, 200, 250};

std::string Frequency(double value, Random& random) {
  // Three decimals lie within the matching tolerance of every frequency, nine are as good as
  // exact.
  const char* const formats[] = {"%.3f", "%.9f", "%.17g"};
  return Number(formats[random.Int(0, 2)], value);
}

// `frequency` times M / D, with an M from `low` to `high` and a D up to `largestD`. Two statements,
// since compilers work out the operands of an expression in orders of their own.
double TimesQuotient(double frequency, int low, int high, int largestD, Random& random) {
  const double multiple = frequency * random.Int(low, high);
  return multiple / random.Int(1, largestD);
}

// A frequency for which one of the cases of the pin assignment is made.
double DrawFrequency(double inFreq, double fx, Random& random) {
  switch (random.Int(0, 9)) {
    case 0:
    case 1: return inFreq;
    case 2: return inFreq / 2;
    case 3: return inFreq * 2;
    case 4: return inFreq / (0.5 * random.Int(3, 36));      // CLKDV, and values that it lacks
    case 5: return inFreq / 2 / (0.5 * random.Int(3, 36));  // CLKDV of the halved input
    case 6:
    case 7: return fx;
    case 8: return TimesQuotient(inFreq, 2, 32, 32, random);
    default: return random.Real(1, 400);
  }
}

double DrawPhase(double offset, Random& random) {
  if (random.OneIn(12)) return random.Real(-400, 400);
  return offset + 90.0 * random.Int(0, random.OneIn(6) ? 5 : 3);
}

void DrawOutputs(KruCase& drawn, Random& random) {
  plain::KruRequest& request = drawn.request;
  request.numOut = random.Int(1, 6);
  const double fx = TimesQuotient(request.inFreq, 2, 12, 10, random);
  const std::vector<double> offsets = {0, 0, 0, 0, 45, 10, 22.5, 89, 88.5, -1, -30};
  const double offset = random.Pick(offsets);
  const bool onlyHalfTurns = random.OneIn(2);
  for (int n = 0; n < request.numOut; ++n) {
    double frequency = DrawFrequency(request.inFreq, fx, random);
    double phase = DrawPhase(offset, random);
    if (onlyHalfTurns) phase = offset + 180.0 * random.Int(0, 1);
    if (drawn.clkgen) {
      frequency = random.OneIn(2) ? fx : fx / (1 << random.Int(1, 5));
      if (random.OneIn(8)) frequency = random.Real(0.1, 400);
      phase = random.OneIn(3) ? 180.0 : 0.0;
      if (random.OneIn(10)) phase = 90;
    }
    request.outFreqs += (n == 0 ? "" : " ") + Frequency(frequency, random);
    request.phases += (n == 0 ? "" : " ") + Number("%.17g", phase);
  }
}

// Limits around those of a device; now and then one that lies exactly on a frequency of the
// request.
void DrawLimits(KruCase& drawn, Random& random) {
  // Periods in ns in the order of the keywords.
  const std::array<double, 13> usual = {3.57, 200, 5.33, 5, 200, 5.33, 2.67,
                                        100,  5.38, 3200, 8, 2.67, 200};
  for (std::size_t i = 0; i < usual.size(); ++i) {
    drawn.periods[i] = random.OneIn(3) ? usual[i] * random.Real(0.5, 2) : usual[i];
  }
  for (int k = random.Int(0, 3); k > 0; --k) {
    const double at = TimesQuotient(drawn.request.inFreq, 1, 4, 4, random);
    const int limit = random.Int(0, 12);
    drawn.periods[static_cast<std::size_t>(limit)] = 1000.0 / at;
  }
}

void MakeWild(KruCase& drawn, Random& random) {
  static const std::vector<std::string> odd = {"0",   "-0",  "-100", "1e308", "inf", "-inf",
                                               "nan", "abc", "360",  "450",   "1e300"};
  plain::KruRequest& request = drawn.request;
  auto odden = [&](std::string& text) {
    if (random.OneIn(2)) text = random.Pick(odd) + (text.empty() ? "" : " ") + text;
    if (random.OneIn(6)) text = text.substr(0, text.size() / 2);
  };
  odden(request.outFreqs);
  odden(request.phases);
  if (random.OneIn(3)) request.inFreq = std::strtod(random.Pick(odd).c_str(), nullptr);
  if (random.OneIn(3)) request.numOut = random.Int(-1, 8);
  if (random.OneIn(5)) drawn.readable = false;
}

}  // namespace

KruCase DrawKruCase(Random& random) {
  KruCase drawn;
  drawn.clkgen = random.OneIn(4);
  drawn.request.inFreq = random.Pick(kInputs);
  drawn.request.feedbackUsed = !random.OneIn(3);
  DrawOutputs(drawn, random);
  DrawLimits(drawn, random);
  if (random.OneIn(10)) MakeWild(drawn, random);
  return drawn;
}

std::string Describe(const KruCase& drawn) {
  const plain::KruRequest& r = drawn.request;
  std::string text = std::string(drawn.clkgen ? "KRU_CLKGEN" : "KRU_SP") + " out={" + r.outFreqs +
                     "} phase={" + r.phases + "} inFreq=" + Number("%.17g", r.inFreq) +
                     " numOut=" + std::to_string(r.numOut) +
                     (r.feedbackUsed ? " feedback" : " no feedback") +
                     (drawn.readable ? "" : " unreadable") + "\n  periods";
  for (const double period : drawn.periods) text += " " + Number("%.17g", period);
  return text;
}

}  // namespace compare
