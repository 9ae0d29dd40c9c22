// The settings of a primitive, as whole numbers: all that a design has to be told.
#ifndef VORKEL_PLANNER_SETTINGS_H_
#define VORKEL_PLANNER_SETTINGS_H_

#include <optional>
#include <variant>
#include <vector>

#include "hardware/Kru.h"
#include "hardware/Loop.h"
#include "planner/Request.h"

namespace planner {

// An output of a PLL or a TSYN. That of an unused one is all 0.
struct LoopOutput {
  int divider = 0;    // in eighths
  int phase = 0;      // in eighths of a VCO period, negative for a negative phase
  int high_time = 0;  // in halves of a VCO period; 0 where nothing is set: 50 percent
  bool operator==(const LoopOutput&) const = default;
};

struct LoopSettings {
  Primitive primitive = Primitive::kPll;
  Bandwidth bandwidth = Bandwidth::kOptimized;
  int m = 0;  // in eighths
  int d = 0;
  std::vector<LoopOutput> outputs;  // as many as the request has

  // Whether M or the divider of output 0 is a fraction: nothing can then be moved.
  bool HasFraction() const {
    return m % hardware::kEighths != 0 ||
           (!outputs.empty() && outputs[0].divider % hardware::kEighths != 0);
  }
  bool operator==(const LoopSettings&) const = default;
};

struct KruSettings {
  Primitive primitive = Primitive::kKruSp;
  bool feedback = false;     // KRU_SP
  bool divide_by_2 = false;  // KRU_SP: CLKIN_DIVIDE_BY_2
  int m = 0;                 // 0 when no output is on CLKFX, CLKFX180 or CLKFXDV
  int d = 0;
  int divide_halves = 0;            // of CLKDV or CLKFXDV; 0 when no output is on it
  int phase_shift = 0;              // KRU_SP: PHASE_SHIFT
  std::vector<hardware::Pin> pins;  // of each output of the request; kNone of an unused one

  hardware::KruRatios Ratios() const { return {divide_by_2, m, d, divide_halves}; }
  bool operator==(const KruSettings&) const = default;
};

using Settings = std::variant<LoopSettings, KruSettings>;

inline Primitive PrimitiveOf(const Settings& settings) {
  return std::visit([](const auto& one) { return one.primitive; }, settings);
}

}  // namespace planner

#endif  // VORKEL_PLANNER_SETTINGS_H_
