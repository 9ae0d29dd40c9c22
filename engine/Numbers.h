// Conversions of doubles to whole numbers that are defined for every double.
#ifndef VORKEL_ENGINE_NUMBERS_H_
#define VORKEL_ENGINE_NUMBERS_H_

#include <cstdint>

namespace Ip {

// `x` truncated toward zero; 0 when no int32 holds the result, NaN included.
constexpr std::int32_t TruncateToInt(double x) {
  if (!(x > -2147483649.0 && x < 2147483648.0)) return 0;
  return static_cast<std::int32_t>(x);
}

// The whole number nearest to `x` for x >= 0, halves upward, by the field's usual
// truncate(x + 0.5); 0 as above.
constexpr std::int32_t RoundToInt(double x) { return TruncateToInt(x + 0.5); }

}  // namespace Ip

#endif  // VORKEL_ENGINE_NUMBERS_H_
