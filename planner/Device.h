// A device at one speed grade: its limits, exactly as the decimals of its file say, and the
// coefficients of its jitter model.
#ifndef VORKEL_PLANNER_DEVICE_H_
#define VORKEL_PLANNER_DEVICE_H_

#include <array>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "hardware/Exact.h"
#include "hardware/Kru.h"
#include "hardware/Primitive.h"
#include "planner/Request.h"

namespace planner {

// The limits of a PLL or a TSYN, MHz.
struct LoopLimits {
  Range vco;
  Range pfd;      // with bandwidth OPTIMIZED or HIGH
  Range pfd_low;  // with bandwidth LOW: never above pfd
  Range output;
  Range output_1;       // of output 1; a PLL's can drive an I/O clock, which runs faster
  int max_count = 0;    // O_MAX_HT_LT, VCO periods; a fraction of the file is cut off
  Rational vco_target;  // TSYN: the VCO that is recommended; 0 of a PLL

  const Range& PfdOf(Bandwidth bandwidth) const {
    return bandwidth == Bandwidth::kLow ? pfd_low : pfd;
  }
  const Range& OutputOf(int index) const { return index == 1 ? output_1 : output; }
};

// The limits of the pins of a KRU, MHz, by the pin that stands for the limits of its family
// (PinFacts::limits). `doubled` are those with feedback from CLK2X, which is so when output 0 is
// on that pin; where the device has none of its own they are the same.
struct PinLimits {
  std::map<std::string, Range, std::less<>> usual;
  std::map<std::string, Range, std::less<>> doubled;

  const Range& Of(hardware::Pin pin, bool feedback_2x) const {
    return (feedback_2x ? doubled : usual).find(hardware::FactsOf(pin).limits)->second;
  }
};

// What only the engine needs of a device: shared, and the same for all who hold it.
class SpeedData;

struct Device {
  std::string name;                   // "vk40"
  std::string package;                // "b484"; empty when there is none
  std::string grade;                  // "2"
  std::string part;                   // "vk40b484-2"
  std::vector<Primitive> primitives;  // those whose limits are all there, in the usual order

  std::optional<LoopLimits> pll;
  std::optional<LoopLimits> tsyn;
  std::optional<PinLimits> kru_sp;
  std::optional<PinLimits> kru_clkgen;

  bool has_loop_jitter = false;  // the coefficients of PLL and TSYN are there
  bool has_kru_jitter = false;

  std::shared_ptr<const SpeedData> speed_data;

  bool Has(Primitive primitive) const {
    for (const Primitive one : primitives) {
      if (one == primitive) return true;
    }
    return false;
  }
  // The limits of a primitive that the device has.
  const LoopLimits& Loop(Primitive primitive) const {
    return primitive == Primitive::kPll ? *pll : *tsyn;
  }
  const PinLimits& Pins(Primitive primitive) const {
    return primitive == Primitive::kKruSp ? *kru_sp : *kru_clkgen;
  }
};

}  // namespace planner

#endif  // VORKEL_PLANNER_DEVICE_H_
