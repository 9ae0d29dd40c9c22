// Tests of the choice between the pin lists of a KRU_SP.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "tests/engine/KruTest.h"

namespace {

using engine_test::Names;
using Ip::KruPin;
using Ip::KruPinList;
using Ip::Trace;
using Ip::VorkelImp;
using Ip::Kru::ClkdvLists;
using enum Ip::KruPin;

constexpr char kFWorks[] = "DLL --    _kruPinsDivBy2F list works!\n";
constexpr char kTWorks[] = "DLL ---------- _kruPinsDivBy2T list works!\n";
constexpr char kSecond[] = "DLL ---------- checking 2nd list: _kruPinsDivBy2T \n";

class ListChoiceTest : public testing::Test {
 protected:
  ListChoiceTest() {
    // What a failed choice has to leave alone.
    kru_._kruChosenPin = {CLK270, CLK270};
    kru_._kruChosenM = 99;
    kru_._kruChosenD = 98;
    kru_._kruChosenClkdv = 7.5;
  }

  bool Choose(const std::vector<double>& frequencies, const KruPinList& f, const KruPinList& t,
              const ClkdvLists& clkdv = {}) {
    for (std::size_t n = 0; n < frequencies.size(); ++n) {
      imp_.requests.reqOutFreq[n] = frequencies[n];
    }
    kru_._kruPinsDivBy2F = f;
    kru_._kruPinsDivBy2T = t;
    bool chosen = false;
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      chosen = Ip::Kru::ChooseList(
          imp_, clkdv, {100, static_cast<int>(frequencies.size()), true, trace});
    });
    return chosen;
  }

  void ExpectChosen(const std::string& pins, int m, int d, bool divBy2, double clkdv) const {
    EXPECT_EQ(Names(kru_._kruChosenPin), pins);
    EXPECT_EQ(kru_._kruChosenM, m);
    EXPECT_EQ(kru_._kruChosenD, d);
    EXPECT_EQ(kru_._kruChosenDivBy2, divBy2);
    EXPECT_EQ(kru_._kruChosenClkdv, clkdv);
  }

  VorkelImp& imp_ = engine_test::NewImp();
  Ip::KruState& kru_ = imp_.kru;
  std::string trace_;
};

// --- Which list --------------------------------------------------------------------------------

// No synthesised output: no search, and M and D stay.
TEST_F(ListChoiceTest, AFilledListFIsTaken) {
  kru_._kruChosenDivBy2 = true;
  EXPECT_TRUE(Choose({100, 100, 200}, {CLK0, CLK90, CLK2X}, {CLK2X, NONE, CLKFX}));
  EXPECT_EQ(trace_, kFWorks);
  ExpectChosen("CLK0 CLK90 CLK2X", 99, 98, false, 0);
}

TEST_F(ListChoiceTest, ListFComesFirst) {
  EXPECT_TRUE(Choose({100}, {CLK0}, {CLK2X}));
  ExpectChosen("CLK0", 99, 98, false, 0);
}

TEST_F(ListChoiceTest, ListTIsTakenWhenListFIsUnfilled) {
  EXPECT_TRUE(Choose({100, 50, 50}, {CLK0, NONE, NONE}, {CLK2X, CLK90, CLK180}));
  EXPECT_EQ(trace_,
            std::string("DLL -------- _kruPinsDivby2F[1] isn't filled, so KRU won't work for "
                        "DivBy2 = F\n") +
                kSecond + kTWorks);
  ExpectChosen("CLK2X CLK90 CLK180", 99, 98, true, 0);
}

TEST_F(ListChoiceTest, BothListsUnfilled) {
  EXPECT_FALSE(Choose({100, 50, 50}, {NONE, CLK0, CLK0}, {CLK0, CLK0, NONE}));
  EXPECT_EQ(trace_,
            std::string("DLL -------- _kruPinsDivby2F[0] isn't filled, so KRU won't work for "
                        "DivBy2 = F\n") +
                kSecond +
                "DLL -------- _kruPinsDivby2T[2] isn't filled, so KRU won't work for DivyBy2 = "
                "T\n");
  ExpectChosen("CLK270 CLK270", 99, 98, false, 7.5);
}

