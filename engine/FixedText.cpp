#include "engine/FixedText.h"

#include <bit>
#include <cfenv>
#include <charconv>
#include <cstdint>

namespace Ip {

namespace {

constexpr int kFractionBits = 52;
constexpr int kExponents = 0x7ff;  // the last is that of infinities and NaN
constexpr int kBias = 1023 + kFractionBits;
constexpr std::uint64_t kImplicitBit = std::uint64_t{1} << kFractionBits;

// The low `bits` bits of a number, 0 < bits < 64.
constexpr std::uint64_t Low(std::uint64_t number, int bits) {
  return number & ((std::uint64_t{1} << bits) - 1);
}

// A number of units: whole ones, and a count of thousandths or of millionths.
struct Decimal {
  std::uint64_t whole;
  std::uint32_t fraction;
};

// m / 2^shift, 0 < shift < 33, in units and `kScale`-ths.
template <std::uint32_t kScale>
Decimal LargeDecimal(std::uint64_t m, int shift) {
  Decimal decimal = {m >> shift, 0};
  const std::uint64_t product = Low(m, shift) * kScale;
  decimal.fraction = static_cast<std::uint32_t>(product >> shift);
  const std::uint64_t rest = Low(product, shift);
  const std::uint64_t half = std::uint64_t{1} << (shift - 1);
  if (rest > half || (rest == half && decimal.fraction % 2 != 0)) ++decimal.fraction;
  if (decimal.fraction == kScale) return {decimal.whole + 1, 0};
  return decimal;
}

// The same for 33 <= shift. The product has 73 bits: `high` and the low 32 bits of `low`.
template <std::uint32_t kScale>
Decimal SmallDecimal(std::uint64_t m, int shift) {
  constexpr int kWord = 32;
  const std::uint64_t low = Low(m, kWord) * kScale;
  const std::uint64_t high = (m >> kWord) * kScale + (low >> kWord);
  shift -= kWord;
  // Below 2^41 / 2^63, which is less than half of the last digit.
  if (shift > 63) return {0, 0};
  std::uint64_t digits = high >> shift;
  const std::uint64_t rest = Low(high, shift);
  const std::uint64_t half = std::uint64_t{1} << (shift - 1);
  const bool isMore = Low(low, kWord) != 0;
  if (rest > half || (rest == half && (isMore || digits % 2 != 0))) ++digits;
  return {digits / kScale, static_cast<std::uint32_t>(digits % kScale)};
}

template <std::uint32_t kScale>
char* Write(double x, char* to) {
  const auto bits = std::bit_cast<std::uint64_t>(x);
  const int exponent = static_cast<int>(bits >> kFractionBits) & kExponents;
  const int shift = kBias - exponent;  // x = m / 2^shift; of the smallest numbers less by one
  constexpr int kLargestLeftShift = 10;
  if (shift < -kLargestLeftShift || std::fegetround() != FE_TONEAREST) return nullptr;
  std::uint64_t m = Low(bits, kFractionBits);
  if (exponent != 0) m |= kImplicitBit;
  const Decimal decimal = shift <= 0   ? Decimal{m << -shift, 0}
                          : shift < 33 ? LargeDecimal<kScale>(m, shift)
                                       : SmallDecimal<kScale>(m, shift);
  if (bits >> 63 != 0) *to++ = '-';
  to = std::to_chars(to, to + kLongestFixed, decimal.whole).ptr;
  *to++ = '.';
  for (std::uint32_t unit = kScale / 10, rest = decimal.fraction; unit != 0; unit /= 10) {
    *to++ = static_cast<char>('0' + rest / unit);
    rest %= unit;
  }
  return to;
}

}  // namespace

char* WriteFixed3(double x, char* to) { return Write<1000>(x, to); }

char* WriteFixed6(double x, char* to) { return Write<1000000>(x, to); }

}  // namespace Ip
