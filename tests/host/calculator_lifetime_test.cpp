// Whose a calculator is, and for how long.
#include <gtest/gtest.h>

#include <atomic>
#include <cstddef>
#include <memory>
#include <thread>
#include <vector>

#include "host/Dly_SpeedController.h"
#include "host/PM_PIC.h"
#include "host/Tw_BmCMBCalculator.h"
#include "tests/host/calculator_support.h"

namespace {

// A controller of a bundled device.
std::unique_ptr<Dly_SpeedController> Controller(const char* part) {
  const SearchPath path(BUNDLED_DEVICES);
  PM_PIC pic(part, true, PM_PARTNAME_BINDING_USUAL);
  pic.fill_defaults();
  return std::make_unique<Dly_SpeedController>(&pic);
}

Tw_BmCMBCalculator* CalculatorOf(const std::unique_ptr<Dly_SpeedController>& controller) {
  return Tw_BmPhysicalBlockModeler::GetCMBCalculator(controller.get());
}

// A KRU's phase error, 150 ps on vk40-2 and 200 on vk10-1.
double KruPhaseError(Tw_BmCMBCalculator* calculator) {
  Port::StringBase error;
  double figure = 0;
  EXPECT_TRUE(calculator->KruPhaseError(&error, &figure)) << error.CStr();
  return figure;
}

TEST(GetCMBCalculator, HasNoneForNoController) {
  EXPECT_EQ(Tw_BmPhysicalBlockModeler::GetCMBCalculator(nullptr), nullptr);
}

TEST(GetCMBCalculator, HasNoneWithoutCoefficients) {
  const DeviceFolder folder;
  const SearchPath path(folder.path());
  folder.WriteDevice("dev");
  PM_PIC pic("dev", true, PM_PARTNAME_BINDING_USUAL);
  pic.fill_defaults();
  Dly_SpeedController controller(&pic);
  EXPECT_EQ(Tw_BmPhysicalBlockModeler::GetCMBCalculator(&controller), nullptr);
}

TEST(GetCMBCalculator, AnswersAlikeForTheSameController) {
  const auto controller = Controller("vk40");
  const std::unique_ptr<Tw_BmCMBCalculator> calculator(CalculatorOf(controller));
  ASSERT_NE(calculator, nullptr);
  EXPECT_EQ(CalculatorOf(controller), calculator.get());
  EXPECT_EQ(CalculatorOf(controller), calculator.get());
}

TEST(GetCMBCalculator, AnswersSeveralThreadsAlike) {
  for (int round = 0; round < 100; ++round) {
    const auto controller = Controller("vk40");
    std::vector<Tw_BmCMBCalculator*> calculators(3, nullptr);
    std::atomic<std::size_t> waiting = calculators.size();
    std::vector<std::thread> threads;
    for (Tw_BmCMBCalculator*& calculator : calculators) {
      threads.emplace_back([&calculator, &controller, &waiting] {
        --waiting;
        while (waiting > 0) std::this_thread::yield();
        calculator = CalculatorOf(controller);
      });
    }
    for (std::thread& thread : threads) thread.join();
    const std::unique_ptr<Tw_BmCMBCalculator> owned(calculators[0]);
    ASSERT_NE(owned, nullptr);
    ASSERT_EQ(calculators[1], calculators[0]);
    ASSERT_EQ(calculators[2], calculators[0]);
  }
}

TEST(GetCMBCalculator, AnswersDifferentlyForDifferentControllers) {
  const auto fast = Controller("vk40-2");
  const auto other = Controller("vk10-1");
  const std::unique_ptr<Tw_BmCMBCalculator> of_fast(CalculatorOf(fast));
  const std::unique_ptr<Tw_BmCMBCalculator> of_other(CalculatorOf(other));
  EXPECT_NE(of_fast, of_other);
  EXPECT_EQ(KruPhaseError(of_fast.get()), 150.0);
  EXPECT_EQ(KruPhaseError(of_other.get()), 200.0);
}

TEST(GetCMBCalculator, MakesANewOneAfterTheOldWasDestroyed) {
  const auto controller = Controller("vk40");
  for (int round = 0; round < 3; ++round) {
    const std::unique_ptr<Tw_BmCMBCalculator> calculator(CalculatorOf(controller));
    ASSERT_NE(calculator, nullptr);
    EXPECT_EQ(KruPhaseError(calculator.get()), 150.0);
  }
}

TEST(GetCMBCalculator, ACalculatorOutlivesItsController) {
  auto controller = Controller("vk40");
  const std::unique_ptr<Tw_BmCMBCalculator> calculator(CalculatorOf(controller));
  controller.reset();
  EXPECT_EQ(KruPhaseError(calculator.get()), 150.0);
}

// The controller keeps nothing that it would delete.
TEST(GetCMBCalculator, AControllerOutlivesItsCalculator) {
  const auto controller = Controller("vk40");
  delete CalculatorOf(controller);
  EXPECT_EQ(controller->GetBelDelay("VCOCLK_FREQ_MAX", nullptr) * 1e9, 1080.0);
}

TEST(GetCMBCalculator, NamesTheDeviceAndTheGrade) {
  const auto controller = Controller("vk20");
  const std::unique_ptr<Tw_BmCMBCalculator> calculator(CalculatorOf(controller));
  Port::StringBase error;
  double figure = 0;
  EXPECT_FALSE(calculator->KruPhaseError(&error, &figure));
  EXPECT_EQ(error, Port::StringBase("Device vk20-2 has neither KRU_SP nor KRU_CLKGEN."));
}

}  // namespace
