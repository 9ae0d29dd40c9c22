#include "drawn.h"

#include <algorithm>
#include <cstddef>
#include <optional>
#include <vector>

#include "hardware/Kru.h"
#include "hardware/Loop.h"
#include "host/bundled/device/DeviceCatalogue.h"
#include "host/bundled/device/DeviceFile.h"
#include "planner/answer/Jitter.h"
#include "planner/device/FromFile.h"

namespace drawn {

namespace {

using hardware::Rational;
using planner::Output;

constexpr const char* kCoefficients = R"(
[grade.1.calculator]
LOOP_KAPPA = 30
LOOP_KAPPA_VCO = 1000
LOOP_BANDWIDTH_LOW = 0.01
LOOP_BANDWIDTH_OPTIMIZED = 0.02
LOOP_BANDWIDTH_HIGH = 0.04
LOOP_BUFFER_JITTER = 2
LOOP_DETERMINISTIC_JITTER = 20
LOOP_STATIC_OFFSET = 40
LOOP_LEAKAGE = 40
KRU_KAPPA = 60
KRU_TAP_STEP = 30
KRU_BUFFER_JITTER = 3
KRU_PHASE_ERROR = 150
)";

std::string Decimal(const Rational& value) { return value.Fixed(9); }
std::string Line(const std::string& keyword, const Rational& value) {
  return keyword + " = " + Decimal(value) + "\n";
}

// One of the values, or `value` times a factor between `low` and `high` percent.
Rational Near(Random& random, const Rational& value, int low, int high) {
  return value * Rational(random.Int(low * 10, high * 10), 1000);
}

std::string LoopText(Random& random, Primitive primitive, const Rational& input) {
  // A VCO that some M and D make, and a bit around it.
  const int d = random.Int(1, 3);
  Rational vco = input * random.Int(10, 40) / d;
  while (vco < 300) vco = vco * 2;
  while (vco > 1600) vco = vco / 2;
  const Rational lowest = random.OneIn(2) ? vco : Near(random, vco, 90, 99);
  const Rational highest = Near(random, vco, 100, 108);
  const Rational pfd_highest = random.OneIn(2) ? input : input * Rational(3, 2);
  const Rational pfd_lowest = input / random.Int(1, 4);
  const std::string prefix = primitive == Primitive::kTsyn ? "TSYN_" : "";
  std::string text = Line(prefix + "VCOCLK_FREQ_MIN", lowest) +
                     Line(prefix + "VCOCLK_FREQ_MAX", highest) +
                     Line(prefix + "CLKPFD_FREQ_MIN", pfd_lowest) +
                     Line(prefix + "CLKPFD_FREQ_MAX", pfd_highest);
  const int count = random.Pick(std::vector<int>{2, 4, 8, 16, 64, 64});
  text += "O_MAX_HT_LT = " + std::to_string(count) + "\n";
  const Rational out_lowest = random.OneIn(2) ? vco / (2 * count) : vco / random.Int(4, 20);
  const Rational out_highest = random.OneIn(2) ? vco / random.Int(1, 3) : vco;
  if (primitive == Primitive::kTsyn) {
    text += Line("TSYN_VCOCLK_FREQ_TARGET", (lowest + highest) / 2);
    text += Line("TSYN_CLKOUT_FREQ_MIN", out_lowest) + Line("TSYN_CLKOUT_FREQ_MAX", out_highest);
    text += Line("TSYN_CLKPFD_FREQ_MAX_LBW",
                 random.OneIn(2) ? pfd_highest : (pfd_lowest + pfd_highest) / 2);
  } else {
    text += Line("CLKOUT_FREQ_MIN_GCLK", out_lowest) + Line("CLKOUT_FREQ_MAX_GCLK", out_highest) +
            Line("CLKOUT_FREQ_MAX_IOCLK", std::max(out_highest, vco));
  }
  return text;
}

// The periods between which a frequency stays.
std::string PeriodLines(Random& random, const std::string& keyword, const Rational& frequency,
                        int wide) {
  const Rational period = Rational(1000) / frequency;
  std::string text = Line(keyword + "MINPERIOD", Near(random, period, 100 - wide, 100));
  if (keyword.find("2X") == std::string::npos || keyword.find("1X") != std::string::npos) {
    text += Line(keyword + "MAXPERIOD", Near(random, period, 100, 100 + wide));
  }
  return text;
}

std::string KruText(Random& random, Primitive primitive, const Rational& input) {
  const std::string start = "D_KRU_";
  const std::string one = "_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_";
  const std::string two = "_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_";
  // A narrow range of the synthesiser leaves few M and D.
  const Rational made = input * random.Int(2, 8) / random.Int(1, 7);
  std::string text = PeriodLines(random, start + "CLKFX" + one, made, 2);
  if (primitive == Primitive::kKruClkgen) {
    const Rational divided = made / random.Pick(std::vector<int>{2, 4, 8, 16, 32});
    return text + PeriodLines(random, start + "CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_", divided, 2);
  }
  text += PeriodLines(random, start + "CLK0" + one, input, 90);
  text += PeriodLines(random, start + "CLK0" + two, input, random.Pick(std::vector<int>{0, 60}));
  text += PeriodLines(random, start + "CLK90" + one, input, 60);
  text += PeriodLines(random, start + "CLK90" + two, input, random.Pick(std::vector<int>{0, 60}));
  text += PeriodLines(random, start + "CLK2X" + one, 2 * input, 60);
  const Rational divided = input / random.Int(2, 9);
  text += PeriodLines(random, start + "CLKDV" + one, divided, 25);
  text += PeriodLines(random, start + "CLKDV" + two, divided, 25);
  return text;
}

// --- Requests ----------------------------------------------------------------------------------

// The settings behind a request, most of whose outputs they make exactly.
struct Behind {
  planner::KruSettings kru;
  Rational vco;
};

Behind DrawBehind(Random& random, Primitive primitive, const Device& device,
                  const Rational& input) {
  Behind behind;
  if (hardware::IsLoop(primitive)) {
    const planner::LoopLimits& limits = device.Loop(primitive);
    // An M near an end of the VCO's range.
    const int d = random.Int(1, 3);
    const Rational end = random.OneIn(2) ? limits.vco.lowest : limits.vco.highest;
    Rational m = (end * d / input).Round();
    if (primitive == Primitive::kTsyn && random.OneIn(3)) m += Rational(random.Int(-8, 8), 8);
    behind.vco = m > 0 ? input * m / d : end;
    return behind;
  }
  using hardware::Pin;
  const planner::PinLimits& limits = device.Pins(primitive);
  const bool is_sp = primitive == Primitive::kKruSp;
  const auto is_in_range = [&](Pin pin) {
    return limits.Of(pin, false).Contains(input * PinRatio(pin, behind.kru.Ratios()));
  };
  const std::vector<int> divides = is_sp ? std::vector<int>{4, 5, 6, 7, 8, 10, 13, 16, 18}
                                         : std::vector<int>{4, 8, 16, 32, 64};
  behind.kru.primitive = primitive;
  behind.kru.divide_by_2 = is_sp && random.OneIn(3);
  // Of some M, D and divides those with which the synthesiser and the divider are in their ranges,
  // if there are any.
  for (int tries = 0; tries < 200; ++tries) {
    behind.kru.m = random.Int(2, 12);
    behind.kru.d = random.Int(1, 12);
    if (is_in_range(Pin::kClkfx)) break;
  }
  for (int tries = 0; tries < 20; ++tries) {
    behind.kru.divide_halves = random.Pick(divides);
    if (is_in_range(is_sp ? Pin::kClkdv : Pin::kClkfxdv)) break;
  }
  return behind;
}

Rational Makeable(Random& random, const Behind& behind, Primitive primitive, int output,
                  const Rational& input) {
  if (hardware::IsLoop(primitive)) return behind.vco / random.Int(1, 12);
  using hardware::Pin;
  const std::vector<Pin> sp = {Pin::kClk0, Pin::kClk2x, Pin::kClkdv, Pin::kClkfx};
  const std::vector<Pin> clkgen = {Pin::kClkfx, Pin::kClkfxdv};
  const Pin pin = primitive == Primitive::kKruSp ? random.Pick(sp)
                  : output == 0                  ? Pin::kClkfx
                                                 : random.Pick(clkgen);
  return input * PinRatio(pin, behind.kru.Ratios());
}

Rational Frequency(Random& random, const Behind& behind, Primitive primitive, const Device& device,
                   int output, const Rational& input) {
  if (random.OneIn(6)) return Rational(random.Int(1, 4000), random.Pick(std::vector<int>{4, 7, 10}));
  if (random.OneIn(6) && hardware::IsLoop(primitive)) {
    const planner::LoopLimits& limits = device.Loop(primitive);
    const planner::Range& range = random.OneIn(2) ? limits.output : limits.vco;
    return random.OneIn(2) ? range.lowest : range.highest;
  }
  return Makeable(random, behind, primitive, output, input);
}

void DrawShape(Random& random, bool with_duty, Output* output) {
  const std::vector<Rational> phases = {0,   45,  90,   180, 270,  -90, Rational(45, 2), 33,
                                        120, 360, -360, 1,   -180, 10,  Rational(1441, 17)};
  const std::vector<Rational> duties = {50, 25, 40, 75, Rational(100, 3), 1, 100, 55};
  const std::vector<Rational> tolerances = {0, Rational(1, 2), 5, 30, Rational(1, 100)};
  if (random.OneIn(2)) output->phase = random.Pick(phases);
  if (with_duty && random.OneIn(2)) output->duty = random.Pick(duties);
  if (random.OneIn(2)) output->phase_tolerance = random.Pick(tolerances);
  if (random.OneIn(2)) output->duty_tolerance = random.Pick(tolerances);
}

// A jitter that some settings have, or a round one.
Rational JitterDemand(Random& random, Primitive primitive, const Device& device,
                      const Request& request) {
  if (random.OneIn(2)) return random.Pick(std::vector<Rational>{0, 80, 120, 150, 200, 300, 1000});
  double jitter = planner::answer::kUnknownJitter;
  if (hardware::IsLoop(primitive)) {
    const int m = random.Int(5, 40) * 8;
    jitter = planner::answer::LoopJitter(device, request)
                 .PeakToPeak(m, random.Int(1, 3), hardware::Bandwidth::kHigh);
  } else {
    const planner::KruSettings settings{
        .primitive = primitive, .feedback = true, .m = 3, .d = 2, .pins = {}};
    jitter = planner::answer::KruJitter(device, request, primitive)
                 .PeakToPeak(settings, primitive == Primitive::kKruSp ? hardware::Pin::kClk0
                                                                      : hardware::Pin::kClkfx);
  }
  return jitter == planner::answer::kUnknownJitter ? Rational(100) : Rational::FromDouble(jitter);
}

}  // namespace

