// What PLL and TSYN accept.
//
// Tested by calculator_loop_arguments_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_LOOPARGUMENTS_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_LOOPARGUMENTS_H_

#include <cstddef>
#include <string_view>

#include "host/bundled/calculator/Candidates.h"
#include "host/bundled/device/DeviceFile.h"

namespace Calculator {

// The setting of the loop's bandwidth.
enum class Bandwidth { kLow, kOptimized, kHigh };

// The setting that a text, in exact case, means. Throws ArgumentError for any other text.
Bandwidth BandwidthOf(std::string_view text);

// Whether a multiplier or divider is in between the whole numbers.
bool IsFractional(double value);

// Checks the arguments of one query. Every check throws ArgumentError when no PLL or TSYN of
// the device can take the argument together with those before it.
class LoopArguments {
 public:
  // A limit that either primitive has, by its keyword index.
  struct Limit {
    std::size_t pll;
    std::size_t tsyn;
  };

  // Throws ArgumentError when the grade has neither PLL nor TSYN. `device_name` is for the
  // sentence. The grade must outlive the checks.
  LoopArguments(const Device::Grade& grade, std::string_view device_name);

  void CheckM(double m);
  void CheckD(double d) const;
  void CheckOutputDivider(double divider);
  void CheckFeedbackDivider(double divider);  // 0: none
  void CheckRequestedPhase(double degrees) const;
  void CheckRequestedDuty(double percent) const;
  void CheckInputJitter(double picoseconds) const;

  // What the largest high or low count of the divider is: `count`, or the device's for 0. It
  // must be large enough to make the divider up of a high and a low count.
  double CheckLargestCount(double count, double divider) const;

  // Hold a frequency in MHz against the device's limits. The solver accepts an M and a D whose
  // quotient misses its VCO by a small remainder, so a frequency may miss a limit by as much.
  void CheckPfd(double pfd, Bandwidth bandwidth);
  void CheckVco(double vco);

 private:
  double Of(const Limit& limit, Device::Primitive primitive) const;

  const Device::Grade& grade_;
  Candidates candidates_;
};

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_LOOPARGUMENTS_H_
