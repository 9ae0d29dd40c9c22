#include "tests/model/ScriptGenerator.h"

#include <utility>

#include "tests/compare/KruGenerator.h"

namespace model {

namespace {

using compare::Number;
using compare::Random;

constexpr int kHandles = 3;

struct Line {
  std::string keyword;
  double value;
};

std::vector<Line> LoopLines(const plain::PllLimits& l) {
  return {{"VCOCLK_FREQ_MIN", l.vcoMin},
          {"VCOCLK_FREQ_MAX", l.vcoMax},
          {"CLKOUT_FREQ_MIN_GCLK", l.clkoutMin},
          {"CLKOUT_FREQ_MAX_GCLK", l.clkoutMax},
          {"CLKOUT_FREQ_MAX_IOCLK", l.clkoutMaxIo},
          {"CLKPFD_FREQ_MIN", l.pfdMin},
          {"CLKPFD_FREQ_MAX", l.pfdMax},
          {"TSYN_VCOCLK_FREQ_MIN", l.vcoMin},
          {"TSYN_VCOCLK_FREQ_MAX", l.vcoMax},
          {"TSYN_VCOCLK_FREQ_TARGET", l.vcoTarget},
          {"TSYN_CLKOUT_FREQ_MIN", l.clkoutMin},
          {"TSYN_CLKOUT_FREQ_MAX", l.clkoutMax},
          {"TSYN_CLKPFD_FREQ_MIN", l.pfdMin},
          {"TSYN_CLKPFD_FREQ_MAX", l.pfdMax},
          {"TSYN_CLKPFD_FREQ_MAX_LBW", l.maxPfdLowB},
          {"O_MAX_HT_LT", l.maxHighLowCount}};
}

constexpr const char* kCoefficients =
    "[grade.1.calculator]\nLOOP_KAPPA = 30\nLOOP_KAPPA_VCO = 1000\nLOOP_BANDWIDTH_LOW = 0.01\n"
    "LOOP_BANDWIDTH_OPTIMIZED = 0.02\nLOOP_BANDWIDTH_HIGH = 0.04\nLOOP_BUFFER_JITTER = 2\n"
    "LOOP_DETERMINISTIC_JITTER = 20\nLOOP_STATIC_OFFSET = 40\nLOOP_LEAKAGE = 40\n";

std::string FileOf(const std::string& name, const plain::PllLimits& limits, Random& random) {
  std::vector<Line> lines = LoopLines(limits);
  const compare::KruCase kru = compare::DrawKruCase(random);
  for (std::size_t i = 0; i < kru.periods.size(); ++i) {
    lines.push_back({compare::kKruKeywords[i], kru.periods[i]});
  }
  // What is missing ends the loading of limits half way.
  if (random.OneIn(2)) {
    const auto missing = random.Int(0, static_cast<int>(lines.size()) - 1);
    lines.erase(lines.begin() + missing);
  }
  std::string text = "device = \"" + name +
                     "\"\npackages = [\"p\"]\ndefault_grade = \"1\"\n[grade.1]\n";
  for (const Line& line : lines) {
    // Speed data are positive.
    if (!(line.value > 0.0)) continue;
    const std::string value = Number("%.17g", line.value);
    const bool is_whole = value.find_first_of(".e") == std::string::npos;
    text += line.keyword + " = " + value + (is_whole ? ".0" : "") + "\n";
  }
  return text + (random.OneIn(2) ? kCoefficients : "");
}

}  // namespace

std::vector<DrawnDevice> DrawDevices(int count, Random& random) {
  const std::vector<compare::Kind> kinds = {compare::Kind::kConstructed, compare::Kind::kCommon,
                                            compare::Kind::kShifted, compare::Kind::kSlowVco};
  std::vector<DrawnDevice> devices;
  for (int i = 0; i < count; ++i) {
    DrawnDevice device;
    device.name = "dut" + std::to_string(i);
    device.drawn = compare::DrawCase(random.Pick(kinds), random);
    device.file = FileOf(device.name, device.drawn.limits, random);
    devices.push_back(std::move(device));
  }
  return devices;
}

// A script does some things with one handle before it turns to another.
int ScriptGenerator::DrawHandle() {
  if (random_.OneIn(4)) last_handle_ = random_.Int(0, kHandles - 1);
  return last_handle_;
}

std::string ScriptGenerator::DrawFlag() {
  static const std::vector<std::string> flags = {"true", "true", "true", "false", "false",
                                                 "false", "1",    "yes",  "TRUE",  ""};
  return random_.Pick(flags);
}

std::string ScriptGenerator::DrawIndex() {
  static const std::vector<std::string> odd = {"", "x", "-1", "7", "1.9", "4294967297", "6x"};
  return random_.OneIn(5) ? random_.Pick(odd) : std::to_string(random_.Int(0, 7));
}

std::string ScriptGenerator::DrawNumber() {
  static const std::vector<std::string> odd = {"",    "abc", "0",   "-1",    "1e308", "inf",
                                               "nan", "1e9", "-0.0", "1e-300"};
  return random_.OneIn(5) ? random_.Pick(odd) : Number("%g", random_.Real(0, 200));
}

Words ScriptGenerator::DrawDevice() {
  static const std::vector<std::string> parts = {"vk40", "vk40",         "vk40-1", "vk10", "vk20",
                                                 "",     "vk40b256-1", "vk99",   "vk40-7"};
  switch (random_.Int(0, 5)) {
    case 0:
      return {"SetLowBandwidth", DrawFlag()};
    case 1:
      return {"SetVcoMinThreshold", DrawNumber()};
    case 2: {
      static const std::vector<std::string> keywords = {
          "VCOCLK_FREQ_MAX", "TSYN_VCOCLK_FREQ_TARGET", "O_MAX_HT_LT",
          "D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MINPERIOD", "", "NO_SUCH_KEY"};
      return {"GetSpdKeyValue", random_.Pick(keywords)};
    }
    default:
      if (random_.OneIn(2)) return {"SetDevice", random_.Pick(devices_).name};
      return {"SetDevice", random_.Pick(parts)};
  }
}

Words ScriptGenerator::DrawLoop() {
  const std::vector<compare::Kind> kinds = {compare::Kind::kCommon, compare::Kind::kConstructed,
                                            compare::Kind::kMeetingEnds, compare::Kind::kWild};
  // A request that belongs to one of the devices, or one of its own.
  plain::PllRequest request = random_.OneIn(3)
                                  ? random_.Pick(devices_).drawn.request
                                  : compare::DrawCase(random_.Pick(kinds), random_).request;
  Words words;
  if (request.closest) {
    words = {"GetClosestSolution", request.outFreqs, request.phases, request.dutyCycles};
  } else {
    const bool is_pll = request.prim == plain::kPrimPll;
    words = {is_pll ? "PLLCalculateActualOutFreqs" : "TSYNCalculateActualOutFreqs",
             request.outFreqs};
  }
  last_input_ = Number("%.17g", request.inFreq);
  words.push_back(last_input_);
  words.push_back(Number("%.17g", request.inFreq2));
  words.push_back(std::to_string(request.count));
  words.push_back(request.preferMaxVco ? "true" : "false");
  words.push_back(request.intDiv0Only ? "true" : "false");
  if (request.closest) words.push_back(request.prim == plain::kPrimPll ? "true" : "false");
  words.push_back(random_.OneIn(3) ? "true" : "false");
  return words;
}

Words ScriptGenerator::DrawKru() {
  const compare::KruCase drawn = compare::DrawKruCase(random_);
  last_input_ = Number("%.17g", drawn.request.inFreq);
  Words words = {drawn.clkgen ? "KruClkgenCalculateActuals" : "KruCalculateActuals",
                 drawn.request.outFreqs, drawn.request.phases, last_input_,
                 std::to_string(drawn.request.numOut)};
  if (!drawn.clkgen) words.push_back(drawn.request.feedbackUsed ? "true" : "false");
  words.push_back(random_.OneIn(3) ? "true" : "false");
  return words;
}

Words ScriptGenerator::DrawChosen() {
  static const std::vector<std::string> plain = {
      "GetChosenM",       "GetChosenMInt",     "GetChosenD",
      "GetChosenDiv0",    "GetChosenDiv0Int",  "GetChosenVCO",
      "GetKruChosenM",    "GetKruChosenD",     "GetKruChosenPhaseShift",
      "GetKruChosenPhaseOffset", "GetKruChosenClkdv", "GetKruChosenClkfxdv",
      "GetKruChosenDivBy2", "GetLatestPhase", "GetLatestDutyCycle"};
  static const std::vector<std::string> indexed = {"GetChosenDivN", "GetChosenOutFreqN",
                                                   "GetChosenPhaseN", "GetChosenDutyCycleN",
                                                   "GetKruChosenPinname"};
  switch (random_.Int(0, 4)) {
    case 0:
    case 1:
      return {random_.Pick(plain)};
    case 2:
      return {"GetKruChosenOutFreqN", random_.OneIn(3) ? DrawNumber() : last_input_, DrawIndex()};
    default:
      return {random_.Pick(indexed), DrawIndex()};
  }
}

Words ScriptGenerator::DrawTiming() {
  static const std::vector<std::string> bandwidths = {"LOW", "OPTIMIZED", "HIGH", "", "low"};
  static const std::vector<std::string> pins = {"CLK0",  "CLK90", "CLK180", "CLK270",  "CLK2X",
                                                "CLKFX", "CLKDV", "CLKFX180", "CLKFXDV", "NONE",
                                                "CLK2X180", ""};
  const auto n = [&](int low, int high) {
    return random_.OneIn(8) ? DrawNumber() : std::to_string(random_.Int(low, high));
  };
  const std::string& in = last_input_;
  switch (random_.Int(0, 7)) {
    case 0: return {"GetVcoFreq", in, n(4, 20), n(1, 3), n(0, 2)};
    case 1:
      return {"GetPLLPkToPkJitter", in, n(4, 20), n(1, 3), random_.Pick(bandwidths), n(1, 20),
              n(0, 50)};
    case 2:
      return {"GetKRUPkToPkJitter", in, random_.Pick(pins), DrawFlag(), DrawFlag(), DrawFlag(),
              n(2, 9), n(1, 9)};
    case 3:
      return {"GetKRU_CLKGENPkToPkJitter", in, random_.Pick(pins), DrawFlag(), DrawFlag(),
              DrawFlag(), n(2, 9), n(1, 9)};
    case 4: return {"GetPLLPhaseError", in, n(1, 20), random_.Pick(bandwidths)};
    case 5: return {"GetKRUPhaseError"};
    case 6:
      return {"GetKRUPeriodPhaseDutyCycle", in, random_.Pick(pins), DrawFlag(), n(1, 9), n(1, 9),
              n(0, 200)};
    default:
      return {"GetPLLPeriodPhaseDutyCycle", in, n(4, 20), n(1, 3), n(1, 20), n(0, 90), n(1, 99),
              n(0, 5)};
  }
}

Words ScriptGenerator::DrawSteps() {
  const std::string divider = random_.OneIn(4) ? Number("%g", random_.Real(0.5, 200))
                                               : Number("%g", 0.125 * random_.Int(0, 600));
  if (random_.OneIn(2)) {
    return {"TSYNCalculateActualPhase", Number("%g", random_.Real(-400, 400)), divider,
            DrawFlag()};
  }
  return {"TSYNCalculateActualDutyCycle", Number("%g", random_.Real(-5, 105)), divider,
          DrawFlag()};
}

Words ScriptGenerator::DrawWrong() {
  Words words = random_.OneIn(2) ? DrawChosen() : DrawKru();
  switch (random_.Int(0, 4)) {
    case 0: return {};
    case 1: words.pop_back(); break;
    case 2: words.push_back(DrawNumber()); break;
    case 3: words.front() += random_.OneIn(2) ? " " : "X"; break;
    default: words.front() = words.front().substr(0, words.front().size() / 2); break;
  }
  return words;
}

Step ScriptGenerator::Draw() {
  const int kind = random_.Int(0, 99);
  if (kind < 6) return {Step::Kind::kCreate, random_.Int(0, kHandles - 1), {}};
  if (kind < 8) {
    return {Step::Kind::kRename, DrawHandle(), {"clock" + std::to_string(random_.Int(0, 2))}};
  }
  if (kind < 10) return {Step::Kind::kDestroy, DrawHandle(), {}};
  if (kind < 24) return Call(DrawDevice());
  if (kind < 38) return Call(DrawLoop());
  if (kind < 52) return Call(DrawKru());
  if (kind < 80) return Call(DrawChosen());
  if (kind < 90) return Call(DrawTiming());
  if (kind < 94) return Call(DrawSteps());
  return Call(DrawWrong());
}

}  // namespace model
