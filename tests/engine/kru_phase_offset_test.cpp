// Tests of the phase offset that all outputs of a KRU_SP share.

#include <gtest/gtest.h>

#include <ostream>
#include <string>
#include <vector>

#include "tests/engine/KruTest.h"

namespace {

using engine_test::kInfinity;
using engine_test::kNan;
using Ip::Trace;
using Ip::VorkelImp;

constexpr char kStart[] = "DLL -- determining if a phase offset is used for KRU\n";
constexpr char kAllZero[] =
    "DLL -- determining if a phase offset is used for KRU\n"
    "DLL ---- all phases have 0 offset\n";

// The offset before a run, which a failed one keeps.
constexpr double kBefore = 12.5;

class PhaseOffsetTest : public testing::Test {
 protected:
  bool Find(const std::vector<double>& phases, bool feedbackUsed) {
    for (std::size_t n = 0; n < phases.size(); ++n) imp_.requests.reqPhase[n] = phases[n];
    imp_.kru._kruPhaseOffset = kBefore;
    bool found = false;
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      found = Ip::Kru::FindPhaseOffset(
          imp_, {100, static_cast<int>(phases.size()), feedbackUsed, trace});
    });
    return found;
  }

  double Offset() const { return imp_.kru._kruPhaseOffset; }

  VorkelImp& imp_ = engine_test::NewImp();
  std::string trace_;
};

// --- Requests on fixed phases ------------------------------------------------------------------

TEST_F(PhaseOffsetTest, AllPhases0) {
  for (const bool feedback : {false, true}) {
    EXPECT_TRUE(Find({0, 0, 0, 0, 0, 0}, feedback));
    EXPECT_EQ(Offset(), 0.0);
    EXPECT_EQ(trace_, kAllZero);
  }
}

TEST_F(PhaseOffsetTest, TheFixedPhasesWithFeedback) {
  for (const double phase : {0.0, -0.0, 90.0, 180.0, 270.0}) {
    EXPECT_TRUE(Find({phase}, true)) << phase;
    EXPECT_EQ(Offset(), 0.0) << phase;
    EXPECT_EQ(trace_, kAllZero) << phase;
  }
  EXPECT_TRUE(Find({270, 0, 180, 90}, true));
  EXPECT_EQ(trace_, kAllZero);
}

TEST_F(PhaseOffsetTest, TheFixedPhasesWithoutFeedback) {
  for (const double phase : {0.0, -0.0, 180.0}) {
    EXPECT_TRUE(Find({phase}, false)) << phase;
    EXPECT_EQ(Offset(), 0.0) << phase;
    EXPECT_EQ(trace_, kAllZero) << phase;
  }
  EXPECT_TRUE(Find({180, 0, 180}, false));
  EXPECT_EQ(trace_, kAllZero);
}

TEST_F(PhaseOffsetTest, WithoutFeedback90And270AreNotFixed) {
  EXPECT_TRUE(Find({90}, false));
  EXPECT_EQ(Offset(), 90.0);
  EXPECT_EQ(trace_, std::string(kStart) + "DLL ---- 90.000 offset was used for all outclks\n");
  EXPECT_TRUE(Find({270, 90}, false));
  EXPECT_EQ(Offset(), 90.0);
  EXPECT_FALSE(Find({0, 90}, false));
  EXPECT_EQ(trace_, std::string(kStart) +
                        "DLL ---- found non-zero offset for clkunm 1 = 90.000000\n");
}

TEST_F(PhaseOffsetTest, NoOtherOutputMayNeedAnOffset) {
  EXPECT_FALSE(Find({0, 45}, true));
  EXPECT_EQ(trace_, std::string(kStart) +
                        "DLL ---- found non-zero offset for clkunm 1 = 45.000000\n");
  EXPECT_EQ(Offset(), kBefore);
}

