// What the tests of the KRU solvers share.
#ifndef VORKEL_TESTS_ENGINE_KRUTEST_H_
#define VORKEL_TESTS_ENGINE_KRUTEST_H_

#include <cstdio>
#include <string>
#include <utility>
#include <vector>

#include "engine/kru/Stages.h"
#include "tests/engine/EngineTest.h"
#include "tests/support/FakeHost.h"

namespace engine_test {

// What one output is asked for.
struct KruOutput {
  double frequency;    // MHz
  double phase = 0.0;  // degrees
};

inline void Request(Ip::VorkelImp& imp, const std::vector<KruOutput>& outputs) {
  for (std::size_t n = 0; n < outputs.size(); ++n) {
    imp.requests.reqOutFreq[n] = outputs[n].frequency;
    imp.requests.reqPhase[n] = outputs[n].phase;
  }
}

// The names of a list, separated by blanks, up to the last pin that is not NONE.
inline std::string Names(const Ip::KruPinList& pins) {
  std::size_t filled = pins.size();
  while (filled > 0 && pins[filled - 1] == Ip::KruPin::NONE) --filled;
  std::string names;
  for (std::size_t n = 0; n < filled; ++n) {
    if (n > 0) names += ' ';
    names += Ip::KruPinName(pins[n]).CStr();
  }
  return names;
}

// The line that says that a pin cannot be used for a frequency.
inline std::string Refused(const char* pin, double frequency) {
  char line[200];
  std::snprintf(line, sizeof line,
                "DLL -!!!!!! Can't use %s because requested freq %3.3f is out of range\n", pin,
                frequency);
  return line;
}

// The same for the pins of the frequency synthesiser, as the KRU_SP says it.
inline std::string PotentiallyRefused(const char* pin, double frequency) {
  char line[200];
  std::snprintf(
      line, sizeof line,
      "DLL -!!!!!! Can't potentially use %s because requested freq %3.3f is out of range\n", pin,
      frequency);
  return line;
}

// The keywords of the KRU_SP limits in the order in which they are read, with the periods (ns)
// of a device that has round limits: CLK0 5 to 250 MHz (200 with 2X feedback), CLK90 4 to 200
// (125), CLK2X 10 to 400, CLKDV 0.3125 to 160 (100) and CLKFX 8 to 500.
inline const std::vector<std::pair<std::string, double>>& KruPeriods() {
  static const std::vector<std::pair<std::string, double>> periods = {
      {"D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", 4},
      {"D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", 200},
      {"D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD", 5},
      {"D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", 5},
      {"D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", 250},
      {"D_KRU_CLK90_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD", 8},
      {"D_KRU_CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", 2.5},
      {"D_KRU_CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", 100},
      {"D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", 6.25},
      {"D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", 3200},
      {"D_KRU_CLKDV_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD", 10},
      {"D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD", 2},
      {"D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD", 125},
  };
  return periods;
}

// What a KRU_SP run on that device prints once its limits are loaded.
inline constexpr char kKruRanges[] =
    "DLL --- KRU output clock valid freq ranges:\n"
    "DLL ------> CLK0, CLK180 min = 5.000; max = 250.000\n"
    "DLL ------> CLK90, CLK270 min = 4.000; max = 200.000\n"
    "DLL ------> CLK2X min = 10.000; max = 400.000\n"
    "DLL ------> CLKDV min = 0.312; max = 160.000\n"
    "DLL ------> CLKFX min = 8.000; max = 500.000\n";

inline void SetKru(const std::string& part) {
  for (const auto& [keyword, period] : KruPeriods()) {
    FakeHost::Instance().devices[part][keyword] = FigureFor(period);
  }
}

}  // namespace engine_test

#endif  // VORKEL_TESTS_ENGINE_KRUTEST_H_
