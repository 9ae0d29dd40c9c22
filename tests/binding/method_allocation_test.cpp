// The 40 methods when memory runs out: each allocation of each call is refused in turn, on a handle
// that has answered the calls before it. The call fails with an error, or answers as ever; and the
// same call answers as ever afterwards.
#include "tests/binding/ScriptCalls.h"

#include <gtest/gtest.h>

#include <array>
#include <set>
#include <string>

#include "tests/binding/MethodFacts.h"
#include "tests/support/RefusingAllocator.h"

// Defined in binding/PackageEntry.cpp.
extern "C" int InitVorkel(ClientData data, Tcl_Interp* interp, int objc, Tcl_Obj* const* objv);

namespace {

// A session that calls every method, each after those that it needs.
constexpr std::array<const char*, 43> kCalls = {
    "SetDevice vk40b484-2",
    "GetSpdKeyValue VCOCLK_FREQ_MIN",
    "SetLowBandwidth false",
    "SetVcoMinThreshold 1",
    "PLLCalculateActualOutFreqs {200 100} 100 0 2 false false false",
    "GetClosestSolution {200 100} {90 0} {50 40} 100 0 2 false false true false",
    "TSYNCalculateActualOutFreqs {148.5 74.25} 74.25 0 2 false false false",
    "GetClosestSolution {148.5 74.25} {45 90} {50 40} 74.25 0 2 true false false false",
    "GetChosenM",
    "GetChosenMInt",
    "GetChosenD",
    "GetChosenDiv0",
    "GetChosenDiv0Int",
    "GetChosenDivN 1",
    "GetChosenVCO",
    "GetChosenOutFreqN 1",
    "GetChosenPhaseN 0",
    "GetChosenDutyCycleN 1",
    "KruCalculateActuals {37.125 55.6875} {0 0} 74.25 2 true false",
    "GetKruChosenM",
    "GetKruChosenD",
    "GetKruChosenPhaseShift",
    "GetKruChosenPhaseOffset",
    "GetKruChosenClkdv",
    "GetKruChosenDivBy2",
    "GetKruChosenPinname 0",
    "GetKruChosenOutFreqN 74.25 1",
    "KruClkgenCalculateActuals {55.6875 27.84375} {0 0} 74.25 2 false",
    "GetKruChosenClkfxdv",
    "GetVcoFreq 100 10 1 0",
    "GetPLLPkToPkJitter 100 10 1 OPTIMIZED 4 100",
    "GetPLLPkToPkJitter 100 10 1 none 4 100",
    "GetKRUPkToPkJitter 100 CLKFX false false false 3 2",
    "GetKRU_CLKGENPkToPkJitter 100 CLKFX false false false 3 2",
    "GetPLLPhaseError 100 1 OPTIMIZED",
    "GetKRUPhaseError",
    "GetKRUPeriodPhaseDutyCycle 100 CLK90 false 0 0 0",
    "GetPLLPeriodPhaseDutyCycle 100 10 1 4 100 40 0",
    "GetLatestPhase",
    "GetLatestDutyCycle",
    "TSYNCalculateActualPhase 100 4 true",
    "TSYNCalculateActualDutyCycle 40 4 true",
    "GetChosenM",
};

std::string MethodOf(const std::string& call) { return call.substr(0, call.find(' ')); }

class MethodAllocation : public testing::TestWithParam<std::size_t> {
 protected:
  MethodAllocation() {
    Tcl_CreateObjCommand(interp_.get(), "Ip::Vorkel::Init", InitVorkel, nullptr, nullptr);
  }

  // A handle that has answered the calls before one.
  void MakeHandle(std::size_t calls) {
    ASSERT_EQ(interp_.Eval("set h [Ip::Vorkel::Init]"), TCL_OK);
    for (std::size_t i = 0; i < calls; ++i) Call(kCalls[i]);
  }
  // The status and the answer.
  std::string Call(const char* call) { return AnswerOf(interp_.Eval(ScriptOf(call))); }
  std::string AnswerOf(int status) { return std::to_string(status) + " " + interp_.Result(); }
  static std::string ScriptOf(const char* call) { return std::string("$h ") + call; }

  TestInterp interp_;
};

TEST(MethodAllocationCalls, AreOfAllMethods) {
  std::set<std::string> called;
  for (const char* call : kCalls) called.insert(MethodOf(call));
  for (const MethodFacts& method : kMethodFacts) EXPECT_EQ(called.count(method.name), 1u);
  EXPECT_EQ(called.size(), kMethodFacts.size());
}

TEST_P(MethodAllocation, EachRefusalIsAnErrorOrDoneWithout) {
  const char* const call = kCalls[GetParam()];
  MakeHandle(GetParam());
  const std::string right = Call(call);
  const std::string script = ScriptOf(call);
  int refused = 1;
  for (int number = 0; refused > 0; ++number) {
    ASSERT_LT(number, 20000);
    MakeHandle(GetParam());
    int status = TCL_OK;
    {
      const RefuseAfter refuse(number);
      status = interp_.Eval(script);
      refused = Refusals();
    }
    const std::string answer = AnswerOf(status);
    // Of a query without a calculator the text is empty, and a message says why.
    EXPECT_TRUE(answer == right || status == TCL_ERROR) << answer << "\nwithout allocation " << number;
    EXPECT_EQ(Call(call), right) << "after allocation " << number;
  }
}

INSTANTIATE_TEST_SUITE_P(
    Calls, MethodAllocation, testing::Range(std::size_t{0}, kCalls.size()),
    [](const testing::TestParamInfo<std::size_t>& one) {
      return std::to_string(one.param) + "_" + MethodOf(kCalls[one.param]);
    });

}  // namespace