TEST_F(ListChoiceTest, AFailureKeepsTheEarlierSettings) {
  kru_._kruChosenDivBy2 = true;
  EXPECT_FALSE(Choose({100}, {NONE}, {NONE}));
  ExpectChosen("CLK270 CLK270", 99, 98, true, 7.5);
}

TEST_F(ListChoiceTest, OutputsBeyondTheCountDoNotMatter) {
  // Neither an entry without a pin nor one that would need M and D nor a divide value.
  EXPECT_TRUE(Choose({100}, {CLK0, NONE, CLKFX}, {}, {.f = {0, 4, 2}}));
  EXPECT_EQ(trace_, kFWorks);
  ExpectChosen("CLK0 NONE CLKFX", 99, 98, false, 0);
}

// --- M and D -----------------------------------------------------------------------------------

TEST_F(ListChoiceTest, ListFWithMAndD) {
  EXPECT_TRUE(Choose({100, 350}, {CLK0, CLKFX}, {CLK2X, CLKFX}));
  EXPECT_EQ(trace_,
            std::string("DLL ----- looking for M/D for requested ofreq = 350.000000\n"
                        "DLL ----- a possible M = 7, D = 2\n"
                        "DLL ----- a possible M = 14, D = 4\n"
                        "DLL ----- a possible M = 21, D = 6\n"
                        "DLL ----- a possible M = 28, D = 8\n"
                        "DLL ----- found 4 possible M and Ds\n"
                        "DLL -- found M = 7, D = 2\n") +
                kFWorks);
  ExpectChosen("CLK0 CLKFX", 7, 2, false, 0);
}

TEST_F(ListChoiceTest, Clkfx180AloneNeedsMAndDToo) {
  EXPECT_TRUE(Choose({100, 350}, {CLK0, CLKFX180}, {}));
  ExpectChosen("CLK0 CLKFX180", 7, 2, false, 0);
}

