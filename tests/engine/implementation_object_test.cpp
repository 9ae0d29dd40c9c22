// Tests of the implementation object: what a fresh one holds, device and mode, and the life of
// its host objects.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <string>
#include <type_traits>
#include <vector>

#include "host/Dly_SpeedController.h"
#include "host/PM_PIC.h"
#include "host/Tw_BmCMBCalculator.h"
#include "host/Util_SharedObjects.h"
#include "tests/engine/EngineTest.h"
#include "tests/support/FakeHost.h"

struct Tcl_Interp {};

namespace {

using Ip::VorkelImp;
using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;

// Taken before any test runs a search.
const std::int32_t kPrimAtStart = VorkelImp::_prim;

using Controllers = Util::SharedObjects<PM_PIC, Dly_SpeedController>;

std::uintptr_t Address(const PM_PIC* pic) { return reinterpret_cast<std::uintptr_t>(pic); }

// Takes the address of a deleted personality out of use: the registry keeps its controller, and
// no other test is to meet it. Gives up when the allocator does not hand the address out.
void Occupy(std::uintptr_t address) {
  static auto* const occupants = new std::vector<std::unique_ptr<PM_PIC>>;
  for (int attempt = 0; attempt < 1000; ++attempt) {
    occupants->push_back(std::make_unique<PM_PIC>("first", true, PM_PARTNAME_BINDING{}));
    if (Address(occupants->back().get()) == address) return;
  }
}

class ImplementationObjectTest : public testing::Test {
 protected:
  ImplementationObjectTest() {
    host_.Reset();
    host_.devices["first"] = {{"KEY", FigureFor(1)}};
    host_.devices["second"] = {{"KEY", FigureFor(2)}};
  }