TEST_F(PhaseOffsetTest, TheFirstThatDoesIsNamed) {
  EXPECT_FALSE(Find({100.25, 90, 45}, true));
  EXPECT_EQ(trace_, std::string(kStart) +
                        "DLL ---- found non-zero offset for clkunm 0 = 10.250000\n");
  EXPECT_FALSE(Find({0, 180, 180, 0, 0, -30}, false));
  EXPECT_EQ(trace_, std::string(kStart) +
                        "DLL ---- found non-zero offset for clkunm 5 = 30.000000\n");
  EXPECT_EQ(Offset(), kBefore);
}

TEST_F(PhaseOffsetTest, AFullTurnIsNoFixedPhase) {
  EXPECT_FALSE(Find({0, 360}, true));
  EXPECT_EQ(trace_, std::string(kStart) +
                        "DLL ---- found non-zero offset for clkunm 1 = 90.000000\n");
}

TEST_F(PhaseOffsetTest, WithoutFeedbackPhasesFrom360OnCountAsOffset0) {
  EXPECT_TRUE(Find({0, 360, 450, 1e300}, false));
  EXPECT_EQ(trace_, kAllZero);
  EXPECT_EQ(Offset(), 0.0);
}

// --- Where each request lies between the fixed phases ------------------------------------------

struct SplitCase {
  const char* name;
  bool feedback;
  double phase;
  const char* offset;
  const char* negOffset;
};

std::ostream& operator<<(std::ostream& out, const SplitCase& split) { return out << split.name; }

class SplitTest : public PhaseOffsetTest, public testing::WithParamInterface<SplitCase> {};

// An output at -20 degrees has the offsets 20 and -20, which none of the others has, so that
// the trace shows both offsets of output 0.
TEST_P(SplitTest, HasItsOffsets) {
  const SplitCase& split = GetParam();
  EXPECT_FALSE(Find({split.phase, -20}, split.feedback));
  EXPECT_EQ(trace_, std::string(kStart) + "DLL ---- both " + split.offset +
                        " offset and 20.000 offset were used, so offsets won't work!\n"
                        "DLL ---- both " +
                        split.negOffset +
                        " negOffset and -20.000 negOffset were used, so negOffsets won't work!\n");
  EXPECT_EQ(Offset(), kBefore);
}

INSTANTIATE_TEST_SUITE_P(
    Rows, SplitTest,
    testing::Values(SplitCase{"NoFeedbackAbove0", false, 10, "10.000", "-170.000"},
                    SplitCase{"NoFeedback90", false, 90, "90.000", "-90.000"},
                    SplitCase{"NoFeedbackBelow180", false, 179.5, "179.500", "-0.500"},
                    SplitCase{"NoFeedbackAbove180", false, 190, "10.000", "-170.000"},
                    SplitCase{"NoFeedback270", false, 270, "90.000", "-90.000"},
                    SplitCase{"NoFeedbackBelow360", false, 359.5, "179.500", "-0.500"},
                    SplitCase{"NoFeedback360", false, 360, "0.000", "0.000"},
                    SplitCase{"NoFeedbackAbove360", false, 370, "0.000", "0.000"},
                    SplitCase{"NoFeedbackBelow0", false, -30, "30.000", "-30.000"},
                    SplitCase{"NoFeedbackMinus180", false, -180, "180.000", "-180.000"},
                    SplitCase{"FeedbackAbove0", true, 10, "10.000", "-80.000"},
                    SplitCase{"FeedbackBelow90", true, 89.5, "89.500", "-0.500"},
                    SplitCase{"FeedbackAbove90", true, 100, "10.000", "-80.000"},
                    SplitCase{"FeedbackBelow180", true, 179.5, "89.500", "-0.500"},
                    SplitCase{"FeedbackAbove180", true, 190, "10.000", "-80.000"},
                    SplitCase{"FeedbackBelow270", true, 269.5, "89.500", "-0.500"},
                    SplitCase{"FeedbackAbove270", true, 280, "10.000", "-80.000"},
                    SplitCase{"FeedbackBelow360", true, 359.5, "89.500", "-0.500"},
                    SplitCase{"Feedback360", true, 360, "90.000", "0.000"},
                    SplitCase{"FeedbackAbove360", true, 450, "180.000", "90.000"},
                    SplitCase{"FeedbackBelow0", true, -30, "30.000", "-30.000"},
                    SplitCase{"FeedbackMinus90", true, -90, "90.000", "-90.000"}),
    [](const auto& parameter) { return std::string(parameter.param.name); });