// Both outputs on CLKFX have no common M and D; in list T only the second is on it, and its
// 1550 is 50 x 31.
TEST_F(ListChoiceTest, ListTIsTakenWhenListFHasNoMAndD) {
  EXPECT_TRUE(Choose({50, 1550}, {CLKFX, CLKFX}, {CLK0, CLKFX}));
  EXPECT_EQ(trace_,
            std::string("DLL ----- looking for M/D for requested ofreq = 50.000000\n"
                        "DLL ----- a possible M = 2, D = 4\n"
                        "DLL ----- a possible M = 3, D = 6\n"
                        "DLL ----- a possible M = 4, D = 8\n"
                        "DLL ----- a possible M = 5, D = 10\n"
                        "DLL ----- a possible M = 6, D = 12\n"
                        "DLL ----- a possible M = 7, D = 14\n"
                        "DLL ----- a possible M = 8, D = 16\n"
                        "DLL ----- a possible M = 9, D = 18\n"
                        "DLL ----- a possible M = 10, D = 20\n"
                        "DLL ----- a possible M = 11, D = 22\n"
                        "DLL ----- a possible M = 12, D = 24\n"
                        "DLL ----- a possible M = 13, D = 26\n"
                        "DLL ----- a possible M = 14, D = 28\n"
                        "DLL ----- a possible M = 15, D = 30\n"
                        "DLL ----- a possible M = 16, D = 32\n"
                        "DLL ----- looking for M/D for requested ofreq = 1550.000000\n"
                        "DLL ----- testing M = 2, D = 4\n"
                        "DLL ----- removed possible M = 2, D = 4\n"
                        "DLL ----- testing M = 3, D = 6\n"
                        "DLL ----- removed possible M = 3, D = 6\n"
                        "DLL ----- testing M = 4, D = 8\n"
                        "DLL ----- removed possible M = 4, D = 8\n"
                        "DLL ----- testing M = 5, D = 10\n"
                        "DLL ----- removed possible M = 5, D = 10\n"
                        "DLL ----- testing M = 6, D = 12\n"
                        "DLL ----- removed possible M = 6, D = 12\n"
                        "DLL ----- testing M = 7, D = 14\n"
                        "DLL ----- removed possible M = 7, D = 14\n"
                        "DLL ----- testing M = 8, D = 16\n"
                        "DLL ----- removed possible M = 8, D = 16\n"
                        "DLL ----- testing M = 9, D = 18\n"
                        "DLL ----- removed possible M = 9, D = 18\n"
                        "DLL ----- testing M = 10, D = 20\n"
                        "DLL ----- removed possible M = 10, D = 20\n"
                        "DLL ----- testing M = 11, D = 22\n"
                        "DLL ----- removed possible M = 11, D = 22\n"
                        "DLL ----- testing M = 12, D = 24\n"
                        "DLL ----- removed possible M = 12, D = 24\n"
                        "DLL ----- testing M = 13, D = 26\n"
                        "DLL ----- removed possible M = 13, D = 26\n"
                        "DLL ----- testing M = 14, D = 28\n"
                        "DLL ----- removed possible M = 14, D = 28\n"
                        "DLL ----- testing M = 15, D = 30\n"
                        "DLL ----- removed possible M = 15, D = 30\n"
                        "DLL ----- testing M = 16, D = 32\n"
                        "DLL ----- removed possible M = 16, D = 32\n"
                        "DLL ----- couldn't find and M and Ds for clknum 1\n"
                        "DLL -- couldn't find an M and D\n") +
                kSecond +
                "DLL ----- looking for M/D for requested ofreq = 1550.000000\n"
                "DLL ----- a possible M = 31, D = 1\n"
                "DLL ----- found 1 possible M and Ds\n"
                "DLL -- found M = 31, D = 1\n" +
                kTWorks);
  ExpectChosen("CLK0 CLKFX", 31, 1, true, 0);
}

TEST_F(ListChoiceTest, NeitherListHasMAndD) {
  EXPECT_FALSE(Choose({3300}, {CLKFX}, {CLKFX180}));
  const std::string search =
      "DLL ----- looking for M/D for requested ofreq = 3300.000000\n"
      "DLL ----- couldn't find and M and Ds for clknum 0\n"
      "DLL -- couldn't find an M and D\n";
  EXPECT_EQ(trace_, search + kSecond + search);
  ExpectChosen("CLK270 CLK270", 99, 98, false, 7.5);
}

TEST_F(ListChoiceTest, ListFWithoutMAndDAndListTUnfilled) {
  EXPECT_FALSE(Choose({3300}, {CLKFX}, {NONE}));
  EXPECT_EQ(trace_,
            std::string("DLL ----- looking for M/D for requested ofreq = 3300.000000\n"
                        "DLL ----- couldn't find and M and Ds for clknum 0\n"
                        "DLL -- couldn't find an M and D\n") +
                kSecond +
                "DLL -------- _kruPinsDivby2T[0] isn't filled, so KRU won't work for DivyBy2 = "
                "T\n");
}

// --- One CLKDV value ---------------------------------------------------------------------------

TEST_F(ListChoiceTest, TheValueOfOneOutput) {
  for (const std::size_t n : {0, 1, 2}) {
    ClkdvLists clkdv;
    clkdv.f[n] = 4;
    KruPinList pins = {CLK0, CLK0, CLK0};
    pins[n] = CLKDV;
    EXPECT_TRUE(Choose({100, 100, 100}, pins, {}, clkdv));
    EXPECT_EQ(trace_, kFWorks) << n;
    EXPECT_EQ(kru_._kruChosenClkdv, 4.0) << n;
  }
  EXPECT_TRUE(Choose({25}, {CLKDV}, {}, {.f = {4}}));
  EXPECT_EQ(kru_._kruChosenClkdv, 4.0);
}

