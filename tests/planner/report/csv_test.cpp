#include "planner/report/Csv.h"

#include <gtest/gtest.h>

namespace planner::report {
namespace {

// As RFC 4180 has it.
TEST(CsvRow, QuotesWhatNeedsIt) {
  EXPECT_EQ(CsvRow({"a", "", "b c"}), "a,,b c\r\n");
  EXPECT_EQ(CsvRow({"a,b"}), "\"a,b\"\r\n");
  EXPECT_EQ(CsvRow({"say \"hi\"", "x\ny", "x\ry"}),
            "\"say \"\"hi\"\"\",\"x\ny\",\"x\ry\"\r\n");
  EXPECT_EQ(CsvRow({}), "\r\n");
}

TEST(CsvRow, SameTextsAreSeveralCells) { EXPECT_EQ(CsvRow({"", "", ""}), ",,\r\n"); }

TEST(CsvNumber, IsAsShortAsItCanBe) {
  EXPECT_EQ(CsvNumber(148.5), "148.5");
  EXPECT_EQ(CsvNumber(27), "27");
  EXPECT_EQ(CsvNumber(-0.0), "0");
  EXPECT_EQ(CsvNumber(100.0 / 3), "33.333333333333336");
  EXPECT_EQ(CsvNumber(-1e300), "-1e+300");
}

}  // namespace
}  // namespace planner::report
