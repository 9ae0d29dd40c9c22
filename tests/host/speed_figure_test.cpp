#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>

#include "host/bundled/device/SpeedFigure.h"

namespace {

using Device::SpeedFigure;

double Product(double figure) { return figure * 1e9; }

// The smallest error that any double near value / 1e9 has: the obvious way to find it.
double SmallestError(double value) {
  constexpr int kNeighbours = 8;
  double figure = value / 1e9;
  for (int i = 0; i < kNeighbours; ++i) figure = std::nextafter(figure, -1.0);
  double smallest = std::numeric_limits<double>::infinity();
  for (int i = 0; i <= 2 * kNeighbours; ++i) {
    smallest = std::min(smallest, std::abs(Product(figure) - value));
    figure = std::nextafter(figure, std::numeric_limits<double>::infinity());
  }
  return smallest;
}

void ExpectNearest(double value) {
  const double error = std::abs(Product(SpeedFigure(value)) - value);
  EXPECT_EQ(error, SmallestError(value)) << "for " << value;
}

TEST(SpeedFigure, GivesRoundLimitsBackExactly) {
  for (const double value :
       {1080.0, 1000.0, 1440.0, 1200.0, 600.0,  500.0,   400.0, 375.0, 300.0, 64.0,   19.0,  10.0,
        5.0,    3.125,  4.6875, 2.5,    0.3125, 0.15625, 2.667, 3.571, 5.333, 3200.0, 6400.0}) {
    EXPECT_EQ(Product(SpeedFigure(value)), value);
  }
}

TEST(SpeedFigure, IsOneUnitInTheLastPlaceOffWhereNoDoubleIsExact) {
  for (const double value : {15.0, 60.0, 960.0}) {
    ASSERT_GT(SmallestError(value), 0) << value;
    const double product = Product(SpeedFigure(value));
    EXPECT_TRUE(product == std::nextafter(value, 0) || product == std::nextafter(value, 1e9))
        << value;
  }
}

TEST(SpeedFigure, IsTheNearestForIntegers) {
  for (int i = 1; i <= 10'000; ++i) ExpectNearest(i);
}

TEST(SpeedFigure, IsTheNearestForThousandthsAndSixtyFourths) {
  for (int i = 1; i <= 20'000; ++i) {
    ExpectNearest(i / 1000.0);
    ExpectNearest(i / 64.0);
  }
}

TEST(SpeedFigure, IsTheNearestForPowersOfTwo) {
  for (int exponent = -300; exponent <= 1000; ++exponent) ExpectNearest(std::ldexp(1, exponent));
}

TEST(SpeedFigure, IsTheNearestForAnyNumber) {
  std::mt19937_64 random(20'240'511);
  std::uniform_real_distribution<double> exponent(-6, 12);
  for (int i = 0; i < 20'000; ++i) ExpectNearest(std::pow(10, exponent(random)));
}

TEST(SpeedFigure, StaysFiniteAtTheEnds) {
  EXPECT_TRUE(std::isfinite(SpeedFigure(std::numeric_limits<double>::max())));
  EXPECT_TRUE(std::isfinite(SpeedFigure(std::numeric_limits<double>::denorm_min())));
  EXPECT_TRUE(std::isfinite(Product(SpeedFigure(std::numeric_limits<double>::max()))));
}

}  // namespace