TEST_F(ListChoiceTest, TheSameValueOfSeveral) {
  EXPECT_TRUE(Choose({25, 100, 25, 25}, {CLKDV, CLK0, CLKDV, CLKDV}, {}, {.f = {4, 0, 4, 4}}));
  EXPECT_EQ(trace_,
            std::string("DLL ------ CLKDV is used, with this value: 4.000000\n"
                        "DLL ------ CLKDV is used, with this value: 4.000000\n") +
                kFWorks);
  ExpectChosen("CLKDV CLK0 CLKDV CLKDV", 99, 98, false, 4);
  // The first value found later is the first value, too.
  EXPECT_TRUE(Choose({100, 25, 25}, {CLK0, CLKDV, CLKDV}, {}, {.f = {0, 4, 4}}));
  EXPECT_EQ(trace_, std::string("DLL ------ CLKDV is used, with this value: 4.000000\n") + kFWorks);
}

TEST_F(ListChoiceTest, AnotherValueGoesToClkfx) {
  EXPECT_TRUE(Choose({50, 350}, {CLKDV, CLKDV}, {CLK0, CLKFX}, {.f = {2, 4}}));
  EXPECT_EQ(trace_,
            std::string("DLL ------ CLKDV is used, with this value: 2.000000\n"
                        "DLL -------- non-matching CLKDVs used: value: 4.000000; changing "
                        "divBy2F[1] to CLKFX\n"
                        "DLL ----- looking for M/D for requested ofreq = 350.000000\n"
                        "DLL ----- a possible M = 7, D = 2\n"
                        "DLL ----- a possible M = 14, D = 4\n"
                        "DLL ----- a possible M = 21, D = 6\n"
                        "DLL ----- a possible M = 28, D = 8\n"
                        "DLL ----- found 4 possible M and Ds\n"
                        "DLL -- found M = 7, D = 2\n") +
                kFWorks);
  ExpectChosen("CLKDV CLKFX", 7, 2, false, 2);
  EXPECT_EQ(Names(kru_._kruPinsDivBy2F), "CLKDV CLKFX");
}

TEST_F(ListChoiceTest, EveryOtherValueGoesToClkfx) {
  // 25 and 12.5 MHz have no common M and D.
  EXPECT_FALSE(Choose({100, 50, 25, 50, 12.5}, {CLK0, CLKDV, CLKDV, CLKDV, CLKDV}, {NONE},
                      {.f = {0, 2, 4, 2, 8}}));
  EXPECT_EQ(trace_.substr(0, trace_.find("DLL ----- looking")),
            "DLL ------ CLKDV is used, with this value: 2.000000\n"
            "DLL -------- non-matching CLKDVs used: value: 4.000000; changing divBy2F[2] to "
            "CLKFX\n"
            "DLL ------ CLKDV is used, with this value: 2.000000\n"
            "DLL ------ CLKDV is used, with this value: 2.000000\n"
            "DLL -------- non-matching CLKDVs used: value: 8.000000; changing divBy2F[4] to "
            "CLKFX\n");
  EXPECT_EQ(Names(kru_._kruPinsDivBy2F), "CLK0 CLKDV CLKFX CLKDV CLKFX");
}

// CLKFX is not asked for its range here: 3300 MHz is beyond it, and only the search refuses.
TEST_F(ListChoiceTest, AnotherValueThatClkfxCannotServe) {
  EXPECT_TRUE(Choose({50, 3300}, {CLKDV, CLKDV}, {CLK0, CLK0}, {.f = {2, 4}}));
  EXPECT_EQ(trace_,
            std::string("DLL ------ CLKDV is used, with this value: 2.000000\n"
                        "DLL -------- non-matching CLKDVs used: value: 4.000000; changing "
                        "divBy2F[1] to CLKFX\n"
                        "DLL ----- looking for M/D for requested ofreq = 3300.000000\n"
                        "DLL ----- couldn't find and M and Ds for clknum 1\n"
                        "DLL -- couldn't find an M and D\n") +
                kSecond + kTWorks);
  ExpectChosen("CLK0 CLK0", 99, 98, true, 0);
}

