// The package in a process that exports a stubs table: what it calls, and in which order.
#include <dlfcn.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "binding/TclCalls.h"
#include "binding/VorkelPtrHandle.h"
#include "tests/binding/FakeStubs.h"
#include "tests/binding/FakeWords.h"
#include "tests/binding/MethodFacts.h"

// Defined in binding/PackageEntry.cpp.
extern "C" int Ip_vorkel_Init(Tcl_Interp* interp);
extern "C" int InitVorkel(ClientData data, Tcl_Interp* interp, int objc, Tcl_Obj* const* objv);

namespace {

using testing::ElementsAre;

constexpr char kCreate[] = "create interp Ip::Vorkel::Init data null delete null";
constexpr char kLoad[] = "eval interp load libPtrHandleQrm.dll";
constexpr char kProvide[] = "provide interp Ip_vorkel 1.1";

class ExportedTable : public testing::Test {
 protected:
  ExportedTable() { stubs_ = FakeStubs{}; }

  FakeStubs& stubs_ = FakeStubs::Instance();
};

TEST_F(ExportedTable, IsFoundInThisProgram) {
  void* const symbol = dlsym(RTLD_DEFAULT, "tclStubsPtr");
  ASSERT_NE(symbol, nullptr);
  EXPECT_NE(*static_cast<const TclStubs* const*>(symbol), nullptr);
}

TEST_F(ExportedTable, LoadingTakesThreeStepsInOrder) {
  EXPECT_EQ(Ip_vorkel_Init(FakeStubs::Interp()), TCL_OK);
  EXPECT_THAT(stubs_.calls, ElementsAre(kCreate, kLoad, kProvide));
  EXPECT_EQ(stubs_.procedure, &InitVorkel);
  EXPECT_EQ(stubs_.stubLibraryCalls, 0);
}

TEST_F(ExportedTable, LoadingSucceedsWhateverTheStepsAnswer) {
  stubs_.evalStatus = TCL_ERROR;
  EXPECT_EQ(Ip_vorkel_Init(FakeStubs::Interp()), TCL_OK);
  EXPECT_THAT(stubs_.calls, ElementsAre(kCreate, kLoad, kProvide));

  stubs_ = FakeStubs{};
  stubs_.provideStatus = TCL_ERROR;
  EXPECT_EQ(Ip_vorkel_Init(FakeStubs::Interp()), TCL_OK);
  EXPECT_THAT(stubs_.calls, ElementsAre(kCreate, kLoad, kProvide));

  stubs_ = FakeStubs{};
  int command = 0;
  stubs_.createdCommand = reinterpret_cast<Tcl_Command>(&command);
  stubs_.evalStatus = 17;
  EXPECT_EQ(Ip_vorkel_Init(FakeStubs::Interp()), TCL_OK);
  EXPECT_THAT(stubs_.calls, ElementsAre(kCreate, kLoad, kProvide));
}

TEST_F(ExportedTable, LoadingTwiceTakesAllStepsAgain) {
  EXPECT_EQ(Ip_vorkel_Init(FakeStubs::Interp()), TCL_OK);
  EXPECT_EQ(Ip_vorkel_Init(FakeStubs::Interp()), TCL_OK);
  EXPECT_THAT(stubs_.calls, ElementsAre(kCreate, kLoad, kProvide, kCreate, kLoad, kProvide));
}

class MethodsOnFiveFunctions : public ExportedTable {
 protected:
  MethodsOnFiveFunctions() { EXPECT_TRUE(Tcl::Bind(FakeStubs::Interp())); }

  int Execute(const std::vector<std::string>& texts) { return ExecuteFake(handle_, texts); }

