// The numbers that a module is given, of which both parts have to be whole and of 31 bits.
#include "planner/hdl/Instance.h"

#include <gtest/gtest.h>

#include <limits>
#include <map>
#include <stdexcept>

#include "tests/planner/report/made.h"

namespace planner::hdl {
namespace {

constexpr std::int64_t kLargest = 2'147'483'647;

// The whole numbers among the attributes.
std::map<std::string, std::int64_t> NumbersOf(const Device& device) {
  const Request request = report::VideoRequest();
  std::map<std::string, std::int64_t> numbers;
  for (const Attribute& one : InstanceOf(request, device, report::VideoAnswer(request)).attributes) {
    if (const auto* number = std::get_if<std::int64_t>(&one.value)) numbers[one.name] = *number;
  }
  return numbers;
}

TEST(Instance, LimitsThatFitAreExact) {
  Device device = report::MadeDevice();
  device.tsyn->vco = {Rational(1801, 3), kLargest};
  auto numbers = NumbersOf(device);
  EXPECT_EQ(numbers["VCO_MIN_NUM"], 1801);
  EXPECT_EQ(numbers["VCO_MIN_DEN"], 3);
  EXPECT_EQ(numbers["VCO_MAX_NUM"], kLargest);
  EXPECT_EQ(numbers["VCO_MAX_DEN"], 1);
}

// Ten decimals are too many: 600.1234567891 is taken as 600.123, and 1440.1234567891 as 1440.124,
// which is 360031 / 250.
TEST(Instance, OthersGoOutwardsToAWholeKilohertz) {
  Device device = report::MadeDevice();
  const Rational rest = Rational::FromDecimal("1234567891", -10);
  device.tsyn->vco = {600 + rest, 1440 + rest};
  auto numbers = NumbersOf(device);
  EXPECT_EQ(numbers["VCO_MIN_NUM"], 600'123);
  EXPECT_EQ(numbers["VCO_MIN_DEN"], 1000);
  EXPECT_EQ(numbers["VCO_MAX_NUM"], 360'031);
  EXPECT_EQ(numbers["VCO_MAX_DEN"], 250);
}

TEST(Instance, LimitsThatAreTooLargeLimitNothing) {
  Device device = report::MadeDevice();
  device.tsyn->vco = {Rational(kLargest + 1), Rational(kLargest + 1)};
  auto numbers = NumbersOf(device);
  EXPECT_EQ(numbers["VCO_MIN_NUM"], 0);
  EXPECT_EQ(numbers["VCO_MIN_DEN"], 1);
  EXPECT_EQ(numbers["VCO_MAX_NUM"], kLargest);
  EXPECT_EQ(numbers["VCO_MAX_DEN"], 1);
}

TEST(Refusal, IsOfInputsThatDoNotFit) {
  Request request = report::MadeRequest({Rational(kLargest), Rational(1, kLargest)}, {});
  EXPECT_EQ(Refusal(request), "");
  request.inputs[1] = Rational(1, kLargest + 1);
  EXPECT_EQ(Refusal(request),
            "the input of 1/2147483648 MHz cannot be written exactly: both parts of this quotient "
            "must be at most 2147483647; give it with fewer digits");
  request.inputs = {Rational(kLargest + 1)};
  EXPECT_EQ(Refusal(request).substr(0, 30), "the input of 2147483648 MHz ca");
}

// 2^63 - 1 is the largest number of 63 bits.
TEST(PartsOf, TakesNoNumberThatIsTooLong) {
  const Rational largest = Rational::FromDecimal("9223372036854775807", 0);
  EXPECT_EQ(PartsOf(1 / largest).denominator, std::numeric_limits<std::int64_t>::max());
  EXPECT_THROW(PartsOf(largest + 1), std::invalid_argument);
}

}  // namespace
}  // namespace planner::hdl