// --- One positive offset -----------------------------------------------------------------------

TEST_F(PhaseOffsetTest, ACommonOffsetWithFeedback) {
  EXPECT_TRUE(Find({45, 135}, true));
  EXPECT_EQ(Offset(), 45.0);
  EXPECT_EQ(trace_, std::string(kStart) + "DLL ---- 45.000 offset was used for all outclks\n");
  EXPECT_TRUE(Find({45, 135, 225, 315, 45, 135}, true));
  EXPECT_EQ(Offset(), 45.0);
}

TEST_F(PhaseOffsetTest, ACommonOffsetWithoutFeedback) {
  EXPECT_TRUE(Find({45, 225}, false));
  EXPECT_EQ(Offset(), 45.0);
  EXPECT_EQ(trace_, std::string(kStart) + "DLL ---- 45.000 offset was used for all outclks\n");
  EXPECT_FALSE(Find({45, 135}, false));
}

TEST_F(PhaseOffsetTest, OffsetsThatDiffer) {
  EXPECT_FALSE(Find({10, 20}, true));
  EXPECT_EQ(trace_,
            std::string(kStart) +
                "DLL ---- both 10.000 offset and 20.000 offset were used, so offsets won't work!\n"
                "DLL ---- both -80.000 negOffset and -70.000 negOffset were used, so negOffsets "
                "won't work!\n");
  EXPECT_EQ(Offset(), kBefore);
}

TEST_F(PhaseOffsetTest, TheFirstThatDiffersFromOutput0IsNamed) {
  EXPECT_FALSE(Find({10, 100, 15, 20}, true));
  EXPECT_EQ(trace_,
            std::string(kStart) +
                "DLL ---- both 10.000 offset and 15.000 offset were used, so offsets won't work!\n"
                "DLL ---- both -80.000 negOffset and -75.000 negOffset were used, so negOffsets "
                "won't work!\n");
}

TEST_F(PhaseOffsetTest, OffsetsCompareExactly) {
  EXPECT_FALSE(Find({10, engine_test::Above(10)}, true));
  EXPECT_TRUE(Find({engine_test::Above(10), engine_test::Above(10)}, true));
  EXPECT_EQ(Offset(), engine_test::Above(10));
}

TEST_F(PhaseOffsetTest, ANegativePhaseIsTakenForItsPositiveOffset) {
  EXPECT_TRUE(Find({-30}, true));
  EXPECT_EQ(Offset(), 30.0);
  EXPECT_EQ(trace_, std::string(kStart) + "DLL ---- 30.000 offset was used for all outclks\n");
  EXPECT_TRUE(Find({-30, 30, 210}, false));
  EXPECT_EQ(Offset(), 30.0);
}

TEST_F(PhaseOffsetTest, AnOffsetOf0WithNoFixedPhase) {
  EXPECT_TRUE(Find({360, 400}, false));
  EXPECT_EQ(Offset(), 0.0);
  EXPECT_EQ(trace_, std::string(kStart) + "DLL ---- 0.000 offset was used for all outclks\n");
}

TEST_F(PhaseOffsetTest, WithFeedbackAFullTurnIsAnOffsetOf90) {
  EXPECT_TRUE(Find({360}, true));
  EXPECT_EQ(Offset(), 90.0);
}

// --- The range of PHASE_SHIFT ------------------------------------------------------------------

