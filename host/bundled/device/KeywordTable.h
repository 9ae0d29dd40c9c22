// The keywords of the speed data.
//
// Tested by keyword_table_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_KEYWORDTABLE_H_
#define VORKEL_HOST_BUNDLED_DEVICE_KEYWORDTABLE_H_

#include <array>
#include <cstddef>
#include <optional>
#include <span>
#include <string_view>

namespace Device {

// The clock-management primitives; the values are bits of a set.
enum Primitive : unsigned { kPll = 1, kTsyn = 2, kKruSp = 4, kKruClkgen = 8 };

// All primitives, in the order in which they are listed to users.
inline constexpr std::array<Primitive, 4> kPrimitives = {kPll, kTsyn, kKruSp, kKruClkgen};

// What the number of a keyword counts.
enum class Unit { kMegahertz, kNanoseconds, kCount };

struct Keyword {
  std::string_view name;
  Unit unit;
  unsigned primitives;  // the set of those that need the keyword
};

// Every keyword, each once. The place of a keyword in the table is its index everywhere else.
std::span<const Keyword> Keywords();

// The index of a keyword, exact case; none when there is no such keyword.
std::optional<std::size_t> FindKeyword(std::string_view name);

// "PLL", "TSYN", "KRU_SP", "KRU_CLKGEN".
std::string_view PrimitiveName(Primitive primitive);

// "MHz", "ns", "count".
std::string_view UnitName(Unit unit);

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_KEYWORDTABLE_H_
