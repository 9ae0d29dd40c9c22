#include "tests/compare/RequestGenerator.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <vector>

namespace compare {

namespace {

const std::vector<double> kInputs = {10,  12,     12.288, 19.2, 20,    24,     25,  26,     27,
                                     33,  33.333, 40,     48,   50,    60,     66,  66.667, 74.25,
                                     100, 122.88, 125,    133,  148.5, 156.25, 200, 250,    300};
const std::vector<double> kOutputs = {4,     5,     6.25,   8,      10,    12,    12.288, 12.5,
                                      16,    20,    24,     24.576, 25,    27,    30,     33.333,
                                      37.125, 40,   44.1,   48,     50,    54,    60,     62.5,
                                      65,    66,    66.667, 74.25,  75,    80,    99.5,   100,
                                      108,   125,   133.333, 148.5, 150,   155.52, 156.25, 175,
                                      200,   222.2, 250,    297,    300,   312.5, 333,    400};

// A frequency as people or programs write it.
std::string Frequency(double value, Random& random) {
  switch (random.Int(0, 3)) {
    case 0: return Number("%.3f", value);
    case 1: return Number("%.6f", value);
    case 2: return Number("%g", value);
    default: return Number("%.17g", value);
  }
}

std::string Join(const std::vector<std::string>& words) {
  std::string list;
  for (const std::string& word : words) list += (list.empty() ? "" : " ") + word;
  return list;
}

// Limits as devices have them, fast and slow ones.
plain::PllLimits DeviceLimits(int prim, bool fast) {
  const bool tsyn = prim == plain::kPrimTsyn;
  plain::PllLimits limits;
  limits.vcoMin = tsyn ? 600 : 400;
  limits.vcoMax = tsyn ? (fast ? 1440 : 1200) : (fast ? 1080 : 1000);
  limits.clkoutMin = tsyn ? 4.6875 : 3.125;
  limits.clkoutMax = tsyn ? (fast ? 800 : 700) : (fast ? 400 : 375);
  limits.pfdMin = tsyn ? 10 : 19;
  limits.pfdMax = fast ? 500 : (tsyn ? 450 : 400);
  limits.clkoutMaxIo = fast ? 1080 : 1000;
  limits.maxHighLowCount = 64;
  limits.vcoTarget = 1000;
  limits.maxPfdLowB = 300;
  return limits;
}

plain::PllLimits DrawLimits(int prim, Random& random) {
  if (random.OneIn(3)) return DeviceLimits(prim, true);
  plain::PllLimits limits;
  limits.vcoMin = std::round(random.Real(100, 900));
  limits.vcoMax = limits.vcoMin + std::round(random.Real(0, 1200));
  limits.clkoutMin = random.OneIn(2) ? random.Real(0.5, 30) : std::round(random.Real(1, 30));
  limits.clkoutMax = std::round(random.Real(100, 1000));
  limits.pfdMin = random.OneIn(2) ? random.Real(1, 60) : std::round(random.Real(1, 60));
  limits.pfdMax = limits.pfdMin + std::round(random.Real(0, 600));
  limits.clkoutMaxIo = limits.clkoutMax + std::round(random.Real(0, 600));
  limits.maxHighLowCount = random.Int(1, 130);
  limits.vcoTarget = std::round(random.Real(limits.vcoMin, limits.vcoMax));
  limits.maxPfdLowB = std::round(random.Real(limits.pfdMin, limits.pfdMax));
  return limits;
}

void DrawOptions(plain::PllRequest& request, Random& random) {
  request.prim = random.OneIn(2) ? plain::kPrimPll : plain::kPrimTsyn;
  request.count = random.Int(1, 7);
  request.inFreq = random.Pick(kInputs);
  if (random.OneIn(5)) request.inFreq2 = random.Pick(kInputs);
  request.preferMaxVco = random.OneIn(4);
  request.intDiv0Only = random.OneIn(4);
  request.lowBandwidth = random.OneIn(4);
  request.closest = random.OneIn(2);
}

void DrawPhasesAndDutyCycles(plain::PllRequest& request, Random& random) {
  std::vector<std::string> phases;
  std::vector<std::string> duties;
  for (int n = 0; n < request.count; ++n) {
    switch (random.Int(0, 3)) {
      case 0: phases.push_back("0"); break;
      case 1: phases.push_back(Number("%g", 45.0 * random.Int(-8, 8))); break;
      case 2: phases.push_back(Number("%g", 11.25 * random.Int(-32, 32))); break;
      default: phases.push_back(Number("%.3f", random.Real(-380, 380))); break;
    }
    switch (random.Int(0, 2)) {
      case 0: duties.push_back("0"); break;
      case 1: duties.push_back("50"); break;
      default: duties.push_back(Number("%.2f", random.Real(-5, 105))); break;
    }
  }
  request.phases = Join(phases);
  request.dutyCycles = Join(duties);
}

// A setting of the primitive within the limits, as far as a few tries find one.
struct Setting {
  double vco = 0;
  double div0 = 1;
};

Setting DrawSetting(const Case& drawn, Random& random) {
  Setting setting;
  for (int tries = 0; tries < 50; ++tries) {
    const int m = random.Int(1, 64);
    const int d = random.Int(1, 20);
    setting.vco = drawn.request.inFreq * m / d;
    if (setting.vco >= drawn.limits.vcoMin && setting.vco <= drawn.limits.vcoMax) break;
  }
  const bool fractional =
      drawn.request.prim == plain::kPrimTsyn && drawn.request.count < 6 && random.OneIn(2);
  setting.div0 = fractional ? 2 + 0.125 * random.Int(0, 200) : random.Int(1, 40);
  return setting;
}

// The outputs of a setting; those after output 0 a little off now and then.
std::vector<std::string> Outputs(const Setting& setting, int count, Random& random) {
  std::vector<std::string> outputs = {Frequency(setting.vco / setting.div0, random)};
  for (int n = 1; n < count; ++n) {
    double frequency = setting.vco / random.Int(1, 60);
    if (random.OneIn(6)) frequency *= random.Real(0.9, 1.1);
    outputs.push_back(Frequency(frequency, random));
  }
  return outputs;
}

Case DrawCommon(Random& random) {
  Case drawn;
  DrawOptions(drawn.request, random);
  drawn.limits = DrawLimits(drawn.request.prim, random);
  drawn.request.count = random.Int(1, 4);
  std::vector<std::string> outputs;
  for (int n = 0; n < drawn.request.count; ++n) {
    outputs.push_back(Frequency(random.Pick(kOutputs), random));
  }
  drawn.request.outFreqs = Join(outputs);
  DrawPhasesAndDutyCycles(drawn.request, random);
  return drawn;
}

Case DrawConstructed(Random& random, double shift) {
  Case drawn;
  DrawOptions(drawn.request, random);
  drawn.limits = DrawLimits(drawn.request.prim, random);
  const Setting setting = DrawSetting(drawn, random);
  std::vector<std::string> outputs = Outputs(setting, drawn.request.count, random);
  if (shift != 0.0) outputs[0] = Frequency(setting.vco / setting.div0 + shift, random);
  drawn.request.outFreqs = Join(outputs);
  DrawPhasesAndDutyCycles(drawn.request, random);
  return drawn;
}

Case DrawRangeEnds(Random& random) {
  Case drawn = DrawConstructed(random, 0.0);
  const double f0 = std::strtod(drawn.request.outFreqs.c_str(), nullptr);
  // The VCO of a step as the search computes it, at a fudge that the loop can reach.
  double fudge = 0.0;
  for (int k = random.OneIn(2) ? 0 : random.Int(0, 40); k > 0; --k) fudge += 0.001;
  if (random.OneIn(2)) fudge = 0.0 - fudge;
  const double vco = (fudge + f0) * random.Int(2, 40);
  if (!(vco > 0.0)) return drawn;
  switch (random.Int(0, 5)) {
    case 0: drawn.limits.vcoMin = vco; break;
    case 1: drawn.limits.vcoMax = vco; break;
    case 2: drawn.limits.vcoMin = drawn.limits.vcoMax = vco; break;
    case 3: drawn.limits.clkoutMin = vco / random.Int(1, 60); break;
    case 4: drawn.limits.clkoutMax = vco / random.Int(1, 60); break;
    default:
      drawn.limits.pfdMin = drawn.request.inFreq / random.Int(1, 8);
      drawn.limits.pfdMax = drawn.request.inFreq / random.Int(1, 3);
      break;
  }
  return drawn;
}

// Limits and requests such that at one VCO frequency, which a fudge brings about, several outputs
// are at an end of their range or of a tolerance, or half way between two dividers.
Case DrawMeetingEnds(Random& random) {
  Case drawn;
  DrawOptions(drawn.request, random);
  plain::PllRequest& request = drawn.request;
  request.count = random.Int(2, 5);
  request.inFreq2 = 0;
  plain::PllLimits& limits = drawn.limits;
  limits = DrawLimits(request.prim, random);
  const double f0 = std::round(random.Real(5000, 200000)) / 1000;
  double fudge = 0.0;
  for (int k = random.Int(1, 200); k > 0; --k) fudge += 0.001;
  if (random.OneIn(2)) fudge = 0.0 - fudge;
  const double vco = (fudge + f0) * random.Int(2, 20);
  request.inFreq = vco * random.Int(1, 8);
  request.inFreq /= random.Int(5, 64);
  limits.pfdMin = 1;
  limits.pfdMax = limits.maxPfdLowB = limits.clkoutMaxIo = 10000;
  limits.vcoMin = random.OneIn(3) ? vco : std::min(limits.vcoMin, 0.8 * vco);
  limits.vcoMax = random.OneIn(4) ? vco : std::max(limits.vcoMax, 1.2 * vco);
  int divider = 1;
  std::vector<std::string> outputs = {Number("%.17g", f0)};
  for (int n = 1; n < request.count; ++n) {
    divider = random.Int(1, 40);
    double frequency = vco / divider;
    switch (random.Int(0, 4)) {
      case 0: frequency /= 1 + 0.01 * random.Int(1, 26); break;
      case 1: frequency /= 1 - 0.01 * random.Int(1, 26); break;
      case 2: frequency = vco / (divider + 0.5); break;
      case 3: frequency *= random.Real(0.8, 1.2); break;
      default: break;
    }
    outputs.push_back(Number("%.17g", frequency));
  }
  request.outFreqs = Join(outputs);
  if (random.OneIn(2)) limits.clkoutMax = vco / divider;
  if (random.OneIn(3)) limits.clkoutMaxIo = vco / random.Int(1, 20);
  if (random.OneIn(2)) limits.clkoutMin = vco / random.Int(1, 40);
  if (random.OneIn(6)) limits.clkoutMin = limits.clkoutMax;
  DrawPhasesAndDutyCycles(request, random);
  return drawn;
}

Case DrawRoundFigures(Random& random) {
  static const std::vector<double> round = {
      3.125, 4.6875, 6.25, 5,   10,  25,  33.333, 50,  62.5, 75,  93.75, 100,  125, 150,
      187.5, 200,    250,  300, 350, 375, 400,    500, 600,  700, 800,   1000, 1080};
  Case drawn;
  DrawOptions(drawn.request, random);
  drawn.limits = DeviceLimits(drawn.request.prim, random.OneIn(2));
  drawn.request.count = random.Int(2, 5);
  drawn.request.inFreq = random.Pick(kInputs);
  const double shift = 0.001 * random.Int(1, random.OneIn(2) ? 10 : 1500);
  const double unshifted = random.Pick(round);
  std::vector<std::string> outputs = {
      Number("%.3f", random.OneIn(2) ? unshifted + shift : unshifted - shift)};
  for (int n = 1; n < drawn.request.count; ++n) outputs.push_back(Number("%g", random.Pick(round)));
  drawn.request.outFreqs = Join(outputs);
  DrawPhasesAndDutyCycles(drawn.request, random);
  return drawn;
}

Case DrawInfeasible(Random& random) {
  Case drawn = DrawConstructed(random, 0.0);
  drawn.request.inFreq2 = 0;
  const int way = random.Int(0, 3);
  if (way == 0) {
    drawn.limits.pfdMin = drawn.request.inFreq * 1.01;  // D would have to be below 1
    drawn.limits.pfdMax = drawn.request.inFreq * 1.02;
  } else if (way == 1 && drawn.request.count > 1) {
    drawn.request.outFreqs = Frequency(random.Pick(kOutputs), random);
    for (int n = 1; n < drawn.request.count; ++n) {
      drawn.request.outFreqs += " " + Frequency(drawn.limits.vcoMax * random.Real(1.4, 3), random);
    }
  } else if (way == 2) {
    drawn.limits.vcoMin = 1000;
    drawn.limits.vcoMax = 1000.5;
    drawn.request.outFreqs = "600";
    for (int n = 1; n < drawn.request.count; ++n) drawn.request.outFreqs += " 50";
  } else {
    drawn.request.closest = true;  // no phase comes within the last tolerance
    drawn.request.outFreqs = Frequency(random.Real(150, 400), random);
    for (int n = 1; n < drawn.request.count; ++n) drawn.request.outFreqs += " 50";
    drawn.request.phases = "2000";
    for (int n = 1; n < drawn.request.count; ++n) drawn.request.phases += " 0";
  }
  return drawn;
}

// A low output 0 has many candidates, and only those below the largest divider times the lowest
// output serve that one. The others rank before them wherever they fit an output before it better.
Case DrawLowOutput(Random& random) {
  Case drawn;
  DrawOptions(drawn.request, random);
  drawn.request.count = random.Int(3, 5);
  do {
    drawn.limits = DrawLimits(drawn.request.prim, random);
  } while (drawn.limits.vcoMax < 1.5 * drawn.limits.vcoMin);
  const double lowest = std::max(drawn.limits.clkoutMin, drawn.limits.vcoMin / 128.0);
  const int low = random.Int(1, drawn.request.count - 1);
  std::vector<std::string> outputs = {Frequency(random.Real(5, 20), random)};
  for (int n = 1; n < drawn.request.count; ++n) {
    const bool isLow = n == low;
    outputs.push_back(
        Frequency(isLow ? lowest * random.Real(1, 1.4) : random.Pick(kOutputs), random));
  }
  drawn.request.outFreqs = Join(outputs);
  DrawPhasesAndDutyCycles(drawn.request, random);
  return drawn;
}

// Made from a setting of a device whose VCO has but a few MHz; output 0 can be moved a little.
Case DrawSlowVco(Random& random) {
  Case drawn;
  DrawOptions(drawn.request, random);
  plain::PllLimits& limits = drawn.limits;
  limits = DeviceLimits(drawn.request.prim, true);
  limits.vcoMin = random.Real(2, 30);
  limits.vcoMax = limits.vcoMin * random.Real(1.2, 3);
  limits.clkoutMin = random.Real(0.01, 0.2);
  limits.clkoutMax = limits.clkoutMaxIo = limits.vcoMax;
  limits.pfdMin = random.Real(0.05, 1);
  limits.vcoTarget = random.Real(limits.vcoMin, limits.vcoMax);
  drawn.request.inFreq = random.OneIn(2) ? random.Int(1, 12) : random.Real(0.5, 12);
  drawn.request.inFreq2 = 0;
  Setting setting = DrawSetting(drawn, random);
  setting.div0 = random.Int(8, 128);
  std::vector<std::string> outputs = Outputs(setting, drawn.request.count, random);
  if (random.OneIn(2)) {
    outputs[0] = Number("%.6f", setting.vco / setting.div0 + random.Real(-0.02, 0.02));
  }
  drawn.request.outFreqs = Join(outputs);
  DrawPhasesAndDutyCycles(drawn.request, random);
  return drawn;
}

// Output 0 comes up from below 0 by a fudge, or down to it, and nearly all dividers make VCOs of it.
Case DrawBelowZero(Random& random) {
  Case drawn = random.OneIn(3) ? DrawSlowVco(random) : DrawConstructed(random, 0.0);
  plain::PllRequest& request = drawn.request;
  if (!random.OneIn(4)) request.inFreq2 = -std::pow(10.0, random.Real(-1, 3));
  const std::size_t others = request.outFreqs.find(' ');
  const double most = random.OneIn(2) ? 0.1 : 3.0;
  const char* const format = random.OneIn(2) ? "%.3f" : "%.6f";
  const std::string first = Number(format, random.Real(-most, most));
  request.outFreqs = others == std::string::npos ? first : first + request.outFreqs.substr(others);
  return drawn;
}

Case DrawWild(Random& random) {
  static const std::vector<std::string> odd = {
      "0",   "-0",  "-100", "1e308", "1e-308", "inf",  "-inf", "nan",  "0x64", "abc",
      "1e5", "0.001", "128", "5e-324", "1,5",  "100MHz", "\t7", "1e400", "3.", ".5"};
  Case drawn = random.OneIn(2) ? DrawConstructed(random, 0.0) : DrawCommon(random);
  plain::PllRequest& request = drawn.request;
  auto list = [&](const std::vector<std::string>& usual) {
    std::string text;
    const int words = random.OneIn(3) ? random.Int(0, 9) : request.count;
    for (int n = 0; n < words; ++n) {
      text += std::string(static_cast<std::size_t>(random.Int(n == 0 ? 0 : 1, 3)), ' ');
      text += random.OneIn(3) ? random.Pick(odd) : random.Pick(usual);
    }
    return text;
  };
  if (random.OneIn(2)) request.outFreqs = list({"100", "50", "148.5", "25", "400"});
  if (random.OneIn(3)) request.phases = list({"0", "90", "-45", "180"});
  if (random.OneIn(3)) request.dutyCycles = list({"0", "50", "25", "75"});
  if (random.OneIn(3)) request.inFreq = std::strtod(random.Pick(odd).c_str(), nullptr);
  if (random.OneIn(4)) request.inFreq2 = std::strtod(random.Pick(odd).c_str(), nullptr);
  if (random.OneIn(4)) request.count = random.Int(-2, 9);
  if (random.OneIn(10)) drawn.limits.readable = false;
  return drawn;
}

}  // namespace

const char* KindName(Kind kind) {
  switch (kind) {
    case Kind::kCommon: return "Common";
    case Kind::kConstructed: return "Constructed";
    case Kind::kShifted: return "Shifted";
    case Kind::kRangeEnds: return "RangeEnds";
    case Kind::kMeetingEnds: return "MeetingEnds";
    case Kind::kRoundFigures: return "RoundFigures";
    case Kind::kInfeasible: return "Infeasible";
    case Kind::kLowOutput: return "LowOutput";
    case Kind::kSlowVco: return "SlowVco";
    case Kind::kBelowZero: return "BelowZero";
    case Kind::kWild: return "Wild";
  }
  return "";
}

Case DrawCase(Kind kind, Random& random) {
  switch (kind) {
    case Kind::kCommon: return DrawCommon(random);
    case Kind::kConstructed: return DrawConstructed(random, 0.0);
    case Kind::kShifted: {
      const double most = random.OneIn(2) ? 0.05 : 11.0;
      return DrawConstructed(random, random.Real(-most, most));
    }
    case Kind::kRangeEnds: return DrawRangeEnds(random);
    case Kind::kMeetingEnds: return DrawMeetingEnds(random);
    case Kind::kRoundFigures: return DrawRoundFigures(random);
    case Kind::kInfeasible: return DrawInfeasible(random);
    case Kind::kLowOutput: return DrawLowOutput(random);
    case Kind::kSlowVco: return DrawSlowVco(random);
    case Kind::kBelowZero: return DrawBelowZero(random);
    case Kind::kWild: return DrawWild(random);
  }
  return {};
}

std::string Describe(const Case& drawn) {
  const plain::PllRequest& r = drawn.request;
  const plain::PllLimits& l = drawn.limits;
  std::string text = std::string(r.prim == plain::kPrimPll ? "PLL" : "TSYN") +
                     (r.closest ? " closest" : " min-power") + " out={" + r.outFreqs + "}";
  if (r.closest) text += " phase={" + r.phases + "} duty={" + r.dutyCycles + "}";
  auto add = [&text](const char* name, double value) {
    text += std::string(" ") + name + "=" + Number("%.17g", value);
  };
  add("inFreq", r.inFreq);
  add("inFreq2", r.inFreq2);
  add("count", r.count);
  add("preferMaxVco", r.preferMaxVco);
  add("intDiv0Only", r.intDiv0Only);
  add("lowBandwidth", r.lowBandwidth);
  text += "\n  limits";
  add("vcoMin", l.vcoMin);
  add("vcoMax", l.vcoMax);
  add("clkoutMin", l.clkoutMin);
  add("clkoutMax", l.clkoutMax);
  add("clkoutMaxIo", l.clkoutMaxIo);
  add("pfdMin", l.pfdMin);
  add("pfdMax", l.pfdMax);
  add("maxPfdLowB", l.maxPfdLowB);
  add("maxHighLowCount", l.maxHighLowCount);
  add("vcoTarget", l.vcoTarget);
  add("readable", l.readable);
  return text;
}

}  // namespace compare
