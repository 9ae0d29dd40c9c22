// The four clock primitives.
#ifndef VORKEL_HARDWARE_PRIMITIVE_H_
#define VORKEL_HARDWARE_PRIMITIVE_H_

#include <array>
#include <string_view>

namespace hardware {

enum class Primitive { kPll, kTsyn, kKruSp, kKruClkgen };

// In the order in which they are listed to users.
inline constexpr std::array kPrimitives = {Primitive::kPll, Primitive::kTsyn, Primitive::kKruSp,
                                           Primitive::kKruClkgen};

constexpr std::string_view Name(Primitive primitive) {
  switch (primitive) {
    case Primitive::kPll:
      return "PLL";
    case Primitive::kTsyn:
      return "TSYN";
    case Primitive::kKruSp:
      return "KRU_SP";
    case Primitive::kKruClkgen:
      break;
  }
  return "KRU_CLKGEN";
}

// PLL and TSYN, which have a VCO in a loop; the others are delay lines.
constexpr bool IsLoop(Primitive primitive) {
  return primitive == Primitive::kPll || primitive == Primitive::kTsyn;
}

// How many clocks a primitive has.
constexpr int MostInputs(Primitive primitive) { return IsLoop(primitive) ? 2 : 1; }
constexpr int MostOutputs(Primitive primitive) { return IsLoop(primitive) ? 7 : 6; }

// The bandwidth of a loop, in the order in which they are tried: the default first.
enum class Bandwidth { kOptimized, kLow, kHigh };
inline constexpr std::array kBandwidths = {Bandwidth::kOptimized, Bandwidth::kLow,
                                           Bandwidth::kHigh};

constexpr std::string_view Name(Bandwidth bandwidth) {
  switch (bandwidth) {
    case Bandwidth::kOptimized:
      return "OPTIMIZED";
    case Bandwidth::kLow:
      return "LOW";
    case Bandwidth::kHigh:
      break;
  }
  return "HIGH";
}

}  // namespace hardware

#endif  // VORKEL_HARDWARE_PRIMITIVE_H_
