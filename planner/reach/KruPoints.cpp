// Tested by reach_test.cpp.
#include "planner/reach/KruPoints.h"

#include <algorithm>
#include <numeric>
#include <tuple>

#include "planner/search/RatioRange.h"

namespace planner::reach {

namespace {

using hardware::Pin;
using hardware::PinFacts;
using hardware::PinSource;

constexpr int kHalves = 2;

}  // namespace

// Tries all pins with all settings.
class KruPoints::Maker {
 public:
  Maker(const Request& request, const Device& device, Primitive primitive, KruPoints* points)
      : request_(request),
        limits_(device.Pins(primitive)),
        is_sp_(primitive == Primitive::kKruSp),
        output_(request.outputs.size() - 1),
        largest_(hardware::LargestKruRatioPart(primitive)),
        jitter_(device, request, primitive),
        points_(*points) {}

  void Make() {
    for (const bool feedback : {false, true}) {
      if (is_sp_ ? request_.feedback && !feedback : feedback) continue;
      for (const bool divide_by_2 : {false, true}) {
        if (divide_by_2 && !is_sp_) continue;
        for (const PinFacts& facts : hardware::kPins) {
          if (CanBeOn(facts, feedback)) MakePin(facts, feedback, divide_by_2);
        }
      }
    }
  }

 private:
  bool CanBeOn(const PinFacts& facts, bool feedback) const {
    if (!(is_sp_ ? facts.is_sp : facts.is_clkgen) || (facts.needs_feedback && !feedback)) {
      return false;
    }
    // Output 0 of a KRU_CLKGEN is on CLKFX.
    return is_sp_ || output_ != 0 || facts.pin == Pin::kClkfx;
  }

  void MakePin(const PinFacts& facts, bool feedback, bool divide_by_2) {
    // With output 0 on CLK2X, the feedback comes from there.
    const bool doubled = is_sp_ && output_ == 0 && facts.pin == Pin::kClk2x;
    const search::RatioRange range(search::InputsOf(request_.inputs),
                                   limits_.Of(facts.pin, doubled));
    const std::int64_t line = divide_by_2 ? 2 : 1;
    Made made{};
    made.feedback = feedback;
    made.divide_by_2 = divide_by_2;
    made.pin = facts.pin;
    switch (facts.source) {
      case PinSource::kLine:
        return Add(made, 1, line, range);
      case PinSource::kDoubler:
        return Add(made, 2, line, range);
      case PinSource::kDivider:
        for (const int halves : hardware::kClkdvHalves) {
          made.divide_halves = halves;
          Add(made, kHalves, line * halves, range);
        }
        return;
      case PinSource::kSynthesiser:
      case PinSource::kDividedSynthesiser:
        break;
    }
    for (made.d = 1; made.d <= largest_; ++made.d) {
      for (made.m = hardware::kSmallestKruM; made.m <= largest_; ++made.m) {
        if (facts.source == PinSource::kSynthesiser) {
          Add(made, made.m, line * made.d, range);
          continue;
        }
        for (const int halves : hardware::kClkfxdvHalves) {
          made.divide_halves = halves;
          Add(made, std::int64_t{kHalves} * made.m, line * made.d * halves, range);
        }
      }
    }
  }

  void Add(Made made, std::int64_t multiply, std::int64_t divide, const search::RatioRange& range) {
    if (!range.Contains(multiply, divide)) return;
    const std::int64_t common = std::gcd(multiply, divide);
    made.multiply = multiply / common;
    made.divide = divide / common;
    made.ratio = RatioOf(multiply, divide);
    settings_ = std::get<KruSettings>(points_.SettingsOf(made));
    made.jitter = jitter_.PeakToPeak(settings_, made.pin);
    points_.all_.push_back(made);
  }

  const Request& request_;
  const PinLimits& limits_;
  bool is_sp_;
  std::size_t output_;
  int largest_;
  answer::KruJitter jitter_;
  KruPoints& points_;
  KruSettings settings_;
};

// As answers to one output are ranked: the least jitter, and then as answer::CompareSettings has
// it.
KruPoints::KruPoints(const Request& request, const Device& device, Primitive primitive)
    : primitive_(primitive), outputs_(request.outputs.size()) {
  Maker(request, device, primitive, this).Make();
  const auto key = [](const Made& one) {
    return std::tuple(one.ratio, one.jitter, one.feedback, one.divide_by_2, one.d, one.m,
                      one.divide_halves, static_cast<int>(one.pin));
  };
  std::sort(all_.begin(), all_.end(),
            [&](const Made& a, const Made& b) { return key(a) < key(b); });
  all_.erase(std::unique(all_.begin(), all_.end(),
                         [](const Made& a, const Made& b) { return a.ratio == b.ratio; }),
             all_.end());
}

bool KruPoints::ForEach(const Range& ratios, const Take& take) const {
  const search::RatioRange range({1, 1}, ratios);
  const auto first = std::partition_point(all_.begin(), all_.end(), [&](const Made& one) {
    return !range.IsNotBelow(one.multiply, one.divide);
  });
  for (auto one = first; one != all_.end(); ++one) {
    if (!range.IsNotAbove(one->multiply, one->divide)) break;
    Point point;
    point.multiply = one->multiply;
    point.divide = one->divide;
    point.source = static_cast<std::size_t>(one - all_.begin());
    if (!take(point)) return false;
  }
  return true;
}

Settings KruPoints::SettingsOf(const Point& point) const { return SettingsOf(all_[point.source]); }

Settings KruPoints::SettingsOf(const Made& made) const {
  KruSettings settings;
  settings.primitive = primitive_;
  settings.feedback = made.feedback;
  settings.divide_by_2 = made.divide_by_2;
  settings.m = made.m;
  settings.d = made.d;
  settings.divide_halves = made.divide_halves;
  settings.pins.assign(outputs_, Pin::kNone);
  settings.pins.back() = made.pin;
  return settings;
}

}  // namespace planner::reach
