// What the result codes of the solvers say to a user.
#ifndef VORKEL_ENGINE_RESULTTEXTS_H_
#define VORKEL_ENGINE_RESULTTEXTS_H_

#include "engine/kru/Stages.h"
#include "engine/pll/Stages.h"

namespace Ip {

// The entries of the PLL and TSYN solver, of which each has words of its own.
enum class PllEntry { kTsynFrequencies, kPllFrequencies, kClosestSolution };

// The sentence for a Pll::ResultCode of a run for `count` outputs; "1" for kSolved.
inline const char* PllResultText(PllEntry entry, int code, int count) {
  switch (code) {
    case Pll::kSolved: return "1";
    case Pll::kNoSpeedData: return "Could not get data from speedsfile.";
    case Pll::kEmptyRange:
      return "Could not obtain a valid VCO because the 2 input clock freqs are too far apart in "
             "range.";
    default: break;
  }
  if (entry == PllEntry::kTsynFrequencies) {
    return count > 1
               ? "Could not obtain valid VCO, M and D values with these requested frequencies."
               : "Could not obtain valid VCO, M and D values with the requested frequency.";
  }
  // The closest-solution entry does not count its outputs.
  return entry == PllEntry::kClosestSolution || count > 1
             ? "Could not obtain valid VCO, M and D values with the given input freqs and the "
               "requested frequencies."
             : "Could not obtain valid VCO, M and D values with the given input freqs and the "
               "requested frequency.";
}

// The same for a Kru::ResultCode of a KRU_SP or a KRU_CLKGEN.
inline const char* KruResultText(bool isKruClkgen, int code, int numOut) {
  if (code == Kru::kSolved) return "1";
  if (code == Kru::kNoSpeedData) return "Could not get data from speedsfile.";
  if (isKruClkgen) {
    return numOut == 1
               ? "The KRU_CLKGEN cannot support the requested output frequency and phase."
               : "The KRU_CLKGEN cannot support the requested output frequencies and phases.";
  }
  return numOut == 1 ? "The KRU_SP cannot support the requested output frequency and phase."
                     : "The KRU_SP cannot support the requested output frequencies and phases.";
}

}  // namespace Ip

#endif  // VORKEL_ENGINE_RESULTTEXTS_H_
