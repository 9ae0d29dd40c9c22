// Devices and plans for the tests of the certificate.
#ifndef VORKEL_TESTS_PLANNER_VERIFY_VERIFY_SUPPORT_H_
#define VORKEL_TESTS_PLANNER_VERIFY_VERIFY_SUPPORT_H_

#include <string>
#include <vector>

#include "host/bundled/device/DeviceFile.h"
#include "planner/Device.h"
#include "planner/device/FromFile.h"
#include "planner/plan/Plan.h"
#include "planner/read/Draft.h"
#include "planner/read/MistakeText.h"
#include "planner/read/Options.h"
#include "planner/report/Json.h"
#include "planner/report/VerifyText.h"
#include "planner/verify/Verify.h"

namespace planner::verify_test {

// The device that a text in TOML describes, at its grade "1"; named "small".
inline planner::Device DeviceOf(const std::string& limits) {
  const std::string text = "device = \"small\"\npackages = [\"p\"]\ndefault_grade = \"1\"\n[grade.1]\n" + limits;
  return device::FromFile(::Device::DeviceFile::Parse(text, "small.toml", "small"), "", "1");
}

// A PLL whose VCO and PFD have one frequency each, 800 and 100 MHz, and no coefficients.
inline constexpr const char* kOnePll = R"(
VCOCLK_FREQ_MIN = 800
VCOCLK_FREQ_MAX = 800
CLKOUT_FREQ_MIN_GCLK = 10
CLKOUT_FREQ_MAX_GCLK = 400
CLKOUT_FREQ_MAX_IOCLK = 800
CLKPFD_FREQ_MIN = 100
CLKPFD_FREQ_MAX = 100
O_MAX_HT_LT = 64
)";

inline constexpr const char* kCoefficients = R"(
[grade.1.calculator]
LOOP_KAPPA = 30
LOOP_KAPPA_VCO = 1000
LOOP_BANDWIDTH_LOW = 0.01
LOOP_BANDWIDTH_OPTIMIZED = 0.02
LOOP_BANDWIDTH_HIGH = 0.04
LOOP_BUFFER_JITTER = 2
LOOP_DETERMINISTIC_JITTER = 20
LOOP_STATIC_OFFSET = 40
LOOP_LEAKAGE = 40
KRU_KAPPA = 60
KRU_TAP_STEP = 30
KRU_BUFFER_JITTER = 3
KRU_PHASE_ERROR = 150
)";

// A PLL and a TSYN with some M and D, and coefficients.
inline std::string NarrowLoops() {
  return std::string(R"(
VCOCLK_FREQ_MIN = 780
VCOCLK_FREQ_MAX = 860
CLKOUT_FREQ_MIN_GCLK = 10
CLKOUT_FREQ_MAX_GCLK = 400
CLKOUT_FREQ_MAX_IOCLK = 800
CLKPFD_FREQ_MIN = 40
CLKPFD_FREQ_MAX = 100
TSYN_VCOCLK_FREQ_MIN = 1000
TSYN_VCOCLK_FREQ_MAX = 1060
TSYN_CLKOUT_FREQ_MIN = 8
TSYN_CLKOUT_FREQ_MAX = 800
TSYN_CLKPFD_FREQ_MIN = 40
TSYN_CLKPFD_FREQ_MAX = 120
TSYN_CLKPFD_FREQ_MAX_LBW = 60
TSYN_VCOCLK_FREQ_TARGET = 1030
O_MAX_HT_LT = 64
)") + kCoefficients;
}

// Both KRUs, the pins with one frequency or two at an input of 50 MHz.
inline std::string NarrowKrus() {
  return std::string(R"(
D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD = 15
D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD = 50
D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD = 16
D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD = 15
D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD = 50
D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD = 16
D_KRU_CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD = 8
D_KRU_CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD = 30
D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD = 45
D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD = 60
D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD = 46
D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD = 11.9
D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD = 12.1
D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MINPERIOD = 23
D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MAXPERIOD = 25
)") + kCoefficients;
}

// A request from options; what is wrong with them ends the test program.
inline Request RequestOf(const std::vector<read::Option>& options) {
  read::Mistakes mistakes;
  const read::Draft draft = read::ReadOptions(options, &mistakes);
  auto reading = read::Finish(draft, {}, &mistakes);
  if (!reading) throw read::MistakeError(mistakes);
  return reading->request;
}

inline std::string Compared(const Request& request, const planner::Device& device) {
  const plan::Plan plan = plan::Make(request, device);
  return report::Json(request, device, report::CompareEntries(plan), plan.front_cut);
}

// What is wrong, a line each, for messages.
inline std::string Text(const std::vector<verify::Discrepancy>& wrong) {
  return report::VerifyText(wrong, "plan.json", {});
}

}  // namespace planner::verify_test

#endif  // VORKEL_TESTS_PLANNER_VERIFY_VERIFY_SUPPORT_H_
