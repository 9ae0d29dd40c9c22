// Words, results and traces in a process with a decimal comma.
#include "tests/binding/ScriptCalls.h"

#include <gtest/gtest.h>

#include <string>

#include "binding/VorkelPtrHandle.h"
#include "tests/support/CaptureTrace.h"
#include "tests/support/CommaLocale.h"

namespace {

// What the calls of a script answer, a line each, and what they print. The object lives on, as in
// the package.
std::string AnswersAndTrace(const std::string& calls) {
  BoundInterp interp;
  auto* const handle = new Ip::VorkelPtrHandle(new Ip::VorkelImp(interp.get()), interp.get());
  EXPECT_EQ(handle->SetResult(interp.get()), TCL_OK);
  EXPECT_EQ(interp.Eval("set h " + interp.Result()), TCL_OK);
  CaptureTrace trace;
  EXPECT_EQ(interp.Eval("set answers {}; foreach call {" + calls + "} {"
                        "  set status [catch {$h {*}$call} answer]\n"
                        "  append answers \"$call: $status $answer\\n\""
                        "}; set answers"),
            TCL_OK)
      << interp.Result();
  return interp.Result() + trace.Text();
}

// Every way in which numbers come in, go out and are printed: by all five searches with their
// traces, of their choices, and of the figures of the calculator.
constexpr char kCalls[] = R"(
  {SetDevice vk40}
  {GetSpdKeyValue CLKOUT_FREQ_MIN_GCLK}
  {GetSpdKeyValue D_KRU_CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD}
  {PLLCalculateActualOutFreqs "148.5 74.25" 74.25 0.0 2 false false true}
  GetChosenVCO GetChosenM GetChosenD GetChosenDiv0 {GetChosenDivN 1} {GetChosenOutFreqN 0}
  {TSYNCalculateActualOutFreqs "148.5 74.25" 33.333 33.334 2 true false true}
  GetChosenVCO GetChosenM {GetChosenOutFreqN 1}
  {GetClosestSolution "148.5 74.25" "22.5 -7.25" "37.5 62.5" 74.25 0 2 false false true true}
  {GetChosenPhaseN 0} {GetChosenPhaseN 1} {GetChosenDutyCycleN 0} {GetChosenDutyCycleN 1}
  {KruCalculateActuals "37.125 55.6875" "0 0" 74.25 2 true true}
  GetKruChosenClkdv GetKruChosenPhaseOffset {GetKruChosenPinname 0} {GetKruChosenOutFreqN 74.25 0}
  {KruClkgenCalculateActuals "55.6875 27.84375" "0 0" 74.25 2 true}
  GetKruChosenClkfxdv {GetKruChosenOutFreqN 74.25 1}
  {GetVcoFreq 74.25 10.5 1 1}
  {GetPLLPkToPkJitter 74.25 10 1 OPTIMIZED 5 12.5}
  {GetPLLPhaseError 74.25 742.5 OPTIMIZED}
  {GetKRUPkToPkJitter 74.25 CLKFX false true false 3 2}
  GetKRUPhaseError
  {GetKRUPeriodPhaseDutyCycle 74.25 CLKDV false 3 2 2.5}
  {GetPLLPeriodPhaseDutyCycle 74.25 10 1 5 22.5 0.5 0}
  GetLatestPhase GetLatestDutyCycle
  {GetVcoFreq 74,25 10.5 1 1}
  {TSYNCalculateActualPhase 22.5 8.125 false}
  {TSYNCalculateActualDutyCycle 37.5 8.5 false}
)";

TEST(LocaleTest, AnswersAndTracesAreThoseOfTheCLocale) {
  const std::string expected = AnswersAndTrace(kCalls);
  const CommaLocale locale;
  if (!CommaLocale::IsSet()) GTEST_SKIP() << "localedef can make no locale with a comma";
  EXPECT_EQ(AnswersAndTrace(kCalls), expected);
  EXPECT_TRUE(CommaLocale::IsSet());
}

// 445.5 MHz is 6 times the input and 3 and 6 times the outputs, and no lower VCO from 400 MHz on
// is: 371.25, 5 times the input, is below.
TEST(LocaleTest, NumbersWithPointsAreReadWhole) {
  const CommaLocale locale;
  if (!CommaLocale::IsSet()) GTEST_SKIP() << "localedef can make no locale with a comma";
  EXPECT_EQ(AnswersAndTrace("{SetDevice vk40} {GetVcoFreq 74.25 10 1 1} "
                            "{PLLCalculateActualOutFreqs {148.5 74.25} 74.25 0 2 false false 0} "
                            "GetChosenVCO {GetChosenOutFreqN 1}"),
            "SetDevice vk40: 0 \n"
            "GetVcoFreq 74.25 10 1 1: 0 742.500\n"
            "PLLCalculateActualOutFreqs {148.5 74.25} 74.25 0 2 false false 0: 0 1\n"
            "GetChosenVCO: 0 445.500\n"
            "GetChosenOutFreqN 1: 0 74.250\n");
}

}  // namespace
