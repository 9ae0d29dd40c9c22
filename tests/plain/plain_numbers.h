// Number conversions shared by the plain solvers.

#ifndef TESTS_PLAIN_PLAIN_NUMBERS_H_
#define TESTS_PLAIN_PLAIN_NUMBERS_H_

namespace plain {

// The value without its fraction (truncated toward zero). A value that no int can hold, NaN
// included, gives 0.
inline int WholeNumber(double value) {
  if (!(value > -2147483649.0 && value < 2147483648.0)) return 0;
  return static_cast<int>(value);
}

// True when low <= value <= high; a NaN anywhere is outside.
inline bool InRange(double value, double low, double high) {
  return low <= value && value <= high;
}

// True when value equals center or lies in [center - tolerance, center + tolerance], both ends
// included. The ends are formed first: on doubles this is not the same as comparing the distance.
inline bool Matches(double value, double center, double tolerance) {
  return value == center || InRange(value, center - tolerance, center + tolerance);
}

}  // namespace plain

#endif  // TESTS_PLAIN_PLAIN_NUMBERS_H_
