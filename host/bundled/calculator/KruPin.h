// The output pins of the KRUs, by the codes of the calculator interface.
//
// Tested by calculator_kru_arguments_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_KRUPIN_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_KRUPIN_H_

#include <string>
#include <string_view>

namespace Calculator {

// Where the clock of a pin comes from: a tap of the delay line, two taps that are combined to
// twice the frequency, the synthesiser or the divider.
enum class KruSource { kTap, kDoubler, kSynthesiser, kDivider };

struct KruPin {
  int code;
  std::string_view name;
  KruSource source;
  double phase;                // a fraction of its cycle
  std::string_view frequency;  // the pin that stands for its frequency limits in keywords
};

// The pin of a code. Throws ArgumentError, with all pins, for a code that no pin has.
const KruPin& PinOf(int code);

// "CLK0, CLK90, ... or CLKDV", all pins or those of the synthesiser.
std::string AllPins();
std::string SynthesiserPins();

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_KRUPIN_H_
