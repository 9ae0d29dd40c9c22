// Decimals of doubles, exactly as printf writes them in the C locale, and several times as fast.
//
// A double is a whole number m of at most 53 bits times a power of two. So x times 1000, or times a
// million, is a whole number of at most 73 bits over a power of two: the quotient gives the digits
// and the remainder tells which way to round, half to even.
//
// Tested by fixed_text_test.cpp.
#ifndef VORKEL_ENGINE_FIXEDTEXT_H_
#define VORKEL_ENGINE_FIXEDTEXT_H_

#include <cstddef>

namespace Ip {

// What the functions below write at most.
inline constexpr std::size_t kLongestFixed = 32;

// Write `x` to `to` as "%.3f" and "%.6f" do and return the end. Null, with nothing written, for what
// is left to printf: infinities and NaN, numbers from 2^63 on, and all when the processor does not
// round to nearest, which printf heeds.
char* WriteFixed3(double x, char* to);
char* WriteFixed6(double x, char* to);

}  // namespace Ip

#endif  // VORKEL_ENGINE_FIXEDTEXT_H_
