// The methods with a host that throws what it does not promise to while it makes the objects
// behind a device.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <functional>
#include <new>
#include <stdexcept>
#include <string>
#include <vector>

#include "binding/TclCalls.h"
#include "binding/VorkelPtrHandle.h"
#include "tests/binding/FakeStubs.h"
#include "tests/binding/FakeWords.h"
#include "tests/binding/MethodFacts.h"
#include "tests/support/FakeHost.h"

namespace {

using testing::ElementsAre;

constexpr char kPart[] = "part";
constexpr char kNoCalculator[] =
    "Internal getCMBCalculator() error -- could not obtain CMBCalculator\n";
constexpr char kNotLoaded[] = "Internal GetSpdKeyValue() error -- speedsfile could not be loaded\n";

class FailingHostTest : public testing::Test {
 protected:
  FailingHostTest() {
    EXPECT_TRUE(Tcl::Bind(FakeStubs::Interp()));
    host_.Reset();
    SetPll(kPart, {});
    SetTsyn(kPart, {});
    imp_.SetDevice(kPart);
  }
  ~FailingHostTest() override { host_.Reset(); }

  // A call with the texts; the messages are those of this call.
  int Execute(const std::vector<std::string>& texts) {
    host_.messages.clear();
    return ExecuteFake(handle_, texts);
  }

  FakeHost& host_ = FakeHost::Instance();
  // As in the package it is never deleted: at the address of a deleted personality another would
  // meet the controller of the first.
  Ip::VorkelImp& imp_ = *new Ip::VorkelImp(FakeStubs::Interp());
  Ip::VorkelPtrHandle handle_{&imp_, FakeStubs::Interp()};
};

TEST_F(FailingHostTest, NoExceptionLeavesAMethod) {
  const std::vector<std::function<void()>> throwers = {[] { throw std::bad_alloc(); },
                                                       [] { throw std::runtime_error("broken"); },
                                                       [] { throw 17; }};
  for (auto* const place : {&host_.whilePersonalityIsMade, &host_.whileControllerIsMade,
                            &host_.whileCalculatorIsMade}) {
    for (const auto& thrower : throwers) {
      *place = thrower;
      for (const MethodFacts& method : kMethodFacts) {
        std::vector<std::string> texts(static_cast<std::size_t>(method.arguments) + 1, "1");
        texts[0] = method.name;
        imp_.SetDevice(kPart);  // a method may have selected another
        EXPECT_NO_THROW(Execute(texts)) << method.name;
      }
    }
    *place = nullptr;
  }
}

TEST_F(FailingHostTest, SpeedDataCannotBeLoaded) {
  host_.whileControllerIsMade = [] { throw std::runtime_error("broken"); };
  EXPECT_EQ(Execute({"GetSpdKeyValue", "KEY"}), TCL_ERROR);
  EXPECT_EQ(FakeStubs::Instance().result,
            "Unable to get value from speedsfile for keyword KEY");
  EXPECT_THAT(host_.MessageTexts(), ElementsAre(kNotLoaded));
  EXPECT_EQ(Execute({"PLLCalculateActualOutFreqs", "200", "100", "0", "1", "0", "0", "0"}),
            TCL_OK);
  EXPECT_EQ(FakeStubs::Instance().result, "Could not get data from speedsfile.");
}

TEST_F(FailingHostTest, TheCalculatorCannotBeObtained) {
  for (auto* const place : {&host_.whilePersonalityIsMade, &host_.whileControllerIsMade,
                            &host_.whileCalculatorIsMade}) {
    *place = [] { throw std::runtime_error("broken"); };
    EXPECT_EQ(Execute({"GetKRUPhaseError"}), TCL_ERROR);
    EXPECT_EQ(FakeStubs::Instance().result, "");
    EXPECT_THAT(host_.MessageTexts(), ElementsAre(kNoCalculator));
    *place = nullptr;
  }
}

}  // namespace
