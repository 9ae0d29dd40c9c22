// Decimals of the engine beside those of printf.
#ifndef VORKEL_TESTS_ENGINE_FIXED_TEXT_H_
#define VORKEL_TESTS_ENGINE_FIXED_TEXT_H_

#include <string>

namespace engine_test {

// What WriteFixed3 and WriteFixed6 write otherwise than printf, which is in the C locale; "" where
// they agree or leave a number to printf that is not finite or from 2^63 on.
std::string FixedMismatch(double x);

// The same for so many drawn numbers: any bits at all, numbers as clock managers have them, and
// halves of last digits.
std::string FirstDrawnMismatch(int count);

}  // namespace engine_test

#endif  // VORKEL_TESTS_ENGINE_FIXED_TEXT_H_
