// Jitter and phase error of settings, by the model of the bundled timing calculator.
//
// A model is made once for a request and a primitive, and then answers for any number of
// settings: its coefficients are looked up only once. What it answers is what the calculator
// does, to the last bit; where the calculator refuses, there is no figure. Formulas:
// doc/calculator.md.
//
// All jitter is in ps. Peak to peak is at a bit error rate of 1e-12, and is 14.069 x rms of the
// random part + the deterministic part. Everything is asked with the first input.
//
// Tested by jitter_test.cpp.
#ifndef VORKEL_PLANNER_ANSWER_JITTER_H_
#define VORKEL_PLANNER_ANSWER_JITTER_H_

#include <array>
#include <limits>
#include <optional>
#include <string_view>

#include "hardware/Kru.h"
#include "host/bundled/calculator/Coefficients.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"

namespace planner::answer {

// A jitter that is not known. It is behind all that are, and above all that may be asked for.
inline constexpr double kUnknownJitter = std::numeric_limits<double>::infinity();

// The jitter behind a PLL or a TSYN. It is the same behind each divider.
class LoopJitter {
 public:
  LoopJitter(const Device& device, const Request& request);
  // `input` in MHz, `input_jitter` in ps peak to peak.
  LoopJitter(const std::optional<Calculator::LoopCoefficients>& coefficients, double input,
             double input_jitter);

  // Whether the jitter is known: the device has coefficients, and the model holds for the input.
  bool IsKnown() const { return is_known_; }

  // M in eighths. That of settings whose VCO and PFD are in the device's ranges; kUnknownJitter
  // when nothing is known.
  double PeakToPeak(int m_eighths, int d, Bandwidth bandwidth) const;
  double Rms(int m_eighths, int d, Bandwidth bandwidth) const;
  // The largest distance between the edges of input and feedback, ps, of a device that has
  // coefficients.
  double PhaseError(int d, Bandwidth bandwidth) const;

  // Whether, with the same bandwidth, the jitter falls when M / D^2 rises: the product of VCO and
  // PFD frequency is input^2 x M / D^2, and the noise of the oscillator falls with its root. The
  // doubles follow it but for their rounding, which kRounding bounds, as a fraction of the jitter:
  // one whose M / D^2 is larger never has a jitter above (1 + kRounding) times that of the other.
  bool FallsWithRatio() const { return true; }
  static constexpr double kRounding = 1e-13;

 private:
  std::optional<Calculator::LoopCoefficients> coefficients_;
  bool is_known_;
  double input_;
  double input_jitter_;
};

// The jitter of the pins of a KRU, with all of the input's: that passes through, and at worst the
// two add up.
class KruJitter {
 public:
  // `primitive` is that of the device whose pins are asked for.
  KruJitter(const Device& device, const Request& request, Primitive primitive);

  // Whether that of any pin is known: as for LoopJitter.
  bool IsKnown() const { return is_known_; }

  // That of a pin, which is not kNone; kUnknownJitter when it is not known: there are no
  // coefficients, or the model does not hold for the frequency of the pin or, for CLKDV, of the
  // delay line. CLKFXDV has that of CLKFX, as a divider moves no edge.
  double PeakToPeak(const KruSettings& settings, hardware::Pin pin) const;
  double Rms(const KruSettings& settings, hardware::Pin pin) const;
  // Of a device that has coefficients.
  double PhaseError() const;

  // Whether the jitter of CLKFX, CLKFX180 and CLKFXDV does not fall when M or D rises and all else
  // stays: the ring of the synthesiser runs freely for D input periods, and M of its own are
  // rounded to taps. Nor does that of any pin with a PHASE_SHIFT above 0 in place of 0, which adds
  // a tap. That is so of the doubles, too, as each step that works them out keeps the order of its
  // arguments.
  bool RisesWithSettings() const { return true; }

 private:
  // MHz; empty for a pin that the device does not have.
  struct Span {
    double lowest = 1.0;
    double highest = 0.0;
  };
  // Of the pin that stands for limits.
  static Span SpanOf(const ::Device::Grade& grade, std::string_view limits);
  bool Holds(const KruSettings& settings, hardware::Pin pin) const;

  std::optional<Calculator::KruCoefficients> coefficients_;
  bool is_known_ = false;
  std::array<Span, hardware::kPins.size() + 1> spans_;  // by the code of the pin
  double input_;
  double input_jitter_;
};

}  // namespace planner::answer

#endif  // VORKEL_PLANNER_ANSWER_JITTER_H_
