#include "tests/cost/Device.h"

#include <algorithm>
#include <cmath>
#include <fstream>
#include <sstream>

#include "planner/device/Check.h"

namespace cost {
namespace {

using compare::Number;
using compare::Random;
using Limit = double plain::PllLimits::*;

constexpr const char* kHead = "device = \"dev\"\npackages = [\"p\"]\ndefault_package = \"p\"\n"
                              "default_grade = \"g\"\n[grade.g]\n";

struct Keyword {
  const char* name;
  Limit limit;
};
using Keywords = std::vector<Keyword>;

const Keywords& KeywordsOf(int prim) {
  using L = plain::PllLimits;
  static const Keywords pll = {
      {"VCOCLK_FREQ_MIN", &L::vcoMin},         {"VCOCLK_FREQ_MAX", &L::vcoMax},
      {"CLKOUT_FREQ_MIN_GCLK", &L::clkoutMin}, {"CLKOUT_FREQ_MAX_GCLK", &L::clkoutMax},
      {"CLKPFD_FREQ_MIN", &L::pfdMin},         {"CLKPFD_FREQ_MAX", &L::pfdMax},
      {"O_MAX_HT_LT", &L::maxHighLowCount},    {"CLKOUT_FREQ_MAX_IOCLK", &L::clkoutMaxIo}};
  static const Keywords tsyn = {
      {"TSYN_VCOCLK_FREQ_MIN", &L::vcoMin},       {"TSYN_VCOCLK_FREQ_MAX", &L::vcoMax},
      {"TSYN_CLKOUT_FREQ_MIN", &L::clkoutMin},    {"TSYN_CLKOUT_FREQ_MAX", &L::clkoutMax},
      {"TSYN_CLKPFD_FREQ_MIN", &L::pfdMin},       {"TSYN_CLKPFD_FREQ_MAX", &L::pfdMax},
      {"TSYN_VCOCLK_FREQ_TARGET", &L::vcoTarget}, {"O_MAX_HT_LT", &L::maxHighLowCount},
      {"TSYN_CLKPFD_FREQ_MAX_LBW", &L::maxPfdLowB}};
  return prim == plain::kPrimPll ? pll : tsyn;
}

std::string Line(const char* keyword, double value) {
  return std::string(keyword) + " = " + Number("%.17e", value) + "\n";
}

// A number from `low` to `high`, of each size equally often; now and then an end.
double DrawSize(double low, double high, Random& random) {
  if (random.OneIn(8)) return low;
  if (random.OneIn(8)) return high;
  return low * std::pow(high / low, random.Real(0, 1));
}

}  // namespace

Verdict Check(const Device& device) {
  using planner::device::DoubtKind;
  const planner::device::Checked checked =
      planner::device::Check(FileOf(device), std::string(kName) + ".toml", kName);
  Verdict verdict;
  verdict.isAccepted = checked.mistakes.empty() && checked.doubts.empty();
  verdict.isLong = std::any_of(checked.doubts.begin(), checked.doubts.end(), [](const auto& doubt) {
    return doubt.kind == DoubtKind::kLongSearch;
  });
  return verdict;
}

std::vector<Device> ReadDevices(const std::string& path, const std::string& name) {
  std::ostringstream text;
  text << std::ifstream(path).rdbuf();
  const planner::device::Checked checked = planner::device::Check(text.str(), path, name);
  std::vector<Device> devices;
  for (const planner::device::GradeDescription& grade : checked.description.grades) {
    for (const int prim : {plain::kPrimPll, plain::kPrimTsyn}) {
      Device device;
      device.prim = prim;
      bool isThere = true;
      for (const Keyword& keyword : KeywordsOf(prim)) {
        const planner::device::Limit* const limit = grade.Find(keyword.name);
        isThere = isThere && limit != nullptr;
        if (limit != nullptr) device.limits.*keyword.limit = limit->value.ToDouble();
      }
      if (isThere) devices.push_back(device);
    }
  }
  return devices;
}

Device DrawDevice(double slowest, double fastest, Random& random) {
  Device device;
  device.prim = random.OneIn(3) ? plain::kPrimPll : plain::kPrimTsyn;
  plain::PllLimits& limits = device.limits;
  limits.vcoMin = DrawSize(slowest, 0.9 * fastest, random);
  limits.vcoMax = DrawSize(limits.vcoMin, fastest, random);
  // From a PFD of less the VCO cannot be had, and of the ends of ranges that nothing comes to
  // `check` warns.
  const double leastPfd = limits.vcoMax / 60;
  limits.pfdMax = DrawSize(leastPfd, 5 * limits.vcoMax, random);
  limits.pfdMin = DrawSize(1e-4 * leastPfd, std::min(limits.pfdMax, limits.vcoMax), random);
  limits.maxPfdLowB = DrawSize(limits.pfdMin, limits.pfdMax, random);
  limits.clkoutMax = DrawSize(limits.vcoMin / 100, 5 * limits.vcoMax, random);
  limits.clkoutMaxIo = DrawSize(limits.clkoutMax, 5 * limits.vcoMax, random);
  limits.clkoutMin =
      DrawSize(1e-3 * limits.clkoutMax, std::min(limits.clkoutMax, limits.vcoMax), random);
  limits.vcoTarget = random.Real(limits.vcoMin, limits.vcoMax);
  limits.maxHighLowCount = random.Int(64, 200);
  return device;
}

std::string FileOf(const Device& device) {
  std::string text = kHead;
  for (const Keyword& keyword : KeywordsOf(device.prim)) {
    text += Line(keyword.name, device.limits.*keyword.limit);
  }
  return text;
}

std::string FileOf(const compare::KruCase& drawn) {
  std::string text = kHead;
  for (std::size_t i = 0; i < compare::kKruKeywords.size(); ++i) {
    text += Line(compare::kKruKeywords[i], drawn.periods[i]);
  }
  return text;
}

}  // namespace cost
