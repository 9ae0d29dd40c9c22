#include "host/bundled/device/KeywordTable.h"

#include <algorithm>
#include <iterator>

namespace Device {
namespace {

constexpr Keyword kKeywords[] = {
    {"VCOCLK_FREQ_MIN", Unit::kMegahertz, kPll},
    {"VCOCLK_FREQ_MAX", Unit::kMegahertz, kPll},
    {"CLKOUT_FREQ_MIN_GCLK", Unit::kMegahertz, kPll},
    {"CLKOUT_FREQ_MAX_GCLK", Unit::kMegahertz, kPll},
    {"CLKPFD_FREQ_MIN", Unit::kMegahertz, kPll},
    {"CLKPFD_FREQ_MAX", Unit::kMegahertz, kPll},
    {"CLKOUT_FREQ_MAX_IOCLK", Unit::kMegahertz, kPll},
    {"O_MAX_HT_LT", Unit::kCount, kPll | kTsyn},

    {"TSYN_VCOCLK_FREQ_MIN", Unit::kMegahertz, kTsyn},
    {"TSYN_VCOCLK_FREQ_MAX", Unit::kMegahertz, kTsyn},
    {"TSYN_VCOCLK_FREQ_TARGET", Unit::kMegahertz, kTsyn},
    {"TSYN_CLKOUT_FREQ_MIN", Unit::kMegahertz, kTsyn},
    {"TSYN_CLKOUT_FREQ_MAX", Unit::kMegahertz, kTsyn},
    {"TSYN_CLKPFD_FREQ_MIN", Unit::kMegahertz, kTsyn},
    {"TSYN_CLKPFD_FREQ_MAX", Unit::kMegahertz, kTsyn},
    {"TSYN_CLKPFD_FREQ_MAX_LBW", Unit::kMegahertz, kTsyn},

    {"D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", Unit::kNanoseconds, kKruSp},
    {"D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", Unit::kNanoseconds, kKruSp},
    {"D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD", Unit::kNanoseconds, kKruSp},
    {"D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", Unit::kNanoseconds, kKruSp},
    {"D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", Unit::kNanoseconds, kKruSp},
    {"D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD", Unit::kNanoseconds, kKruSp},
    {"D_KRU_CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", Unit::kNanoseconds, kKruSp},
    {"D_KRU_CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", Unit::kNanoseconds, kKruSp},
    {"D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", Unit::kNanoseconds, kKruSp},
    {"D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", Unit::kNanoseconds, kKruSp},
    {"D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD", Unit::kNanoseconds, kKruSp},
    {"D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", Unit::kNanoseconds,
     kKruSp | kKruClkgen},
    {"D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", Unit::kNanoseconds,
     kKruSp | kKruClkgen},

    {"D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MINPERIOD", Unit::kNanoseconds, kKruClkgen},
    {"D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MAXPERIOD", Unit::kNanoseconds, kKruClkgen},
};

}  // namespace

std::span<const Keyword> Keywords() { return kKeywords; }

std::optional<std::size_t> FindKeyword(std::string_view name) {
  const auto found = std::find_if(std::begin(kKeywords), std::end(kKeywords),
                                  [name](const Keyword& keyword) { return keyword.name == name; });
  if (found == std::end(kKeywords)) return std::nullopt;
  return static_cast<std::size_t>(found - std::begin(kKeywords));
}

std::string_view PrimitiveName(Primitive primitive) {
  switch (primitive) {
    case kPll:
      return "PLL";
    case kTsyn:
      return "TSYN";
    case kKruSp:
      return "KRU_SP";
    case kKruClkgen:
      return "KRU_CLKGEN";
  }
  return "";
}

std::string_view UnitName(Unit unit) {
  switch (unit) {
    case Unit::kMegahertz:
      return "MHz";
    case Unit::kNanoseconds:
      return "ns";
    case Unit::kCount:
      return "count";
  }
  return "";
}

}  // namespace Device