// 360.7 / 360 x 255 + 0.5 = 255.996, 360.75 makes 256.03. The offset below the next fixed phase
// is then the larger one.
TEST_F(PhaseOffsetTest, PhaseShiftEndsAt255) {
  EXPECT_TRUE(Find({270 + 360.6875}, true));
  EXPECT_EQ(Offset(), 360.6875);
  EXPECT_EQ(trace_, std::string(kStart) + "DLL ---- 360.688 offset was used for all outclks\n");
  EXPECT_TRUE(Find({270 + 360.75}, true));
  EXPECT_EQ(Offset(), 270.75);
  EXPECT_EQ(trace_,
            std::string(kStart) +
                "DLL ---- PHASE_SHIFT = 256.000 from offset 360.750000 is out of valid range!\n"
                "DLL ---- 270.750 offset (should be negative) was used for all outclks\n");
}

// 730 / 360 x 255 = 517.08 and 640 / 360 x 255 = 453.33.
TEST_F(PhaseOffsetTest, BothOffsetsBeyondTheRange) {
  EXPECT_FALSE(Find({1000}, true));
  EXPECT_EQ(trace_,
            std::string(kStart) +
                "DLL ---- PHASE_SHIFT = 517.000 from offset 730.000000 is out of valid range!\n"
                "DLL ---- PHASE_SHIFT = 453.000 from offset 640.000000 is out of valid range!\n");
  EXPECT_EQ(Offset(), kBefore);
}

// 400 / 360 x 255 = 283.33, so -400 makes -282.83 and truncates toward zero.
TEST_F(PhaseOffsetTest, ANegativePhaseBeyondTheRange) {
  EXPECT_FALSE(Find({-400}, false));
  EXPECT_EQ(trace_,
            std::string(kStart) +
                "DLL ---- PHASE_SHIFT = 283.000 from offset 400.000000 is out of valid range!\n"
                "DLL ---- PHASE_SHIFT = -282.000 from offset -400.000000 is out of valid range!\n");
  EXPECT_EQ(Offset(), kBefore);
}

// --- One negative offset -----------------------------------------------------------------------

// -1 / 360 x 255 + 0.5 = -0.21 truncates to 0.
TEST_F(PhaseOffsetTest, ASmallNegativeOffset) {
  EXPECT_TRUE(Find({-1, 89}, true));
  EXPECT_EQ(Offset(), -1.0);
  EXPECT_EQ(trace_,
            std::string(kStart) +
                "DLL ---- both 1.000 offset and 89.000 offset were used, so offsets won't work!\n"
                "DLL ---- -1.000 offset (should be negative) was used for all outclks\n");
  EXPECT_TRUE(Find({359, 179, -1}, false));
  EXPECT_EQ(Offset(), -1.0);
}

TEST_F(PhaseOffsetTest, PhaseShiftEndsAt0ForNegativeOffsetsToo) {
  EXPECT_FALSE(Find({-30, 60}, true));
  EXPECT_EQ(trace_,
            std::string(kStart) +
                "DLL ---- both 30.000 offset and 60.000 offset were used, so offsets won't work!\n"
                "DLL ---- PHASE_SHIFT = -20.000 from offset -30.000000 is out of valid range!\n");
  EXPECT_EQ(Offset(), kBefore);
}

// -1.5 x 360 / 255 = -2.11765 is the end.
TEST_F(PhaseOffsetTest, TheLargestNegativeOffset) {
  EXPECT_TRUE(Find({-2.1171875, 90 - 2.1171875}, true));
  EXPECT_EQ(Offset(), -2.1171875);
  EXPECT_FALSE(Find({-2.125, 90 - 2.125}, true));
  EXPECT_EQ(trace_,
            std::string(kStart) +
                "DLL ---- both 2.125 offset and 87.875 offset were used, so offsets won't work!\n"
                "DLL ---- PHASE_SHIFT = -1.000 from offset -2.125000 is out of valid range!\n");
}

// --- Bad numbers -------------------------------------------------------------------------------

