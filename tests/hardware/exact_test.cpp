#include "hardware/Exact.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <optional>
#include <stdexcept>

namespace hardware {
namespace {

TEST(Rational, IsKeptInLowestTerms) {
  const Rational value(-6, -4);
  EXPECT_EQ(value.NumeratorText(), "3");
  EXPECT_EQ(value.DenominatorText(), "2");
  EXPECT_THROW(Rational(1, 0), std::domain_error);
}

TEST(Rational, CountsBeyondTwoWords) {
  const Rational most = std::numeric_limits<std::int64_t>::max();
  const Rational square = most * most;
  EXPECT_EQ(square.NumeratorText(), "85070591730234615847396907784232501249");
  EXPECT_EQ(square / most, most);
  EXPECT_EQ((square + 1) - square, Rational(1));
  const Rational least = std::numeric_limits<std::int64_t>::min();
  EXPECT_EQ((-least).NumeratorText(), "9223372036854775808");
  EXPECT_EQ(-(-least), least);
}

TEST(Rational, TellsItsWordsWhereItFits) {
  const std::optional<Rational::Words> words = Rational(6, -4).InWords();
  ASSERT_TRUE(words.has_value());
  EXPECT_EQ(words->numerator, -3);
  EXPECT_EQ(words->denominator, 2);
  const Rational most = std::numeric_limits<std::int64_t>::max();
  EXPECT_FALSE((most + 1).InWords().has_value());
}

TEST(Rational, RoundsOnceWhenShown) {
  EXPECT_EQ(Rational(2, 3).Fixed(3), "0.667");
  EXPECT_EQ(Rational(-1, 2).Fixed(0), "-1");
  EXPECT_EQ(Rational(-1, 3000).Fixed(3), "0.000");
  EXPECT_EQ(Rational(12345, 10).Fixed(0), "1235");
}

}  // namespace
}  // namespace hardware
