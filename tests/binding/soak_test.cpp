// Very many calls, and very many handles, in one process: answers stay what they are, and memory is
// flat but for the implementation objects, which live until the process ends.
//
// VORKEL_TEST_LONG in the environment asks for a million calls and 100,000 handles.
#include "tests/binding/ScriptCalls.h"

#include <gtest/gtest.h>
#include <malloc.h>

#include <cstddef>
#include <cstdlib>
#include <string>

// Defined in binding/PackageEntry.cpp.
extern "C" int Ip_vorkel_Init(Tcl_Interp* interp);

#ifdef __SANITIZE_ADDRESS__
// Of the sanitizer's run-time library; g++ brings no header for it.
extern "C" std::size_t __sanitizer_get_current_allocated_bytes();
#endif

// Implementation objects live until the process ends; the leak checker need not tell.
extern "C" const char* __asan_default_options() { return "detect_leaks=0"; }

namespace {

// What a handle may leave: its implementation object and all that this owns. The sanitizer counts
// the margins that it puts around each of them, too.
#ifdef __SANITIZE_ADDRESS__
constexpr std::ptrdiff_t kMostOfHandle = 16384;
#else
constexpr std::ptrdiff_t kMostOfHandle = 4096;
#endif

// The bytes that are allocated now.
std::ptrdiff_t HeapBytes() {
#ifdef __SANITIZE_ADDRESS__
  return static_cast<std::ptrdiff_t>(__sanitizer_get_current_allocated_bytes());
#else
  const struct mallinfo2 info = mallinfo2();
  return static_cast<std::ptrdiff_t>(info.uordblks + info.hblkhd);
#endif
}

int NormalOrLong(int normal, int in_long) {
  return std::getenv("VORKEL_TEST_LONG") == nullptr ? normal : in_long;
}

// Each of the 40 methods, with solvers that succeed and fail in turn, and calls that are wrong.
constexpr int kCallsOfRound = 50;
constexpr const char* kRound = R"(
  $h SetDevice vk40
  $h SetLowBandwidth false
  $h SetVcoMinThreshold 5
  $h GetSpdKeyValue VCOCLK_FREQ_MAX
  $h PLLCalculateActualOutFreqs "148.5 74.25" 74.25 0 2 false false false
  $h GetChosenVCO
  $h GetChosenM
  $h GetChosenMInt
  $h GetChosenD
  $h GetChosenDivN 1
  $h TSYNCalculateActualOutFreqs "300 600" 300 0 2 false false false
  $h GetChosenDiv0
  $h GetChosenDiv0Int
  $h GetChosenOutFreqN 0
  $h GetClosestSolution "148.5 74.25" "22.5 0" "37.5 50" 74.25 0 2 false false false false
  $h GetChosenPhaseN 0
  $h GetChosenDutyCycleN 0
  $h PLLCalculateActualOutFreqs "" 100 0 1 false false false
  $h GetChosenM
  $h KruCalculateActuals "37.125 55.6875" "0 0" 74.25 2 true false
  $h GetKruChosenM
  $h GetKruChosenD
  $h GetKruChosenPhaseShift
  $h GetKruChosenPhaseOffset
  $h GetKruChosenClkdv
  $h GetKruChosenDivBy2
  $h GetKruChosenPinname 0
  $h GetKruChosenOutFreqN 74.25 1
  $h KruClkgenCalculateActuals "55.6875 27.84375" "0 0" 74.25 2 false
  $h GetKruChosenClkfxdv
  $h KruCalculateActuals "1" "7 7" 0 2 true false
  $h GetVcoFreq 74.25 10 1 1
  $h GetPLLPkToPkJitter 74.25 10 1 OPTIMIZED 5 12.5
  $h GetKRUPkToPkJitter 74.25 CLKFX false true false 3 2
  $h GetKRU_CLKGENPkToPkJitter 74.25 CLKFX false true false 3 2
  $h GetPLLPhaseError 74.25 10 LOW
  $h GetKRUPhaseError
  $h GetKRUPeriodPhaseDutyCycle 74.25 CLK90 true 3 2 0
  $h GetLatestPhase
  $h GetPLLPeriodPhaseDutyCycle 100 10 1 5 45 50 0
  $h GetLatestDutyCycle
  $h TSYNCalculateActualPhase 100 1 true
  $h TSYNCalculateActualDutyCycle 40 4 true
  $h GetChosenM 1
  $h NoMethod
  $h {}
  $h
  $h GetPLLPkToPkJitter x x x x x x
  $h GetKruChosenPinname 99
  $h GetChosenDivN -1
)";

class SoakTest : public testing::Test {
 protected:
  SoakTest() {
    EXPECT_EQ(Ip_vorkel_Init(interp_.get()), TCL_OK);
    const std::string round = std::string("proc round {h} {\n  set answers {}\n") +
                              "  foreach call [split [string trim {" + kRound + "}] \\n] {\n" +
                              "    lappend answers [catch $call answer] $answer\n  }\n" +
                              "  return $answers\n}";
    EXPECT_EQ(interp_.Eval(round), TCL_OK) << interp_.Result();
  }

  // Runs a script that succeeds; its result.
  std::string Run(const std::string& script) {
    EXPECT_EQ(interp_.Eval(script), TCL_OK) << interp_.Result();
    return interp_.Result();
  }

  TestInterp interp_;
};

TEST_F(SoakTest, CallsLeaveNothingBehind) {
  constexpr int kWarmUp = 4;
  const int rounds = NormalOrLong(300, 1'000'000 / kCallsOfRound);
  Run("set h [Ip::Vorkel::Init]");
  const std::string first = Run("round $h");
  EXPECT_EQ(Run("expr {[llength [round $h]] / 2}"), std::to_string(kCallsOfRound));
  for (int i = 0; i < kWarmUp; ++i) ASSERT_EQ(Run("round $h"), first);
  const std::ptrdiff_t before = HeapBytes();
  for (int i = 0; i < rounds; ++i) ASSERT_EQ(Run("round $h"), first) << "round " << i;
  EXPECT_LE(HeapBytes() - before, 1024) << rounds << " rounds";
}

// What a handle leaves is its implementation object, and that is small.
TEST_F(SoakTest, HandlesLeaveTheirObjectsAlone) {
  constexpr int kWarmUp = 20;
  const int handles = NormalOrLong(400, 100'000);
  const std::string life =
      "set h [Ip::Vorkel::Init]; set answers [round $h]; "
      "rename $h renamed; set h renamed; lappend answers [$h GetLatestDutyCycle]; rename $h {}; "
      "lappend answers [llength [info commands ::Script::handle*]]";
  const std::string first = Run(life);
  for (int i = 1; i < kWarmUp; ++i) ASSERT_EQ(Run(life), first);
  const std::ptrdiff_t before = HeapBytes();
  for (int i = 0; i < handles; ++i) ASSERT_EQ(Run(life), first) << "handle " << i;
  const std::ptrdiff_t of_handle = (HeapBytes() - before) / handles;
  EXPECT_LE(of_handle, kMostOfHandle);
  RecordProperty("bytes of a handle", static_cast<int>(of_handle));
}

// The same in short, to be run where each instruction takes long.
TEST_F(SoakTest, AFewOfEach) {
  Run("set h [Ip::Vorkel::Init]");
  const std::string first = Run("round $h");
  for (int i = 0; i < 3; ++i) EXPECT_EQ(Run("round $h"), first);
  for (int i = 0; i < 5; ++i) {
    EXPECT_EQ(Run("set h [Ip::Vorkel::Init]; set answers [round $h]; rename $h {}; set answers"),
              first);
  }
}

}  // namespace