Device DeviceOf(const std::string& text) {
  const auto file = ::Device::DeviceFile::Parse(
      "device = \"dev\"\npackages = [\"p\"]\n[grade.1]\n" + text, "dev.toml", "dev");
  return planner::device::FromFile(file, "p", "1");
}

Device Bundled(const std::string& name, const std::string& grade) {
  const auto catalogue = ::Device::DeviceCatalogue::ListFolders({BUNDLED_DEVICES});
  const auto file = ::Device::DeviceFile::Read(*catalogue.FindFile(name), name);
  return planner::device::FromFile(file, "", grade);
}

Device SmallDevice(Random& random, Primitive primitive, const Rational& input) {
  std::string text = hardware::IsLoop(primitive) ? LoopText(random, primitive, input)
                                                 : KruText(random, primitive, input);
  if (!random.OneIn(6)) text += kCoefficients;
  return DeviceOf(text);
}

Rational Input(Random& random) {
  const std::vector<Rational> usual = {100, 27, 50, 25, 125, 24, 200, 33, Rational(33333, 1000),
                                       Rational(297, 4), Rational(100, 3), Rational(245760, 10000)};
  if (random.OneIn(5)) return Rational(random.Int(20000, 300000), 1000);
  return random.Pick(usual);
}

Request RequestFor(Random& random, const Device& device, Primitive primitive, const Rational& input,
                   int most_outputs) {
  Request request;
  request.inputs = {input};
  const bool is_loop = hardware::IsLoop(primitive);
  if (is_loop && random.OneIn(4)) {
    request.inputs.push_back(random.OneIn(2) ? Near(random, input, 97, 103) : input);
  }
  request.input_jitter = random.Pick(std::vector<Rational>{0, 0, 50, 300, Rational(1, 3)});
  request.tolerance =
      random.Pick(std::vector<Rational>{100, 100, 0, 1, 20, 1000, 20000, 200000, 1500000});
  if (random.OneIn(3)) {
    request.rank = random.Pick(std::vector<planner::Rank>{
        planner::Rank::kError, planner::Rank::kMargin, planner::Rank::kVco});
  }
  request.prefer_max_vco = random.OneIn(4);
  request.whole_divider_0 = random.OneIn(5);
  request.feedback = random.OneIn(3);
  if (is_loop && random.OneIn(4)) {
    request.bandwidth = random.Pick(std::vector<hardware::Bandwidth>(
        hardware::kBandwidths.begin(), hardware::kBandwidths.end()));
  }
  const int outputs = random.Int(1, most_outputs);
  const bool shaped = random.OneIn(2);
  const bool with_jitter = random.OneIn(4);
  const Rational million = 1000000;
  const Behind behind = DrawBehind(random, primitive, device, input);
  for (int i = 0; i < outputs; ++i) {
    Output output;
    output.frequency = Frequency(random, behind, primitive, device, i, input);
    if (random.OneIn(4)) {
      output.tolerance = random.Pick(std::vector<Rational>{0, 50, 300, 5000, 100000});
    }
    // Just within the tolerance, one way or the other.
    const Rational& tolerance = request.ToleranceOf(output);
    if (random.OneIn(6) && tolerance < million) {
      output.frequency =
          output.frequency / (1 + (random.OneIn(2) ? tolerance : -tolerance) / million);
    }
    if (shaped && !random.OneIn(3)) DrawShape(random, is_loop || random.OneIn(3), &output);
    if (with_jitter && random.OneIn(2)) {
      output.max_jitter = JitterDemand(random, primitive, device, request);
    }
    request.outputs.push_back(output);
  }
  if (with_jitter && random.OneIn(3)) {
    request.max_jitter = JitterDemand(random, primitive, device, request);
  }
  // A place that stays empty, but not all of them.
  const std::size_t unused = static_cast<std::size_t>(random.Int(0, outputs - 1));
  if (outputs > 1 && random.OneIn(5)) request.outputs[unused].used = false;
  return request;
}

