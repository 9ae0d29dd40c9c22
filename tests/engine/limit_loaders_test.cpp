// Tests of the limit loaders: which keywords they read, in which order, into which fields, and
// what a keyword that is missing leaves behind.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <climits>
#include <cstddef>
#include <string>
#include <vector>

#include "tests/engine/EngineTest.h"
#include "tests/support/FakeHost.h"

namespace {

using engine_test::kInfinity;
using Ip::KruLimits;
using Ip::PllLimits;
using Ip::VorkelImp;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr char kPart[] = "limited";

// A field of either group of limits.
struct Field {
  double PllLimits::*pll = nullptr;
  double KruLimits::*kru = nullptr;

  Field(double PllLimits::*field) : pll(field) {}  // NOLINT: table entries
  Field(double KruLimits::*field) : kru(field) {}  // NOLINT

  double Of(const VorkelImp& imp) const {
    return pll != nullptr ? imp.pllLimits.*pll : imp.kruLimits.*kru;
  }
};

struct Row {
  std::string keyword;
  Field field;
};

struct Loader {
  const char* name;
  bool (*load)(VorkelImp&);
  std::vector<Row> rows;
  bool periods;  // values are periods, fields frequencies
};

std::string Kru(const std::string& key) {
  const std::size_t pinEnd = key.find('_');
  return "D_KRU_" + key.substr(0, pinEnd) + "_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK" +
         key.substr(pinEnd) + "PERIOD";
}

const std::vector<Loader>& Loaders() {
  static const auto* const loaders = new std::vector<Loader>{
      {"Pll",
       [](VorkelImp& imp) { return imp.LoadPllLimits(1); },
       {{"VCOCLK_FREQ_MIN", &PllLimits::vcoMin},
        {"VCOCLK_FREQ_MAX", &PllLimits::vcoMax},
        {"CLKOUT_FREQ_MIN_GCLK", &PllLimits::clkoutMin},
        {"CLKOUT_FREQ_MAX_GCLK", &PllLimits::clkoutMax},
        {"CLKPFD_FREQ_MIN", &PllLimits::pfdMin},
        {"CLKPFD_FREQ_MAX", &PllLimits::pfdMax},
        {"O_MAX_HT_LT", &PllLimits::maxHighLowCount},
        {"CLKOUT_FREQ_MAX_IOCLK", &PllLimits::clkoutMaxIo},
        {"O_MAX_HT_LT", &PllLimits::maxHighLowCount}},
       false},
      {"Tsyn",
       [](VorkelImp& imp) { return imp.LoadPllLimits(0); },
       {{"TSYN_VCOCLK_FREQ_MIN", &PllLimits::vcoMin},
        {"TSYN_VCOCLK_FREQ_MAX", &PllLimits::vcoMax},
        {"TSYN_CLKOUT_FREQ_MIN", &PllLimits::clkoutMin},
        {"TSYN_CLKOUT_FREQ_MAX", &PllLimits::clkoutMax},
        {"TSYN_CLKPFD_FREQ_MIN", &PllLimits::pfdMin},
        {"TSYN_CLKPFD_FREQ_MAX", &PllLimits::pfdMax},
        {"TSYN_VCOCLK_FREQ_TARGET", &PllLimits::vcoTarget},
        {"O_MAX_HT_LT", &PllLimits::maxHighLowCount},
        {"TSYN_CLKPFD_FREQ_MAX_LBW", &PllLimits::_maxPfdLowB}},
       false},
      {"Kru",
       [](VorkelImp& imp) { return imp.LoadKruLimits(); },
       {{Kru("CLK0_1X_MIN"), &KruLimits::_kruClk0Max},
        {Kru("CLK0_1X_MAX"), &KruLimits::_kruClk0Min},
        {Kru("CLK0_2X_MIN"), &KruLimits::_kruClk0Max2x},
        {Kru("CLK90_1X_MIN"), &KruLimits::_kruClk90Max},
        {Kru("CLK90_1X_MAX"), &KruLimits::_kruClk90Min},
        {Kru("CLK90_2X_MIN"), &KruLimits::_kruClk90Max2x},
        {Kru("CLK2X_1X_MIN"), &KruLimits::_kruClk2xMax},
        {Kru("CLK2X_1X_MAX"), &KruLimits::_kruClk2xMin},
        {Kru("CLKDV_1X_MIN"), &KruLimits::_kruClkdvMax},
        {Kru("CLKDV_1X_MAX"), &KruLimits::_kruClkdvMin},
        {Kru("CLKDV_2X_MIN"), &KruLimits::_kruClkdvMax2x},
        {Kru("CLKFX_1X_MIN"), &KruLimits::_kruClkfxMax},
        {Kru("CLKFX_1X_MAX"), &KruLimits::_kruClkfxMin}},
       true},
      {"KruClkgen",
       [](VorkelImp& imp) { return imp.LoadKruClkgenLimits(); },
       {{Kru("CLKFX_1X_MIN"), &KruLimits::_kruClkfxMax},
        {Kru("CLKFX_1X_MAX"), &KruLimits::_kruClkfxMin},
        {"D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MAXPERIOD", &KruLimits::_kruClkfxdvMin},
        {"D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MINPERIOD", &KruLimits::_kruClkfxdvMax}},
       true}};
  return *loaders;
}

// All fields, to see that a loader leaves alone what is not its own.
const std::vector<Field>& AllFields() {
  static const auto* const fields = new std::vector<Field>{
      &PllLimits::vcoTarget,        &PllLimits::vcoMin,         &PllLimits::vcoMax,
      &PllLimits::pfdMin,           &PllLimits::pfdMax,         &PllLimits::_maxPfdLowB,
      &PllLimits::clkoutMin,        &PllLimits::clkoutMax,      &PllLimits::clkoutMaxIo,
      &PllLimits::maxHighLowCount,  &KruLimits::_kruClk0Min,    &KruLimits::_kruClk0Max,
      &KruLimits::_kruClk0Max2x,    &KruLimits::_kruClk90Min,   &KruLimits::_kruClk90Max,
      &KruLimits::_kruClk90Max2x,   &KruLimits::_kruClk2xMin,   &KruLimits::_kruClk2xMax,
      &KruLimits::_kruClkdvMin,     &KruLimits::_kruClkdvMax,   &KruLimits::_kruClkdvMax2x,
      &KruLimits::_kruClkfxMin,     &KruLimits::_kruClkfxMax,   &KruLimits::_kruClkfxdvMin,
      &KruLimits::_kruClkfxdvMax};
  return *fields;
}

bool Same(const Field& a, const Field& b) { return a.pll == b.pll && a.kru == b.kru; }

class LimitLoaderTest : public testing::TestWithParam<int> {
 protected:
  LimitLoaderTest() { FakeHost::Instance().Reset(); }

