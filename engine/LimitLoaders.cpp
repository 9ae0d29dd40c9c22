// The limits of the primitives, read from the device's speed data in a fixed order.
//
// Tested by limit_loaders_test.cpp.

#include <vector>

#include "engine/Ip_VorkelImp.h"
#include "engine/pll/Stages.h"

namespace Ip {

namespace {

template <typename Limits>
struct Key {
  Port::StringBase keyword;
  double Limits::*field;
};

template <typename Limits>
using Keys = std::vector<Key<Limits>>;

// The host is asked for every keyword at every load, in the order of the table; its strings are
// made at the first. They are never destroyed: a run may come at the very end of the process.

// O_MAX_HT_LT is read twice; a host that counts its reads sees both.
const Keys<PllLimits>& PllKeys() {
  static const auto* const keys = new Keys<PllLimits>{
      {"VCOCLK_FREQ_MIN", &PllLimits::vcoMin},
      {"VCOCLK_FREQ_MAX", &PllLimits::vcoMax},
      {"CLKOUT_FREQ_MIN_GCLK", &PllLimits::clkoutMin},
      {"CLKOUT_FREQ_MAX_GCLK", &PllLimits::clkoutMax},
      {"CLKPFD_FREQ_MIN", &PllLimits::pfdMin},
      {"CLKPFD_FREQ_MAX", &PllLimits::pfdMax},
      {"O_MAX_HT_LT", &PllLimits::maxHighLowCount},
      {"CLKOUT_FREQ_MAX_IOCLK", &PllLimits::clkoutMaxIo},
      {"O_MAX_HT_LT", &PllLimits::maxHighLowCount},
  };
  return *keys;
}

const Keys<PllLimits>& TsynKeys() {
  static const auto* const keys = new Keys<PllLimits>{
      {"TSYN_VCOCLK_FREQ_MIN", &PllLimits::vcoMin},
      {"TSYN_VCOCLK_FREQ_MAX", &PllLimits::vcoMax},
      {"TSYN_CLKOUT_FREQ_MIN", &PllLimits::clkoutMin},
      {"TSYN_CLKOUT_FREQ_MAX", &PllLimits::clkoutMax},
      {"TSYN_CLKPFD_FREQ_MIN", &PllLimits::pfdMin},
      {"TSYN_CLKPFD_FREQ_MAX", &PllLimits::pfdMax},
      {"TSYN_VCOCLK_FREQ_TARGET", &PllLimits::vcoTarget},
      {"O_MAX_HT_LT", &PllLimits::maxHighLowCount},
      {"TSYN_CLKPFD_FREQ_MAX_LBW", &PllLimits::_maxPfdLowB},
  };
  return *keys;
}

// The KRU keywords are periods: the shortest period is the highest frequency.
const Keys<KruLimits>& KruKeys() {
  static const auto* const keys = new Keys<KruLimits>{
      {"D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", &KruLimits::_kruClk0Max},
      {"D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", &KruLimits::_kruClk0Min},
      {"D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD", &KruLimits::_kruClk0Max2x},
      {"D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", &KruLimits::_kruClk90Max},
      {"D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", &KruLimits::_kruClk90Min},
      {"D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD",
       &KruLimits::_kruClk90Max2x},
      {"D_KRU_CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", &KruLimits::_kruClk2xMax},
      {"D_KRU_CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", &KruLimits::_kruClk2xMin},
      {"D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", &KruLimits::_kruClkdvMax},
      {"D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", &KruLimits::_kruClkdvMin},
      {"D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD",
       &KruLimits::_kruClkdvMax2x},
      {"D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", &KruLimits::_kruClkfxMax},
      {"D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", &KruLimits::_kruClkfxMin},
  };
  return *keys;
}

const Keys<KruLimits>& KruClkgenKeys() {
  static const auto* const keys = new Keys<KruLimits>{
      {"D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", &KruLimits::_kruClkfxMax},
      {"D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", &KruLimits::_kruClkfxMin},
      {"D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MAXPERIOD", &KruLimits::_kruClkfxdvMin},
      {"D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MINPERIOD", &KruLimits::_kruClkfxdvMax},
  };
  return *keys;
}

double AsRead(double value) { return value; }

// A period in ns as a frequency in MHz.
double FrequencyOfPeriod(double period) { return 1000.0 / period; }

template <typename Limits>
bool Load(VorkelImp& imp, const Keys<Limits>& keys, Limits& limits, double (*convert)(double)) {
  for (const Key<Limits>& key : keys) {
    double value = 0.0;
    if (!imp.ReadSpeedData(key.keyword, &value)) return false;
    limits.*key.field = convert(value);
  }
  return true;
}

}  // namespace

bool VorkelImp::LoadPllLimits(int prim) {
  switch (prim) {
    case Pll::kPll: return Load(*this, PllKeys(), pllLimits, AsRead);
    case Pll::kTsyn: return Load(*this, TsynKeys(), pllLimits, AsRead);
    default: return false;
  }
}

bool VorkelImp::LoadKruLimits() {
  return Load(*this, KruKeys(), kruLimits, FrequencyOfPeriod);
}

// No driver calls this: a KRU_CLKGEN run works with the limits as they stand, the defaults or
// what the last KRU_SP run has loaded for CLKFX. That is meant so.
bool VorkelImp::LoadKruClkgenLimits() {
  return Load(*this, KruClkgenKeys(), kruLimits, FrequencyOfPeriod);
}

}  // namespace Ip
