// Tests of the walks for any divider: the plain walks of OutputSteps.h are the definition, and
// are compared with wherever they come to an end in reasonable time.

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>

#include "engine/timing/LongWalks.h"
#include "engine/timing/OutputSteps.h"
#include "tests/engine/EngineTest.h"

namespace {

using engine_test::Above;
using engine_test::Below;
using engine_test::kInfinity;
using engine_test::kNan;
using Ip::DutyRange;
using Ip::DutyRangeOf;
using Ip::NearestDutyCycle;
using Ip::NearestDutyCycleOfAny;
using Ip::NearestPhaseStep;
using Ip::NearestPhaseStepOfAny;
using Ip::PhaseStep;

constexpr double kTiny = std::numeric_limits<double>::denorm_min();
constexpr double kHuge = std::numeric_limits<double>::max();

// Random numbers, the same in each run.
class Numbers {
 public:
  explicit Numbers(unsigned seed) : random_(seed) {}

  double Between(double lowest, double highest) {
    return std::uniform_real_distribution(lowest, highest)(random_);
  }
  double Whole(double lowest, double highest) { return std::floor(Between(lowest, highest + 1)); }
  // A number of any size, with its exponent of ten evenly distributed.
  double OfAnySize(double lowest, double highest) {
    return std::pow(10.0, Between(lowest, highest));
  }
  bool OneIn(int count) { return Whole(0, count - 1) == 0; }

