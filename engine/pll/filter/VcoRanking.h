// The VCO frequencies of a run, ranked by what the divider search makes of them.
//
// It keeps the candidates with the smallest key (ToleranceKey.h). The key of a VCO frequency does
// not depend on the fudge, and it is the same all over a stretch of frequencies: until the error of
// an output comes to the next tolerance, the divider to the next whole number, or the output to an
// end of its range.
//
// Example: output 1 of 70 MHz. 400 MHz is divided by 6, which gives 66.67 MHz, 4.8 percent too
// little; so it keeps tolerance number 5. The stretch goes from 399 MHz, where 5 percent are
// missing, to 403.2 MHz, where it is 4.
//
// An end has the key of a stretch beside it, but a VCO at which ends meet - of one output, of two,
// or of an output and the VCO range - can have a smaller key than the stretches on both sides,
// since tolerances and ranges include their ends. And only the multiples of an output keep its
// tolerance 0; the stretches are as if they kept 1. Such VCOs are points of the ranking, each with
// the smallest key that a candidate there can have; which one it has is to be looked up. Example:
// outputs 1 and 2 of 3.125 and 400 MHz, as low and as high as the device allows: 400 MHz, 128 times
// the one and once the other, is the only VCO for both.
//
// The ends of stretches and the points are off as Rounding.h tells. Whoever uses them has to allow
// for that. The ends of what has an M and a D are outer bounds already.
//
// Tested by vco_ranking_test.cpp.
#ifndef VORKEL_ENGINE_PLL_FILTER_VCORANKING_H_
#define VORKEL_ENGINE_PLL_FILTER_VCORANKING_H_

#include <cstdint>
#include <vector>

#include "engine/pll/Stages.h"
#include "engine/pll/filter/ToleranceKey.h"

namespace Ip::Pll {

// A range of VCO frequencies, MHz, with both ends.
struct RankedRange {
  enum class Kind : std::uint8_t {
    kAccepted,  // part of a stretch, or a point, that may have an M, a D and all dividers
    kServed,    // a whole stretch, or another point, with dividers for all outputs
    kUnserved,  // likewise, but some output has no divider
  };

  double low;
  double high;
  ToleranceKey key;
  Kind kind;

  bool IsPoint() const { return low == high; }
};

// Sorted by key, then by kind, then rising. Without a range that is accepted, no VCO above 0 has an
// M, a D and all dividers.
using VcoRanking = std::vector<RankedRange>;

// The ranking for a run whose VCO range is prepared.
VcoRanking RankVcos(const VorkelImp& imp, const Run& run);

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_FILTER_VCORANKING_H_
