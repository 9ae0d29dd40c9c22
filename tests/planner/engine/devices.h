// Devices whose limits make the engine's answers easy to work out by hand.
#ifndef VORKEL_TESTS_PLANNER_ENGINE_DEVICES_H_
#define VORKEL_TESTS_PLANNER_ENGINE_DEVICES_H_

#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "host/bundled/device/DeviceFile.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/device/FromFile.h"

namespace engine_test {

// VCO 400 to 1000 MHz, PFD 20 to 500, outputs 5 to 400, output 1 to 1000.
inline const std::string kPll =
    "VCOCLK_FREQ_MIN = 400\nVCOCLK_FREQ_MAX = 1000\nCLKOUT_FREQ_MIN_GCLK = 5\n"
    "CLKOUT_FREQ_MAX_GCLK = 400\nCLKOUT_FREQ_MAX_IOCLK = 1000\nCLKPFD_FREQ_MIN = 20\n"
    "CLKPFD_FREQ_MAX = 500\n";

// VCO 600 to 1200 MHz, best at 900, PFD 10 to 500 and in LOW to 60, outputs 5 to 800.
inline const std::string kTsyn =
    "TSYN_VCOCLK_FREQ_MIN = 600\nTSYN_VCOCLK_FREQ_MAX = 1200\nTSYN_VCOCLK_FREQ_TARGET = 900\n"
    "TSYN_CLKOUT_FREQ_MIN = 5\nTSYN_CLKOUT_FREQ_MAX = 800\nTSYN_CLKPFD_FREQ_MIN = 10\n"
    "TSYN_CLKPFD_FREQ_MAX = 500\nTSYN_CLKPFD_FREQ_MAX_LBW = 60\n";

inline std::string KruLine(const std::string& pin, const std::string& what,
                           const std::string& period) {
  return "D_KRU_" + pin + "_CLKIN_DIVIDE_BY_2_FALSE_" + what + "PERIOD = " + period + "\n";
}

// MHz: CLK0 5 to 200, CLK90 5 to 160, CLK2X 10 to 400, CLKDV 1 to 200, CLKFX 20 to 400,
// CLKFXDV 1 to 200; CLK0, CLK90 and CLKDV to 125 with feedback from CLK2X.
inline std::string Kru() {
  const std::string usual = "CLK_FEEDBACK_1X_";
  const std::string doubled = "CLK_FEEDBACK_2X_";
  return KruLine("CLK0", usual + "MIN", "5") + KruLine("CLK0", usual + "MAX", "200") +
         KruLine("CLK0", doubled + "MIN", "8") + KruLine("CLK90", usual + "MIN", "6.25") +
         KruLine("CLK90", usual + "MAX", "200") + KruLine("CLK90", doubled + "MIN", "8") +
         KruLine("CLK2X", usual + "MIN", "2.5") + KruLine("CLK2X", usual + "MAX", "100") +
         KruLine("CLKDV", usual + "MIN", "5") + KruLine("CLKDV", usual + "MAX", "1000") +
         KruLine("CLKDV", doubled + "MIN", "8") + KruLine("CLKFX", usual + "MIN", "2.5") +
         KruLine("CLKFX", usual + "MAX", "50") + KruLine("CLKFXDV", "MIN", "5") +
         KruLine("CLKFXDV", "MAX", "1000");
}

inline std::string RoundText() {
  return "device = \"round\"\npackages = [\"p\"]\ndefault_package = \"p\"\ndefault_grade = \"1\"\n"
         "[grade.1]\nO_MAX_HT_LT = 64\n" + kPll + kTsyn + Kru();
}

inline planner::Device Round() {
  return planner::device::FromFile(
      ::Device::DeviceFile::Parse(RoundText(), "round.toml", "round"), "p", "1");
}

// An output of so many MHz; nothing is one that is not used.
inline planner::Output Out(std::optional<hardware::Rational> frequency,
                           std::optional<hardware::Rational> phase = {},
                           std::optional<hardware::Rational> duty = {}) {
  planner::Output output;
  output.used = frequency.has_value();
  output.frequency = frequency.value_or(hardware::Rational(0));
  output.phase = std::move(phase);
  output.duty = std::move(duty);
  return output;
}

inline planner::Request Ask(std::vector<hardware::Rational> inputs,
                            std::vector<planner::Output> outputs) {
  planner::Request request;
  request.inputs = std::move(inputs);
  request.outputs = std::move(outputs);
  return request;
}

}  // namespace engine_test

#endif  // VORKEL_TESTS_PLANNER_ENGINE_DEVICES_H_