  const Loader& Param() const { return Loaders()[static_cast<std::size_t>(GetParam())]; }
  const std::vector<Row>& Rows() const { return Param().rows; }

  // The value given to the keyword of row i: all differ, all 1000 / value are exact.
  static double ValueOfRow(std::size_t i) {
    static constexpr double kValues[] = {2.5, 4,  5,  8,   10,  16, 20,
                                         25,  32, 40, 50,  64,  80};
    return kValues[i];
  }
  double FieldOfRow(std::size_t i) const {
    return Param().periods ? 1000.0 / ValueOfRow(i) : ValueOfRow(i);
  }

  // A device with the keywords of the first `count` rows only.
  VorkelImp& ImpWithRows(std::size_t count) {
    FakeHost& host = FakeHost::Instance();
    host.devices[kPart].clear();
    for (std::size_t i = 0; i < count; ++i) {
      host.devices[kPart][Rows()[i].keyword] = FigureFor(ValueOfRow(i));
    }
    VorkelImp& imp = engine_test::NewImp();
    imp.SetDevice(kPart);
    return imp;
  }

  std::vector<std::string> Keywords(std::size_t count) const {
    std::vector<std::string> keywords;
    for (std::size_t i = 0; i < count; ++i) keywords.push_back(Rows()[i].keyword);
    return keywords;
  }

