#include "plain_reach.h"

#include <algorithm>
#include <iterator>

#include "hardware/Kru.h"
#include "hardware/Loop.h"

namespace plain {

namespace {

using hardware::Pin;
using planner::Bandwidth;
using planner::Device;
using planner::Primitive;
using planner::Range;
using planner::Rational;
using planner::Request;

std::vector<Rational> Sorted(std::vector<Rational> all) {
  std::sort(all.begin(), all.end());
  all.erase(std::unique(all.begin(), all.end()), all.end());
  return all;
}

// All that the inputs can be, as far as it decides: the ends.
std::vector<Rational> Corners(const Request& request) {
  std::vector<Rational> corners;
  for (const Rational& input : request.inputs) {
    for (const int sign : {-1, 0, 1}) {
      corners.push_back(input * (1 + sign * request.input_tolerance / 1'000'000));
    }
  }
  return corners;
}

std::vector<Rational> OfLoop(const Request& request, const Device& device, Primitive primitive,
                             int output) {
  const planner::LoopLimits& limits = device.Loop(primitive);
  const bool fractions =
      primitive == Primitive::kTsyn && output < 5 && !request.whole_divider_0;
  const int largest = hardware::LargestDivider(limits.max_count);
  std::vector<Rational> vcos;
  for (const Bandwidth bandwidth : hardware::kBandwidths) {
    if (request.bandwidth && *request.bandwidth != bandwidth) continue;
    for (int d = 1; d <= hardware::kLargestD; ++d) {
      for (int m = 1; m <= hardware::kLargestM * 8; ++m) {
        if (!hardware::IsM(primitive, m, fractions)) continue;
        bool is_kept = true;
        for (const Rational& input : Corners(request)) {
          is_kept = is_kept && limits.PfdOf(bandwidth).Contains(input / d) &&
                    limits.vco.Contains(input * m / (8 * d));
        }
        if (is_kept) vcos.push_back(request.inputs[0] * m / (8 * d));
      }
    }
  }
  std::vector<Rational> all;
  for (const Rational& vco : Sorted(vcos)) {
    for (int divider = 1; divider <= largest * 8; ++divider) {
      if (!hardware::IsDivider(divider, output, fractions, largest)) continue;
      const Rational frequency = vco * 8 / divider;
      bool is_kept = true;
      for (const Rational& input : Corners(request)) {
        is_kept = is_kept &&
                  limits.OutputOf(output).Contains(frequency * input / request.inputs[0]);
      }
      if (is_kept) all.push_back(frequency);
    }
  }
  return Sorted(all);
}

// Every pin with every M, D, divide and CLKIN_DIVIDE_BY_2. With its feedback connected a KRU_SP has
// all of them.
std::vector<Rational> OfKru(const Request& request, const Device& device, Primitive primitive,
                            int output) {
  const bool is_sp = primitive == Primitive::kKruSp;
  const planner::PinLimits& limits = device.Pins(primitive);
  const int largest = hardware::LargestKruRatioPart(primitive);
  std::vector<int> divides;
  if (is_sp) {
    divides.assign(hardware::kClkdvHalves.begin(), hardware::kClkdvHalves.end());
  } else {
    divides.assign(hardware::kClkfxdvHalves.begin(), hardware::kClkfxdvHalves.end());
  }
  std::vector<Rational> all;
  for (const hardware::PinFacts& facts : hardware::kPins) {
    if (!(is_sp ? facts.is_sp : facts.is_clkgen)) continue;
    if (!is_sp && output == 0 && facts.pin != Pin::kClkfx) continue;
    const Range& range = limits.Of(facts.pin, is_sp && output == 0 && facts.pin == Pin::kClk2x);
    const bool uses_m = facts.source == hardware::PinSource::kSynthesiser ||
                        facts.source == hardware::PinSource::kDividedSynthesiser;
    const bool uses_divide = facts.source == hardware::PinSource::kDivider ||
                             facts.source == hardware::PinSource::kDividedSynthesiser;
    for (const bool divide_by_2 : {false, true}) {
      if (divide_by_2 && !is_sp) continue;
      for (int m = 2; m <= (uses_m ? largest : 2); ++m) {
        for (int d = 1; d <= (uses_m ? largest : 1); ++d) {
          for (const int halves : divides) {
            const Rational ratio = PinRatio(facts.pin, {divide_by_2, m, d, halves});
            bool is_kept = true;
            for (const Rational& input : Corners(request)) {
              is_kept = is_kept && range.Contains(input * ratio);
            }
            if (is_kept) all.push_back(request.inputs[0] * ratio);
            if (!uses_divide) break;
          }
        }
      }
    }
  }
  return Sorted(all);
}

}  // namespace

std::vector<Rational> Frequencies(const Request& request, const Device& device,
                                  Primitive primitive, int output) {
  return hardware::IsLoop(primitive) ? OfLoop(request, device, primitive, output)
                                     : OfKru(request, device, primitive, output);
}

std::vector<Rational> Within(const std::vector<Rational>& all, const Range& range) {
  std::vector<Rational> within;
  std::copy_if(all.begin(), all.end(), std::back_inserter(within),
               [&](const Rational& one) { return range.Contains(one); });
  return within;
}

}  // namespace plain