TEST_F(PhaseOffsetTest, NanLiesNowhereAndCountsAsOffset0) {
  for (const bool feedback : {false, true}) {
    EXPECT_TRUE(Find({kNan}, feedback));
    EXPECT_EQ(Offset(), 0.0);
    EXPECT_EQ(trace_, std::string(kStart) + "DLL ---- 0.000 offset was used for all outclks\n");
    EXPECT_TRUE(Find({kNan, 0}, feedback));
    EXPECT_EQ(trace_, kAllZero);
    EXPECT_FALSE(Find({kNan, 10}, feedback));
  }
}

// No int holds the PHASE_SHIFT of these; it is 0 then.
TEST_F(PhaseOffsetTest, OffsetsWithoutAPhaseShift) {
  EXPECT_TRUE(Find({kInfinity}, true));
  EXPECT_EQ(Offset(), kInfinity);
  EXPECT_EQ(trace_, std::string(kStart) + "DLL ---- inf offset was used for all outclks\n");
  EXPECT_TRUE(Find({-kInfinity}, true));
  EXPECT_EQ(Offset(), kInfinity);
  EXPECT_TRUE(Find({1e300}, true));
  EXPECT_EQ(Offset(), 1e300);
  EXPECT_TRUE(Find({kInfinity}, false));
  EXPECT_EQ(Offset(), 0.0);
}

// --- Scope -------------------------------------------------------------------------------------

TEST_F(PhaseOffsetTest, OutputsBeyondTheCountDoNotMatter) {
  imp_.requests.reqPhase.fill(33);
  EXPECT_TRUE(Find({0, 90}, true));
  EXPECT_EQ(trace_, kAllZero);
}

TEST_F(PhaseOffsetTest, IsSilentWithTheTraceOff) {
  for (const double phase : {0.0, 45.0, 1000.0}) {
    imp_.requests.reqPhase = {phase, 0};
    EXPECT_EQ(engine_test::TraceOf(
                  [&](const Trace& trace) {
                    Ip::Kru::FindPhaseOffset(imp_, {100, 1, true, trace});
                    Ip::Kru::FindPhaseOffset(imp_, {100, 2, true, trace});
                  },
                  false),
              "");
  }
}

// --- PHASE_SHIFT -------------------------------------------------------------------------------

TEST(PhaseShiftTest, CountsIn255Steps) {
  using Ip::Kru::PhaseShift;
  EXPECT_EQ(PhaseShift(0), 0);
  EXPECT_EQ(PhaseShift(-0.0), 0);
  EXPECT_EQ(PhaseShift(30), 21);    // 21.25
  EXPECT_EQ(PhaseShift(45), 32);    // 31.875
  EXPECT_EQ(PhaseShift(90), 64);    // 63.75
  EXPECT_EQ(PhaseShift(180), 128);  // 127.5
  EXPECT_EQ(PhaseShift(270), 191);  // 191.25
  EXPECT_EQ(PhaseShift(360), 255);
  EXPECT_EQ(PhaseShift(0.7), 0);    // 0.496
  EXPECT_EQ(PhaseShift(0.71), 1);   // 0.503
}

TEST(PhaseShiftTest, TruncatesTowardZero) {
  using Ip::Kru::PhaseShift;
  EXPECT_EQ(PhaseShift(-1), 0);      // -0.708 + 0.5
  EXPECT_EQ(PhaseShift(-30), -20);   // -21.25 + 0.5
  EXPECT_EQ(PhaseShift(-90), -63);   // -63.75 + 0.5
  EXPECT_EQ(PhaseShift(-360), -254);
}

TEST(PhaseShiftTest, IsDefinedForEveryDouble) {
  using Ip::Kru::PhaseShift;
  EXPECT_EQ(PhaseShift(kNan), 0);
  EXPECT_EQ(PhaseShift(kInfinity), 0);
  EXPECT_EQ(PhaseShift(-kInfinity), 0);
  EXPECT_EQ(PhaseShift(1e300), 0);
  EXPECT_EQ(PhaseShift(-1e300), 0);
  EXPECT_EQ(PhaseShift(3600000000.0), 0);            // 2 550 000 000 steps
  EXPECT_EQ(PhaseShift(360000000.0), 255000000);
}

}  // namespace