  // What a field holds after the first `count` rows were read into `fresh`; a later row of
  // the same field wins.
  double Expected(const Field& field, std::size_t count, const VorkelImp& fresh) const {
    double expected = field.Of(fresh);
    for (std::size_t i = 0; i < count; ++i) {
      // Rows of one keyword all read the last value that the test stored under it.
      if (!Same(Rows()[i].field, field)) continue;
      std::size_t last = i;
      for (std::size_t j = i; j < count; ++j) {
        if (Rows()[j].keyword == Rows()[i].keyword) last = j;
      }
      expected = FieldOfRow(last);
    }
    return expected;
  }
};

TEST_P(LimitLoaderTest, ReadsItsKeywordsInOrder) {
  VorkelImp& imp = ImpWithRows(Rows().size());
  EXPECT_TRUE(Param().load(imp));
  EXPECT_EQ(FakeHost::Instance().reads, Keywords(Rows().size()));
  EXPECT_THAT(FakeHost::Instance().messages, IsEmpty());
}

TEST_P(LimitLoaderTest, FillsItsFieldsAndNoOthers) {
  VorkelImp& imp = ImpWithRows(Rows().size());
  ASSERT_TRUE(Param().load(imp));
  const VorkelImp& fresh = engine_test::NewImp();
  for (std::size_t f = 0; f < AllFields().size(); ++f) {
    const Field& field = AllFields()[f];
    EXPECT_EQ(field.Of(imp), Expected(field, Rows().size(), fresh)) << "field " << f;
  }
}

// With the first k keywords only: exactly k fields are new, keyword k + 1 is asked for and
// reported, and nothing after it is read.
TEST_P(LimitLoaderTest, StopsAtTheFirstMissingKeyword) {
  FakeHost& host = FakeHost::Instance();
  const VorkelImp& fresh = engine_test::NewImp();
  for (std::size_t known = 0; known < Rows().size(); ++known) {
    // A keyword that stands in two rows is there at the second when it was at the first.
    bool readBefore = false;
    for (std::size_t i = 0; i < known; ++i) {
      if (Rows()[i].keyword == Rows()[known].keyword) readBefore = true;
    }
    if (readBefore) continue;

    host.Reset();
    VorkelImp& imp = ImpWithRows(known);
    EXPECT_FALSE(Param().load(imp)) << known;
    EXPECT_EQ(host.reads, Keywords(known + 1));
    EXPECT_THAT(host.MessageTexts(),
                ElementsAre("Internal GetSpdKeyValue() error -- could not get speedsfile data "
                            "for key " + Rows()[known].keyword + "\n"));
    for (std::size_t f = 0; f < AllFields().size(); ++f) {
      const Field& field = AllFields()[f];
      EXPECT_EQ(field.Of(imp), Expected(field, known, fresh)) << known << " field " << f;
    }
  }
}

TEST_P(LimitLoaderTest, AFailedLoadKeepsTheFieldsOfAnEarlierOne) {
  VorkelImp& imp = ImpWithRows(Rows().size());
  ASSERT_TRUE(Param().load(imp));
  const Field last = Rows().back().field;
  const double before = last.Of(imp);
  const Field first = Rows().front().field;

  auto& keys = FakeHost::Instance().devices[kPart];
  keys[Rows().front().keyword] = FigureFor(125);
  keys.erase(Rows()[1].keyword);
  EXPECT_FALSE(Param().load(imp));
  EXPECT_EQ(first.Of(imp), Param().periods ? 8.0 : 125.0);
  EXPECT_EQ(last.Of(imp), before);
}

TEST_P(LimitLoaderTest, NoDeviceFailsAtTheFirstKeyword) {
  VorkelImp& imp = engine_test::NewImp();
  EXPECT_FALSE(Param().load(imp));
  EXPECT_THAT(FakeHost::Instance().MessageTexts(),
              ElementsAre("Internal GetSpdKeyValue() error -- no device was specified yet\n"));
}

INSTANTIATE_TEST_SUITE_P(Primitives, LimitLoaderTest, testing::Range(0, 4),
                         [](const testing::TestParamInfo<int>& index) {
                           return Loaders()[static_cast<std::size_t>(index.param)].name;
                         });

TEST(LimitLoaders, OtherPrimitivesLoadNothing) {
  FakeHost::Instance().Reset();
  SetPll(kPart, {});
  SetTsyn(kPart, {});
  VorkelImp& imp = engine_test::NewImp();
  imp.SetDevice(kPart);
  for (const int prim : {-1, 2, 3, INT_MIN, INT_MAX}) {
    EXPECT_FALSE(imp.LoadPllLimits(prim)) << prim;
  }
  EXPECT_THAT(FakeHost::Instance().reads, IsEmpty());
  EXPECT_THAT(FakeHost::Instance().messages, IsEmpty());
  EXPECT_EQ(imp.pllLimits.vcoMax, 1200.0);
}

TEST(LimitLoaders, APeriodOf2Point5NsIs400MHz) {
  FakeHost& host = FakeHost::Instance();
  host.Reset();
  host.devices[kPart][Kru("CLK0_1X_MIN")] = FigureFor(2.5);
  VorkelImp& imp = engine_test::NewImp();
  imp.SetDevice(kPart);
  EXPECT_FALSE(imp.LoadKruLimits());  // no further keywords
  EXPECT_EQ(imp.kruLimits._kruClk0Max, 400.0);
}

TEST(LimitLoaders, APeriodOfZeroIsNoLimit) {
  FakeHost& host = FakeHost::Instance();
  host.Reset();
  host.devices[kPart][Kru("CLKFX_1X_MIN")] = 0.0;
  VorkelImp& imp = engine_test::NewImp();
  imp.SetDevice(kPart);
  EXPECT_FALSE(imp.LoadKruClkgenLimits());
  EXPECT_EQ(imp.kruLimits._kruClkfxMax, kInfinity);
}

// The fifth keyword of a TSYN is its lowest PFD frequency.
TEST(LimitLoaders, ATsynWithoutItsFifthKeywordHasFourNewLimits) {
  FakeHost& host = FakeHost::Instance();
  host.Reset();
  SetTsyn(kPart, {.vcoMin = 610, .vcoMax = 1450, .clkoutMin = 5, .clkoutMax = 810, .pfdMin = 11});
  host.devices[kPart].erase("TSYN_CLKPFD_FREQ_MIN");
  VorkelImp& imp = engine_test::NewImp();
  imp.SetDevice(kPart);
  EXPECT_FALSE(imp.LoadPllLimits(0));
  EXPECT_EQ(imp.pllLimits.vcoMin, 610.0);
  EXPECT_EQ(imp.pllLimits.vcoMax, 1450.0);
  EXPECT_EQ(imp.pllLimits.clkoutMin, 5.0);
  EXPECT_EQ(imp.pllLimits.clkoutMax, 810.0);
  EXPECT_EQ(imp.pllLimits.pfdMin, 10.0);
  EXPECT_EQ(imp.pllLimits.pfdMax, 550.0);
}

// One set of fields serves both primitives: what only the other one loads stays.
TEST(LimitLoaders, PllAndTsynShareTheirFields) {
  FakeHost& host = FakeHost::Instance();
  host.Reset();
  SetPll(kPart, {.vcoMin = 401, .clkoutMaxIo = 901});
  SetTsyn(kPart, {.vcoMin = 601, .vcoTarget = 1001, .maxPfdLowB = 301});
  VorkelImp& imp = engine_test::NewImp();
  imp.SetDevice(kPart);
  ASSERT_TRUE(imp.LoadPllLimits(1));
  EXPECT_EQ(imp.pllLimits._maxPfdLowB, 300.0);
  EXPECT_EQ(imp.pllLimits.vcoTarget, 0.0);
  ASSERT_TRUE(imp.LoadPllLimits(0));
  EXPECT_EQ(imp.pllLimits.vcoMin, 601.0);
  EXPECT_EQ(imp.pllLimits.clkoutMaxIo, 901.0);
  ASSERT_TRUE(imp.LoadPllLimits(1));
  EXPECT_EQ(imp.pllLimits.vcoMin, 401.0);
  EXPECT_EQ(imp.pllLimits._maxPfdLowB, 301.0);
  EXPECT_EQ(imp.pllLimits.vcoTarget, 1001.0);
}

}  // namespace