std::string TextOf(const Request& request) {
  const auto text = [](const Rational& value) {
    return value.NumeratorText() + "/" + value.DenominatorText();
  };
  std::string all = "inputs";
  for (const Rational& input : request.inputs) all += " " + text(input);
  all += " jitter " + text(request.input_jitter) + " tolerance " + text(request.tolerance);
  if (request.input_tolerance != 0) all += " input tolerance " + text(request.input_tolerance);
  if (request.max_jitter) all += " max jitter " + text(*request.max_jitter);
  if (request.bandwidth) all += " " + std::string(Name(*request.bandwidth));
  all += " rank " + std::to_string(static_cast<int>(request.rank));
  if (request.feedback) all += " feedback";
  if (request.whole_divider_0) all += " whole";
  if (request.prefer_max_vco) all += " max VCO";
  for (const Output& output : request.outputs) {
    all += output.used ? "\n  output " : "\n  unused ";
    all += text(output.frequency);
    if (output.tolerance) all += " tolerance " + text(*output.tolerance);
    if (output.phase) all += " phase " + text(*output.phase);
    if (output.phase_tolerance) all += " tolerance " + text(*output.phase_tolerance);
    if (output.duty) all += " duty " + text(*output.duty);
    if (output.duty_tolerance) all += " tolerance " + text(*output.duty_tolerance);
    if (output.max_jitter) all += " max jitter " + text(*output.max_jitter);
  }
  return all;
}

}  // namespace drawn
