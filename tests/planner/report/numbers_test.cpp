#include "planner/report/Numbers.h"

#include <gtest/gtest.h>

namespace planner::report {
namespace {

TEST(Numbers, FixedHasAllDecimalsAndNeverANegativeZero) {
  EXPECT_EQ(Fixed(Rational(297, 2), 6), "148.500000");
  EXPECT_EQ(Fixed(Rational(-1, 1000), 2), "0.00");
  EXPECT_EQ(Fixed(Rational(-5, 1000), 2), "-0.01");  // half of the last decimal, away from 0
  EXPECT_EQ(Fixed(128.815, 3), "128.815");
}

TEST(Numbers, ShortHasNoZerosAtItsEnd) {
  EXPECT_EQ(Short(Rational(297, 2), 6), "148.5");
  EXPECT_EQ(Short(Rational(100, 3), 6), "33.333333");
  EXPECT_EQ(Short(Rational(300), 6), "300");
  EXPECT_EQ(Short(Rational(1, 10000000), 6), "0");
  EXPECT_EQ(Short(Rational(300), 0), "300");
}

TEST(Numbers, GeneralHasSoManyDigits) {
  EXPECT_EQ(General(0, 6), "0");
  EXPECT_EQ(General(Rational(124375, 100), 6), "1243.75");
  EXPECT_EQ(General(Rational(12475, 14), 6), "891.071");
  EXPECT_EQ(General(Rational(999999, 1), 3), "1e+06");
  EXPECT_EQ(General(Rational(9999996, 10), 6), "1e+06");
  EXPECT_EQ(General(Rational(9999994, 10), 6), "999999");
  EXPECT_EQ(General(Rational::FromDecimal("1", 300), 6), "1e+300");
  EXPECT_EQ(General(Rational(-1234567, 1), 3), "-1.23e+06");
  EXPECT_EQ(General(Rational(23, 100000), 2), "0.00023");
  EXPECT_EQ(General(Rational(23, 1000000), 2), "2.3e-05");
  EXPECT_EQ(General(Rational(400), 6), "400");
}

TEST(Numbers, DistinctHasTheDecimalsThatTellItFromAnother) {
  EXPECT_EQ(Distinct(Rational(500), Rational(400), 6), "500");
  EXPECT_EQ(Distinct(Rational(400), Rational(400), 6), "400");
  // 400 - 4e-7 would read as 400.
  EXPECT_EQ(Distinct(Rational(3999999996, 10000000), Rational(400), 6), "399.9999996");
  EXPECT_EQ(Distinct(Rational(400) + Rational(1, 300000000), Rational(400), 6), "400.000000003");
}

TEST(Numbers, TimesHaveThreeDecimals) {
  EXPECT_EQ(Ps(126.03), "126.030");
  EXPECT_EQ(Ps(0), "0.000");
}

TEST(Numbers, CountsOfEighthsAreNumbers) {
  EXPECT_EQ(Eighths(352), "44");
  EXPECT_EQ(Eighths(499), "62.375");
  EXPECT_EQ(Eighths(50), "6.25");
}

TEST(Numbers, ExactTexts) {
  EXPECT_EQ(Quotient(Rational(297, 2)), "297/2");
  EXPECT_EQ(Quotient(Rational(-3)), "-3");
  EXPECT_EQ(Decimal(Rational(297, 2)), "148.5");
  EXPECT_EQ(Decimal(Rational(-1, 8)), "-0.125");
  EXPECT_EQ(Decimal(Rational(1, 1024)), "0.0009765625");
  EXPECT_EQ(Decimal(Rational(100, 3)), "100/3");
  EXPECT_EQ(Decimal(Rational(1200)), "1200");
  EXPECT_EQ(Decimal(Rational(1, 15)), "1/15");
}

}  // namespace
}  // namespace planner::report