 private:
  std::mt19937_64 random_;
};

// --- Phases ----------------------------------------------------------------------------------

// A request that is likely to be met, near a step, anywhere in the range or far from it.
double SomePhase(Numbers& numbers, double step) {
  const double multiple = numbers.Whole(0, 360.0 / step) * step;
  switch (static_cast<int>(numbers.Whole(0, 7))) {
    case 0:
      return multiple;
    case 1:
      return multiple - 360.0;
    case 2:
      return multiple + step / 2;
    case 3:
      return Above(multiple) - 360.0;
    case 4:
      return numbers.Between(-360, 0);
    case 5:
      return numbers.OfAnySize(-12, 20);
    case 6:
      return -numbers.OfAnySize(-12, 20);
    default:
      return numbers.Between(0, 360);
  }
}

void ComparePhase(double phase, double step) {
  EXPECT_EQ(NearestPhaseStepOfAny(phase, step, phase > 0), NearestPhaseStep(phase, step, phase > 0))
      << phase << " by " << step;
}

TEST(NearestPhaseStepOfAny, IsThePlainWalkOfShortOnes) {
  Numbers numbers(1);
  for (int i = 0; i < 20000; ++i) {
    const double divider = numbers.OneIn(2) ? numbers.Whole(1, 128) : numbers.Between(0.01, 300);
    ComparePhase(SomePhase(numbers, PhaseStep(divider)), PhaseStep(divider));
  }
}

// A quotient from 2^40 on has another window than one below.
TEST(NearestPhaseStepOfAny, FindsTheStepOnBothSidesOfAWiderWindow) {
  constexpr double kSteps = 1099511627776.0;  // 2^40
  for (const double divider : {kSteps / 8.0, kSteps / 4.0}) {
    const double step = PhaseStep(divider);
    for (const double phase : {45.0, 180.0 - step, 180.0, 180.0 + step, 315.0, -45.0, -315.0}) {
      // A power of two of steps a turn: each of these phases is one.
      EXPECT_EQ(NearestPhaseStepOfAny(phase, step, phase > 0), phase) << divider;
      EXPECT_EQ(NearestPhaseStepOfAny(phase + step / 8, step, phase > 0),
                phase > 0 ? phase : phase + step)
          << divider;
    }
  }
}

// Upward it is the nearest, and downward the first that is not below.
TEST(NearestPhaseStepOfAny, IsThePlainWalkOfEveryDivider) {
  Numbers numbers(8);
  for (double divider = 1; divider <= 128; divider += 0.125) {
    const double step = PhaseStep(divider);
    for (int i = 0; i < 24; ++i) ComparePhase(SomePhase(numbers, step), step);
    for (const double phase : {45.0, 90.0, 180.0, 270.0, 360.0}) {
      for (const double near : {Below(phase), phase, Above(phase)}) {
        ComparePhase(near, step);
        ComparePhase(-near, step);
      }
    }
  }
}

// One to six million steps each.
TEST(NearestPhaseStepOfAny, IsThePlainWalkOfLongOnes) {
  Numbers numbers(2);
  for (int i = 0; i < 240; ++i) {
    const double divider =
        numbers.OneIn(2) ? numbers.Whole(1.26e5, 7.5e5) : numbers.Between(1.26e5, 7.5e5);
    const double step = PhaseStep(divider);
    ASSERT_GT(360.0 / step, 1e6) << "not a long one";
    ComparePhase(SomePhase(numbers, step), step);
  }
}

TEST(NearestPhaseStepOfAny, IsThePlainWalkOfVeryLongOnes) {
  Numbers numbers(3);
  for (int i = 0; i < 6; ++i) {
    const double step = PhaseStep(numbers.Between(2e6, 3e6));  // 16 to 24 million steps
    ComparePhase(SomePhase(numbers, step), step);
  }
}

TEST(NearestPhaseStepOfAny, IsThePlainWalkWhereShortMeetsLong) {
  for (const double divider : {1.875, 2.0, 2.125, 2.25, 124999.0, 125000.0, 125001.0}) {
    const double step = PhaseStep(divider);
    for (const double phase : {100.0, -100.0, 360.0, -360.0, 1e-9, -1e-9, 400.0, -400.0}) {
      ComparePhase(phase, step);
    }
  }
}

TEST(NearestPhaseStepOfAny, IsThePlainWalkAtBothEnds) {
  const double step = PhaseStep(200000);
  for (const double phase : {kTiny, -kTiny, step / 2, Below(step / 2), -step / 2, -step,
                             Above(-step), Below(360.0), 360.0, Above(360.0), -360.0, Above(-360.0),
                             Below(-360.0), kInfinity, -kInfinity, kHuge, -kHuge}) {
    ComparePhase(phase, step);
  }
  EXPECT_EQ(NearestPhaseStepOfAny(kNan, step, false), NearestPhaseStep(kNan, step, false));
}

TEST(NearestPhaseStepOfAny, HasNoAnswerWithoutAStep) {
  for (const double phase : {100.0, -100.0, kInfinity, kNan}) {
    for (const double step : {0.0, -0.0, kInfinity, -kInfinity, kNan}) {
      EXPECT_EQ(NearestPhaseStepOfAny(phase, step, phase > 0), 0.0) << phase << " by " << step;
    }
  }
}

// Multiples of a negative step leave the range, all but the first.
TEST(NearestPhaseStepOfAny, HasNoAnswerForANegativeStep) {
  for (const double step : {-45.0, -1e-300, -1e300}) {
    for (const double phase : {100.0, -100.0, -45.0, 360.0, -405.0, kNan}) {
      EXPECT_EQ(NearestPhaseStepOfAny(phase, step, phase > 0), 0.0) << phase << " by " << step;
    }
    EXPECT_EQ(NearestPhaseStepOfAny(-360, step, false), -360.0);
  }
}

// With a step far below the last digit of a phase every phase is a step, or next to one. The last
// two dividers are the largest of which there is a step.
TEST(NearestPhaseStepOfAny, FindsAFineStepAtThePhase) {
  for (const double step : {1e-9, 1e-12, 1e-15, 1e-100, PhaseStep(1e307), PhaseStep(kHuge / 8)}) {
    ASSERT_GT(step, 0.0);
    for (const double phase : {1e-3, 45.0, 123.456, 359.9, -1e-3, -45.0, -123.456, -359.9}) {
      const double found = NearestPhaseStepOfAny(phase, step, phase > 0);
      EXPECT_NEAR(found, phase, step + 1e-13) << phase << " by " << step;
    }
  }
}

// --- Duty cycles -----------------------------------------------------------------------------

void CompareDuty(double percent, double divider, double count) {
  EXPECT_EQ(NearestDutyCycleOfAny(percent, divider, count),
            NearestDutyCycle(percent, divider, count))
      << percent << " of " << divider << " up to " << count;
}

// A duty cycle that the walk comes to, as the walk comes to it.
double SomeStep(Numbers& numbers, const DutyRange& range) {
  const double steps = (range.highest - range.lowest) / range.step;
  if (!(steps >= 1)) return range.lowest;
  double duty = range.lowest;
  for (double k = numbers.Whole(0, steps); k > 0; --k) duty += range.step;
  return duty;
}

double SomeDuty(Numbers& numbers, double divider, double count) {
  switch (static_cast<int>(numbers.Whole(0, 6))) {
    case 0:
      return 100.0 * SomeStep(numbers, DutyRangeOf(divider, count));
    case 1:
      return 100.0 * (SomeStep(numbers, DutyRangeOf(divider, count)) + 0.25 / divider);
    case 2:
      return numbers.OfAnySize(-12, 2);
    case 3:
      return numbers.OfAnySize(2, 20);
    case 4:
      return -numbers.OfAnySize(-12, 4);
    case 5:
      return numbers.Between(40, 60);
    default:
      return numbers.Between(0, 100);
  }
}

TEST(NearestDutyCycleOfAny, IsThePlainWalkOfEveryDivider) {
  Numbers numbers(9);
  for (double divider = 1; divider <= 128; divider += 0.125) {
    for (const double count : {32.0, 64.0, 100.5, 128.0}) {
      for (int i = 0; i < 6; ++i) CompareDuty(SomeDuty(numbers, divider, count), divider, count);
      for (const double percent : {12.5, 25.0, 50.0, 75.0}) {
        for (const double near : {Below(percent), percent, Above(percent)}) {
          CompareDuty(near, divider, count);
        }
      }
    }
  }
}

TEST(NearestDutyCycleOfAny, IsThePlainWalkOfShortOnes) {
  Numbers numbers(4);
  for (int i = 0; i < 20000; ++i) {
    const double divider = numbers.OneIn(2) ? numbers.Whole(1, 128) : numbers.Between(0.1, 300);
    const double count = numbers.OneIn(2) ? 64 : numbers.Between(0.5, 300);
    CompareDuty(SomeDuty(numbers, divider, count), divider, count);
  }
}

// One to four million steps each.
TEST(NearestDutyCycleOfAny, IsThePlainWalkOfLongOnes) {
  Numbers numbers(5);
  int compared = 0;
  while (compared < 240) {
    const double divider =
        numbers.OneIn(2) ? numbers.Whole(5.1e5, 2e6) : numbers.Between(5.1e5, 2e6);
    const double count = divider * numbers.Between(0.6, 1.5);
    const DutyRange range = DutyRangeOf(divider, count);
    if ((range.highest - range.lowest) / range.step <= 1e6) continue;
    CompareDuty(SomeDuty(numbers, divider, count), divider, count);
    ++compared;
  }
}

TEST(NearestDutyCycleOfAny, IsThePlainWalkOfVeryLongOnes) {
  Numbers numbers(6);
  for (int i = 0; i < 6; ++i) {
    const double divider = numbers.Between(5e6, 1e7);  // 10 to 20 million steps
    CompareDuty(SomeDuty(numbers, divider, 2 * divider), divider, 2 * divider);
  }
}

TEST(NearestDutyCycleOfAny, IsThePlainWalkAtBothEnds) {
  const double divider = 1e6;
  const DutyRange range = DutyRangeOf(divider, divider);
  for (const double percent :
       {kTiny, 100 * range.lowest, 100 * Below(range.lowest), 100 * Above(range.lowest), 99.0,
        100.0, 100 * range.highest, 100 * Above(range.highest), 101.0, 1e20, kHuge, kInfinity,
        -kTiny, -1.0, -100.0}) {
    CompareDuty(percent, divider, divider);
  }
  EXPECT_EQ(NearestDutyCycleOfAny(kNan, divider, divider),
            NearestDutyCycle(kNan, divider, divider));
}

// So far below the range, rounding makes many steps equally near, or all of them. The walk takes
// the last.
TEST(NearestDutyCycleOfAny, IsThePlainWalkForRequestsFarBelow) {
  for (const double percent :
       {-1e12, -1e13, -1e14, -1e15, -1e16, -1e17, -1e18, -1e20, -1e300, -kHuge, -kInfinity}) {
    for (const double divider : {100.0, 6e5, 1e6, 1234567.5}) {
      CompareDuty(percent, divider, 2 * divider);
    }
  }
}

TEST(NearestDutyCycleOfAny, HasNoAnswerWithoutARequestOrADivider) {
  for (const double divider : {0.5, 4.0, 1e9, -4.0, kInfinity, kNan}) {
    EXPECT_EQ(NearestDutyCycleOfAny(0, divider, 64), 0.0) << divider;
  }
  for (const double percent : {50.0, -50.0, kInfinity, kNan}) {
    EXPECT_EQ(NearestDutyCycleOfAny(percent, 0, 64), 0.0) << percent;
    EXPECT_EQ(NearestDutyCycleOfAny(percent, 1, 64), 0.5) << percent;
  }
}

// Dividers of which two counts are too short, or that cannot be counted at all.
TEST(NearestDutyCycleOfAny, HasNoAnswerWithoutARange) {
  for (const double divider : {129.0, 1e6, 1e300, kHuge, kInfinity, kNan, 0.5, 1e-300, kTiny}) {
    EXPECT_EQ(NearestDutyCycleOfAny(50, divider, 64), 0.0) << divider;
  }
  EXPECT_EQ(NearestDutyCycleOfAny(50, 4, kNan), 0.5) << "a count that bounds nothing";
}

// The walk of a negative divider goes down for ever. It can only meet the request: from -1/4 in
// steps of -1/8.
TEST(NearestDutyCycleOfAny, OfANegativeDividerMeetsTheRequestOrNothing) {
  EXPECT_EQ(NearestDutyCycleOfAny(-25, -4, 64), -0.25);
  EXPECT_EQ(NearestDutyCycleOfAny(-37.5, -4, 64), -0.375);
  EXPECT_EQ(NearestDutyCycleOfAny(-150, -4, 64), -1.5);
  EXPECT_EQ(NearestDutyCycleOfAny(-30, -4, 64), 0.0);
  EXPECT_EQ(NearestDutyCycleOfAny(50, -4, 64), 0.0);
  EXPECT_EQ(NearestDutyCycleOfAny(-kInfinity, -4, 64), 0.0);
  EXPECT_EQ(NearestDutyCycleOfAny(kNan, -4, 64), 0.0);
}

// --- Length ----------------------------------------------------------------------------------

// Every pair of extreme arguments, some thousands. Plain walks over them would not end.
TEST(LongWalks, AnswerWhateverTheNumbers) {
  const double numbers[] = {0.0,    -0.0,  kTiny, -kTiny, 1e-300,    1e-9,      0.5,
                            1.0,    -1.0,  128.0, 1e6,    -1e6,      1e9,       1e12,
                            1e15,   1e17,  -1e15, 1e100,  -1e100,    1e300,     kHuge,
                            -kHuge, 360.0, 99.0,  kNan,   kInfinity, -kInfinity};
  int answered = 0;
  for (const double request : numbers) {
    for (const double divider : numbers) {
      const double phase = NearestPhaseStepOfAny(request, PhaseStep(divider), request > 0);
      EXPECT_GE(phase, -360.0) << request << ' ' << divider;
      EXPECT_LE(phase, 360.0) << request << ' ' << divider;
      ++answered;
      for (const double count : {64.0, 1e6, 1e12, 1e15, kHuge, kInfinity, kTiny, kNan}) {
        const double duty = NearestDutyCycleOfAny(request, divider, count);
        // A negative divider answers with the request itself or 0.
        if (divider > 0) {
          EXPECT_GE(duty, 0.0) << request << ' ' << divider << ' ' << count;
          EXPECT_LE(duty, 1.0) << request << ' ' << divider << ' ' << count;
        }
        ++answered;
      }
    }
  }
  EXPECT_GT(answered, 6000);
}

}  // namespace