  Ip::VorkelImp imp_{FakeStubs::Interp()};
  Ip::VorkelPtrHandle handle_{&imp_, FakeStubs::Interp()};
};

TEST_F(MethodsOnFiveFunctions, ResultsAreVolatileText) {
  EXPECT_EQ(Execute({"GetChosenVCO"}), TCL_OK);
  EXPECT_EQ(stubs_.result, "0.000");
  EXPECT_THAT(stubs_.calls, ElementsAre("result interp volatile"));

  EXPECT_EQ(Execute({"no such method"}), TCL_ERROR);
  EXPECT_EQ(stubs_.result, "Error: Unknown Tcl command \"no such method\".");
  EXPECT_THAT(stubs_.calls, ElementsAre("result interp volatile"));
}

TEST_F(MethodsOnFiveFunctions, SettersLeaveTheResultAlone) {
  EXPECT_EQ(Execute({"SetVcoMinThreshold", "5"}), TCL_OK);
  EXPECT_THAT(stubs_.calls, ElementsAre());
  EXPECT_EQ(Execute({"SetDevice", "part"}), TCL_OK);
  EXPECT_EQ(stubs_.result, "");
  EXPECT_STREQ(imp_.partName.CStr(), "part");
  EXPECT_EQ(Execute({"SetLowBandwidth", "true"}), TCL_OK);
  EXPECT_EQ(stubs_.result, "");
  EXPECT_TRUE(imp_.lowBandwidth);
}

// No device is selected, so that no run gets as far as the host.
TEST_F(MethodsOnFiveFunctions, AllOfThemAnswer) {
  for (const MethodFacts& method : kMethodFacts) {
    std::vector<std::string> texts(static_cast<std::size_t>(method.arguments) + 1, "1");
    texts[0] = method.name;
    const int status = Execute(texts);
    EXPECT_TRUE(status == TCL_OK || status == TCL_ERROR) << method.name;
    EXPECT_NE(stubs_.result, WrongCount(method));
    for (const std::string& call : stubs_.calls) EXPECT_EQ(call, "result interp volatile");
    texts.push_back("1");
    EXPECT_EQ(Execute(texts), TCL_ERROR);
    EXPECT_EQ(stubs_.result, WrongCount(method));
  }
  EXPECT_EQ(stubs_.stubLibraryCalls, 0);
}

// From the method name on, each word's object and then its text, before anything of the next. The
// word of SetVcoMinThreshold is the one that nobody looks at.
TEST_F(MethodsOnFiveFunctions, ReadTheirWordsFromTheFirstToTheLast) {
  for (const MethodFacts& method : kMethodFacts) {
    std::vector<std::string> texts = {method.name};
    for (int i = 1; i <= method.arguments; ++i) texts.push_back(std::to_string(i));
    const std::size_t wordsRead = method.missingObject == nullptr ? 1 : texts.size();
    std::vector<std::string> expected;
    for (std::size_t i = 0; i < wordsRead; ++i) {
      expected.push_back("object " + texts[i]);
      expected.push_back("text " + texts[i]);
    }
    Execute(texts);
    EXPECT_EQ(stubs_.reads, expected) << method.name;
  }
}

// Arguments are read through their Tcl objects, in the places that the method gives them.
TEST_F(MethodsOnFiveFunctions, ConvertTheirArguments) {
  // No device: the list, the count and the input frequency decide whether it comes to that.
  EXPECT_EQ(Execute({"TSYNCalculateActualOutFreqs", "10 20.5", "100", "0", "2", "true", "1", "0"}),
            TCL_OK);
  EXPECT_EQ(stubs_.result, "Could not get data from speedsfile.");
  EXPECT_EQ(imp_.requests.reqOutFreq[0], 10.0);
  EXPECT_EQ(imp_.requests.reqOutFreq[1], 20.5);
  EXPECT_TRUE(imp_.pll._preferMaxVco);
  EXPECT_FALSE(imp_.pll._intDiv0Only);
  EXPECT_TRUE(imp_.pll._minPowerMode);

  EXPECT_EQ(Execute({"PLLCalculateActualOutFreqs", "30", "100", "0", "1", "yes", "true", "0"}),
            TCL_OK);
  EXPECT_EQ(stubs_.result, "Could not get data from speedsfile.");
  EXPECT_EQ(imp_.requests.reqOutFreq[0], 30.0);
  EXPECT_FALSE(imp_.pll._preferMaxVco);
  EXPECT_TRUE(imp_.pll._intDiv0Only);

  EXPECT_EQ(Execute({"GetClosestSolution", "1 2", "-90 45", "50 25", "100", "0", "2", "true",
                     "false", "true", "0"}),
            TCL_OK);
  EXPECT_EQ(stubs_.result, "Could not get data from speedsfile.");
  EXPECT_EQ(imp_.requests.reqOutFreq[1], 2.0);
  EXPECT_EQ(imp_.requests.reqPhase[0], -90.0);
  EXPECT_EQ(imp_.requests.reqPhase[1], 45.0);
  EXPECT_EQ(imp_.requests.reqDutyCycle[0], 50.0);
  EXPECT_EQ(imp_.requests.reqDutyCycle[1], 25.0);
  EXPECT_TRUE(imp_.pll._preferMaxVco);
  EXPECT_FALSE(imp_.pll._intDiv0Only);
  EXPECT_FALSE(imp_.pll._minPowerMode);
}

}  // namespace
