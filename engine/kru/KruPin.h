// The output pins of the KRU primitives.
#ifndef VORKEL_ENGINE_KRU_KRUPIN_H_
#define VORKEL_ENGINE_KRU_KRUPIN_H_

#include <cstdint>

#include "host/Port_StringBase.h"

namespace Ip {

enum class KruPin : std::int32_t {
  NONE = 0,
  CLK0 = 1,       // the input frequency, at 0 degrees
  CLK90 = 2,      // at 90
  CLK180 = 3,     // at 180
  CLK270 = 4,     // at 270
  CLKDV = 5,      // divided by the CLKDV value
  CLK2X = 6,      // doubled
  CLK2X180 = 7,   // doubled, at 180
  CLKFX = 8,      // times M / D
  CLKFX180 = 9,   // the same at 180
  CLKFXDV = 10,   // CLKFX divided by DV; KRU_CLKGEN only
};

// The name of a pin as scripts and traces show it; "NONE" for NONE.
Port::StringBase KruPinName(KruPin pin);

}  // namespace Ip

#endif  // VORKEL_ENGINE_KRU_KRUPIN_H_