  FakeHost& host_ = FakeHost::Instance();
  VorkelImp& imp_ = engine_test::NewImp();
};

// --- Construction --------------------------------------------------------------------------

TEST_F(ImplementationObjectTest, HasNoHostObjectsAndNoDeviceAtFirst) {
  EXPECT_EQ(imp_.cmbCalculator, nullptr);
  EXPECT_EQ(imp_.speedController, nullptr);
  EXPECT_EQ(imp_.pic, nullptr);
  EXPECT_TRUE(imp_.partName.IsEmpty());
  EXPECT_EQ(imp_.GetLatestPhase(), 0.0);
  EXPECT_EQ(imp_.GetLatestDutyCycle(), 0.0);
}

TEST_F(ImplementationObjectTest, KeepsItsInterpreter) {
  Tcl_Interp interp;
  const VorkelImp imp(&interp);
  EXPECT_EQ(imp.interp, &interp);
  EXPECT_EQ(imp_.interp, nullptr);
}

TEST_F(ImplementationObjectTest, HasTheDefaultPllLimits) {
  EXPECT_EQ(imp_.pllLimits.vcoTarget, 0.0);
  EXPECT_EQ(imp_.pllLimits.vcoMin, 400.0);
  EXPECT_EQ(imp_.pllLimits.vcoMax, 1200.0);
  EXPECT_EQ(imp_.pllLimits.pfdMin, 10.0);
  EXPECT_EQ(imp_.pllLimits.pfdMax, 550.0);
  EXPECT_EQ(imp_.pllLimits._maxPfdLowB, 300.0);
  EXPECT_EQ(imp_.pllLimits.clkoutMin, 3.125);
  EXPECT_EQ(imp_.pllLimits.clkoutMax, 375.0);
  EXPECT_EQ(imp_.pllLimits.clkoutMaxIo, 1000.0);
  EXPECT_EQ(imp_.pllLimits.maxHighLowCount, 64.0);
}

TEST_F(ImplementationObjectTest, HasTheDefaultKruLimits) {
  EXPECT_EQ(imp_.kruLimits._kruClk0Min, 5.0);
  EXPECT_EQ(imp_.kruLimits._kruClk0Max, 280.112);
  EXPECT_EQ(imp_.kruLimits._kruClk0Max2x, 187.617);
  EXPECT_EQ(imp_.kruLimits._kruClk90Min, 5.0);
  EXPECT_EQ(imp_.kruLimits._kruClk90Max, 200.0);
  EXPECT_EQ(imp_.kruLimits._kruClk90Max2x, 187.617);
  EXPECT_EQ(imp_.kruLimits._kruClk2xMin, 10.0);
  EXPECT_EQ(imp_.kruLimits._kruClk2xMax, 374.532);
  EXPECT_EQ(imp_.kruLimits._kruClkdvMin, 0.3125);
  EXPECT_EQ(imp_.kruLimits._kruClkdvMax, 185.874);
  EXPECT_EQ(imp_.kruLimits._kruClkdvMax2x, 125.0);
  EXPECT_EQ(imp_.kruLimits._kruClkfxMin, 5.0);
  EXPECT_EQ(imp_.kruLimits._kruClkfxMax, 374.532);
  EXPECT_EQ(imp_.kruLimits._kruClkfxdvMin, 0.156);
  EXPECT_EQ(imp_.kruLimits._kruClkfxdvMax, 187.266);
}

TEST_F(ImplementationObjectTest, HasTheDefaultSolverState) {
  EXPECT_EQ(imp_.pll.minAdjVco, 400.0);
  EXPECT_EQ(imp_.pll.maxAdjVco, 1200.0);
  EXPECT_EQ(imp_.pll.minM, 0.0);
  EXPECT_EQ(imp_.pll.maxM, 0.0);
  EXPECT_FALSE(imp_.lowBandwidth);
  EXPECT_FALSE(imp_.pll._preferMaxVco);
  EXPECT_FALSE(imp_.pll._intDiv0Only);
  EXPECT_FALSE(imp_.pll._minPowerMode);
  EXPECT_TRUE(imp_.pll._vcoCandidates.Occupied().IsEmpty());
  EXPECT_TRUE(imp_.pll._solutions.Occupied().IsEmpty());
  EXPECT_EQ(imp_.pll.chosen, nullptr);
}

// Scripts make thousands of them, and each lives as long as the process.
TEST_F(ImplementationObjectTest, IsSmall) { EXPECT_LE(sizeof(VorkelImp), 2048u); }

TEST_F(ImplementationObjectTest, HasEmptyRequests) {
  EXPECT_EQ(imp_.requests.reqOutFreq.size(), 7u);
  EXPECT_THAT(imp_.requests.reqOutFreq, Each(0.0));
  EXPECT_THAT(imp_.requests.reqPhase, Each(0.0));
  EXPECT_THAT(imp_.requests.reqDutyCycle, Each(0.0));
}

TEST_F(ImplementationObjectTest, ThePrimitiveOfTheProcessIsMinusOneAtFirst) {
  EXPECT_EQ(kPrimAtStart, -1);
}

// --- Device and mode -----------------------------------------------------------------------

TEST_F(ImplementationObjectTest, SetDeviceTakesTheNameAndNothingElse) {
  imp_.SetDevice("first");
  EXPECT_EQ(imp_.partName, Port::StringBase("first"));
  EXPECT_EQ(imp_.pic, nullptr);
  EXPECT_EQ(imp_.speedController, nullptr);
  imp_.SetDevice("second");
  EXPECT_EQ(imp_.partName, Port::StringBase("second"));
}

TEST_F(ImplementationObjectTest, SetDeviceTakesNamesThatNoDeviceHas) {
  imp_.SetDevice("first");
  imp_.SetDevice(" ");
  EXPECT_EQ(imp_.partName, Port::StringBase(" "));
}

TEST_F(ImplementationObjectTest, SetDeviceIgnoresAnEmptyName) {
  imp_.SetDevice("");
  EXPECT_TRUE(imp_.partName.IsEmpty());
  imp_.SetDevice("first");
  imp_.SetDevice("");
  EXPECT_EQ(imp_.partName, Port::StringBase("first"));
}

TEST_F(ImplementationObjectTest, SetLowBandwidthSetsAndClears) {
  imp_.SetLowBandwidth(true);
  EXPECT_TRUE(imp_.lowBandwidth);
  imp_.SetLowBandwidth(true);
  EXPECT_TRUE(imp_.lowBandwidth);
  imp_.SetLowBandwidth(false);
  EXPECT_FALSE(imp_.lowBandwidth);
  EXPECT_FALSE(engine_test::NewImp().lowBandwidth);
}

// --- Speed controller ----------------------------------------------------------------------

TEST_F(ImplementationObjectTest, WithoutADeviceThereIsNoController) {
  host_.devices[""] = {{"KEY", FigureFor(3)}};  // not even when the host would have one
  EXPECT_FALSE(imp_.EnsureSpeedController());
  EXPECT_EQ(imp_.pic, nullptr);
  EXPECT_EQ(imp_.speedController, nullptr);
  EXPECT_EQ(host_.controllers, 0);
  EXPECT_THAT(host_.messages, IsEmpty()) << "reporting is the caller's";
}

TEST_F(ImplementationObjectTest, MakesPersonalityAndControllerOnce) {
  const int personalities = host_.personalities;
  imp_.SetDevice("first");
  EXPECT_TRUE(imp_.EnsureSpeedController());
  ASSERT_NE(imp_.pic, nullptr);
  ASSERT_NE(imp_.speedController, nullptr);
  const PM_PIC* const pic = imp_.pic;
  const Dly_SpeedController* const controller = imp_.speedController;

  EXPECT_TRUE(imp_.EnsureSpeedController());
  EXPECT_EQ(imp_.pic, pic);
  EXPECT_EQ(imp_.speedController, controller);
  EXPECT_EQ(host_.personalities, personalities + 1);
  EXPECT_EQ(host_.controllers, 1);
  EXPECT_EQ(host_.fillDefaultsCalls, 1);
}

TEST_F(ImplementationObjectTest, TheControllerIsInTheRegistryUnderItsPersonality) {
  imp_.SetDevice("first");
  ASSERT_TRUE(imp_.EnsureSpeedController());
  ASSERT_TRUE(imp_.EnsureSpeedController());
  const Controllers::Entry* const entry = Controllers::Instance(imp_.pic).Find();
  ASSERT_NE(entry, nullptr);
  EXPECT_EQ(entry->object, imp_.speedController);
  EXPECT_EQ(entry->useCount, 1);
}

TEST_F(ImplementationObjectTest, EachObjectHasItsOwnPersonalityAndController) {
  VorkelImp& other = engine_test::NewImp();
  imp_.SetDevice("first");
  other.SetDevice("first");
  ASSERT_TRUE(imp_.EnsureSpeedController());
  ASSERT_TRUE(other.EnsureSpeedController());
  EXPECT_NE(imp_.pic, other.pic);
  EXPECT_NE(imp_.speedController, other.speedController);
  EXPECT_EQ(host_.controllers, 2);
}

TEST_F(ImplementationObjectTest, ASecondDeviceKeepsTheSpeedDataOfTheFirst) {
  imp_.SetDevice("first");
  double value = 0.0;
  ASSERT_TRUE(imp_.GetSpdKeyValue("KEY", &value));
  imp_.SetDevice("second");
  EXPECT_EQ(imp_.partName, Port::StringBase("second"));
  ASSERT_TRUE(imp_.GetSpdKeyValue("KEY", &value));
  EXPECT_EQ(value, 1.0);
  EXPECT_EQ(host_.controllers, 1);
}

TEST_F(ImplementationObjectTest, ADeviceThatIsReplacedBeforeAnyReadDoesNotCount) {
  imp_.SetDevice("first");
  imp_.SetDevice("second");
  double value = 0.0;
  ASSERT_TRUE(imp_.GetSpdKeyValue("KEY", &value));
  EXPECT_EQ(value, 2.0);
}

TEST_F(ImplementationObjectTest, AnUnknownDeviceFailsAndTheNextOneWorks) {
  imp_.SetDevice("unknown");
  EXPECT_FALSE(imp_.EnsureSpeedController());
  EXPECT_EQ(imp_.pic, nullptr);
  EXPECT_EQ(imp_.speedController, nullptr);
  imp_.SetDevice("first");
  EXPECT_TRUE(imp_.EnsureSpeedController());
}

TEST_F(ImplementationObjectTest, ADeviceWithoutSpeedDataFailsAndTheNextOneWorks) {
  const int personalities = host_.personalities;
  host_.withoutSpeedData = {"first"};
  imp_.SetDevice("first");
  EXPECT_FALSE(imp_.EnsureSpeedController());
  EXPECT_FALSE(imp_.EnsureSpeedController());
  EXPECT_EQ(imp_.speedController, nullptr);
  EXPECT_EQ(host_.personalities, personalities) << "personalities of failed tries are freed";

  imp_.SetDevice("second");
  double value = 0.0;
  ASSERT_TRUE(imp_.GetSpdKeyValue("KEY", &value));
  EXPECT_EQ(value, 2.0);
  EXPECT_NE(imp_.pic, nullptr);
}

// The host promises exceptions of one type. What else its constructors may throw is a failed
// creation all the same.
TEST_F(ImplementationObjectTest, WhateverTheHostThrowsIsAFailedCreation) {
  const int personalities = host_.personalities;
  imp_.SetDevice("first");
  for (auto* const place : {&host_.whilePersonalityIsMade, &host_.whileControllerIsMade}) {
    for (const auto& action : engine_test::Throwers()) {
      *place = action;
      EXPECT_FALSE(imp_.EnsureSpeedController());
      EXPECT_EQ(imp_.pic, nullptr);
      EXPECT_EQ(imp_.speedController, nullptr);
      EXPECT_EQ(host_.personalities, personalities);
    }
    *place = nullptr;
  }
  EXPECT_TRUE(imp_.EnsureSpeedController());
}

TEST_F(ImplementationObjectTest, AFailedDeviceCanBeTriedAgain) {
  host_.withoutSpeedData = {"first"};
  imp_.SetDevice("first");
  ASSERT_FALSE(imp_.EnsureSpeedController());
  host_.withoutSpeedData.clear();
  EXPECT_TRUE(imp_.EnsureSpeedController());
}

// A personality at the address of an earlier, deleted one finds that one's controller in the
// registry and counts itself as one more user.
TEST_F(ImplementationObjectTest, AnEntryOfTheRegistryIsUsedAgain) {
  auto former = std::make_unique<VorkelImp>(nullptr);
  former->SetDevice("first");
  ASSERT_TRUE(former->EnsureSpeedController());
  Dly_SpeedController* const controller = former->speedController;
  const std::uintptr_t address = Address(former->pic);
  former.reset();

  for (int attempt = 0; attempt < 100; ++attempt) {
    VorkelImp& imp = engine_test::NewImp();
    imp.SetDevice("first");
    const int controllers = host_.controllers;
    ASSERT_TRUE(imp.EnsureSpeedController());
    if (Address(imp.pic) != address) continue;
    EXPECT_EQ(imp.speedController, controller);
    EXPECT_EQ(host_.controllers, controllers);
    EXPECT_EQ(Controllers::Instance(imp.pic).Find()->useCount, 2);
    return;
  }
  Occupy(address);
  GTEST_SKIP() << "the allocator did not hand out the address again";
}

// --- Destruction ---------------------------------------------------------------------------

static_assert(std::has_virtual_destructor_v<VorkelImp>);
static_assert(!std::is_copy_constructible_v<VorkelImp>);

// A calculator that notes how many personalities live when it is deleted.
class NotingCalculator : public Tw_BmCMBCalculator {
 public:
  explicit NotingCalculator(int* livingAtDeletion) : livingAtDeletion_(livingAtDeletion) {}
  ~NotingCalculator() override { *livingAtDeletion_ = FakeHost::Instance().personalities; }

