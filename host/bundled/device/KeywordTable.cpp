#include "host/bundled/device/KeywordTable.h"

#include <cassert>
#include <cstdint>
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

// Every run of a search asks for a dozen keywords, so a keyword is found by a number that is made
// of its length and a few of its letters, with a factor for which no two keywords share a place.
constexpr std::size_t kShortest = 11;  // of the keywords, in letters

constexpr std::uint32_t NumberOf(std::string_view name) {
  // These tell the pins, the feedbacks, and minimum and maximum apart.
  std::uint32_t number = 0;
  for (const std::size_t place : {std::size_t{9}, std::size_t{10}, name.size() - 2,
                                  name.size() - 7, name.size() > 12 ? name.size() - 12 : 0}) {
    number = number * 31 + static_cast<unsigned char>(name[place]);
  }
  return number * 31 + static_cast<std::uint32_t>(name.size());
}

// Places by number, for one factor. 0 is a free place; others are one more than an index.
struct Places {
  static constexpr unsigned kBits = 7;

  constexpr std::size_t Of(std::uint32_t number) const { return number * factor >> (32 - kBits); }

  // False when two keywords share a place.
  constexpr bool Fill() {
    for (std::uint8_t& place : one_more_than_index) place = 0;
    for (std::size_t i = 0; i < std::size(kKeywords); ++i) {
      std::uint8_t& place = one_more_than_index[Of(NumberOf(kKeywords[i].name))];
      if (place != 0) return false;
      place = static_cast<std::uint8_t>(i + 1);
    }
    return true;
  }

  std::uint32_t factor = 1;
  std::uint8_t one_more_than_index[std::size_t{1} << kBits] = {};
};

constexpr Places kPlaces = [] {
  Places places;
  while (!places.Fill()) places.factor = places.factor * 1664525 + 2;
  return places;
}();

}  // namespace

std::span<const Keyword> Keywords() { return kKeywords; }

std::optional<std::size_t> FindKeyword(std::string_view name) {
  if (name.size() < kShortest) return std::nullopt;
  const std::uint8_t place = kPlaces.one_more_than_index[kPlaces.Of(NumberOf(name))];
  if (place == 0 || kKeywords[place - 1].name != name) return std::nullopt;
  return place - std::size_t{1};
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
  return (assert(false), "");  // not reached: those are all primitives
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
  return (assert(false), "");  // not reached: those are all units
}

}  // namespace Device
