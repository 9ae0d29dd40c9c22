// Tested by reach_test.cpp.
#include "planner/reach/LoopPoints.h"

#include <algorithm>
#include <cmath>
#include <numeric>
#include <tuple>
#include <unordered_set>
#include <utility>

#include "hardware/Loop.h"
#include "planner/answer/Jitter.h"
#include "planner/search/LoopGrid.h"
#include "planner/search/RatioRange.h"

namespace planner::reach {

namespace {

using hardware::kEighths;
using search::RatioRange;

// The steps of a divider, of `first` to `last`, that keep a range of ratios.
std::pair<int, int> StepsWithin(const RatioRange& range, int m, std::int64_t d, int first,
                                int last) {
  // Doubles are near enough to begin with; the comparison decides.
  const double ratio = RatioOf(m, d);
  if (range.Highest() <= 0) return {1, 0};
  const double low = ratio / range.Highest() - 1;
  if (low > first) first = low < last ? static_cast<int>(low) : last + 1;
  while (first <= last && !range.IsNotAbove(m, d * first)) ++first;
  if (range.Lowest() > 0) {
    const double high = ratio / range.Lowest() + 2;
    if (high < last) last = static_cast<int>(high);
  }
  while (first <= last && !range.IsNotBelow(m, d * last)) --last;
  return {first, last};
}

}  // namespace

LoopPoints::LoopPoints(const Request& request, const Device& device, Primitive primitive,
                       std::size_t window)
    : primitive_(primitive), outputs_(request.outputs.size()), window_(window) {
  const LoopLimits& limits = device.Loop(primitive);
  const bool fractions =
      hardware::HasFractions(primitive, static_cast<int>(outputs_), request.whole_divider_0);
  // Only output 0 has dividers in eighths.
  step_ = fractions && outputs_ == 1 ? 1 : kEighths;
  for (const Bandwidth bandwidth : hardware::kBandwidths) {
    if (request.bandwidth && *request.bandwidth != bandwidth) continue;
    AddVcos(bandwidth, request.inputs, limits, fractions, request, device);
  }
  KeepPreferred();
  const RatioRange range(search::InputsOf(request.inputs),
                         limits.OutputOf(static_cast<int>(outputs_) - 1));
  const int largest = hardware::LargestDivider(limits.max_count) * kEighths / step_;
  for (Vco& vco : vcos_) {
    std::tie(vco.first, vco.last) =
        StepsWithin(range, vco.m, std::int64_t{vco.d} * step_, kEighths / step_, largest);
  }
}

void LoopPoints::AddVcos(Bandwidth bandwidth, const std::vector<Rational>& inputs,
                         const LoopLimits& limits, bool fractions, const Request& request,
                         const Device& device) {
  const answer::LoopJitter jitter(device, request);
  const search::LoopGrid grid =
      LoopGridOf(search::InputsOf(inputs), search::MSetOf(primitive_, fractions),
                 hardware::kLargestD, limits.vco, limits.PfdOf(bandwidth));
  const auto add = [&](int m, int d) {
    vcos_.push_back({m, d, bandwidth, jitter.PeakToPeak(m, d, bandwidth), 0, 0});
  };
  for (const search::Row& row : grid.rows) {
    if (row.one) add(kEighths, row.d);
    for (int m = row.first; m <= row.last; m += grid.step) add(m, row.d);
  }
}

// Sorts as answers to one output are ranked: the least jitter, then the lowest VCO, and so on. Of
// each VCO frequency the first is enough.
void LoopPoints::KeepPreferred() {
  const auto key = [](const Vco& vco) {
    return std::tuple(vco.jitter, vco.Ratio(), static_cast<int>(vco.bandwidth), vco.d, vco.m);
  };
  std::sort(vcos_.begin(), vcos_.end(),
            [&](const Vco& a, const Vco& b) { return key(a) < key(b); });
  std::unordered_set<double> seen;
  std::erase_if(vcos_, [&](const Vco& vco) { return !seen.insert(vco.Ratio()).second; });
}

// There is none between 1 and 2.
bool LoopPoints::IsDivider(int step) const {
  const int divider = step * step_;
  return divider == kEighths || divider >= hardware::kSmallestFractionalDivider * kEighths;
}

bool LoopPoints::ForEach(const Range& ratios, const Take& take) const {
  const RatioRange range({1, 1}, ratios);
  std::vector<Stretch> stretches;
  double lowest = HUGE_VAL;
  double highest = 0;
  for (std::size_t i = 0; i < vcos_.size(); ++i) {
    const Vco& vco = vcos_[i];
    const auto [first, last] =
        StepsWithin(range, vco.m, std::int64_t{vco.d} * step_, vco.first, vco.last);
    if (first > last) continue;
    stretches.push_back({i, first, last});
    lowest = std::min(lowest, RatioWith(vco, last));
    highest = std::max(highest, RatioWith(vco, first));
  }
  if (stretches.empty()) return true;
  return Tell(stretches, std::nextafter(lowest, 0), highest, take);
}

// The dividers with ratios above `lowest` and up to `highest`.
std::vector<LoopPoints::Stretch> LoopPoints::Within(const std::vector<Stretch>& all, double lowest,
                                                    double highest) const {
  std::vector<Stretch> within;
  for (Stretch one : all) {
    const Vco& vco = vcos_[one.vco];
    const double whole = vco.Ratio() / step_;
    one.first = std::max(one.first, static_cast<int>(std::min(whole / highest - 1, 1e6)));
    while (one.first <= one.last && RatioWith(vco, one.first) > highest) ++one.first;
    one.last = static_cast<int>(std::min<double>(one.last, whole / lowest + 1));
    while (one.first <= one.last && RatioWith(vco, one.last) <= lowest) --one.last;
    if (one.first <= one.last) within.push_back(one);
  }
  return within;
}

// Halves what is too much at once.
bool LoopPoints::Tell(const std::vector<Stretch>& stretches, double lowest, double highest,
                      const Take& take) const {
  std::size_t count = 0;
  for (const Stretch& one : stretches) count += static_cast<std::size_t>(one.last - one.first) + 1;
  const double middle = std::sqrt(lowest * highest);
  // With a window of one point there is nothing to halve.
  if (count <= window_ || middle <= lowest || middle >= highest) {
    return TellWindow(stretches, take);
  }
  return Tell(Within(stretches, lowest, middle), lowest, middle, take) &&
         Tell(Within(stretches, middle, highest), middle, highest, take);
}

bool LoopPoints::TellWindow(const std::vector<Stretch>& stretches, const Take& take) const {
  std::vector<Made> made;
  for (const Stretch& one : stretches) {
    for (int step = one.first; step <= one.last; ++step) {
      if (!IsDivider(step)) continue;
      made.push_back({RatioWith(vcos_[one.vco], step), static_cast<std::uint32_t>(one.vco)});
    }
  }
  std::sort(made.begin(), made.end(), [](const Made& a, const Made& b) {
    return a.ratio != b.ratio ? a.ratio < b.ratio : a.vco < b.vco;
  });
  double last = 0;
  for (const Made& one : made) {
    if (one.ratio == last) continue;
    last = one.ratio;
    const Vco& vco = vcos_[one.vco];
    Point point;
    point.source = one.vco;
    point.divider = static_cast<int>(std::lround(vco.Ratio() / one.ratio));
    point.multiply = vco.m;
    point.divide = std::int64_t{vco.d} * point.divider;
    const std::int64_t common = std::gcd(point.multiply, point.divide);
    point.multiply /= common;
    point.divide /= common;
    if (!take(point)) return false;
  }
  return true;
}

Settings LoopPoints::SettingsOf(const Point& point) const {
  const Vco& vco = vcos_[point.source];
  LoopSettings settings;
  settings.primitive = primitive_;
  settings.bandwidth = vco.bandwidth;
  settings.m = vco.m;
  settings.d = vco.d;
  settings.outputs.resize(outputs_);
  settings.outputs.back().divider = point.divider;
  return settings;
}

}  // namespace planner::reach
