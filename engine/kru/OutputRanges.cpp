// The frequency ranges of the pin families, for a reader of the trace.

#include "engine/kru/Stages.h"

namespace Ip::Kru {

void TraceOutputRanges(const KruLimits& limits, const Trace& trace) {
  TRACE(trace, "DLL --- KRU output clock valid freq ranges:\n");
  TRACE(trace, "DLL ------> CLK0, CLK180 min = %3.3f; max = %3.3f\n", limits._kruClk0Min,
        limits._kruClk0Max);
  TRACE(trace, "DLL ------> CLK90, CLK270 min = %3.3f; max = %3.3f\n", limits._kruClk90Min,
        limits._kruClk90Max);
  TRACE(trace, "DLL ------> CLK2X min = %3.3f; max = %3.3f\n", limits._kruClk2xMin,
        limits._kruClk2xMax);
  TRACE(trace, "DLL ------> CLKDV min = %3.3f; max = %3.3f\n", limits._kruClkdvMin,
        limits._kruClkdvMax);
  TRACE(trace, "DLL ------> CLKFX min = %3.3f; max = %3.3f\n", limits._kruClkfxMin,
        limits._kruClkfxMax);
}

}  // namespace Ip::Kru
