// Tests of how far the pins of a KRU are off a phase.
#include <gtest/gtest.h>

#include <algorithm>

#include "exactly.h"
#include "planner/search/PhaseTable.h"
#include "tests/compare/Random.h"

namespace planner::search {
namespace {

using exactly::Holds;
using hardware::Rational;

Request RequestOf(const Rational& phase, const Rational& tolerance) {
  Request request;
  request.inputs = {100};
  request.phase_tolerance = tolerance;
  Output output;
  output.frequency = 50;
  output.phase = phase;
  request.outputs.push_back(output);
  return request;
}

PhaseTable TableOf(const Request& request, std::size_t shifts = kShifts) {
  return PhaseTable(request, request.outputs[0], shifts);
}

// The way from what a pin has to what is asked for, the shorter one around.
Rational PlainError(const Rational& phase, std::size_t quarter, std::size_t shift) {
  const Rational made =
      Rational(static_cast<int>(quarter)) * 90 + Rational(static_cast<int>(shift)) * 360 / 255;
  Rational nearest = 360;
  for (int turns = -2; turns <= 3; ++turns) {
    nearest = std::min(nearest, (made - phase - turns * 360).Absolute());
  }
  return nearest;
}

void ExpectPlain(const Request& request, std::size_t shifts) {
  const Rational& phase = *request.outputs[0].phase;
  const Rational& tolerance = request.phase_tolerance;
  const Rational unit = tolerance > 0 ? tolerance : Rational(1, 2);
  const PhaseTable table = TableOf(request, shifts);
  for (std::size_t quarter = 0; quarter < kQuarters; ++quarter) {
    for (std::size_t shift = 0; shift < shifts; ++shift) {
      const Rational error = PlainError(phase, quarter, shift);
      ASSERT_TRUE(Holds(table.Error(quarter, shift), error / unit))
          << exactly::TextOf(phase) << " " << quarter << " " << shift;
      ASSERT_EQ(table.Met(quarter)[shift], error <= tolerance)
          << exactly::TextOf(phase) << " " << quarter << " " << shift;
    }
    for (std::size_t shift = shifts; shift < kShifts; ++shift) {
      ASSERT_FALSE(table.Met(quarter)[shift]);
    }
  }
}

// 85 steps of 360 / 255 degrees are 120, and all 255 are a turn.
TEST(PhaseTable, StepsThatMakeAPhaseExactly) {
  const PhaseTable table = TableOf(RequestOf(120, 0));
  EXPECT_EQ(table.Error(0, 85).value, 0);
  EXPECT_EQ(table.Met(0).count(), 1u);
  EXPECT_TRUE(table.Met(0)[85]);
  const PhaseTable still = TableOf(RequestOf(0, 0));
  EXPECT_EQ(still.Met(0).count(), 2u);
  EXPECT_TRUE(still.Met(0)[0]);
  EXPECT_TRUE(still.Met(0)[255]);
}

TEST(PhaseTable, PhasesBelowZeroAreTurned) {
  for (const auto& [below, above] :
       {std::pair(-240, 120), std::pair(-90, 270), std::pair(-360, 0)}) {
    const PhaseTable one = TableOf(RequestOf(below, Rational(1, 2)));
    const PhaseTable other = TableOf(RequestOf(above, Rational(1, 2)));
    for (std::size_t quarter = 0; quarter < kQuarters; ++quarter) {
      EXPECT_EQ(one.Met(quarter), other.Met(quarter)) << below;
    }
  }
  EXPECT_EQ(TableOf(RequestOf(-90, 0)).Error(3, 0).value, 0);
}

// The unit of a tolerance of 0 is half a degree.
TEST(PhaseTable, NothingIsFurtherOffThanHalfATurn) {
  EXPECT_TRUE(Holds(TableOf(RequestOf(180, 0)).Error(0, 0), 360));
  EXPECT_TRUE(Holds(TableOf(RequestOf(181, 1)).Error(0, 0), 179));
  EXPECT_EQ(TableOf(RequestOf(77, 180)).Met(1).count(), kShifts);
}

TEST(PhaseTable, TheToleranceBelongsToWhatIsMet) {
  // A step is 24 / 17 degrees.
  Request request = RequestOf(0, Rational(24, 17));
  EXPECT_TRUE(TableOf(request).Met(0)[1]);
  EXPECT_TRUE(TableOf(request).Met(0)[254]);
  EXPECT_FALSE(TableOf(request).Met(0)[2]);
  request.phase_tolerance = exactly::JustBelow(Rational(24, 17));
  EXPECT_FALSE(TableOf(request).Met(0)[1]);
  EXPECT_FALSE(TableOf(request).Met(0)[254]);
}

TEST(PhaseTable, AnOutputsOwnToleranceCounts) {
  Request request = RequestOf(45, 1);
  request.outputs[0].phase_tolerance = 45;
  const PhaseTable table = TableOf(request);
  EXPECT_TRUE(table.Met(0)[0]);
  EXPECT_TRUE(table.Met(1)[0]);
  EXPECT_FALSE(table.Met(2)[0]);
  EXPECT_TRUE(Holds(table.Error(0, 0), 1));
}

// Parts below 2^44 are counted with in words, and others are not.
TEST(PhaseTable, IsTheSameInWordsAndBeyond) {
  constexpr std::int64_t kLarge = (std::int64_t{1} << 44) - 1;
  for (const std::int64_t whole : {kLarge, kLarge + 2}) {
    for (const int sign : {-1, 1}) {
      ExpectPlain(RequestOf(Rational(sign) * whole / (whole / 359), Rational(1, 2)), 20);
      ExpectPlain(RequestOf(Rational(sign) * (whole / 2) / whole, Rational(1, 2)), 20);
    }
    ExpectPlain(RequestOf(120, Rational(whole, whole - 1)), 20);
  }
}

TEST(PhaseTable, IsWhatExactNumbersSay) {
  compare::Random random(1);
  for (int i = 0; i < 60; ++i) {
    const auto shifts = static_cast<std::size_t>(random.OneIn(4) ? 256 : random.Int(1, 40));
    Rational phase = random.OneIn(2) ? Rational(random.Int(-359'000, 359'000), 1000)
                                     : Rational(24 * random.Int(-254, 254), 17);
    phase = exactly::Nudged(random, phase);
    const Rational tolerance =
        random.OneIn(3) ? PlainError(phase, 1, shifts / 2) : Rational(random.Int(0, 100), 8);
    ExpectPlain(RequestOf(phase, tolerance), shifts);
  }
}

}  // namespace
}  // namespace planner::search
