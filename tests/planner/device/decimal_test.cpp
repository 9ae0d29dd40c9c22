#include "planner/device/Decimal.h"

#include <gtest/gtest.h>

namespace {

using hardware::Rational;
using planner::device::ExactDecimal;

TEST(ExactDecimal, IsTheQuotientThatItSays) {
  EXPECT_EQ(ExactDecimal("187.617"), Rational(187617, 1000));
  EXPECT_EQ(ExactDecimal("1080"), Rational(1080));
  EXPECT_EQ(ExactDecimal("3.125"), Rational(25, 8));
  EXPECT_EQ(ExactDecimal("0.10"), Rational(1, 10));
  EXPECT_EQ(ExactDecimal("0"), Rational(0));
}

TEST(ExactDecimal, TakesExponents) {
  EXPECT_EQ(ExactDecimal("4e2"), Rational(400));
  EXPECT_EQ(ExactDecimal("40.5e02"), Rational(4050));
  EXPECT_EQ(ExactDecimal("125e-3"), Rational(1, 8));
  EXPECT_EQ(ExactDecimal("1.25e-1"), Rational(1, 8));
  EXPECT_EQ(ExactDecimal("9223372036854775807"), Rational(9223372036854775807));
}

// 0.1 and 187.617 are no doubles: what the double is, is another number.
TEST(ExactDecimal, IsNotTheDouble) {
  EXPECT_NE(ExactDecimal("0.1"), Rational::FromDouble(0.1));
  EXPECT_NE(ExactDecimal("187.617"), Rational::FromDouble(187.617));
  EXPECT_EQ(ExactDecimal("0.5"), Rational::FromDouble(0.5));
}

TEST(ExactDecimal, TakesNumbersOfAnyLength) {
  EXPECT_EQ(ExactDecimal("1e300") * ExactDecimal("1e-300"), Rational(1));
  EXPECT_EQ(ExactDecimal("1" + std::string(6000, '0') + ".0e-6000"), Rational(1));
  EXPECT_EQ(ExactDecimal("0." + std::string(5999, '0') + "1e6000"), Rational(1));
  EXPECT_EQ(ExactDecimal("0.3" + std::string(6000, '0') + "e1"), Rational(3));
  // 10^6000 + 1 in units of 10^-6000.
  EXPECT_EQ(ExactDecimal("1" + std::string(5999, '0') + "1e-6000") - Rational(1),
            ExactDecimal("1e-6000"));
}

TEST(ExactFigure, IsTheDoubleWhereThereIsNoSource) {
  Device::Grade grade;
  grade.figures.resize(Device::Keywords().size());
  grade.figures[3] = 0.1;
  EXPECT_EQ(planner::device::ExactFigure(grade, 3), Rational::FromDouble(0.1));
  EXPECT_EQ(planner::device::ExactFigure(grade, 2), std::nullopt);
}

}  // namespace
