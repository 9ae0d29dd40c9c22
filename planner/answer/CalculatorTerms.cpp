// Tested by jitter_test.cpp.
#include "planner/answer/CalculatorTerms.h"

#include "planner/device/SpeedData.h"

namespace planner::answer {

namespace {

// By the codes of hardware::Pin, which are not those of the calculator; kNone is not asked for.
int CodeOf(hardware::Pin pin) {
  switch (pin) {
    case hardware::Pin::kNone:
    case hardware::Pin::kClk0:
      return 1;
    case hardware::Pin::kClk90:
      return 2;
    case hardware::Pin::kClk180:
      return 3;
    case hardware::Pin::kClk270:
      return 4;
    case hardware::Pin::kClk2x:
      return 5;
    case hardware::Pin::kClk2x180:
      return 7;
    case hardware::Pin::kClkfx180:
      return 9;
    case hardware::Pin::kClkdv:
      return 10;
    case hardware::Pin::kClkfx:
    case hardware::Pin::kClkfxdv:
      break;
  }
  return 8;
}

}  // namespace

const ::Device::Grade* GradeOf(const Device& device) {
  return device.speed_data ? &device.speed_data->grade() : nullptr;
}

Calculator::Bandwidth CalculatorBandwidth(Bandwidth bandwidth) {
  switch (bandwidth) {
    case Bandwidth::kLow:
      return Calculator::Bandwidth::kLow;
    case Bandwidth::kHigh:
      return Calculator::Bandwidth::kHigh;
    case Bandwidth::kOptimized:
      break;
  }
  return Calculator::Bandwidth::kOptimized;
}

const Calculator::KruPin& CalculatorPin(hardware::Pin pin) {
  return Calculator::PinOf(CodeOf(pin));
}

Calculator::KruSettings CalculatorSettings(const KruSettings& settings, double input) {
  return {.input = input,
          .divide_by_2 = settings.divide_by_2,
          .feedback = settings.feedback,
          .phase_shift = settings.phase_shift != 0,
          .m = static_cast<double>(settings.m),
          .d = static_cast<double>(settings.d)};
}

}  // namespace planner::answer
