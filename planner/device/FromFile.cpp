#include "planner/device/FromFile.h"

#include <algorithm>
#include <stdexcept>
#include <string>

#include "hardware/Loop.h"
#include "host/bundled/device/DeviceFile.h"
#include "planner/device/Decimal.h"
#include "planner/device/SpeedData.h"

namespace planner::device {
namespace {

// Counts of VCO periods above this one make no difference to any divider.
constexpr int kLargestCount = 1'000'000;

// The figures of a grade by keyword.
class Figures {
 public:
  explicit Figures(const ::Device::Grade& grade) : grade_(grade) {}

  std::optional<Rational> Find(std::string_view keyword) const {
    const auto index = ::Device::FindKeyword(keyword);
    return index ? ExactFigure(grade_, *index) : std::nullopt;
  }
  // One that is there.
  Rational Of(std::string_view keyword) const { return *Find(keyword); }
  // That of a period in ns, as a frequency in MHz.
  Rational Frequency(std::string_view keyword) const { return Rational(1000) / Of(keyword); }

 private:
  const ::Device::Grade& grade_;
};

// O_MAX_HT_LT; a fraction of a period is none that a counter could count.
int MaxCount(const Figures& figures) {
  const Rational count = figures.Of("O_MAX_HT_LT").Floor();
  if (count >= Rational(kLargestCount)) return kLargestCount;
  return static_cast<int>(*count.Whole());
}

LoopLimits PllLimits(const Figures& figures) {
  LoopLimits limits;
  limits.vco = {figures.Of("VCOCLK_FREQ_MIN"), figures.Of("VCOCLK_FREQ_MAX")};
  limits.pfd = {figures.Of("CLKPFD_FREQ_MIN"), figures.Of("CLKPFD_FREQ_MAX")};
  limits.pfd_low = {limits.pfd.lowest,
                    std::min(limits.pfd.highest, Rational(hardware::kPllLowBandwidthPfd))};
  limits.output = {figures.Of("CLKOUT_FREQ_MIN_GCLK"), figures.Of("CLKOUT_FREQ_MAX_GCLK")};
  limits.output_1 = {limits.output.lowest, figures.Of("CLKOUT_FREQ_MAX_IOCLK")};
  limits.max_count = MaxCount(figures);
  return limits;
}

LoopLimits TsynLimits(const Figures& figures) {
  LoopLimits limits;
  limits.vco = {figures.Of("TSYN_VCOCLK_FREQ_MIN"), figures.Of("TSYN_VCOCLK_FREQ_MAX")};
  limits.pfd = {figures.Of("TSYN_CLKPFD_FREQ_MIN"), figures.Of("TSYN_CLKPFD_FREQ_MAX")};
  limits.pfd_low = {limits.pfd.lowest,
                    std::min(limits.pfd.highest, figures.Of("TSYN_CLKPFD_FREQ_MAX_LBW"))};
  limits.output = {figures.Of("TSYN_CLKOUT_FREQ_MIN"), figures.Of("TSYN_CLKOUT_FREQ_MAX")};
  limits.output_1 = limits.output;
  limits.max_count = MaxCount(figures);
  limits.vco_target = figures.Of("TSYN_VCOCLK_FREQ_TARGET");
  return limits;
}

// How the keywords of a pin begin.
std::string Stem(std::string_view pin) {
  return "D_KRU_" + std::string(pin) + "_CLKIN_DIVIDE_BY_2_FALSE_";
}

// The limits of those pins that stand for a family. A pin without a period of its own for the
// feedback from CLK2X has the usual one.
PinLimits LimitsOfPins(const Figures& figures, bool hardware::PinFacts::*is_there) {
  PinLimits limits;
  for (const hardware::PinFacts& pin : hardware::kPins) {
    if (!(pin.*is_there) || pin.name != pin.limits) continue;
    const bool has_feedback = pin.pin != hardware::Pin::kClkfxdv;
    const std::string usual = Stem(pin.name) + (has_feedback ? "CLK_FEEDBACK_1X_" : "");
    Range range = {figures.Frequency(usual + "MAXPERIOD"), figures.Frequency(usual + "MINPERIOD")};
    limits.usual[std::string(pin.name)] = range;
    if (const auto period = figures.Find(Stem(pin.name) + "CLK_FEEDBACK_2X_MINPERIOD")) {
      range.highest = Rational(1000) / *period;
    }
    limits.doubled[std::string(pin.name)] = range;
  }
  return limits;
}

const ::Device::Grade& GradeOf(const ::Device::DeviceFile& file, std::string_view package,
                               std::string_view grade) {
  if (!package.empty() && !file.HasPackage(package)) {
    throw std::invalid_argument("device " + file.device + " has no package " +
                                std::string(package));
  }
  const ::Device::Grade* const found = file.FindGrade(grade);
  if (found == nullptr) {
    throw std::invalid_argument("device " + file.device + " has no grade " + std::string(grade));
  }
  return *found;
}

}  // namespace

planner::Device FromFile(const ::Device::DeviceFile& file, std::string_view package,
                         std::string_view grade) {
  const ::Device::Grade& data = GradeOf(file, package, grade);
  const Figures figures(data);
  planner::Device device;
  device.name = file.device;
  device.package = package;
  device.grade = grade;
  device.part = file.device + device.package + '-' + device.grade;
  for (const Primitive primitive : hardware::kPrimitives) {
    if (data.Has(HostPrimitive(primitive))) device.primitives.push_back(primitive);
  }
  if (device.Has(Primitive::kPll)) device.pll = PllLimits(figures);
  if (device.Has(Primitive::kTsyn)) device.tsyn = TsynLimits(figures);
  if (device.Has(Primitive::kKruSp)) {
    device.kru_sp = LimitsOfPins(figures, &hardware::PinFacts::is_sp);
  }
  if (device.Has(Primitive::kKruClkgen)) {
    device.kru_clkgen = LimitsOfPins(figures, &hardware::PinFacts::is_clkgen);
  }
  device.has_loop_jitter = data.Has(::Device::CoefficientGroup::kLoop);
  device.has_kru_jitter = data.Has(::Device::CoefficientGroup::kKru);
  device.speed_data = std::make_shared<const SpeedData>(file, grade);
  return device;
}

}  // namespace planner::device
