// How a method reads a count or an index.
#include "tests/binding/ScriptCalls.h"

#include <gtest/gtest.h>

#include <climits>
#include <cstdlib>
#include <string>

#include "binding/Call.h"

namespace {

class CountTest : public testing::Test {
 protected:
  int CountOf(const std::string& text) {
    const TestWords words(handle_, {"Method", text});
    return Ip::Call(words.Count(), words.Data(), interp_.get()).Count(0);
  }

  BoundInterp interp_;
  Ip::VorkelPtrHandle handle_{interp_.get()};
};

TEST_F(CountTest, IsWhatAtoiReads) {
  for (const char* text :
       {"", "0", "-0", "+7", " \t\n12x", "1.9", "1e3", "0x10", "abc", "--1", "2147483647",
        "-2147483648", "2147483648", "-2147483649", "4294967295", "4294967296", "4294967297",
        "-4294967295", "99999999999", "-99999999999", "9223372036854775807",
        "9223372036854775808", "-9223372036854775808", "-9223372036854775809",
        "1000000000000000000000000"}) {
    EXPECT_EQ(CountOf(text), std::atoi(text)) << text;
  }
}

TEST_F(CountTest, KeepsTheLow32BitsOfALong) {
  EXPECT_EQ(CountOf("4294967297"), 1);
  EXPECT_EQ(CountOf("-4294967295"), 1);
  EXPECT_EQ(CountOf("2147483648"), INT_MIN);
  EXPECT_EQ(CountOf("-2147483649"), INT_MAX);
}

TEST_F(CountTest, TakesTheNearestLongBeforeThat) {
  EXPECT_EQ(CountOf("9223372036854775808"), -1);
  EXPECT_EQ(CountOf("-9223372036854775809"), 0);
}

}  // namespace