TEST_F(ListChoiceTest, TheRangeOfClkfxIsNotAsked) {
  imp_.kruLimits._kruClkfxMax = 1;
  EXPECT_TRUE(Choose({50, 350}, {CLKDV, CLKDV}, {}, {.f = {2, 4}}));
  ExpectChosen("CLKDV CLKFX", 7, 2, false, 2);
}

// The value counts, not the pin.
TEST_F(ListChoiceTest, AValueWithoutClkdv) {
  EXPECT_TRUE(Choose({50, 350}, {CLKDV, CLK0}, {}, {.f = {2, 4}}));
  ExpectChosen("CLKDV CLKFX", 7, 2, false, 2);
  EXPECT_TRUE(Choose({100, 100}, {CLK0, CLK0}, {}, {.f = {0, 2}}));
  ExpectChosen("CLK0 CLK0", 7, 2, false, 2);
}

TEST_F(ListChoiceTest, ValuesOfListT) {
  EXPECT_TRUE(Choose({50, 175, 25}, {NONE, CLK0, CLK0}, {CLKDV, CLKDV, CLKDV},
                     {.f = {2.5, 3, 5}, .t = {2, 4, 2}}));
  EXPECT_EQ(trace_,
            std::string("DLL -------- _kruPinsDivby2F[0] isn't filled, so KRU won't work for "
                        "DivBy2 = F\n") +
                kSecond +
                "DLL ------ CLKDV is used, with this value: 2.000000\n"
                "DLL -------- non-matching CLKDVs used: value: 4.000000; changing divBy2T[1] to "
                "CLKFX\n"
                "DLL ------ CLKDV is used, with this value: 2.000000\n"
                "DLL ----- looking for M/D for requested ofreq = 175.000000\n"
                "DLL ----- a possible M = 7, D = 2\n"
                "DLL ----- a possible M = 14, D = 4\n"
                "DLL ----- a possible M = 21, D = 6\n"
                "DLL ----- a possible M = 28, D = 8\n"
                "DLL ----- found 4 possible M and Ds\n"
                "DLL -- found M = 7, D = 2\n" +
                kTWorks);
  ExpectChosen("CLKDV CLKFX CLKDV", 7, 2, true, 2);
  EXPECT_EQ(Names(kru_._kruPinsDivBy2T), "CLKDV CLKFX CLKDV");
  EXPECT_EQ(Names(kru_._kruPinsDivBy2F), "NONE CLK0 CLK0") << "an unfilled list stays";
}

TEST_F(ListChoiceTest, TheValueOfAListThatFailedIsNotTaken) {
  EXPECT_TRUE(Choose({50, 3300}, {CLKDV, CLKFX}, {CLKDV, CLK0}, {.f = {2, 0}, .t = {5, 0}}));
  ExpectChosen("CLKDV CLK0", 99, 98, true, 5);
}

TEST_F(ListChoiceTest, IsSilentWithTheTraceOff) {
  imp_.requests.reqOutFreq = {50, 3300};
  kru_._kruPinsDivBy2F = {CLKDV, CLKDV};
  kru_._kruPinsDivBy2T = {CLKDV, CLKDV};
  const ClkdvLists clkdv = {.f = {2, 4}, .t = {2, 4}};
  EXPECT_EQ(engine_test::TraceOf(
                [&](const Trace& trace) {
                  EXPECT_FALSE(Ip::Kru::ChooseList(imp_, clkdv, {100, 2, true, trace}));
                  kru_._kruPinsDivBy2F = kru_._kruPinsDivBy2T = {};
                  EXPECT_FALSE(Ip::Kru::ChooseList(imp_, clkdv, {100, 2, true, trace}));
                  kru_._kruPinsDivBy2F = {CLK0, CLK0};
                  EXPECT_TRUE(Ip::Kru::ChooseList(imp_, {}, {100, 2, true, trace}));
                },
                false),
            "");
}

}  // namespace
