// Calculators for tests: of the bundled devices, and of devices that a test describes.
#ifndef VORKEL_TESTS_HOST_CALCULATOR_SUPPORT_H_
#define VORKEL_TESTS_HOST_CALCULATOR_SUPPORT_H_

#include <atomic>
#include <limits>
#include <memory>
#include <string>
#include <string_view>

#include "host/Tw_BmCMBCalculator.h"
#include "host/bundled/calculator/DeviceCalculator.h"
#include "host/bundled/device/PartName.h"
#include "tests/host/device_folder.h"

namespace calculator_test {

inline constexpr double kNan = std::numeric_limits<double>::quiet_NaN();
inline constexpr double kInfinity = std::numeric_limits<double>::infinity();

// The speed data of a bundled device at one grade.
inline Device::Grade BundledGrade(std::string_view device, std::string_view grade) {
  const auto catalogue = Device::DeviceCatalogue::ListFolders({BUNDLED_DEVICES});
  return *Device::FindDevice(catalogue, device)->FindGrade(grade);
}

// The file of a device "dev" whose grade "1" is made of these lines.
inline Device::DeviceFile ReadDevice(const DeviceFolder& folder, const std::string& lines) {
  folder.Write("dev.toml", "device = \"dev\"\npackages = [\"p1\"]\n[grade.1]\n" + lines);
  return Device::DeviceFile::Read(folder.File("dev.toml"), "dev");
}
inline Device::Grade GradeOf(const std::string& lines) {
  const DeviceFolder folder;
  return *ReadDevice(folder, lines).FindGrade("1");
}

// Limits of each kind of primitive, as lines of a grade.
inline const std::string kPllLines =
    "VCOCLK_FREQ_MIN = 400\nVCOCLK_FREQ_MAX = 1000\n"
    "CLKOUT_FREQ_MIN_GCLK = 5\nCLKOUT_FREQ_MAX_GCLK = 400\nCLKOUT_FREQ_MAX_IOCLK = 1000\n"
    "CLKPFD_FREQ_MIN = 20\nCLKPFD_FREQ_MAX = 500\nO_MAX_HT_LT = 64\n";
inline const std::string kKruClkgenLines =
    "D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD = 2.5\n"
    "D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD = 200\n"
    "D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MINPERIOD = 5\n"
    "D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MAXPERIOD = 6400\n";

// Coefficients of each kind, and the head of their table.
inline const std::string kCalculatorHead = "[grade.1.calculator]\n";
inline const std::string kLoopLines =
    "LOOP_KAPPA = 30\nLOOP_KAPPA_VCO = 1000\nLOOP_BANDWIDTH_LOW = 0.01\n"
    "LOOP_BANDWIDTH_OPTIMIZED = 0.02\nLOOP_BANDWIDTH_HIGH = 0.04\nLOOP_BUFFER_JITTER = 2\n"
    "LOOP_DETERMINISTIC_JITTER = 20\nLOOP_STATIC_OFFSET = 40\nLOOP_LEAKAGE = 40\n";
inline const std::string kKruLines =
    "KRU_KAPPA = 60\nKRU_TAP_STEP = 30\nKRU_BUFFER_JITTER = 3\nKRU_PHASE_ERROR = 150\n";

// What an operation answers: a figure, or the sentence of a refusal.
struct Answer {
  double figure = 0.0;
  std::string error;
};

// A calculator, called as the engine calls it. A figure that an operation leaves unwritten reads
// as NaN, and so does every figure of a refused query, which must write none.
class Asked {
 public:
  explicit Asked(Device::Grade grade, const std::string& device = "dev")
      : place_(std::make_shared<std::atomic<Tw_BmCMBCalculator*>>(nullptr)) {
    auto file = std::make_shared<Device::DeviceFile>();
    file->device = device;
    file->grades.push_back(std::move(grade));
    calculator_ =
        std::make_unique<Calculator::DeviceCalculator>(file, file->grades.front(), place_);
  }

  Tw_BmCMBCalculator& calculator() { return *calculator_; }

  Answer Vco(double input, double m, double d, double feedback = 0) {
    return Ask([&](auto* error, auto* figure) {
      return calculator_->VcoFrequency(input, m, d, feedback, error, figure);
    });
  }
  Answer Jitter(double input, double m, double d, const char* bandwidth, double divider = 4,
                double input_jitter = 0) {
    return Ask([&](auto* error, auto* figure) {
      return calculator_->PllPkToPkJitter(input, m, d, bandwidth, divider, input_jitter, error,
                                          figure);
    });
  }
  Answer KruJitter(double input, int pin, bool clkgen, bool divide_by_2, bool feedback, bool shift,
                   double m, double d) {
    return Ask([&](auto* error, auto* figure) {
      return calculator_->KruPkToPkJitter(input, pin, clkgen, divide_by_2, feedback, shift, m, d,
                                          error, figure);
    });
  }
  Answer PhaseError(double input, double d, const char* bandwidth) {
    return Ask([&](auto* error, auto* figure) {
      return calculator_->PllPhaseError(input, d, bandwidth, error, figure);
    });
  }
  Answer KruPhaseError() {
    return Ask(
        [&](auto* error, auto* figure) { return calculator_->KruPhaseError(error, figure); });
  }
  // The period; phase and duty cycle are kept.
  Answer KruPeriod(double input, int pin, bool divide_by_2, double m = 0, double d = 0,
                   double divide = 0) {
    phase = duty = kNan;
    return Ask([&](auto* error, auto* figure) {
      return calculator_->KruPeriodPhaseDutyCycle(input, pin, divide_by_2, m, d, divide, error,
                                                  figure, &phase, &duty);
    });
  }
  Answer Period(double input, double m, double d, double divider, double wanted_phase = 0,
                double wanted_duty = 0, double count = 0) {
    phase = duty = kNan;
    return Ask([&](auto* error, auto* figure) {
      return calculator_->PllPeriodPhaseDutyCycle(input, m, d, divider, wanted_phase, wanted_duty,
                                                  count, error, figure, &phase, &duty);
    });
  }

  double phase = kNan;
  double duty = kNan;

 private:
  template <typename Operation>
  static Answer Ask(Operation operation) {
    Port::StringBase error;
    double figure = kNan;
    const bool answered = operation(&error, &figure);
    // Exactly one of the two is written.
    if (answered != error.IsEmpty()) return {kNan, "true with an error, or false without"};
    if (!answered && figure == figure) return {figure, "refused with a figure"};
    return {figure, error.CStr()};
  }

  std::shared_ptr<std::atomic<Tw_BmCMBCalculator*>> place_;
  std::unique_ptr<Calculator::DeviceCalculator> calculator_;
};

}  // namespace calculator_test

#endif  // VORKEL_TESTS_HOST_CALCULATOR_SUPPORT_H_
