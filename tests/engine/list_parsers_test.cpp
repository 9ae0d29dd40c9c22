// Tests of the request lists. The three parsers share one rule, so every test runs for each.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <ostream>
#include <string>

#include "tests/engine/EngineTest.h"

namespace {

using engine_test::kInfinity;
using Ip::RequestList;
using Ip::VorkelImp;
using testing::Each;
using testing::ElementsAre;

struct ListParser {
  const char* name;
  bool (VorkelImp::*parse)(int, const Port::StringBase&);
  RequestList Ip::Requests::*list;
};

void PrintTo(const ListParser& parser, std::ostream* out) { *out << parser.name; }

class ListParserTest : public testing::TestWithParam<ListParser> {
 protected:
  // What the lists hold before each test, so that a slot that was written shows.
  static constexpr double kOld = 99.0;

  ListParserTest() {
    imp_.requests.reqOutFreq.fill(kOld);
    imp_.requests.reqPhase.fill(kOld);
    imp_.requests.reqDutyCycle.fill(kOld);
  }

  bool Parse(int count, const Port::StringBase& text) {
    return (imp_.*GetParam().parse)(count, text);
  }
  const RequestList& List() const { return imp_.requests.*GetParam().list; }

  VorkelImp& imp_ = engine_test::NewImp();
};

TEST_P(ListParserTest, StoresCountNumbersAndLeavesTheRest) {
  EXPECT_TRUE(Parse(3, "100 200.5 -3e1"));
  EXPECT_THAT(List(), ElementsAre(100, 200.5, -30, kOld, kOld, kOld, kOld));
}

TEST_P(ListParserTest, FillsOnlyItsOwnList) {
  ASSERT_TRUE(Parse(7, "1 2 3 4 5 6 7"));
  EXPECT_THAT(List(), ElementsAre(1, 2, 3, 4, 5, 6, 7));
  int changed = 0;
  for (const RequestList* list : {&imp_.requests.reqOutFreq, &imp_.requests.reqPhase,
                                  &imp_.requests.reqDutyCycle}) {
    if ((*list)[0] != kOld) ++changed;
  }
  EXPECT_EQ(changed, 1);
}

TEST_P(ListParserTest, EmptyTextIsFalseAndChangesNothing) {
  for (int count = 1; count <= 7; ++count) EXPECT_FALSE(Parse(count, "")) << count;
  EXPECT_THAT(List(), Each(kOld));
}

TEST_P(ListParserTest, BlanksAloneHoldNoNumber) {
  EXPECT_FALSE(Parse(1, " "));
  EXPECT_FALSE(Parse(1, "      "));
  EXPECT_THAT(List(), Each(kOld));
}

TEST_P(ListParserTest, ShortListStoresWhatItHasAndIsFalse) {
  EXPECT_FALSE(Parse(3, "100 200"));
  EXPECT_THAT(List(), ElementsAre(100, 200, kOld, kOld, kOld, kOld, kOld));
}

TEST_P(ListParserTest, ListShortByAllButOneStoresThatOne) {
  EXPECT_FALSE(Parse(7, "5 "));
  EXPECT_THAT(List(), ElementsAre(5, kOld, kOld, kOld, kOld, kOld, kOld));
}

TEST_P(ListParserTest, NumbersBeyondCountAreIgnored) {
  EXPECT_TRUE(Parse(2, "1 2 3 4"));
  EXPECT_THAT(List(), ElementsAre(1, 2, kOld, kOld, kOld, kOld, kOld));
}

TEST_P(ListParserTest, MoreNumbersThanOutputsAreIgnored) {
  EXPECT_TRUE(Parse(7, "1 2 3 4 5 6 7 8 9"));
  EXPECT_THAT(List(), ElementsAre(1, 2, 3, 4, 5, 6, 7));
}

TEST_P(ListParserTest, CountOutsideTheOutputsIsFalseAndStoresNothing) {
  for (const int count : {0, -1, INT_MIN, 8, 9, INT_MAX}) {
    EXPECT_FALSE(Parse(count, "1 2 3 4 5 6 7 8 9")) << count;
    EXPECT_FALSE(Parse(count, "")) << count;
    EXPECT_FALSE(Parse(count, " ")) << count;
  }
  EXPECT_THAT(List(), Each(kOld));
}

TEST_P(ListParserTest, TextThatIsNoNumberReadsAsZero) {
  EXPECT_TRUE(Parse(6, "abc 12abc .5 1,5 --3 {4"));
  EXPECT_THAT(List(), ElementsAre(0, 12, 0.5, 1, 0, 0, kOld));
}

TEST_P(ListParserTest, TakesInfinityAndNan) {
  EXPECT_TRUE(Parse(5, "inf -INF infinity nan NaN"));
  EXPECT_EQ(List()[0], kInfinity);
  EXPECT_EQ(List()[1], -kInfinity);
  EXPECT_EQ(List()[2], kInfinity);
  EXPECT_TRUE(std::isnan(List()[3]));
  EXPECT_TRUE(std::isnan(List()[4]));
}

TEST_P(ListParserTest, TakesHexadecimal) {
  // 0x1p4 = 16, 0X1F = 31, -0x.8 = -1/2.
  EXPECT_TRUE(Parse(3, "0x1p4 0X1F -0x.8"));
  EXPECT_THAT(List(), ElementsAre(16, 31, -0.5, kOld, kOld, kOld, kOld));
}

TEST_P(ListParserTest, TakesNumbersBeyondTheRangeOfDouble) {
  EXPECT_TRUE(Parse(3, "1e999 -1e999 1e-999"));
  EXPECT_THAT(List(), ElementsAre(kInfinity, -kInfinity, 0, kOld, kOld, kOld, kOld));
}

TEST_P(ListParserTest, AnyRunOfBlanksSeparates) {
  EXPECT_TRUE(Parse(3, "   1   2  3    "));
  EXPECT_THAT(List(), ElementsAre(1, 2, 3, kOld, kOld, kOld, kOld));
}

TEST_P(ListParserTest, OtherWhiteSpaceIsTrimmedFromBothEndsOfAToken) {
  EXPECT_TRUE(Parse(3, "\t100\n \v200\f\r 300"));
  EXPECT_THAT(List(), ElementsAre(100, 200, 300, kOld, kOld, kOld, kOld));
}

TEST_P(ListParserTest, OtherWhiteSpaceSeparatesNothing) {
  EXPECT_FALSE(Parse(2, "100\t200"));
  EXPECT_THAT(List(), ElementsAre(100, kOld, kOld, kOld, kOld, kOld, kOld));
  EXPECT_FALSE(Parse(2, "300\n400"));
  EXPECT_THAT(List(), ElementsAre(300, kOld, kOld, kOld, kOld, kOld, kOld));
}

TEST_P(ListParserTest, ATokenOfWhiteSpaceOnlyIsATokenAndReadsAsZero) {
  EXPECT_TRUE(Parse(2, "\t 5"));
  EXPECT_THAT(List(), ElementsAre(0, 5, kOld, kOld, kOld, kOld, kOld));
}

TEST_P(ListParserTest, ALaterListOverwrites) {
  ASSERT_TRUE(Parse(3, "1 2 3"));
  ASSERT_TRUE(Parse(2, "4 5"));
  EXPECT_THAT(List(), ElementsAre(4, 5, 3, kOld, kOld, kOld, kOld));
}

TEST_P(ListParserTest, LongTokensAreReadWhole) {
  const std::string digits = std::string(100000, '0') + "7." + std::string(100000, '0') + "1";
  EXPECT_TRUE(Parse(1, digits.c_str()));
  EXPECT_EQ(List()[0], 7.0);
}

INSTANTIATE_TEST_SUITE_P(
    Lists, ListParserTest,
    testing::Values(
        ListParser{"OutFreqs", &VorkelImp::ParseOutFreqs, &Ip::Requests::reqOutFreq},
        ListParser{"Phases", &VorkelImp::ParsePhases, &Ip::Requests::reqPhase},
        ListParser{"DutyCycles", &VorkelImp::ParseDutyCycles, &Ip::Requests::reqDutyCycle}),
    [](const testing::TestParamInfo<ListParser>& parser) { return parser.param.name; });

}  // namespace