  bool VcoFrequency(double, double, double, double, Port::StringBase*, double*) override {
    return false;
  }
  bool PllPkToPkJitter(double, double, double, Port::StringBase, double, double,
                       Port::StringBase*, double*) override {
    return false;
  }
  bool KruPkToPkJitter(double, int, bool, bool, bool, bool, const double&, const double&,
                       Port::StringBase*, double*) override {
    return false;
  }
  bool PllPhaseError(double, double, Port::StringBase, Port::StringBase*, double*) override {
    return false;
  }
  bool KruPhaseError(Port::StringBase*, double*) override { return false; }
  bool KruPeriodPhaseDutyCycle(double, int, bool, double, double, double, Port::StringBase*,
                               double*, double*, double*) override {
    return false;
  }
  bool PllPeriodPhaseDutyCycle(double, double, double, double, double, double, double,
                               Port::StringBase*, double*, double*, double*) override {
    return false;
  }

 private:
  int* livingAtDeletion_;
};

TEST_F(ImplementationObjectTest, DeletesPersonalityThenCalculator) {
  const int personalities = host_.personalities;
  auto imp = std::make_unique<VorkelImp>(nullptr);
  imp->pic = new PM_PIC("first", true, PM_PARTNAME_BINDING{});
  ASSERT_EQ(host_.personalities, personalities + 1);
  int livingAtDeletion = -1;
  imp->cmbCalculator = new NotingCalculator(&livingAtDeletion);
  imp.reset();
  EXPECT_EQ(host_.personalities, personalities);
  EXPECT_EQ(livingAtDeletion, personalities) << "the personality goes first";
}

TEST_F(ImplementationObjectTest, ACalculatorAloneIsDeletedToo) {
  int livingAtDeletion = -1;
  {
    VorkelImp imp(nullptr);
    imp.cmbCalculator = new NotingCalculator(&livingAtDeletion);
  }
  EXPECT_EQ(livingAtDeletion, host_.personalities);
}

TEST_F(ImplementationObjectTest, LeavesTheControllerAndItsUseCountToTheRegistry) {
  auto imp = std::make_unique<VorkelImp>(nullptr);
  imp->SetDevice("second");
  ASSERT_TRUE(imp->EnsureSpeedController());
  const Dly_SpeedController* const controller = imp->speedController;
  Controllers& controllers = Controllers::Instance(imp->pic);
  const int useCount = controllers.Find()->useCount;
  const std::uintptr_t address = Address(imp->pic);
  const int personalities = host_.personalities;
  imp.reset();
  EXPECT_EQ(host_.personalities, personalities - 1);
  // The registry's key of the request at hand is still that of the deleted personality.
  const Controllers::Entry* const entry = controllers.Find();
  ASSERT_NE(entry, nullptr);
  EXPECT_EQ(entry->object, controller);
  EXPECT_EQ(entry->useCount, useCount);
  EXPECT_EQ(controller->GetBelDelay("KEY", nullptr), FigureFor(2));
  Occupy(address);
}

TEST_F(ImplementationObjectTest, ASubclassIsDestroyedThroughTheBase) {
  struct Derived : VorkelImp {
    explicit Derived(bool* flag) : VorkelImp(nullptr), gone(flag) {}
    ~Derived() override { *gone = true; }
    bool* gone;
  };
  bool gone = false;
  std::unique_ptr<VorkelImp> imp = std::make_unique<Derived>(&gone);
  imp.reset();
  EXPECT_TRUE(gone);
}

}  // namespace
