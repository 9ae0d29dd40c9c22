// Tested by loop_test.cpp.
#include "hardware/Loop.h"

#include <algorithm>

namespace hardware {

bool HasFractions(Primitive primitive, int outputs, bool whole) {
  return primitive == Primitive::kTsyn && !whole && outputs < kWholeOutputs;
}

bool IsM(Primitive primitive, int eighths, bool fractions) {
  if (eighths > kLargestM * kEighths || (!fractions && eighths % kEighths != 0)) return false;
  if (eighths == kEighths) return true;
  return eighths >= (primitive == Primitive::kTsyn ? kSmallestTsynM * kEighths : kEighths);
}

bool IsD(int d) { return d >= 1 && d <= kLargestD; }

bool IsDivider(int eighths, int output, bool fractions, int largest) {
  if (eighths > largest * kEighths) return false;
  if (eighths % kEighths != 0 && (output != 0 || !fractions)) return false;
  return eighths == kEighths || eighths >= kSmallestFractionalDivider * kEighths;
}

int LargestDivider(int count) {
  return std::clamp(count > kLargestDivider / 2 ? kLargestDivider : 2 * count, 1, kLargestDivider);
}

Rational VcoRatio(int m_eighths, int d) { return Rational(m_eighths, kEighths * d); }

Rational OutputRatio(int m_eighths, int d, int divider_eighths) {
  return Rational(m_eighths, std::int64_t{d} * divider_eighths);
}

Rational PhaseOfStep(int step, int divider_eighths) {
  // 45 degrees of the VCO, in eighths of the divider.
  return Rational(step * 360, divider_eighths);
}

int NearestPhaseStep(const Rational& degrees, int divider_eighths) {
  return static_cast<int>(*(degrees * divider_eighths / 360).Round().Whole());
}

HighTimes HighTimesOf(int divider, int count) {
  if (divider == 1) return {1, 1};
  if (divider > count) return {2 * (divider - count), std::min(2 * count + 1, 2 * divider - 1)};
  return {2, 2 * divider - 1};
}

Rational DutyOfHighTime(int halves, int divider) { return Rational(50 * halves, divider); }

int NearestHighTime(const Rational& percent, int divider, int count) {
  const HighTimes times = HighTimesOf(divider, count);
  const Rational nearest = (percent * divider / 50).Round();
  if (nearest <= times.shortest) return times.shortest;
  if (nearest >= times.longest) return times.longest;
  return static_cast<int>(*nearest.Whole());
}

}  // namespace hardware
