// What the KRU_SP and KRU_CLKGEN solvers keep in the implementation object.
#ifndef VORKEL_ENGINE_KRU_KRUSTATE_H_
#define VORKEL_ENGINE_KRU_KRUSTATE_H_

#include <array>
#include <cstdint>

#include "engine/kru/KruPin.h"

namespace Ip {

// A KRU serves up to six outputs, numbered 0 to 5.
inline constexpr int kKruOutputs = 6;

using KruPinList = std::array<KruPin, kKruOutputs>;

// The values persist until the next KRU or KRU_CLKGEN run; one that fails may leave some of
// its own.
struct KruState {
  // The pins that could serve the outputs, with CLKIN_DIVIDE_BY_2 FALSE and TRUE.
  KruPinList _kruPinsDivBy2F{};
  KruPinList _kruPinsDivBy2T{};

  KruPinList _kruChosenPin{};
  std::int32_t _kruChosenM = 0;
  std::int32_t _kruChosenD = 0;
  bool _kruChosenDivBy2 = false;  // CLKIN_DIVIDE_BY_2; a KRU_CLKGEN run leaves it as it is
  double _kruChosenClkdv = 0.0;   // CLKDV or CLKFXDV divide; 0: not used
  double _kruPhaseOffset = 0.0;   // degrees, common to all outputs; likewise
};

}  // namespace Ip

#endif  // VORKEL_ENGINE_KRU_KRUSTATE_H_
